// Options: one client of the activity sensor changes its requests, those of all are merged, every client starts over,
// and the merged settings are delivered as properties.
#include <jansson.h>
#include <sigc++/sigc++.h>

#include <algorithm>
#include <array>
#include <boost/signals2.hpp>
#include <charconv>
#include <functional>
#include <iterator>
#include <memory>
#include <range/v3/algorithm/for_each.hpp>
#include <range/v3/numeric/accumulate.hpp>
#include <range/v3/view/transform.hpp>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "contest.h"
#include "contests.h"
#include "dispatch.h"
#include "empty_call.h"

namespace bench {
namespace {

// Set in turn, so that each changes something.
constexpr const char* kTexts[] = {
    R"({"mode": 1, "logN": 3, "logM": 1, "classMask": 15, "summary": 1, "weightVar": 2, "continuous": 0})",
    R"({"mode": 0, "logN": 2, "logM": 0, "classMask": 48, "summary": 1, "weightVar": 1, "continuous": 1})",
};

struct Requests {
  int mode = 0;
  int logN = 0;
  int logM = 0;
  int classMask = -1;
  int summary = 1;
  int weightVar = -1;
  int continuous = 0;
  int largestLogN = 0;

  void merge(const Requests& other) {
    largestLogN = std::max(largestLogN, other.logN);
    mode = mode == 1 && other.mode == 1 && logN == other.logN ? 1 : 0;
    logN = std::min(logN, other.logN);
    logM = std::min(logM, other.logM);
    classMask |= other.classMask;
    continuous |= other.continuous;
  }
};

struct Property {
  int id;
  int value;
};
using Properties = std::array<Property, 4>;

Properties propertiesOf(const Requests& merged) {
  return {{
      {41, merged.mode},
      {43, (1 << merged.largestLogN) << 16 | 1 << merged.logN},
      {44, (1 << merged.logN) >> merged.logM},
      {42, merged.classMask},
  }};
}

template <class List, class Sink>
void deliver(const List& properties, Sink& sink) {
  sink(properties.data(), static_cast<int>(properties.size() * sizeof properties[0]));
}

// Through the C interface.
template <class Sink>
class OptionsOfLibrary {
 public:
  OptionsOfLibrary(size_t count, Sink& results) : clients(count, "PHYAC"), sink(results) {}

  void operator()() {
    for (const char* text : kTexts) {
      ctx_option_t* list = nullptr;
      require(ctx_set_option(clients[0].handle, 0, text, &list) == 0, "an option was refused");
      Properties properties;
      for (size_t i = 0; i < properties.size(); ++i) {
        properties[i] = {list->properties[i].id, *static_cast<const int32_t*>(list->properties[i].value)};
      }
      ctx_option_release(list);
      deliver(properties, sink);
    }
  }

 private:
  const Clients clients;
  Sink& sink;
};

// Without any interface: reads texts of the one form that there is, and keeps nothing but what differs.
template <class Sink>
class OptionsInlined {
 public:
  OptionsInlined(size_t count, Sink& results) : requests(count), gathered(count), sink(results) {}

  void operator()() {
    for (const char* text : kTexts) {
      requests.front() = read(text);
      Requests merged = requests.front();
      for (const Requests& each : requests) merged.merge(each);
      std::fill(gathered.begin(), gathered.end(), 0);
      deliver(propertiesOf(merged), sink);
    }
  }

 private:
  static Requests read(std::string_view text) {
    Requests result;
    const char* next = text.data();
    for (int* value : {&result.mode, &result.logN, &result.logM, &result.classMask, &result.summary, &result.weightVar,
                       &result.continuous}) {
      while (*next++ != ':') {
      }
      next = std::from_chars(next + 1, text.data() + text.size(), *value).ptr;
    }
    result.largestLogN = result.logN;
    return result;
  }

  std::vector<Requests> requests;
  std::vector<int> gathered;  // decisions of the batch that each client is gathering
  Sink& sink;
};

using Json = std::unique_ptr<json_t, decltype(&json_decref)>;
Json parsed(const char* text) {
  return {json_loads(text, 0, nullptr), json_decref};
}

// A client of the ways below.
struct OptionClient {
  Requests requests;
  std::vector<int> batch;

  void setWishes(const char* text) {
    const Json root = parsed(text);
    const auto read = [&](const char* key, int missing, int low, int high) {
      const json_t* value = json_object_get(root.get(), key);
      return std::clamp(json_is_integer(value) ? static_cast<int>(json_integer_value(value)) : missing, low, high);
    };
    requests.mode = read("mode", 0, 0, 1);
    requests.logN = read("logN", 0, 0, 8);
    requests.logM = read("logM", 0, 0, requests.logN);
    requests.classMask = read("classMask", -1, -1, 255);
    requests.summary = read("summary", 1, 0, 1);
    requests.weightVar = read("weightVar", -1, -1, 31);
    requests.continuous = read("continuous", 0, 0, 1);
    requests.largestLogN = requests.logN;
  }

