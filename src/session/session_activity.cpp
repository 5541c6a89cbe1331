#include "session/session_activity.h"

#include <algorithm>
#include <cstring>

#include "bytes.h"
#include "session/context_sensor.h"
#include "session/record.h"

namespace senseloom {

SessionActivity::Chain SessionActivity::makeChain(std::span<uint8_t> batch) const {
  const Batch first(batch);
  const bool onChange = wanted.mode() == 1;
  if (wanted.summary() == 0) {
    const Decisions decisions(first, wanted.classMask());
    if (onChange) return ProcChange<Decisions, _activity_equal_func>(decisions);
    return decisions;
  }
  const Votes votes({first, ActivityVote(wanted.weightVar())}, wanted.classMask());
  if (onChange) return ProcChange<Votes, _activity_equal_func>(votes);
  return votes;
}

int SessionActivity::buildProc() {
  const ContextSensor* sensor = findSensor(name);
  if (sensor == nullptr || sensor->mergedOption == nullptr) return -1;
  const auto& merged = static_cast<const OptionActivity&>(*sensor->mergedOption);
  const auto exponent = static_cast<uint32_t>(wanted.logN() - merged.logM()) & 31U;
  const size_t size = ActivityDecision::kSize << exponent;
  if (size > memorySize) {
    auto* larger = new (std::nothrow) uint8_t[size];
    if (larger == nullptr) return -1;  // the old chain stays
    memory.reset(larger);
    memorySize = size;
  }
  chain = makeChain({memory.get(), size});
  proc = &chain;
  return 0;
}

int SessionActivity::postProcess(void* data, int len, void** out, int* outLen) noexcept {
  if (out == nullptr || data == nullptr || outLen == nullptr || len < 0) return -1;
  if (proc == nullptr) return passThrough(data, len, out, outLen);

  const auto record = recordBytes(data, len);
  if (!record.empty()) {  // an empty record repeats what is in `work`
    if (record.size() < kHeaderSize) return -1;
    const auto count = static_cast<size_t>(std::max<int>(loadI16(record, kValueOffset), 0));
    const size_t bytes = count * ActivityDecision::kSize;
    if (record.size() < kHeaderSize + bytes) return -1;
    std::memcpy(work.data(), record.data(), kHeaderSize);
    copyBytes<ActivityDecision::kSize>(work.data() + kHeaderSize, record.data() + kHeaderSize,
                                       std::min(bytes, work.size() - kHeaderSize));
  }
  // A batch takes at most as many decisions as `work` holds, however many are counted.
  const int count = loadI16(work, kValueOffset);
  return std::visit(
      [&](auto& shape) { return shape.accept(work.data() + kHeaderSize, count) ? deliver(shape, out, outLen) : 0; },
      chain);
}

template <class Shape>
int SessionActivity::deliver(Shape& shape, void** out, int* outLen) {
  const auto delivered = static_cast<size_t>(shape.length());
  const size_t bytes = delivered * ActivityDecision::kSize;
  storeU16(work, kValueOffset, static_cast<uint16_t>(delivered));
  copyBytes<ActivityDecision::kSize>(work.data() + kHeaderSize, shape.buffer(), bytes);
  *out = work.data();
  *outLen = static_cast<int>(kHeaderSize + bytes);
  shape.reset();
  return 1;
}

}  // namespace senseloom
