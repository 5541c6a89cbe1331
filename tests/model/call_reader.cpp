#include "call_reader.h"

#include <algorithm>
#include <iterator>

#include "input_error.h"
#include "trace/hex.h"
#include "trace/record_codec.h"

namespace oracle {
namespace {

using senseloom::tool::compactText;
using senseloom::tool::encodeRecord;
using senseloom::tool::findSensor;
using senseloom::tool::fromHex;
using senseloom::tool::InputError;

std::string quoted(const std::string& text) {
  return '"' + text + '"';
}

const json_t* member(const json_t* object, const char* key) {
  const json_t* value = json_object_get(object, key);
  if (value == nullptr) throw InputError("missing " + quoted(key));
  return value;
}

std::string stringMember(const json_t* object, const char* key) {
  const json_t* value = member(object, key);
  if (!json_is_string(value)) throw InputError(quoted(key) + " must be a string");
  return {json_string_value(value), json_string_length(value)};
}

Bytes bytesMember(const json_t* object, const char* key) {
  const auto bytes = fromHex(stringMember(object, key));
  if (!bytes) throw InputError(quoted(key) + " must hold hexadecimal digits, two a byte");
  return *bytes;
}

// The value from `first` to `last` that has this name.
template <class Named>
Named named(const std::string& name, Named first, Named last, const char* what) {
  for (int value = first; value <= last; ++value) {
    if (name == nameOf(static_cast<Named>(value))) return static_cast<Named>(value);
  }
  throw InputError(std::string("unknown ") + what + ' ' + quoted(name));
}

Call::What whatMember(const json_t* object) {
  const auto what = named(stringMember(object, "call"), Call::open, Call::find, "call");
  const bool isToSensor = what == Call::dispatch && json_object_get(object, "sensor") != nullptr;
  return isToSensor ? Call::dispatchToSensor : what;
}

// A name that is not a sensor's can be tried, but not dispatched to.
void readSensor(Call& call, const json_t* object) {
  const std::string name = stringMember(object, "sensor");
  const int sensor = sensorNamed(name);
  if (sensor >= 0) {
    call.sensor = sensor;
  } else if (call.what == Call::dispatchToSensor) {
    throw InputError("unknown sensor " + quoted(name));
  } else {
    call.otherName = name;
  }
}

OptionText optionOf(const json_t* object) {
  OptionText option;
  if (json_object_get(object, "optionHex") != nullptr) {
    const Bytes bytes = bytesMember(object, "optionHex");
    option.verbatim = std::string(bytes.begin(), bytes.end());
    return option;
  }
  const json_t* value = member(object, "option");
  option.isNull = json_is_null(value);
  if (json_is_string(value)) {
    option.verbatim = json_string_value(value);
  } else if (json_is_object(value)) {
    option.verbatim = compactText(value);
  } else if (!option.isNull) {
    throw InputError("\"option\" must be an object, a string or null");
  }
  return option;
}

template <class Integer>
void readInteger(Integer& answer, const json_t* value, const std::string& key) {
  if (!json_is_integer(value)) throw InputError(quoted(key) + " must be an integer");
  answer = static_cast<Integer>(json_integer_value(value));
}

void readBool(bool& answer, const json_t* value, const std::string& key) {
  if (!json_is_boolean(value)) throw InputError(quoted(key) + " must be true or false");
  answer = json_is_true(value);
}

void readNames(Answers& answers, const json_t* value) {
  for (size_t i = 0; i < json_array_size(value); ++i) {
    const json_t* name = json_array_get(value, i);
    if (!json_is_string(name) && !json_is_null(name)) throw InputError("\"names\" must hold strings and null");
    answers.names.push_back(json_is_null(name) ? std::nullopt : std::optional<std::string>(json_string_value(name)));
  }
}

Answers answersOf(json_t* object) {
  if (!json_is_object(object)) throw InputError("\"platform\" must be an object");
  Answers answers;
  const char* key;
  json_t* value;
  json_object_foreach(object, key, value) {
    const std::string name = key;
    if (name == "get") {
      readInteger(answers.get, value, name);
    } else if (name == "open") {
      readInteger(answers.open, value, name);
    } else if (name == "gives") {
      readBool(answers.gives, value, name);
    } else if (name == "version") {
      readInteger(answers.version, value, name);
    } else if (name == "activate") {
      readInteger(answers.activate, value, name);
    } else if (name == "deactivate") {
      readInteger(answers.deactivate, value, name);
    } else if (name == "starts") {
      readBool(answers.starts, value, name);
    } else if (name == "names" && json_is_array(value)) {
      readNames(answers, value);
    } else {
      throw InputError("unknown answer of the platform " + quoted(name));
    }
  }
  return answers;
}

Bytes recordOf(const json_t* object, int sensor) {
  json_t* record = json_object_get(object, "record");
  if (!json_is_object(record)) throw InputError("\"record\" must be an object");
  return encodeRecord(*findSensor(kSensorNames[sensor]), record);
}

}  // namespace

int sensorNamed(const std::string& name) {
  const auto* const* found = std::find(std::begin(kSensorNames), std::end(kSensorNames), name);
  return found == std::end(kSensorNames) ? -1 : static_cast<int>(found - std::begin(kSensorNames));
}

int CallReader::sessionNamed(const std::string& name) {
  if (name.empty()) throw InputError("\"session\" must not be empty");
  const auto found = std::find(names.begin(), names.end(), name);
  if (found != names.end()) return static_cast<int>(found - names.begin());
  names.push_back(name);
  return static_cast<int>(names.size()) - 1;
}

void CallReader::readSession(Call& call, json_t* object) {
  const bool needsNone = call.misuse == Call::unknownHandle || call.misuse == Call::nullHandle;
  if (needsNone && json_object_get(object, "session") == nullptr) return;
  call.session = sessionNamed(stringMember(object, "session"));
  if (call.what == Call::open) return;
  if (sensors.count(call.session) == 0) throw InputError("session " + quoted(names.back()) + " was never opened");
}

Call CallReader::read(json_t* object) {
  Call call;
  call.what = whatMember(object);
  if (json_object_get(object, "misuse") != nullptr) {
    call.misuse = named(stringMember(object, "misuse"), Call::nullName, Call::nullHandle, "misuse");
  }
  if (json_t* answers = json_object_get(object, "platform")) call.answers = answersOf(answers);
  const bool isDispatch = call.what == Call::dispatch || call.what == Call::dispatchToSensor;
  if (call.what <= Call::dispatch || call.what == Call::close) readSession(call, object);
  const bool hasName = call.misuse != Call::nullName || json_object_get(object, "sensor") != nullptr;
  if (call.what == Call::open || call.what == Call::dispatchToSensor || call.what == Call::find) {
    if (hasName) readSensor(call, object);
  }
  if (call.what == Call::open) sensors[call.session] = call.sensor;
  if (call.what == Call::setOption) call.option = optionOf(object);
  if (isDispatch) call.record = recordOf(object, call.what == Call::dispatch ? sensors[call.session] : call.sensor);
  return call;
}

}  // namespace oracle
