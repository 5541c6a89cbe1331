// Whole sequences of calls over several sensors and sessions, with failures of the platform and misuse. An input is the
// decisions of the generator that the random sequences of the tests come from, too.

#include <generator.h>

#include "target.h"

namespace {

class InputChoices final : public oracle::Choices {
 public:
  InputChoices(const uint8_t* data, size_t size) : next(data), end(data + size) {}

  uint32_t below(uint32_t bound) override {
    uint32_t number = 0;
    for (uint32_t rest = bound - 1; rest > 0 && next != end; rest >>= 8) number = number << 8 | *next++;
    return number % bound;
  }
  bool isExhausted() const override { return next == end; }

 private:
  const uint8_t* next;
  const uint8_t* end;
};

}  // namespace

void fuzz::sequences(const uint8_t* data, size_t size) {
  InputChoices choices(data, size);
  check(oracle::makeSequence(choices));
}
