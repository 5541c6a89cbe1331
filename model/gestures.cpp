#include "gestures.h"

#include <algorithm>
#include <cstring>
#include <string>

namespace senseloom::model {
namespace {

constexpr size_t kSizeOffset = 10;
constexpr size_t kSamplesOffset = 12;
constexpr size_t kFewestBytes = 24;
constexpr size_t kMostBytes = 2052;
constexpr int kGroupBytes = 12;

// By class number, from 1. The names that the engine gives end in a blank.
constexpr const char* kNames[] = {"NumberOne ",  "NumberTwo ",  "NumberThree ", "NumberFour ",
                                  "NumberFive ", "NumberSix ",  "NumberSeven ", "NumberEight ",
                                  "NumberNine ", "NumberZero ", "LetterA ",     "LetterB ",
                                  "LetterC ",    "LetterD ",    "LetterE ",     "LetterF "};

}  // namespace

void Gestures::sessionOpened(const Answers& answers, Outcome& outcome) {
  if (++sessions > 1) return;
  ++outcome.engineStarts;
  if (answers.starts) return;
  const std::string& line = write(outcome.log, kError, kTag, "hmm gesture algorithm start return false");
  outcome.why.remarks.push_back(engineNotStarted(line));
}

void Gestures::sessionClosed(Outcome& outcome) {
  if (--sessions == 0) ++outcome.engineCloses;
}

Verdict Gestures::judge(int32_t classMask, Record record, const Answers& answers, Outcome& outcome) {
  if (record.size() < kFewestBytes || record.size() > kMostBytes) {
    return refused(Refusal::wrongSize, record.size(), kMostBytes);
  }
  const size_t room = record.size() - kSamplesOffset;
  if (const auto size = at<uint16_t>(record, kSizeOffset); size > room) {
    return refused(Refusal::samplesMissing, size, room);
  }
  if (const auto now = at<uint64_t>(record, kTimestampOffset); now != timestamp) {
    timestamp = now;
    classNumber = 0;
    recognise(record, answers, outcome);
  }
  if (classNumber == 0) return {Fate::noGesture};
  if (!bit(classMask, classNumber - 1)) return {Fate::classNotWanted, shifted(1, classNumber - 1), classMask};
  outcome.delivers = Outcome::ownBuffer;
  outcome.result.assign(record.begin(), record.end());
  outcome.result[kValueOffset] = static_cast<uint8_t>(classNumber);
  outcome.result[kValueOffset + 1] = 0;
  return {Fate::delivered};
}

void Gestures::recognise(Record record, const Answers& answers, Outcome& outcome) {
  const int prx = at<int16_t>(record, kValueOffset);
  const int size = at<uint16_t>(record, kSizeOffset);
  const int groups = std::max((size + kGroupBytes - 1) / kGroupBytes, 1);
  for (int k = 0; k < groups; ++k) {
    SampleGroup group{.last = k == groups - 1};
    auto& s = group.samples;
    const auto samples = record.subspan(kSamplesOffset + static_cast<size_t>(kGroupBytes * k));
    std::memcpy(s.data(), samples.data(), std::min<size_t>(kGroupBytes, samples.size()));
    if (group.last) {
      write(outcome.log, kDebug, kTag, "num %d: %hd %hd %hd %hd %hd %hd: last %d, size %d, prx %d\n", k, s[0], s[1],
            s[2], s[3], s[4], s[5], 1, size, prx);
    }
    outcome.groups.push_back(group);
    const auto answer = static_cast<size_t>(k);
    if (answer >= answers.names.size() || !answers.names[answer]) continue;
    const std::string& name = *answers.names[answer];
    write(outcome.log, kDebug, kTag, "-- gesture: %s", name.c_str());
    if (prx != 0) continue;  // something is near the device, and the gesture does not count
    const auto* found = std::find(std::begin(kNames), std::end(kNames), name);
    if (found != std::end(kNames)) classNumber = static_cast<int>(found - std::begin(kNames)) + 1;
  }
}

}  // namespace senseloom::model
