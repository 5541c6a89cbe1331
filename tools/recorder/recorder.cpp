#include "recorder.h"

#include <android/log.h>
#include <sys/syscall.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstddef>
#include <cstdlib>
#include <ctime>
#include <new>
#include <utility>

#include "library.h"
#include "start_order.h"

namespace senseloom::trace {

using tool::CallKind;
using tool::callName;
using tool::TraceLine;
namespace member = tool::member;

namespace {

constexpr char kTag[] = "senseloom-trace";
constexpr std::string_view kRecordOrder = "record ";

int64_t nanoseconds(clockid_t clock) {
  timespec now{};
  clock_gettime(clock, &now);
  return int64_t{now.tv_sec} * 1'000'000'000 + now.tv_nsec;
}

}  // namespace

// Does a step under the lock, and leaves errno as it was. What is to be logged is logged without the lock, since a
// logger may call the library.
template <class Step>
void Recorder::step(Step&& work) noexcept {
  const int error = errno;
  std::string warning;
  {
    const Lock lock(mutex);
    try {
      work();
    } catch (...) {  // there is nothing to catch but a failed allocation
      if (writer != nullptr) writer->lose("out of memory");
    }
    if (writer != nullptr) warning = writer->takeWarning();
  }
  if (!warning.empty()) __android_log_print(ANDROID_LOG_WARN, kTag, "%s", warning.c_str());
  errno = error;
}

// Makes a call between its two steps.
template <class Before, class Make, class After>
auto Recorder::pass(CallKind kind, Before before, Make make, After after) noexcept {
  Call call{.kind = kind};
  step([&] {
    begin(call);
    before(call);
    call.isWhole = true;
    note(watch.entered(call.thread, callName(kind)));
  });
  call.start = nanoseconds(CLOCK_MONOTONIC);
  const auto returned = make();
  call.end = nanoseconds(CLOCK_MONOTONIC);
  step([&] {
    call.isAlone = watch.left(call.thread);
    after(call, returned);
    finish(call);
  });
  return returned;
}

void* Recorder::open(const char* sensor) noexcept {
  return pass(
      CallKind::open, [](Call&) {}, [=] { return library().openSession(sensor); },
      [=, this](Call& call, void* handle) {
        TraceLine& line = call.line;
        if (library().getSensor(sensor) != nullptr) {
          call.session.number = ++lastSession;
          line.addText(member::kCall, callName(call.kind));
          line.addText(member::kSession, sessionName(call.session.number));
        } else {
          call.isNote = true;
          line.addText(member::kNote, "open of a sensor that does not exist");
        }
        if (sensor != nullptr) {
          line.addText(member::kSensor, sensor);
        } else {
          line.addNull(member::kSensor);
        }
        line.addOpened(handle != nullptr);
        if (handle == nullptr || call.isNote) return;
        call.session.counts = control.countsFor(call.session.number);
        sessions[handle] = call.session;
        inForce.opened(call.session.number, sensor);
        carried.opened(call.session.number);
        watch.opened(handle);
      });
}

int Recorder::setOption(void* handle, int32_t reserved, const char* option, ctx_option_t** out) noexcept {
  return pass(
      CallKind::setOption,
      [=, this](Call& call) {
        beginOnSession(call, handle, out != nullptr);
        if (!call.hasResult) return;
        if (option != nullptr) {
          call.line.addText(member::kOption, option);
        } else {
          call.line.addNull(member::kOption);
          call.hasResult = false;
        }
      },
      [=] { return library().setOption(handle, reserved, option, out); },
      [=, this](Call& call, int returned) {
        negotiated(call, returned, out);
        if (call.hasResult) inForce.optionSet(call.session.number, option, returned == 0);
        if (call.hasResult && returned == 0) carried.restarted(inForce.sessionsBeside(call.session.number));
      });
}

int Recorder::dispatch(void* handle, void* data, int len, void** out, int* outlen) noexcept {
  return pass(
      CallKind::dispatch,
      [=, this](Call& call) {
        beginOnSession(call, handle, data != nullptr && len >= 0 && out != nullptr && outlen != nullptr);
        if (!call.isRecorded || !call.hasResult) return;
        note(watch.recordGiven(data, len, call.thread));
        watch.resultEnded(call.session.number);
        call.line.addBytes(member::kRecord, {static_cast<const uint8_t*>(data), static_cast<size_t>(len)});
        asked = {.thread = call.thread};
      },
      [=] { return library().dispatchData(handle, data, len, out, outlen); },
      [=, this](Call& call, int returned) {
        const bool gaveResult = call.hasResult && returned == 1;
        if (call.session.number != 0) QuickSessions::count(*call.session.counts, gaveResult);
        if (!isRecording && call.session.number != 0) gQuickSessions.set(handle, call.session.counts);
        if (!call.isRecorded) return;
        addEngineAnswers(call);
        if (call.hasResult && (order.maxSize != 0 || order.followForks)) {
          carried.dispatched(call.session.number, std::string(call.line.text()) + "}\n", gaveResult);
        }
        if (!call.isAlone) return;
        call.line.addReturned(returned);
        if (!gaveResult) return;
        call.line.addBytes(member::kResult, {static_cast<const uint8_t*>(*out), static_cast<size_t>(*outlen)});
        watch.resultGiven(call.session.number, *out, *outlen, data, call.thread);
      });
}

void Recorder::engineAnswered(const char* name) noexcept {
  if (!isRecording) return;
  step([=, this] {
    if (asked.thread != currentThread()) return;  // somebody else's samples
    const int group = asked.groups++;
    if (name == nullptr || !std::exchange(asked.isWhole, false)) return;  // stays so if there is no memory
    asked.answers.push_back({.group = group, .name = name});
    asked.isWhole = true;
  });
}

int Recorder::close(void* handle, ctx_option_t** out) noexcept {
  return pass(
      CallKind::close, [=, this](Call& call) { beginOnSession(call, handle, out != nullptr); },
      [=] { return library().closeSession(handle, out); },
      [=, this](Call& call, int returned) {
        // The session is gone, whatever was returned.
        if (call.hasResult) {
          const uint32_t number = call.session.number;
          if (returned == 1) carried.restarted(inForce.sessionsBeside(number));
          sessions.erase(handle);
          gQuickSessions.forget(handle);
          carried.closed(number);
          watch.closed(handle, number, call.thread);
          control.forget(call.session.counts);
          negotiated(call, returned, out);
          inForce.closed(number, returned == 1);
        } else {
          negotiated(call, returned, out);
        }
      });
}

int32_t Recorder::release(ctx_option_t* list) noexcept {
  step([=, this] { released(list); });
  return library().optionRelease(list);
}

void Recorder::uninit() noexcept {
  pass(
      CallKind::uninit, [](Call&) {},
      [] {
        library().uninit();
        return 0;
      },
      [this](Call& call, int /*returned*/) {
        call.line.addText(member::kCall, callName(call.kind));
        inForce.uninitialised();
      });
}

void Recorder::atExit() noexcept {
  step([this] {
    if (writer == nullptr || isInChild) return;
    writer->end();
    if (const uint64_t missing = writer->missingAtEnd(); missing != 0) {
      __android_log_print(ANDROID_LOG_WARN, kTag, "lines missing at the end of the trace: %llu",
                          static_cast<unsigned long long>(missing));
    }
  });
}

Recorder& recorder() {
  alignas(Recorder) static std::byte storage[sizeof(Recorder)];
  static Recorder* const instance = new (storage) Recorder;
  return *instance;
}

// Only the thread that forked is left, and it holds the lock. What is shared with the parent must not be used.
void Recorder::inChild() noexcept {
  isInChild = true;
  isPrepared = false;
  if (threadKey) pthread_setspecific(*threadKey, nullptr);
  gQuickSessions.forgetAll();
  control.abandon();
  if (writer != nullptr) writer->abandon();
  mutex.unlock();
}

void Recorder::prepare() {
  isPrepared = true;
  control.open();
  if (isInChild) return prepareChild();
  if (pthread_key_t key; pthread_key_create(&key, nullptr) == 0) threadKey = key;
  pthread_atfork([] { recorder().beforeFork(); }, [] { recorder().afterFork(); }, [] { recorder().inChild(); });
  const auto given = readOrder(startOrder());
  if (!given) return;
  summary.connect(given->summary);
  start(*given);
}

// The child has the sessions of its parent. Their recording goes on in a file of its own, if it is to.
void Recorder::prepareChild() {
  isInChild = false;
  watch.inChild();
  for (auto& [handle, session] : sessions) session.counts = control.countsFor(session.number);
  const bool goesOn = isRecording && order.followForks;
  isRecording = false;
  writer.reset();
  tellStateAnew();
  if (goesOn) start(TraceOrder(order));
}

// An order names what the process is to do from now on: "off", or "record" and how.
void Recorder::obey(const std::string& text) {
  if (text == "off") {
    stop();
    return control.answer("ok: off");
  }
  const auto given = text.rfind(kRecordOrder, 0) == 0 ? readOrder(text.substr(kRecordOrder.size())) : std::nullopt;
  if (!given) return control.answer("no: neither \"off\" nor \"record FILE\"");
  if (isRecording) return control.answer("no: it is being recorded in " + writer->file());
  summary.connect(given->summary);
  noteUnknownRecords();
  if (start(*given)) return control.answer("ok: recording in " + writer->file());
  const std::string trouble = writer->file() + ": " + writer->trouble();
  stop();
  control.answer("no: " + trouble);
}

// Lines are counted as lost if the file cannot be opened.
bool Recorder::start(const TraceOrder& given) {
  order = given;
  writer = std::make_unique<TraceWriter>(order, summary);
  startedAt = nanoseconds(CLOCK_REALTIME);
  startTime = nanoseconds(CLOCK_MONOTONIC);
  isRecording = true;
  watch.tellAnew();
  gQuickSessions.forgetAll();
  const bool isOpen = writer->trouble() == nullptr;
  if (isOpen) writeHead();
  control.setRecording(true);
  return isOpen;
}

void Recorder::stop() {
  if (writer != nullptr) writer->end();
  writer.reset();
  isRecording = false;
  control.setRecording(false);
}

// Before the recording only the number of a session's records was noted.
void Recorder::noteUnknownRecords() {
  for (const auto& [handle, session] : sessions) {
    if (session.counts->records == 0) {
      carried.opened(session.number);
    } else {
      carried.found(session.number);
    }
  }
}

void Recorder::begin(Call& call) {
  if (!isPrepared) prepare();
  if (gBell.isRung()) {
    if (const auto text = control.takeOrder()) obey(*text);
  }
  call.thread = currentThread();
  call.isRecorded = isRecording;
  if (!isRecording) return;
  summary.called();
  if (!spareLines.empty()) {
    call.line = std::move(spareLines.back());
    spareLines.pop_back();
    call.line.clear();
  }
  // Before the call, since what is in force is written at the head of a part.
  if (writer->isFull() && writer->beginPart()) writeHead();
}

// Whether a replay can make the call again.
void Recorder::beginOnSession(Call& call, const void* handle, bool hasArguments) {
  const auto found = sessions.find(handle);
  const bool isOpen = found != sessions.end();
  if (isOpen) call.session = found->second;
  call.hasResult = isOpen && hasArguments;
  if (!call.isRecorded && call.kind == CallKind::dispatch) return;
  if (call.hasResult) {
    call.line.addText(member::kCall, callName(call.kind));
    call.line.addText(member::kSession, sessionName(call.session.number));
    return;
  }
  call.isNote = true;
  if (!isOpen && call.isRecorded) note(watch.usedClosed(handle, callName(call.kind), call.thread));
  call.line.addText(member::kNote, std::string(callName(call.kind)) +
                                       (isOpen ? " without an argument" : " on a handle that is not open"));
}

void Recorder::finish(Call& call) {
  if (!call.isWhole || call.line.isEmpty()) return;
  if (call.isRecorded && isRecording) {
    addTime(call.line, {std::max<int64_t>(call.start - startTime, 0), call.end - call.start, call.thread});
  }
  const std::string_view line = call.line.finish();
  if (!call.isNote && call.kind != CallKind::dispatch) tellState(line);
  // Also if the recording began meanwhile: what is open and asked for has to be in it.
  if (isRecording) writer->write(line, call.isNote ? LineKind::note : LineKind::call);
  spareLines.push_back(std::move(call.line));
}

// They are an argument as much as the record is: the library does what it does with both.
void Recorder::addEngineAnswers(Call& call) {
  if (call.isAlone && asked.groups != 0 && asked.isWhole) call.line.addEngine(asked.answers);
  asked = {};
}

void Recorder::negotiated(Call& call, int returned, ctx_option_t** out) {
  const bool hasList = call.hasResult && *out != nullptr;
  const int64_t list = hasList ? watch.listGiven(*out) : 0;
  if (call.isAlone) call.line.addReturned(returned);
  if (call.isAlone && hasList) {
    addProperties(call.line, **out);
    inForce.listed(call.session.number, listNote(inForce.sensorOf(call.session.number), **out));
  }
  if (hasList) call.line.addInteger(member::kList, list);
}

// Before the release is made, which may be what ends the program.
void Recorder::released(const ctx_option_t* list) {
  const int thread = currentThread();
  const ListRelease release = watch.listReleased(list, thread);
  if (!isRecording || isInChild) return;  // a child is recorded from its next call on
  note(release.breach);
  writer->write(releaseLine(list, release.list, sinceStart(), thread), LineKind::note);
}

void Recorder::tellState(std::string_view line) {
  if (control.tell(line)) tellStateAnew();
}

void Recorder::tellStateAnew() {
  control.beginAnew();
  inForce.tell([this](std::string_view line, bool /*isCall*/) { control.tell(line); },
               [](uint32_t /*session*/) { return false; });
  control.endAnew();
}

// What a part needs to be replayed alone.
void Recorder::writeHead() {
  writer->write(headLine(writer->part(), startedAt), LineKind::head);
  inForce.tell(
      [this](std::string_view line, bool isCall) { writer->write(line, isCall ? LineKind::repeated : LineKind::note); },
      [this](uint32_t session) { return !carried.isWhole(session); });
  for (const std::string& line : carried.lines()) writer->write(line, LineKind::repeated);
}

void Recorder::note(const std::optional<Breach>& breach) {
  if (!breach || writer == nullptr) return;
  writer->breached(breach->text);
  writer->write(breachLine(*breach, sinceStart()), LineKind::note);
}

int64_t Recorder::sinceStart() const {
  return nanoseconds(CLOCK_MONOTONIC) - startTime;
}

// Asking the system takes longer than most calls of the library, so each thread asks once.
int Recorder::currentThread() {
  const void* known = threadKey ? pthread_getspecific(*threadKey) : nullptr;
  if (known != nullptr) return static_cast<int>(reinterpret_cast<intptr_t>(known));
  const auto number = static_cast<intptr_t>(syscall(SYS_gettid));
  if (threadKey) pthread_setspecific(*threadKey, reinterpret_cast<void*>(number));
  return static_cast<int>(number);
}

}  // namespace senseloom::trace
