#include "session/session_gesture_hmm.h"

#include <android/log.h>
#include <gesture.h>

#include <algorithm>
#include <array>
#include <cstring>
#include <memory>

#include "session/record.h"

namespace senseloom {
namespace {

constexpr size_t kSizeOffset = 10;     // uint16_t: bytes of samples that follow
constexpr size_t kSamplesOffset = 12;  // groups of six int16_t
constexpr size_t kGroupValues = 6;
constexpr size_t kGroupSize = kGroupValues * sizeof(int16_t);
constexpr size_t kLeastBytes = kSamplesOffset + kGroupSize;

// Class number - 1 is the index. The engine's names end in a blank and are compared with it, on purpose.
constexpr std::array<const char*, 16> classNames = {
    "NumberOne ",   "NumberTwo ",   "NumberThree ", "NumberFour ", "NumberFive ", "NumberSix ",
    "NumberSeven ", "NumberEight ", "NumberNine ",  "NumberZero ", "LetterA ",    "LetterB ",
    "LetterC ",     "LetterD ",     "LetterE ",     "LetterF ",
};

// Shared by all gesture sessions. The last two outlive the engine on purpose: a new engine does not see a record again
// that an old one was fed, and a first record with timestamp 0 counts as fed.
int32_t session_num = 0;
uint64_t ts = 0;               // timestamp of the last record fed to the engine
uint16_t current_gesture = 0;  // class number found in it; 0: none

// The class of a recognised name; 0 if no class has that name.
uint16_t classOf(const char* name) {
  for (size_t i = 0; i < classNames.size(); ++i) {
    if (std::strcmp(name, classNames[i]) == 0) return static_cast<uint16_t>(i + 1);
  }
  return 0;
}

// Feeds a record's samples, group by group, and leaves the class found in `current_gesture`.
void recognise(std::span<const uint8_t> record) {
  const int prx = loadI16(record, kValueOffset);
  const size_t size = loadU16(record, kSizeOffset);
  bool last = false;
  for (size_t k = 0; !last; ++k) {
    last = size <= kGroupSize * (k + 1);
    // A group that the record holds only in part is completed with zeros.
    const auto rest = record.subspan(kSamplesOffset + kGroupSize * k);
    std::array<int16_t, kGroupValues> group{};
    std::memcpy(group.data(), rest.data(), std::min(rest.size(), kGroupSize));
    if (last) {
      __android_log_print(ANDROID_LOG_DEBUG, kLogTag, "num %d: %hd %hd %hd %hd %hd %hd: last %d, size %d, prx %d\n",
                          static_cast<int>(k), group[0], group[1], group[2], group[3], group[4], group[5], 1,
                          static_cast<int>(size), prx);
    }
    const std::unique_ptr<char[]> name(gesture_process_single_data(group.data(), 1, last));
    if (name == nullptr) continue;
    __android_log_print(ANDROID_LOG_DEBUG, kLogTag, "-- gesture: %s", name.get());
    if (const uint16_t found = classOf(name.get()); prx == 0 && found != 0) current_gesture = found;
  }
}

}  // namespace

SessionGestureHMM::SessionGestureHMM() {
  if (++session_num == 1 && !gesture_initial(0, 0)) {
    __android_log_print(ANDROID_LOG_ERROR, kLogTag, "hmm gesture algorithm start return false");
  }
}

SessionGestureHMM::~SessionGestureHMM() {
  if (--session_num == 0) gesture_close();
}

int SessionGestureHMM::postProcess(void* data, int len, void** out, int* outLen) noexcept {
  const auto record = recordBytes(data, len);
  if (record.size() < kLeastBytes || record.size() > kMostBytes) return -1;
  if (record.size() < kSamplesOffset + loadU16(record, kSizeOffset)) return -1;

  if (const uint64_t timestamp = loadU64(record, kTimestampOffset); timestamp != ts) {
    ts = timestamp;
    current_gesture = 0;
    recognise(record);
  }
  // No gesture is class 0, which stands for bit 31: no mask that a client can set has it.
  if (!bitAt(wanted.classMask(), current_gesture - 1)) return 0;

  const std::span<uint8_t> result = work;
  std::memcpy(result.data(), record.data(), record.size());
  storeU16(result, kValueOffset, current_gesture);
  *out = result.data();
  *outLen = len;
  return 1;
}

}  // namespace senseloom
