#pragma once

#include <sigc++/sigc++.h>

#include <boost/signals2.hpp>
#include <functional>
#include <memory>
#include <span>
#include <string>
#include <type_traits>
#include <unordered_map>
#include <utility>
#include <vector>

#include "client.h"
#include "contest.h"
#include "empty_call.h"
#include "records.h"

// The ways in which a sensor's records reach its clients. Each takes a set of records, one after the other, to all
// clients in the given order, which tells the clients' numbers.
namespace bench {

using Order = std::vector<size_t>;
Order openingOrder(size_t clients);
Order shuffledOrder(size_t clients);

using Dispatch = decltype(ctx_dispatch_data);

// By handle, through a function of the C interface. The option is the first client's; any others have their default.
template <Dispatch* dispatch, class Sink>
class ByHandle {
 public:
  ByHandle(const char* sensor, const char* option, const Order& order, Records& input, Sink& results)
      : clients(order.size(), sensor), records(input), sink(results) {
    clients[0].setOption(option);
    for (const size_t client : order) handles.push_back(clients[client].handle);
  }

  void operator()() {
    const auto to = std::span(handles);
    for (uint8_t* record = records.begin(); record != records.end(); record += records.size()) {
      for (void* const handle : to) {
        void* result;
        int length;
        if (dispatch(handle, record, records.size(), &result, &length) == 1) sink(result, length);
      }
    }
  }

 private:
  const Clients clients;
  std::vector<void*> handles;
  Records& records;
  Sink& sink;
};

// All further ways take the records to copies of a `Receiver`: a function object that takes a record, its size and a
// sink, and does what the library does for a session.

// Without any interface, to one client that is known at compile time.
template <class Receiver, class Sink>
class Inlined {
 public:
  Inlined(const Receiver& one, Records& input, Sink& results) : client(one), records(input), sink(results) {}

  void operator()() {
    Sink local = std::move(sink);  // in a register
    const int size = records.size();
    uint8_t* const end = records.end();
    for (uint8_t* record = records.begin(); record != end; record += size) client(record, size, local);
    sink = std::move(local);
  }

 private:
  Receiver client;
  Records& records;
  Sink& sink;
};

// A signal of the sensor, with a slot for each client.
template <class Signal, class Receiver, class Sink>
class BySignal {
 public:
  BySignal(const Receiver& one, const Order& order, Records& input, Sink& sink)
      : clients(order.size(), one), records(input) {
    for (const size_t client : order) {
      signal.connect([client = &clients[client], &sink](uint8_t* record, int size) { (*client)(record, size, sink); });
    }
  }

  void operator()() {
    for (uint8_t* record = records.begin(); record != records.end(); record += records.size()) {
      signal(record, records.size());
    }
  }

 private:
  std::vector<Receiver> clients;
  Signal signal;
  Records& records;
};
// Without its mutex, since nobody else needs one either.
using BoostSignal =
    boost::signals2::signal_type<void(uint8_t*, int),
                                 boost::signals2::keywords::mutex_type<boost::signals2::dummy_mutex>>::type;
using SigcSignal = sigc::signal<void, uint8_t*, int>;

// By handle, which a hash map knows the client's function by.
template <class Receiver, class Sink>
class ByHashMap {
 public:
  ByHashMap(const Receiver& one, const Order& order, Records& input, Sink& sink)
      : clients(order.size(), one), records(input) {
    for (Receiver& client : clients) {
      functions[&client] = [&client, &sink](uint8_t* record, int size) { client(record, size, sink); };
    }
    for (const size_t client : order) handles.push_back(&clients[client]);
  }

  void operator()() {
    for (uint8_t* record = records.begin(); record != records.end(); record += records.size()) {
      for (void* const handle : handles) {
        if (const auto found = functions.find(handle); found != functions.end()) found->second(record, records.size());
      }
    }
  }

 private:
  std::vector<Receiver> clients;
  std::unordered_map<void*, std::function<void(uint8_t*, int)>> functions;
  std::vector<void*> handles;
  Records& records;
};

template <class Sink>
using SinkOf = std::remove_reference_t<Sink>;

// Enters the library, and what an empty function costs in its place.
inline void enterLibrary(Contest& contest, const char* sensor, const std::string& option, const Order& order,
                         std::shared_ptr<Records> records) {
  contest.enter("senseloom", [=](auto& sink) {
    return ByHandle<ctx_dispatch_data, SinkOf<decltype(sink)>>(sensor, option.c_str(), order, *records, sink);
  });
  contest.enterFloor("empty call", [=](auto& sink) {
    return ByHandle<empty_call, SinkOf<decltype(sink)>>(sensor, option.c_str(), order, *records, sink);
  });
}

// Enters the libraries that call something for each record.
template <class Receiver>
void enterCalls(Contest& contest, const Receiver& receiver, const Order& order, std::shared_ptr<Records> records) {
  contest.enter("Boost.Signals2", [=](auto& sink) {
    return BySignal<BoostSignal, Receiver, SinkOf<decltype(sink)>>(receiver, order, *records, sink);
  });
  contest.enter("sigc++", [=](auto& sink) {
    return BySignal<SigcSignal, Receiver, SinkOf<decltype(sink)>>(receiver, order, *records, sink);
  });
  contest.enter("hash map", [=](auto& sink) {
    return ByHashMap<Receiver, SinkOf<decltype(sink)>>(receiver, order, *records, sink);
  });
}

}  // namespace bench
