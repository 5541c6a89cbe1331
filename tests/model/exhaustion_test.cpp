#include <gtest/gtest.h>
#include <jansson.h>
#include <library_memory.h>
#include <senseloom.h>

#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <string>
#include <vector>

// Option strings with texts and numbers that are longer than what the JSON parser has room for at first, read while
// memory runs out: above a limit, for ever from one allocation on, and in one allocation alone. A string is then
// refused, or means what it says.
//
// One thing is left to the parser, which does not bear it: that it gets no memory although all that it can need was
// there just before. With a limit that cannot be, so there the parser's own allocations fail, too. Elsewhere the first
// allocation of a reading, which is that of all it can need, fails and those of the parser do not.
namespace {

using Bytes = std::vector<uint8_t>;

enum class Shortage { aboveALimit, fromOneOn, once };

bool parser_is_spared = false;
bool reading_begins = false;

void* allocateForJson(size_t size) {
  if (!parser_is_spared || reading_begins) {
    reading_begins = false;
    return std::malloc(size);
  }
  const memory::Exempt spared;
  return std::malloc(size);
}

// The values of a list one after the other.
Bytes valuesOf(ctx_option_t* list) {
  Bytes values;
  for (int32_t i = 0; list != nullptr && i < list->count; ++i) {
    const ctx_property_t& property = list->properties[i];
    const auto* const value = static_cast<const uint8_t*>(property.value);
    values.insert(values.end(), value, value + property.size);
  }
  ctx_option_release(list);
  return values;
}

Bytes integers(const std::vector<int32_t>& values) {
  Bytes bytes(values.size() * sizeof(int32_t));
  std::memcpy(bytes.data(), values.data(), bytes.size());
  return bytes;
}

struct Outcome {
  int result;
  Bytes values;
};

Outcome setOption(void* session, const std::string& text) {
  ctx_option_t* list = nullptr;
  reading_begins = true;
  const int result = ctx_set_option(session, 0, text.c_str(), &list);
  memory::stopFailing();
  return {result, valuesOf(list)};
}

// The values of the session's option, which a second session's closing shows.
Bytes optionOf(void* session, const char* sensor) {
  ctx_option_t* list = nullptr;
  EXPECT_EQ(ctx_close_session(ctx_open_session(sensor), &list), 1) << session;
  return valuesOf(list);
}

struct OptionCase {
  const char* sensor;
  const char* before;  // the session's option until then
  Bytes beforeValues;
  std::string text;
  Bytes values;
};
// Sets the option of a session of its own while memory runs out in that way. Returns whether it could.
bool isSetDespite(Shortage shortage, size_t which, const OptionCase& option) {
  void* const session = ctx_open_session(option.sensor);
  EXPECT_EQ(setOption(session, option.before).result, 0);
  parser_is_spared = shortage != Shortage::aboveALimit;
  if (shortage == Shortage::aboveALimit) {
    memory::failAbove(memory::bytes() + which);
  } else {
    memory::failAt(which, shortage == Shortage::fromOneOn);
  }
  const auto [result, values] = setOption(session, option.text);
  parser_is_spared = false;
  EXPECT_TRUE(result == 0 || result == -1);
  EXPECT_EQ(values, result == 0 ? option.values : Bytes{});
  const Bytes own = optionOf(session, option.sensor);
  EXPECT_TRUE(own == option.values || (result == -1 && own == option.beforeValues));
  ctx_option_t* list = nullptr;
  EXPECT_EQ(ctx_close_session(session, &list), 0);
  return result == 0;
}

// The interval of an audio client whose string has something else in it, too.
OptionCase audio(const std::string& other) {
  return {"LPE_P", R"({"interval":5})", integers({5}), "{" + other + R"(,"interval":123456})", integers({123456})};
}

std::vector<OptionCase> cases() {
  std::vector<OptionCase> all = {
      {"STAP", R"({"classMask":1})", integers({1, 0}), R"({"client":"navigation-app","classMask":2,"level":-1})",
       integers({2, -1})},
      {"ISACT", R"({"classMask":1})", integers({1}), R"({"client":"navigation-app","classMask":2})", integers({2})},
      {"SCOUN", R"({"mode":0})", integers({0, 1}), R"({"client":"navigation-app","logN":7})", integers({1, 7})},
      {"DTWGS",
       R"({"mode":4,"classMask":1,"template1":"0001ee"})",
       {0, 0, 0, 0, 0, 0, 0, 0, 0xEE},  // level, number and data of the template
       R"({"template1":"0020404142434445464748494a4b4c4d4e4f505152535455565758595a5b5c5d5e5f","mode":4,"classMask":1})",
       {0,    0,    0,    0,    0,    0,    0,    0,    0x40, 0x41, 0x42, 0x43, 0x44, 0x45,
        0x46, 0x47, 0x48, 0x49, 0x4A, 0x4B, 0x4C, 0x4D, 0x4E, 0x4F, 0x50, 0x51, 0x52, 0x53,
        0x54, 0x55, 0x56, 0x57, 0x58, 0x59, 0x5A, 0x5B, 0x5C, 0x5D, 0x5E, 0x5F}},
      audio(R"("nested":)" + std::string(60, '[') + std::string(60, ']')),
      audio(R"("escaped":"\u066b\u066b\u066b\u066b\u066b\u066b\u066b\u066b\u066b\u066b\u066b\u066b")"),
      audio(R"("real":-0.00000000000000012345678901234567890123456789012345678901234e+12)"),
  };
  for (const size_t length : {13U, 14U, 15U, 16U, 17U, 30U, 31U, 32U, 33U, 62U, 63U, 64U, 65U, 70U}) {
    all.push_back(audio('"' + std::string(length, 'k') + R"(":1)"));
    all.push_back(audio(R"("text":")" + std::string(length, 't') + '"'));
    all.push_back(audio(R"("real":1.)" + std::string(length - 2, '7')));
  }
  return all;
}

// Each string is refused until there is enough for it.
void expectRefusalsUntilThereIsEnough(Shortage shortage, size_t first, size_t step, size_t fewest) {
  json_set_alloc_funcs(allocateForJson, std::free);
  for (const OptionCase& option : cases()) {
    size_t which = first;
    for (; !isSetDespite(shortage, which, option); which += step) {
      ASSERT_FALSE(::testing::Test::HasFailure()) << which << ' ' << option.text;
    }
    EXPECT_GT(which, fewest) << option.text;
  }
}

TEST(OptionStrings, AreRefusedOrMeanWhatTheySayWithoutMemoryAboveALimit) {
  expectRefusalsUntilThereIsEnough(Shortage::aboveALimit, 0, 16, 1024);
}

// The reading fails, and so do the merged option and the list.
TEST(OptionStrings, AreRefusedOrMeanWhatTheySayWithoutMemoryFromOneAllocationOn) {
  expectRefusalsUntilThereIsEnough(Shortage::fromOneOn, 1, 1, 3);
}

TEST(OptionStrings, AreRefusedOrMeanWhatTheySayWithoutMemoryForOneAllocation) {
  expectRefusalsUntilThereIsEnough(Shortage::once, 1, 1, 3);
}

#if UINTPTR_MAX == UINT32_MAX

TEST(Exhaustion, StringThatWouldTakeMoreThanTheAddressSpaceToReadIsRefused) {
  void* const session = ctx_open_session("LPE_P");
  std::string text = R"({"interval":7})";
  text.append(size_t{1} << 26, ' ');
  ctx_option_t* list = nullptr;
  EXPECT_EQ(ctx_set_option(session, 0, text.c_str(), &list), -1);
  EXPECT_EQ(ctx_close_session(session, &list), 0);
}

#endif

}  // namespace
