#include "session/session_activity.h"

#include <algorithm>
#include <cstring>
#include <new>

#include "bytes.h"
#include "session/context_sensor.h"
#include "session/record.h"

namespace senseloom {

void SessionActivity::makeChain(std::span<uint8_t> batch) {
  const int mask = wanted.classMask();
  const ActivityVote vote(wanted.weightVar());
  if (wanted.mode() == 1) {
    shape = wanted.summary() == 0 ? Shape::changedDecisions : Shape::changedVotes;
  } else {
    shape = wanted.summary() == 0 ? Shape::decisions : Shape::votes;
  }
  switch (shape) {  // not covered: that no case fits, since each shape has one
    case Shape::decisions:
      new (&chain.decisions) Decisions(mask, batch);
      break;
    case Shape::changedDecisions:
      new (&chain.changedDecisions) ChangedDecisions(mask, batch);
      break;
    case Shape::votes:
      new (&chain.votes) Votes(mask, vote, batch);
      break;
    case Shape::changedVotes:
      new (&chain.changedVotes) ChangedVotes(mask, vote, batch);
      break;
  }
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
  makeChain({memory.get(), size});
  proc = &chain;
  return 0;
}

int SessionActivity::postProcess(void* data, int len, void** out, int* outLen) noexcept {
  if (out == nullptr || data == nullptr || outLen == nullptr || len < 0) return -1;
  if (proc == nullptr) return passThrough(data, len, out, outLen);

  const auto record = recordBytes(data, len);
  if (record.empty()) return repeat(out, outLen);
  if (record.size() < kHeaderSize) return -1;
  const int16_t count = loadI16(record, kValueOffset);
  const size_t bytes = static_cast<size_t>(std::max<int>(count, 0)) * ActivityDecision::kSize;
  if (record.size() < kHeaderSize + bytes) return -1;

  const uint8_t* const decisions = record.data() + kHeaderSize;
  std::memcpy(work.data() + kTimestampOffset, record.data() + kTimestampOffset, kTimestampSize);
  if (offer(decisions, count, out, outLen) == 1) return 1;
  storeU16(work, kValueOffset, static_cast<uint16_t>(count));
  copyBytes<ActivityDecision::kSize>(work.data() + kHeaderSize, decisions, std::min(bytes, work.size() - kHeaderSize));
  return 0;
}

int SessionActivity::repeat(void** out, int* outLen) {
  return offer(work.data() + kHeaderSize, loadI16(work, kValueOffset), out, outLen);
}

// A batch takes at most as many decisions as `work` holds, however many are counted.
inline int SessionActivity::offer(const uint8_t* decisions, int count, void** out, int* outLen) {
  const auto offerTo = [&](auto& last) { return last.accept(decisions, count) ? deliver(last, out, outLen) : 0; };
  if (shape == Shape::votes) return offerTo(chain.votes);
  if (shape == Shape::changedVotes) return offerTo(chain.changedVotes);
  return shape == Shape::decisions ? offerTo(chain.decisions) : offerTo(chain.changedDecisions);
}

template <class Last>
int SessionActivity::deliver(Last& last, void** out, int* outLen) {
  const auto delivered = static_cast<size_t>(last.length());
  const size_t bytes = delivered * ActivityDecision::kSize;
  storeU16(work, kValueOffset, static_cast<uint16_t>(delivered));
  copyBytes<ActivityDecision::kSize>(work.data() + kHeaderSize, last.buffer(), bytes);
  *out = work.data();
  *outLen = static_cast<int>(kHeaderSize + bytes);
  last.reset();
  return 1;
}

}  // namespace senseloom
