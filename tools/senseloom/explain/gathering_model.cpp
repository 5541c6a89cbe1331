#include "explain/gathering_model.h"

#include <cstddef>
#include <utility>

#include "trace/record_field.h"

namespace senseloom::tool {
namespace {

constexpr int32_t kMostItems = 64;
constexpr size_t kItemSize = 28;

}  // namespace

Verdict GatheringModel::judge(const Wishes& wishes, std::span<const uint8_t> record, const std::vector<LogLine>&) {
  const auto count = recordField<int16_t>(record, kValueOffset);
  if (!count || *count < 0 || pending + *count > kMostItems) return {Fate::refused};
  if (record.size() < kElementsOffset + static_cast<size_t>(*count) * kItemSize) return {Fate::refused};
  pending += *count;
  const int32_t wanted = 1 << wishes.valueOf("N");
  if (pending < wanted) return {Fate::batchFilling, pending, wanted};
  return {Fate::delivered, std::exchange(pending, 0), wanted};
}

std::string GatheringModel::account() const {
  return pending == 0 ? "" : "items gathered and not delivered: " + std::to_string(pending);
}

}  // namespace senseloom::tool
