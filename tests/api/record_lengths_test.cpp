#include "client.h"

// Records of every length up to beyond the largest one, with all kinds of contents, at even and odd addresses: what
// each sensor makes of them follows a rule of the test's own. The records lie in blocks of just their size, so that
// AddressSanitizer reports a single byte read beyond one.
namespace api {
namespace {

// Integers of a record; what it does not hold is never asked for.
template <class Integer>
Integer at(const Bytes& bytes, size_t offset) {
  Integer value;
  EXPECT_LE(offset + sizeof value, bytes.size());
  std::memcpy(&value, bytes.data() + offset, sizeof value);
  return value;
}
int count(const Bytes& record) {
  return at<int16_t>(record, 8);
}

// A result: the record's timestamp, the count, and so many bytes of the record's items.
Delivery firstItems(const Bytes& record, int items, int itemSize) {
  Bytes result(record.begin(), record.begin() + 8);
  append(result, static_cast<int16_t>(items));
  result.insert(result.end(), record.begin() + 10, record.begin() + 10 + items * itemSize);
  return made(result);
}

Delivery everything(const Bytes& record) {
  return handedBack(record);
}

// By default the vote of the first item; classes above 7 count as 0.
Delivery activityVoted(const Bytes& record) {
  if (record.empty()) return kNothing;
  if (record.size() < 10) return kRefused;
  if (count(record) <= 0) return kNothing;
  if (record.size() < 10 + 2 * static_cast<size_t>(count(record))) return kRefused;
  Delivery voted = firstItems(record, 1, 2);
  if ((voted.record[10] & 8) != 0) voted.record[10] &= 0xF0;
  return voted;
}

Delivery activityInBatchesOf256(const Bytes& record) {
  const Delivery first = activityVoted(record);
  if (first.result != 1) return first;
  return count(record) >= 256 ? firstItems(record, 256, 2) : kNothing;
}

Delivery classSetOf3(const Bytes& record) {
  return record.size() >= 10 && (record[8] & 3) != 0 ? handedBack(record) : kNothing;
}

// Classes 1 to `largest`, of which only the low 5 bits count.
Delivery classNumber(const Bytes& record, size_t end, int largest) {
  return record.size() >= end && (record[8] + 31) % 32 < largest ? handedBack(record) : kNothing;
}
Delivery flick(const Bytes& record) {
  return classNumber(record, 10, 6);
}
Delivery earTouch(const Bytes& record) {
  return classNumber(record, 10, 2);
}
Delivery instantActivity(const Bytes& record) {
  return classNumber(record, 12, 4);
}

Delivery hundredsOfSteps(const Bytes& record) {
  return record.size() >= 12 && at<int32_t>(record, 8) % 100 == 0 ? handedBack(record) : kNothing;
}

Delivery deadReckoning(const Bytes& record) {
  if (record.size() < 10 || count(record) < 0 || count(record) > 64) return kRefused;
  if (record.size() < 10 + 28 * static_cast<size_t>(count(record))) return kRefused;
  return count(record) == 0 ? kNothing : firstItems(record, count(record), 28);
}

Delivery deadReckoningIn64s(const Bytes& record) {
  const Delivery all = deadReckoning(record);
  return all.result == 1 && count(record) < 64 ? kNothing : all;
}

// The engine finds "LetterA " in every record's last group, and `prx` is 0 in what is not refused.
Delivery gesture(const Bytes& record) {
  if (record.size() < 24 || record.size() > 2052) return kRefused;
  if (record.size() < size_t{12} + at<uint16_t>(record, 10)) return kRefused;
  Bytes result = record;
  result[8] = 11;
  return made(result);
}

// The groups that the engine must have got of a record: its samples, and zeros behind its end.
std::vector<fake::Platform::Group> groupsOf(Bytes record) {
  std::vector<fake::Platform::Group> groups;
  if (gesture(record).result == -1) return groups;
  const size_t fed = std::max<size_t>(1, (at<uint16_t>(record, 10) + size_t{11}) / 12);
  record.resize(std::max(record.size(), 12 + 12 * fed));
  for (size_t k = 0; k < fed; ++k) {
    fake::Platform::Group group{.samples = {}, .count = 1, .last = k + 1 == fed};
    std::memcpy(group.samples.data(), record.data() + 12 + 12 * k, 12);
    groups.push_back(group);
  }
  return groups;
}

// Contents of a record of that length. A size of 0 items means that the kind counts none.
Bytes zeros(size_t length, size_t) {
  return Bytes(length);
}
Bytes ones(size_t length, size_t) {
  return Bytes(length, 0xFF);
}

Bytes counted(size_t length, size_t offset, size_t value, uint8_t rest) {
  Bytes bytes(length, rest);
  const auto integer = static_cast<uint16_t>(value);
  if (length >= offset + 2) std::memcpy(bytes.data() + offset, &integer, sizeof integer);
  return bytes;
}
Bytes justFitting(size_t length, size_t itemSize) {
  return counted(length, 8, itemSize == 0 || length < 10 ? 1 : (length - 10) / itemSize, 0x5A);
}
Bytes oneTooMany(size_t length, size_t itemSize) {
  return counted(length, 8, itemSize == 0 || length < 10 ? 2 : (length - 10) / itemSize + 1, 0xA5);
}

// Gesture records count bytes of samples instead, behind `prx`, which is 0 here.
Bytes samples(size_t length, size_t size, uint8_t rest) {
  Bytes bytes = counted(length, 10, size, rest);
  for (size_t i = 8; i < std::min<size_t>(length, 10); ++i) bytes[i] = 0;
  return bytes;
}
Bytes samplesJustFitting(size_t length, size_t) {
  return samples(length, length < 12 ? 0 : length - 12, 0x5A);
}
Bytes oneSampleByteTooMany(size_t length, size_t) {
  return samples(length, length < 12 ? 0 : length - 11, 0xA5);
}
Bytes fewSamples(size_t length, size_t) {
  return samples(length, 13, 0x77);
}

using Fill = Bytes (*)(size_t length, size_t itemSize);
const std::vector<Fill> kFills = {zeros, ones, justFitting, oneTooMany};
const std::vector<Fill> kSampleFills = {zeros, ones, samplesJustFitting, oneSampleByteTooMany, fewSamples};

struct Kind {
  const char* name;  // of the test
  const char* sensor;
  const char* option;
  size_t limit;
  size_t itemSize;
  Delivery (*rule)(const Bytes& record);
  const std::vector<Fill>& fills = kFills;
};

const Kind kKinds[] = {
    {"ActivityVoted", "PHYAC", "{}", 522, 2, activityVoted},
    {"ActivityInBatches", "PHYAC", R"({"logN": 8, "summary": 0})", 522, 2, activityInBatchesOf256},
    {"Tapping", "STAP", "{}", 12, 0, classSetOf3},
    {"Flick", "GSFLK", "{}", 12, 0, flick},
    {"Shaking", "SHAKI", "{}", 12, 0, everything},
    {"InstantActivity", "ISACT", "{}", 12, 0, instantActivity},
    {"StepCount", "SCOUN", "{}", 12, 0, everything},
    {"HundredsOfSteps", "SCOUN", R"({"mode": 0})", 12, 0, hundredsOfSteps},
    {"Gesture", "GSPX", "{}", 2052, 0, gesture, kSampleFills},
    {"TemplateGesture", "DTWGS", R"({"mode": 4, "classMask": 3})", 12, 0, classSetOf3},
    {"EarTouch", "GSETH", "{}", 12, 0, earTouch},
    {"AudioClassification", "LPE_P", "{}", 12, 0, everything},
    {"DeadReckoning", "PDR", "{}", 1802, 28, deadReckoning},
    {"DeadReckoningInBatches", "PDR", R"({"N": 6})", 1802, 28, deadReckoningIn64s},
    {"Lift", "LIFT", "{}", 12, 0, everything},
};

void PrintTo(const Kind& kind, std::ostream* out) {
  *out << kind.sensor;
}

class RecordLengths : public ::testing::TestWithParam<Kind> {};

TEST_P(RecordLengths, AreDeliveredDroppedOrRefusedByTheKindsRule) {
  const Kind& kind = GetParam();
  uint64_t timestamp = 0;
  for (size_t length = 0; length <= kind.limit + 16 && !HasFailure(); ++length) {
    for (const Fill fill : kind.fills) {
      for (size_t misalignment = 0; misalignment < 2; ++misalignment) {
        SCOPED_TRACE(length);
        // A session and a timestamp of its own, so that nothing is left of the record before.
        void* const handle = ctx_open_session(kind.sensor);
        setOption(handle, kind.option);
        Bytes record = fill(length, kind.itemSize);
        if (length >= 8) std::memcpy(record.data(), &++timestamp, sizeof timestamp);
        platform().groups.clear();
        platform().takeLog();
        const auto expectedGroups = kind.rule == gesture ? groupsOf(record) : std::vector<fake::Platform::Group>{};
        platform().gestureNames.assign(expectedGroups.size(), std::nullopt);
        if (!expectedGroups.empty()) platform().gestureNames.back() = "LetterA ";

        EXPECT_EQ(dispatch(handle, record, misalignment), kind.rule(record));
        EXPECT_EQ(platform().groups, expectedGroups);
        EXPECT_EQ(closeSession(handle), kStopped);
      }
    }
  }
}

INSTANTIATE_TEST_SUITE_P(Of, RecordLengths, ::testing::ValuesIn(kKinds),
                         [](const auto& test) { return test.param.name; });

}  // namespace
}  // namespace api
