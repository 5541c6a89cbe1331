// Dead reckoning: the items of 64 records are delivered as one result, under the header of the last record.
#include <array>
#include <range/v3/view/chunk.hpp>
#include <range/v3/view/iota.hpp>

#include "contests.h"
#include "dispatch.h"

namespace bench {
namespace {

constexpr int kItems = 64;

// Room for a result, and how many items are in it.
struct KnownCollector {
  std::array<uint8_t, kHeaderSize + kItems * kDeadReckoningItem> result;
  int16_t items = 0;

  template <class Sink>
  void operator()(const uint8_t* record, int /*size*/, Sink& sink) {
    std::memcpy(result.data() + kHeaderSize + static_cast<size_t>(items) * kDeadReckoningItem, record + kHeaderSize,
                kDeadReckoningItem);
    if (++items < kItems) return;
    std::memcpy(result.data(), record, kTimestampSize);
    std::memcpy(result.data() + kValueOffset, &items, sizeof items);
    items = 0;
    sink(result.data(), static_cast<int>(result.size()));
  }
};

class Collector {
 public:
  explicit Collector(int threshold) : least(threshold) {}

  template <class Sink>
  void operator()(const uint8_t* record, int size, Sink& sink) {
    result.insert(result.end(), record + kHeaderSize, record + size);
    items = static_cast<int16_t>(items + valueOf(record));
    if (items < least) return;
    std::memcpy(result.data(), record, kTimestampSize);
    std::memcpy(result.data() + kValueOffset, &items, sizeof items);
    sink(result.data(), static_cast<int>(result.size()));
    result.resize(kHeaderSize);
    items = 0;
  }

 private:
  int least;
  std::vector<uint8_t> result = std::vector<uint8_t>(kHeaderSize);
  int16_t items = 0;
};

}  // namespace

void deadReckoningContest() {
  const auto records = std::make_shared<Records>(deadReckonings());
  const Order one = openingOrder(1);
  Contest contest("dead reckoning, N 6", records->count());
  enterLibrary(contest, "PDR", R"({"N": 6})", one, records);
  contest.enter("limit",
                [=](auto& sink) { return Inlined<KnownCollector, SinkOf<decltype(sink)>>({}, *records, sink); });
  enterCalls(contest, Collector(kItems), one, records);
  contest.enter("range-v3", [=](auto& sink) {
    return [records, &sink] {
      namespace views = ranges::views;
      std::vector<uint8_t> result;
      for (auto batch : views::iota(size_t{0}, records->count()) | views::chunk(kItems)) {
        const auto last = static_cast<size_t>(*ranges::prev(ranges::end(batch)));
        const auto items = static_cast<int16_t>(ranges::distance(batch));
        result.assign(records->at(last), records->at(last) + kValueOffset);
        result.resize(kHeaderSize);
        std::memcpy(result.data() + kValueOffset, &items, sizeof items);
        for (const size_t index : batch) {
          const auto item = std::span(records->at(index), static_cast<size_t>(records->size())).subspan(kHeaderSize);
          result.insert(result.end(), item.begin(), item.end());
        }
        sink(result.data(), static_cast<int>(result.size()));
      }
    };
  });
}

}  // namespace bench