  void startOver(const Requests& merged) {
    batch.clear();
    batch.reserve(size_t{1} << (requests.logN - merged.logM));
  }
};

// What combines the answers of a signal's slots, each the requests of a client.
struct Merging {
  using result_type = Requests;
  template <class Iterator>
  Requests operator()(Iterator first, Iterator last) const {
    Requests merged = **first;
    for (; first != last; ++first) merged.merge(**first);
    return merged;
  }
};

template <class AskSignal, class TellSignal, class Sink>
class OptionsBySignal {
 public:
  OptionsBySignal(size_t count, Sink& results) : clients(count), sink(results) {
    for (OptionClient& client : clients) {
      ask.connect([&client]() -> const Requests* { return &client.requests; });
      tell.connect([&client](const Requests& merged) { client.startOver(merged); });
    }
  }

  void operator()() {
    for (const char* text : kTexts) {
      clients.front().setWishes(text);
      const Requests merged = ask();
      tell(merged);
      const auto list = propertiesOf(merged);
      deliver(std::vector(list.begin(), list.end()), sink);
    }
  }

 private:
  std::vector<OptionClient> clients;
  AskSignal ask;
  TellSignal tell;
  Sink& sink;
};

namespace signals = boost::signals2;
using BoostAsk = signals::signal_type<const Requests*(), signals::keywords::combiner_type<Merging>,
                                      signals::keywords::mutex_type<signals::dummy_mutex>>::type;
using BoostTell =
    signals::signal_type<void(const Requests&), signals::keywords::mutex_type<signals::dummy_mutex>>::type;
using SigcAsk = sigc::signal<const Requests*>::accumulated<Merging>;
using SigcTell = sigc::signal<void, const Requests&>;

template <class Sink>
class OptionsByHashMap {
 public:
  OptionsByHashMap(size_t count, Sink& results) : clients(count), sink(results) {
    for (OptionClient& client : clients) {
      functions[&client] = {
          [&client](const char* text) { client.setWishes(text); },
          [&client]() -> const Requests& { return client.requests; },
          [&client](const Requests& merged) { client.startOver(merged); },
      };
    }
  }

  void operator()() {
    for (const char* text : kTexts) {
      const auto found = functions.find(&clients.front());
      if (found == functions.end()) continue;
      found->second.set(text);
      Requests merged = found->second.ask();
      for (const auto& [handle, client] : functions) merged.merge(client.ask());
      for (const auto& [handle, client] : functions) client.tell(merged);
      const auto list = propertiesOf(merged);
      deliver(std::vector(list.begin(), list.end()), sink);
    }
  }

 private:
  struct Functions {
    std::function<void(const char*)> set;
    std::function<const Requests&()> ask;
    std::function<void(const Requests&)> tell;
  };

  std::vector<OptionClient> clients;
  std::unordered_map<void*, Functions> functions;
  Sink& sink;
};

template <class Sink>
class OptionsByRanges {
 public:
  OptionsByRanges(size_t count, Sink& results) : clients(count), sink(results) {}

  void operator()() {
    for (const char* text : kTexts) {
      clients.front().setWishes(text);
      const auto merged = ranges::accumulate(clients | ranges::views::transform(&OptionClient::requests),
                                             clients.front().requests, [](Requests all, const Requests& each) {
                                               all.merge(each);
                                               return all;
                                             });
      ranges::for_each(clients, [&](OptionClient& client) { client.startOver(merged); });
      const auto list = propertiesOf(merged);
      deliver(std::vector(list.begin(), list.end()), sink);
    }
  }

 private:
  std::vector<OptionClient> clients;
  Sink& sink;
};

void optionContest(size_t clients) {
  Contest contest("set option, " + std::to_string(clients) + (clients == 1 ? " session" : " sessions"),
                  std::size(kTexts));
  contest.enter("senseloom", [=](auto& sink) { return OptionsOfLibrary<SinkOf<decltype(sink)>>(clients, sink); });
  contest.enterFloor("empty call", [](auto&) {
    return [] {
      for (const char* text : kTexts) {
        void* list = nullptr;
        int length = 0;
        empty_call(nullptr, const_cast<char*>(text), 0, &list, &length);
      }
    };
  });
  contest.enterFloor("jansson alone", [](auto&) {
    return [] {
      for (const char* text : kTexts) require(parsed(text) != nullptr, "an option could not be read");
    };
  });
  contest.enter("limit", [=](auto& sink) { return OptionsInlined<SinkOf<decltype(sink)>>(clients, sink); });
  contest.enter("Boost.Signals2", [=](auto& sink) {
    return OptionsBySignal<BoostAsk, BoostTell, SinkOf<decltype(sink)>>(clients, sink);
  });
  contest.enter("sigc++",
                [=](auto& sink) { return OptionsBySignal<SigcAsk, SigcTell, SinkOf<decltype(sink)>>(clients, sink); });
  contest.enter("hash map", [=](auto& sink) { return OptionsByHashMap<SinkOf<decltype(sink)>>(clients, sink); });
  contest.enter("range-v3", [=](auto& sink) { return OptionsByRanges<SinkOf<decltype(sink)>>(clients, sink); });
}

}  // namespace

void optionContests() {
  for (const size_t clients : {1U, 10U, 100U, 1000U}) optionContest(clients);
}

}  // namespace bench
