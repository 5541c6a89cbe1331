#include "explain/gesture_model.h"

#include <algorithm>
#include <iterator>
#include <string_view>

#include "trace/record_field.h"

namespace senseloom::tool {
namespace {

constexpr size_t kLengthOffset = 10;
constexpr size_t kSamplesOffset = 12;
constexpr size_t kFewestBytes = 24;
constexpr size_t kMostBytes = 2052;

// By class number, from 1. The names that the engine gives end in a blank.
constexpr std::string_view kNames[] = {
    "NumberOne ",   "NumberTwo ",   "NumberThree ", "NumberFour ", "NumberFive ", "NumberSix ",
    "NumberSeven ", "NumberEight ", "NumberNine ",  "NumberZero ", "LetterA ",    "LetterB ",
    "LetterC ",     "LetterD ",     "LetterE ",     "LetterF ",
};

// The last class that the log of a record names; 0: none.
int32_t classIn(const std::vector<LogLine>& log) {
  constexpr std::string_view kLead = "-- gesture: ";
  int32_t number = 0;
  for (const LogLine& line : log) {
    const std::string_view text = line.text;
    if (text.substr(0, kLead.size()) != kLead) continue;
    const auto* name = std::find(std::begin(kNames), std::end(kNames), text.substr(kLead.size()));
    if (name != std::end(kNames)) number = static_cast<int32_t>(name - std::begin(kNames)) + 1;
  }
  return number;
}

}  // namespace

Verdict GestureModel::judge(const Wishes& wishes, std::span<const uint8_t> record, const std::vector<LogLine>& log) {
  if (record.size() < kFewestBytes || record.size() > kMostBytes) return {Fate::refused};
  if (record.size() < kSamplesOffset + *recordField<uint16_t>(record, kLengthOffset)) return {Fate::refused};

  const auto timestamp = *recordField<uint64_t>(record, kTimestampOffset);
  if (timestamp != state.timestamp) {
    // Something near the device, and the gesture does not count.
    const bool isNear = *recordField<int16_t>(record, kValueOffset) != 0;
    state = {timestamp, isNear ? 0 : classIn(log)};
  }
  if (state.classNumber == 0) return {Fate::noGesture};
  const int32_t mask = wishes.valueOf("classMask");
  const int32_t bit = 1 << (state.classNumber - 1);
  return {(bit & mask) != 0 ? Fate::delivered : Fate::classNotWanted, bit, mask};
}

}  // namespace senseloom::tool
