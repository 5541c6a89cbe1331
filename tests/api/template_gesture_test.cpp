#include "client.h"

// Template gestures: one store of two templates for all sessions, and modes that do not go together.
namespace api {
namespace {

const std::string kEnroll = R"({"mode": 1})";

std::string match(int mask, int level = 0) {
  return R"({"mode": 4, "classMask": )" + std::to_string(mask) + R"(, "level": )" + std::to_string(level) + "}";
}

std::string object(const std::string& members) {
  return '{' + members + '}';
}
// A match option for class mask 3 with these templates.
std::string matchWith(const std::string& members) {
  return object(R"("mode": 4, "classMask": 3, )" + members);
}
std::string template1(const std::string& text) {
  return R"("template1": ")" + text + '"';
}
std::string template2(const std::string& text) {
  return R"("template2": ")" + text + '"';
}

// A list of a match option: the level, then a pair for each template.
Negotiated matching(int32_t level, const std::optional<Bytes>& first, const std::optional<Bytes>& second) {
  Properties list = {property(121, level)};
  if (first) list.insert(list.end(), {property(122, 0), {123, *first}});
  if (second) list.insert(list.end(), {property(122, 1), {123, *second}});
  return {0, list};
}

std::string digits(size_t count, char digit) {
  return std::string(count, digit);
}

class TemplateGesture : public ::testing::Test {
 protected:
  void* const client_ = ctx_open_session("DTWGS");
};

TEST_F(TemplateGesture, MatchingListHoldsTheWantedTemplatesThatAreStored) {
  const Bytes a = {0xA1, 0xB2, 0xC3};
  const Bytes b = {0x09};
  EXPECT_EQ(setOption(client_, match(3, 1)), matching(1, {}, {}));
  EXPECT_EQ(setOption(client_, matchWith(template1("0003a1b2c3"))), matching(0, a, {}));
  EXPECT_EQ(setOption(client_, matchWith(template2("000109"))), matching(0, a, b));
  EXPECT_EQ(setOption(client_, match(1, -1)), matching(-1, a, {}));
  EXPECT_EQ(setOption(client_, match(2)), matching(0, {}, b));
  EXPECT_EQ(setOption(client_, matchWith(template1("0000"))), matching(0, {}, b));  // no length, no template
}

TEST_F(TemplateGesture, TemplateTextIsDecodedAsItStands) {
  const struct {
    std::string text;
    Bytes stored;
  } texts[] = {
      {"0001ff", {0xFF}},
      {"0002a1b", {0xA1, 0x00}},     // an odd last digit is dropped
      {"0004", {0xA1, 0x00, 0, 0}},  // no data: what was there stays
      {"00010203", {0x02}},          // more data than declared is stored, but not in the list
      {"0002", {0x02, 0x03}},        // ... until the length says so
      {"0001A1", {0x11}},            // uppercase is no digit: 17 * 16 + 1, in 8 bits
      {"0001zz", {0x53}},            // 35 * 16 + 35
      {"000B01", Bytes{0x01, 0x03, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0, 0}},  // nor in the length: 18
      {"0010000102030405060708090a0b0c0d0e0f", {0, 1, 2, 3, 4, 5, 6, 7, 8, 9, 10, 11, 12, 13, 14, 15}},
      {"0384" + digits(1800, '5'), Bytes(900, 0x55)},
      {"0384" + digits(1801, '6'), Bytes(900, 0x66)},
  };
  for (const auto& [text, stored] : texts) {
    SCOPED_TRACE(text);
    EXPECT_EQ(setOption(client_, matchWith(template1(text))), matching(0, stored, {}));
  }
}

TEST_F(TemplateGesture, BadTemplateRefusesTheStringAndKeepsItsSlot) {
  EXPECT_EQ(setOption(client_, matchWith(template1("000111") + ", " + template2("000122"))).result, 0);
  platform().takeLog();
  for (const std::string& bad : {std::string(), digits(3, '0'), "0385" + digits(10, '1'), std::string("ffff00"),
                                 "0001" + digits(1802, '1'), std::string("00.01")}) {
    SCOPED_TRACE(bad);
    EXPECT_EQ(setOption(client_, matchWith(template1(bad))), kFailed);
    EXPECT_EQ(platform().takeLog(), Log{error("Invalid template1 value")});
    EXPECT_EQ(setOption(client_, matchWith(template2(bad))), kFailed);
    EXPECT_EQ(platform().takeLog(), Log{error("Invalid template2 value")});
    EXPECT_EQ(setOption(client_, matchWith(template1(bad) + ", " + template2(bad))), kFailed);
    EXPECT_EQ(platform().takeLog(), (Log{error("Invalid template1 value"), error("Invalid template2 value")}));
    EXPECT_EQ(setOption(client_, match(3)), matching(0, Bytes{0x11}, Bytes{0x22}));
    EXPECT_EQ(platform().takeLog(), negotiation("DTWGS", {client_}));
  }
}

