#pragma once

#include <pthread.h>

#include <atomic>
#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "call_line.h"
#include "carried_records.h"
#include "contract_watch.h"
#include "control.h"
#include "in_force.h"
#include "mutex.h"
#include "quick_sessions.h"
#include "senseloom.h"
#include "summary.h"
#include "trace/trace_form.h"
#include "trace/trace_line.h"
#include "trace_order.h"
#include "trace_writer.h"

namespace senseloom::trace {

// Makes the calls of the program and, while recording, writes them to a trace, one line each, when they have returned.
// Each call is recorded in two steps: its arguments before it is made, since they may be in memory that it changes, and
// then what it returned. Nothing is locked while the library runs, but for a moment when the gesture engine has
// answered. The release of a property list is recorded in one step, before it is made: from then on the memory of the
// list may be another one's.
//
// Sessions are named s1, s2 and so on, in the order of the calls that opened them. What a trace cannot express (an
// argument that is NULL, a handle that is not open, a sensor that does not exist) is written as a note, for readers
// only: the library refuses such calls and changes nothing, so a replay has the same outcome without them.
//
// Recording never makes a call fail: a line for which there is not enough memory counts as lost.
class Recorder {
 public:
  void* open(const char* sensor) noexcept;
  int setOption(void* handle, int32_t reserved, const char* option, ctx_option_t** out) noexcept;
  int dispatch(void* handle, void* data, int len, void** out, int* outlen) noexcept;
  int close(void* handle, ctx_option_t** out) noexcept;
  int32_t release(ctx_option_t* list) noexcept;
  void uninit() noexcept;

  // The platform's gesture engine has taken a group of samples, and recognised this name, or nothing: null.
  void engineAnswered(const char* name) noexcept;

  void atExit() noexcept;
  void beforeFork() { mutex.lock(); }
  void afterFork() { mutex.unlock(); }
  void inChild() noexcept;

 private:
  struct Session {
    uint32_t number;
    SessionCounts* counts;
  };
  // A call between its two steps.
  struct Call {
    tool::CallKind kind;
    tool::TraceLine line = {};
    bool isWhole = false;     // the line: there was memory for it
    bool isRecorded = false;  // a recording was going on when the call was made
    bool isNote = false;
    bool isAlone = false;    // no other thread was in the library: what it has handed out is still there
    bool hasResult = false;  // whether the arguments give the result a place to go
    Session session = {};    // zeros: none that is open
    int thread = 0;
    int64_t start = 0;
    int64_t end = 0;
  };

  // What the gesture engine answers during a dispatch.
  struct EngineAnswers {
    int thread = 0;  // of the dispatch; 0: none
    int groups = 0;
    bool isWhole = true;  // there was memory for the answers
    std::vector<tool::EngineAnswer> answers = {};
  };

  // What is done before and after a call.
  template <class Step>
  void step(Step&& work) noexcept;
  template <class Before, class Make, class After>
  auto pass(tool::CallKind kind, Before before, Make make, After after) noexcept;

  void prepare();
  void prepareChild();
  void obey(const std::string& order);
  bool start(const TraceOrder& order);
  void stop();

  void begin(Call& call);
  void beginOnSession(Call& call, const void* handle, bool hasArguments);
  void finish(Call& call);
  void addEngineAnswers(Call& call);
  void negotiated(Call& call, int returned, ctx_option_t** out);
  void released(const ctx_option_t* list);
  void tellState(std::string_view line);
  void tellStateAnew();

  void writeHead();
  void noteUnknownRecords();
  void note(const std::optional<Breach>& breach);
  int64_t sinceStart() const;
  int currentThread();

  Mutex mutex;
  bool isPrepared = false;
  bool isInChild = false;
  Control control;
  std::unordered_map<const void*, Session> sessions;  // by handle
  uint32_t lastSession = 0;
  InForce inForce;

  std::atomic<bool> isRecording = false;
  TraceOrder order;
  Summary summary;
  std::unique_ptr<TraceWriter> writer;  // there is one while it records
  CarriedRecords carried;
  EngineAnswers asked;  // of the dispatch that began last
  ContractWatch watch;
  int64_t startedAt = 0;  // wall-clock nanoseconds
  int64_t startTime = 0;  // monotonic nanoseconds

  std::vector<tool::TraceLine> spareLines;  // for their memory
  std::optional<pthread_key_t> threadKey;   // by which each thread has its number
};

// The one of this process. It is never destroyed: programs close sessions in destructors of their own, some of which
// run after those of this library.
Recorder& recorder();

}  // namespace senseloom::trace
