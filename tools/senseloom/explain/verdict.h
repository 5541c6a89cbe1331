#pragma once

#include <cstddef>
#include <cstdint>
#include <string>

namespace senseloom::tool {

// What became of a record at one session.
enum class Fate {
  delivered,
  batchFilling,
  classNotWanted,
  unchanged,
  notAMultiple,
  noGesture,
  noItems,
  tooShort,
  refused,
};
inline constexpr size_t kFates = 9;

const char* fateText(Fate fate);

// A fate with the two numbers that made it so.
struct Verdict {
  Fate fate;
  int32_t first = 0;
  int32_t second = 0;

  // What ctx_dispatch_data() returns for it.
  int returned() const;
  // The fate with its numbers.
  std::string text() const;
};

}  // namespace senseloom::tool