TEST_F(TemplateGesture, TemplateIsStoredThoughTheRestOfTheStringIsRefused) {
  EXPECT_EQ(setOption(client_, object(template1("000133"))), kFailed);
  EXPECT_EQ(platform().takeLog(), Log{error("Invalid mode value 0")});
  EXPECT_EQ(setOption(client_, object(R"("mode": 4, )" + template2("000144"))), kFailed);
  EXPECT_EQ(platform().takeLog(), Log{error("Invalid mask value 0 at match mode")});
  EXPECT_EQ(setOption(client_, match(3)), matching(0, Bytes{0x33}, Bytes{0x44}));
  platform().takeLog();

  // With one template bad, the other one is stored, and nothing else is checked.
  EXPECT_EQ(setOption(client_, object(template1("") + ", " + template2("000155"))), kFailed);
  EXPECT_EQ(setOption(client_, object(template1("000166") + ", " + template2("1"))), kFailed);
  EXPECT_EQ(platform().takeLog(), (Log{error("Invalid template1 value"), error("Invalid template2 value")}));
  EXPECT_EQ(setOption(client_, match(3)), matching(0, Bytes{0x66}, Bytes{0x55}));
}

TEST_F(TemplateGesture, TemplateThatIsNoStringIsIgnored) {
  EXPECT_EQ(setOption(client_, matchWith(R"("template1": 5, "template2": null)")), matching(0, {}, {}));
}

TEST_F(TemplateGesture, ListShowsATemplateThatAnyClientStoresLater) {
  const auto [result, list] = setAndKeep(client_, matchWith(template1("000211aa")));
  EXPECT_EQ(result, 0);
  void* const other = ctx_open_session("DTWGS");
  EXPECT_EQ(setOption(other, object(template1("000122"))), kFailed);  // no negotiation: the list stays good
  EXPECT_EQ(read(list), *matching(0, Bytes{0x22, 0xAA}, {}).list);
}

TEST_F(TemplateGesture, TemplatesOutliveSessionsAndSensors) {
  EXPECT_EQ(setOption(client_, matchWith(template2("000177"))).result, 0);
  EXPECT_EQ(closeSession(client_), kStopped);
  ctx_uninit();
  void* const next = ctx_open_session("DTWGS");
  EXPECT_EQ(setOption(next, match(3)), matching(0, {}, Bytes{0x77}));
}

TEST_F(TemplateGesture, EnrollingListIsEmpty) {
  EXPECT_EQ(setOption(client_, R"({"mode": 1, "classMask": 3, "index": 1, "template1": "0001ff"})"),
            (Negotiated{0, Properties{}}));
  EXPECT_EQ(platform().takeLog(), negotiation("DTWGS", {client_}));
}

TEST_F(TemplateGesture, SecondEnrollingClientIsRefusedUntilTheFirstIsGone) {
  void* const second = ctx_open_session("DTWGS");
  EXPECT_EQ(setOption(client_, kEnroll), (Negotiated{0, Properties{}}));
  platform().takeLog();
  EXPECT_EQ(setOption(second, kEnroll), kFailed);
  EXPECT_EQ(platform().takeLog(), negotiation("DTWGS", {client_, second}) + Log{debug("option invalid")});
  EXPECT_EQ(setOption(client_, kEnroll), kFailed);  // the second one's wish stands

  EXPECT_EQ(closeSession(client_), (Negotiated{1, Properties{}}));
  EXPECT_EQ(closeSession(second), kStopped);
}

TEST_F(TemplateGesture, EnrollingAndMatchingDoNotGoTogether) {
  void* const second = ctx_open_session("DTWGS");
  void* const third = ctx_open_session("DTWGS");
  EXPECT_EQ(setOption(client_, match(1)), matching(0, {}, {}));
  EXPECT_EQ(setOption(second, match(2, -1)), matching(-1, {}, {}));
  platform().takeLog();
  EXPECT_EQ(setOption(third, kEnroll), kFailed);
  EXPECT_EQ(platform().takeLog(),
            negotiation("DTWGS", {client_, second, third}) + Log{debug("option mode incompatible: 5")});

  // The sessions that remain conflict as well, which is no failure of the closing.
  EXPECT_EQ(closeSession(client_), (Negotiated{1, std::nullopt}));
  EXPECT_EQ(platform().takeLog(), negotiation("DTWGS", {second, third}) + Log{debug("option mode incompatible: 5")});
  EXPECT_EQ(setOption(third, match(1, 1)), matching(-1, {}, {}));
  EXPECT_EQ(closeSession(second), (Negotiated{1, properties({{121, 1}})}));
  EXPECT_EQ(closeSession(third), kStopped);
}

TEST_F(TemplateGesture, SensorWithoutAnyOptionHasNoList) {
  void* const second = ctx_open_session("DTWGS");
  EXPECT_EQ(closeSession(second), (Negotiated{1, std::nullopt}));
  EXPECT_EQ(platform().takeLog(), negotiation("DTWGS", {client_}) + Log{debug("option mode incompatible: 0")});
}

TEST_F(TemplateGesture, ClientKeepsItsMaskWhenItsStringIsRefused) {
  setOption(client_, match(1));
  EXPECT_EQ(setOption(client_, match(4)), kFailed);
  EXPECT_EQ(setOption(client_, R"({"mode": 1, "classMask": 2, "index": 2})"), kFailed);
  EXPECT_EQ(dispatch(client_, record(1, int16_t{1})), handedBack(record(1, int16_t{1})));
  EXPECT_EQ(dispatch(client_, record(1, int16_t{2})), kNothing);
}

}  // namespace
}  // namespace api
