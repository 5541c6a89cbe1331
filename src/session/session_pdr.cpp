#include "session/session_pdr.h"

#include <cstring>

#include "session/record.h"

namespace senseloom {

int SessionPDR::postProcess(void* data, int len, void** out, int* outLen) {
  const auto record = recordBytes(data, len);
  if (record.size() < kHeaderSize) return -1;
  const int count = loadI16(record, kValueOffset);
  if (count < 0 || pendingCount + count > kMostItems) return -1;
  const auto added = static_cast<size_t>(count * kItemSize);
  if (record.size() < kHeaderSize + added) return -1;

  const auto result = work.bytes();
  const size_t end = kHeaderSize + static_cast<size_t>(pendingCount * kItemSize);
  std::memcpy(result.data() + end, record.data() + kHeaderSize, added);
  pendingCount += count;
  const int threshold = 1 << static_cast<const OptionPDR&>(*option).N();  // 0 to 6
  if (pendingCount < threshold) return 0;

  std::memcpy(result.data() + kTimestampOffset, record.data() + kTimestampOffset, kTimestampSize);
  storeU16(result, kValueOffset, static_cast<uint16_t>(pendingCount));
  pendingCount = 0;
  *out = result.data();
  *outLen = static_cast<int>(end + added);
  return 1;
}

}  // namespace senseloom
