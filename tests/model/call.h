#pragma once

#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "model/kinds.h"
#include "model/outcome.h"

// The calls of a client as data: made up at random, made on the library and on the model of it, shrunk, and written as
// a trace.
namespace oracle {

namespace model = senseloom::model;

using model::Answers;
using model::Bytes;

// The sensors in the library's order; a call names one by its place here.
using enum model::Kind;
constexpr int kSensors = model::kKinds;
inline constexpr struct SensorNames {
  const char* names[kSensors];
} kSensorNameList = [] {
  SensorNames list{};
  for (int sensor = 0; sensor < kSensors; ++sensor) list.names[sensor] = model::rowOf(sensor).sensor;
  return list;
}();
inline constexpr auto& kSensorNames = kSensorNameList.names;

// An option string: members with their values as JSON text, or text as it stands, or a null pointer.
struct OptionText {
  std::vector<std::pair<std::string, std::string>> members;
  std::optional<std::string> verbatim;
  bool isNull = false;

  std::string text() const;
};

struct Call {
  enum What {
    open,
    setOption,
    dispatch,
    dispatchToSensor,
    close,
    uninit,
    audioInit,
    audioActivate,
    audioDeactivate,
    find
  };
  // Misuses, which no trace can express.
  enum Misuse {
    none,
    nullName,
    longName,
    nullOut,
    nullLength,
    nullData,
    negativeLength,
    staleHandle,
    unknownHandle,
    nullHandle
  };

  What what = uninit;
  int session = 0;  // of open, setOption, dispatch and close: the client's name for it, a small number
  int sensor = 0;   // of open, dispatchToSensor and find
  std::optional<std::string> otherName;  // of open and find: one that is not a sensor's, in place of `sensor`
  OptionText option;                     // of setOption
  Bytes record;                          // of a dispatch
  Misuse misuse = none;
  Answers answers;
};
using Sequence = std::vector<Call>;

// The names of the calls and of the misuses in JSON.
const char* nameOf(Call::What what);
const char* nameOf(Call::Misuse misuse);

// Whether a trace can express the call.
bool isTraceable(const Call& call);

// The call on one line of JSON, as `senseloom replay` reads it. What the tool does not know of, the platform's answers
// and calls that are not traceable, is in members that it skips.
std::string toJson(const Call& call);

// A sequence as a trace that `senseloom replay` runs. Calls that are not traceable are notes of the next one that is.
std::string toTrace(const Sequence& sequence);

}  // namespace oracle
