// Flick gestures: a record is delivered if the client asked for its class.
#include <range/v3/view/filter.hpp>
#include <range/v3/view/iota.hpp>
#include <range/v3/view/transform.hpp>

#include "contests.h"
#include "dispatch.h"

namespace bench {
namespace {

constexpr const char* kSensor = "GSFLK";
constexpr const char* kEveryOther = R"({"classMask": 21})";
constexpr uint32_t kEveryOtherMask = 21;
constexpr const char* kAll = R"({"classMask": 63})";
constexpr uint32_t kAllMask = 63;

bool isIn(uint32_t mask, const uint8_t* record) {
  return (mask >> (static_cast<uint32_t>(valueOf(record) - 1) & 31U) & 1U) != 0;
}

struct FlickClient {
  uint32_t mask;

  template <class Sink>
  void operator()(uint8_t* record, int size, Sink& sink) const {
    if (isIn(mask, record)) sink(record, size);
  }
};

template <uint32_t mask>
struct KnownFlickClient {
  template <class Sink>
  void operator()(uint8_t* record, int size, Sink& sink) const {
    if (isIn(mask, record)) sink(record, size);
  }
};

// Without any interface, to clients of which nothing but the masks is kept.
template <class Sink>
class OfMasks {
 public:
  OfMasks(uint32_t mask, const Order& order, Records& input, Sink& results)
      : masks(order.size(), mask), records(input), sink(results) {
    for (const size_t client : order) ordered.push_back(&masks[client]);
  }

  void operator()() {
    Sink local = std::move(sink);  // in a register
    constexpr int kSize = kHeaderSize;
    uint8_t* const end = records.end();
    for (uint8_t* record = records.begin(); record != end; record += kSize) {
      const uint32_t bit = static_cast<uint32_t>(valueOf(record) - 1) & 31U;
      for (const uint32_t* mask : ordered) {
        if ((*mask >> bit & 1U) != 0) local(record, kSize);
      }
    }
    sink = std::move(local);
  }

 private:
  const std::vector<uint32_t> masks;
  std::vector<const uint32_t*> ordered;
  Records& records;
  Sink& sink;
};

void filterContest(const char* title, Records (*input)()) {
  const auto records = std::make_shared<Records>(input());
  Contest contest(title, records->count());
  const Order one = openingOrder(1);
  enterLibrary(contest, kSensor, kEveryOther, one, records);
  contest.enter("limit", [=](auto& sink) {
    return Inlined<KnownFlickClient<kEveryOtherMask>, SinkOf<decltype(sink)>>({}, *records, sink);
  });
  enterCalls(contest, FlickClient{kEveryOtherMask}, one, records);
  contest.enter("range-v3", [=](auto& sink) {
    return [records, &sink] {
      auto wanted = ranges::views::iota(size_t{0}, records->count()) |
                    ranges::views::transform([&](size_t index) { return records->at(index); }) |
                    ranges::views::filter([](const uint8_t* record) { return isIn(kEveryOtherMask, record); });
      for (const uint8_t* record : wanted) sink(record, records->size());
    };
  });
}

void fanOutContest(const std::string& title, const Order& order) {
  // A few records, since each goes to many.
  const auto all = randomFlicks();
  const auto records = std::make_shared<Records>(16, static_cast<size_t>(all.size()));
  std::copy_n(Records(all).begin(), records->end() - records->begin(), records->begin());

  Contest contest(title, records->count() * order.size());
  enterLibrary(contest, kSensor, kAll, order, records);
  contest.enter("limit", [=](auto& sink) { return OfMasks<SinkOf<decltype(sink)>>(kAllMask, order, *records, sink); });
  enterCalls(contest, FlickClient{kAllMask}, order, records);
  contest.enter("range-v3", [=](auto& sink) {
    return [=, &sink, clients = std::vector<FlickClient>(order.size(), {kAllMask})] {
      for (size_t i = 0; i < records->count(); ++i) {
        uint8_t* const record = records->at(i);
        const auto wants = [&](size_t client) { return isIn(clients[client].mask, record); };
        for ([[maybe_unused]] const size_t client : order | ranges::views::filter(wants)) sink(record, records->size());
      }
    };
  });
}

}  // namespace

void filterContests() {
  filterContest("flick filter, classes in turn", inTurnFlicks);
  filterContest("flick filter, random classes", randomFlicks);
}

void fanOutContests() {
  for (const size_t clients : {1U, 10U, 100U, 1000U, 10000U}) {
    const auto title = "to " + std::to_string(clients) + " sessions, ";
    fanOutContest(title + "in order", openingOrder(clients));
    fanOutContest(title + "shuffled", shuffledOrder(clients));
  }
}

}  // namespace bench
