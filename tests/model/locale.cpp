#include <clocale>
#include <cstdio>
#include <cstdlib>
#include <cstring>

// Has the program run in the locale of the environment, which must write fractions with a comma, when
// SENSELOOM_TEST_LOCALE is set: a service may have set any locale before it calls the library.
namespace {

[[gnu::constructor]] void useLocale() {
  if (std::getenv("SENSELOOM_TEST_LOCALE") == nullptr) return;
  if (std::setlocale(LC_ALL, "") == nullptr || std::strcmp(std::localeconv()->decimal_point, ",") != 0) {
    std::fputs("there is no locale with a decimal comma in the environment\n", stderr);
    std::exit(2);
  }
  std::setlocale(LC_MESSAGES, "C");  // expected texts are in English
}

}  // namespace
