#include "session/session_pdr.h"

#include <cstring>

#include "session/record.h"

namespace senseloom {

int SessionPDR::postProcess(void* data, int len, void** out, int* outLen) noexcept {
  const auto record = recordBytes(data, len);
  if (record.size() < kHeaderSize) return -1;
  const int count = loadI16(record, kValueOffset);
  if (count < 0 || pendingCount + count > kMostItems) return -1;
  if (record.size() < kHeaderSize + static_cast<size_t>(count * kItemSize)) return -1;

  uint8_t* const end = work.data() + kHeaderSize + pendingCount * kItemSize;
  pendingCount += count;
  copyBytes<kItemSize>(end, record.data() + kHeaderSize, static_cast<size_t>(count * kItemSize));
  const auto threshold = static_cast<int32_t>(1U << (static_cast<uint32_t>(wanted.N()) & 31U));
  return pendingCount < threshold ? 0 : deliver(record, out, outLen);
}

int SessionPDR::deliver(std::span<const uint8_t> lastRecord, void** out, int* outLen) {
  const std::span<uint8_t> result = work;
  std::memcpy(result.data() + kTimestampOffset, lastRecord.data() + kTimestampOffset, kTimestampSize);
  storeU16(result, kValueOffset, static_cast<uint16_t>(pendingCount));
  *out = result.data();
  *outLen = static_cast<int>(kHeaderSize) + pendingCount * kItemSize;
  pendingCount = 0;
  return 1;
}

}  // namespace senseloom
