#pragma once

#include <array>
#include <cstddef>

// The words that traces are made of, for those who write traces and for those who read them. docs/traces.md explains
// their form.
namespace senseloom::tool {

enum class CallKind { open, setOption, dispatch, close, uninit };
inline constexpr std::array kAllCalls{CallKind::open, CallKind::setOption, CallKind::dispatch, CallKind::close,
                                      CallKind::uninit};

// The name of a call in traces and in output.
constexpr const char* callName(CallKind kind) {
  constexpr const char* kNames[] = {"open", "set_option", "dispatch", "close", "uninit"};
  return kNames[static_cast<size_t>(kind)];
}

// The release of a property list. It is not one of the kinds, because no replay makes it: the tool copies each list and
// releases it at once, and what the library does does not depend on it.
inline constexpr char kRelease[] = "release";

namespace member {

// A call.
inline constexpr char kCall[] = "call";
inline constexpr char kNote[] = "note";
inline constexpr char kSession[] = "session";
inline constexpr char kSensor[] = "sensor";
inline constexpr char kOption[] = "option";
inline constexpr char kOptionHex[] = "optionHex";
inline constexpr char kRecord[] = "record";
inline constexpr char kTruth[] = "truth";

// What the platform's gesture engine answered during a dispatch.
inline constexpr char kEngine[] = "engine";
inline constexpr char kGroup[] = "group";
inline constexpr char kName[] = "name";
inline constexpr char kNameHex[] = "nameHex";

// A note, or a head.
inline constexpr char kTimeUnit[] = "timeUnit";
inline constexpr char kClassNames[] = "classNames";

// What came of it.
inline constexpr char kReturned[] = "returned";
inline constexpr char kProperties[] = "properties";
inline constexpr char kId[] = "id";
inline constexpr char kSize[] = "size";
inline constexpr char kValue[] = "value";
inline constexpr char kResult[] = "result";
inline constexpr char kList[] = "list";  // the number of the property list that was given, or is released

// When a call was made, as a recording tells it.
inline constexpr char kAt[] = "atUs";  // microseconds since the recording began
inline constexpr char kThread[] = "thread";
inline constexpr char kTook[] = "tookNs";  // nanoseconds in the library

// The head of a recording, a line of its own.
inline constexpr char kFormat[] = "format";
inline constexpr char kTool[] = "tool";
inline constexpr char kLibrary[] = "library";
inline constexpr char kLibraryBuild[] = "libraryBuild";
inline constexpr char kProgram[] = "program";
inline constexpr char kProcess[] = "process";
inline constexpr char kBits[] = "bits";
inline constexpr char kStarted[] = "started";
inline constexpr char kClock[] = "clock";
inline constexpr char kPart[] = "part";
inline constexpr char kRefused[] = "refused";  // of an option that was refused before
inline constexpr char kResumed[] = "resumed";  // of an open that was made before the recording

// Its end, and what is missing.
inline constexpr char kEnd[] = "end";
inline constexpr char kLost[] = "lost";
inline constexpr char kWhy[] = "why";
inline constexpr char kCause[] = "cause";  // the recording did not end by itself

// A note about a breach of the library's contract.
inline constexpr char kBreach[] = "breach";
inline constexpr char kThreads[] = "threads";

// A record, a result: its bytes, or its fields beside those that a sensor names itself.
inline constexpr char kHex[] = "hex";
inline constexpr char kTimestamp[] = "timestamp";
inline constexpr char kItems[] = "items";
inline constexpr char kClass[] = "class";
inline constexpr char kSequence[] = "seq";
inline constexpr char kSamples[] = "samples";

}  // namespace member

// The format of recordings that is written and read.
inline constexpr int kTraceFormat = 1;

// What an open returned that gave a session, in "returned".
inline constexpr char kHandle[] = "handle";

// The "list" of a release that frees none that a call gave.
inline constexpr char kUnknownList[] = "unknown";

}  // namespace senseloom::tool
