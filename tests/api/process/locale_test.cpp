#include <gtest/gtest.h>
#include <locale.h>
#include <senseloom.h>

#include <clocale>
#include <cstring>
#include <string>

// Numbers in option strings, in a locale whose decimal point has several bytes.
namespace {

constexpr const char* kLocale = "ps_AF.UTF-8";

class ManyByteDecimalPoint : public ::testing::TestWithParam<bool> {
 protected:
  void SetUp() override {
    ASSERT_NE(std::setlocale(LC_ALL, kLocale), nullptr) << "no " << kLocale << " in LOCPATH";
    if (GetParam()) {
      own = duplocale(LC_GLOBAL_LOCALE);
      std::setlocale(LC_ALL, "C");
      uselocale(own);
    }
    ASSERT_GT(std::strlen(localeconv()->decimal_point), 1U);
  }
  void TearDown() override {
    uselocale(LC_GLOBAL_LOCALE);
    if (own != nullptr) freelocale(own);
  }

  locale_t own = nullptr;  // the thread's, or none and so the process's
};

TEST_P(ManyByteDecimalPoint, DoesNotMatterAndStays) {
  const locale_t ofThread = uselocale(nullptr);
  const std::string ofProcess = std::setlocale(LC_ALL, nullptr);
  const struct {
    const char* text;
    int result;
  } cases[] = {
      {R"({"interval":7,"other":2.5})", 0},
      {R"({"other":-1234567890.12345678901234567890e-20,"interval":7})", 0},
      {R"({"interval":7,"other":1e400})", -1},  // beyond range
      {"{\"interval\":7,\"other\":2\u066B5}", -1},
  };
  void* const handle = ctx_open_session("LPE_P");
  for (const auto& [text, result] : cases) {
    ctx_option_t* list = nullptr;
    EXPECT_EQ(ctx_set_option(handle, 0, text, &list), result) << text;
    EXPECT_EQ(list != nullptr, result == 0) << text;
    EXPECT_TRUE(list == nullptr || *static_cast<int32_t*>(list->properties[0].value) == 7) << text;
    ctx_option_release(list);
    EXPECT_EQ(uselocale(nullptr), ofThread);
    EXPECT_EQ(std::setlocale(LC_ALL, nullptr), ofProcess);
  }
  ctx_option_t* list = nullptr;
  EXPECT_EQ(ctx_close_session(handle, &list), 0);
}

INSTANTIATE_TEST_SUITE_P(Of, ManyByteDecimalPoint, ::testing::Bool(),
                         [](const auto& of) { return of.param ? "TheThread" : "TheProcess"; });

}  // namespace
