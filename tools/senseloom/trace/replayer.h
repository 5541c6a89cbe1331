#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <span>
#include <string>
#include <vector>

#include "senseloom.hpp"
#include "trace/trace_reader.h"

namespace senseloom::tool {

// One entry of a property list, copied.
struct Property {
  int32_t id;
  std::vector<uint8_t> value;
  bool isBytes = false;  // such as a gesture template; all other properties are integers

  // Nothing if it is not an integer.
  std::optional<int32_t> integer() const;
};
using PropertyList = std::vector<Property>;

// The outcome of a call for one session. It refers to the replayer's own data, which the next call changes.
struct CallOutcome {
  const TraceCall& call;                                  // line 0: the closing of a session that the trace left open
  const std::string& session;                             // empty for uninit
  const Sensor* sensor = nullptr;                         // null for uninit
  bool failed = false;                                    // the library returned -1 or, for an open, a null pointer
  int returned = 0;                                       // 0 for open and uninit, which return no int
  std::optional<PropertyList> properties = std::nullopt;  // the list that the library handed out, if it did
  std::optional<std::span<const uint8_t>> result = std::nullopt;  // of a dispatch that returned 1
  std::span<const uint8_t> record = {};                           // of a dispatch
};

class ReplayObserver {
 public:
  virtual ~ReplayObserver() = default;
  virtual void onOutcome(const CallOutcome& outcome) = 0;
  // A line of the trace with a note in place of a call.
  virtual void onNote(size_t /*line*/, const std::string& /*text*/) {}
  // The trace was replayed to its end.
  virtual void onEnd() {}
};

// Makes the calls of a trace, through the library's C interface, and reports the outcome of each to an observer. Where
// the trace has what the platform's gesture engine answered, the library is answered the same.
//
// A session that failed to open keeps its name, with a null pointer as its handle: calls that name it are made, and
// fail. It is not on its sensor, so a dispatch to the whole sensor leaves it out, and its name may be opened again.
class Replayer {
 public:
  explicit Replayer(ReplayObserver& listener) : observer(listener) {}
  // Closes the sessions that are open, without reporting it.
  ~Replayer() = default;
  Replayer(const Replayer&) = delete;
  Replayer& operator=(const Replayer&) = delete;

  // Makes all calls of a trace, then closes the sessions that it left open, in opening order. Throws InputError, with
  // the position in the trace, at the first line that is not a call or does not suit the calls before it.
  void replay(TraceReader& trace);

  // Makes one call. Throws InputError when it does not suit the calls before it.
  void perform(const TraceCall& call);

 private:
  struct Client {
    std::string name;
    const Sensor* sensor;
    Session session;
  };
  using ClientIterator = std::vector<Client>::iterator;

  void open(const TraceCall& call);
  void setOption(const TraceCall& call, Client& client);
  void dispatch(const TraceCall& call, Client& client, std::span<const uint8_t> record);
  void dispatchToSensor(const TraceCall& call);
  void close(const TraceCall& call, ClientIterator client);

  ClientIterator find(const std::string& name);
  ClientIterator require(const std::string& name);

  ReplayObserver& observer;
  std::vector<Client> clients;  // in opening order
};

}  // namespace senseloom::tool
