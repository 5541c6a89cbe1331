#include "trace/trace_call.h"

#include <algorithm>
#include <string_view>

#include "input_error.h"
#include "trace/hex.h"

namespace senseloom::tool {
namespace {

std::string quoted(std::string_view name) {
  return '"' + std::string(name) + '"';
}

json_t* requireMember(const Json& object, const char* key) {
  json_t* value = json_object_get(object.get(), key);
  if (value == nullptr) throw InputError("missing " + quoted(key));
  return value;
}

std::string stringMember(const Json& object, const char* key) {
  const json_t* value = requireMember(object, key);
  if (!json_is_string(value)) throw InputError(quoted(key) + " must be a string");
  return json_string_value(value);
}

CallKind callMember(const Json& object) {
  const std::string name = stringMember(object, member::kCall);
  const auto* call =
      std::find_if(kAllCalls.begin(), kAllCalls.end(), [&name](CallKind kind) { return name == callName(kind); });
  if (call == kAllCalls.end()) {
    throw InputError("unknown call \"" + name + "\": open, set_option, dispatch, close, uninit and release are known");
  }
  return *call;
}

std::string sessionMember(const Json& object) {
  std::string name = stringMember(object, member::kSession);
  if (name.empty()) throw InputError(quoted(member::kSession) + " must not be empty");
  return name;
}

const Sensor* sensorMember(const Json& object) {
  return &sensorNamed(stringMember(object, member::kSensor));
}

// A text that no string can hold is given as bytes.
std::optional<std::string> hexMember(const Json& object, const char* key) {
  if (json_object_get(object.get(), key) == nullptr) return std::nullopt;
  const auto bytes = fromHex(stringMember(object, key));
  if (!bytes) throw InputError(quoted(key) + " must hold hexadecimal digits, two a byte");
  return std::string(bytes->begin(), bytes->end());
}

// An option given as a string reaches the library as it stands, whether it is JSON or not.
std::optional<std::string> optionMember(const Json& object) {
  if (auto bytes = hexMember(object, member::kOptionHex)) return bytes;
  const json_t* option = requireMember(object, member::kOption);
  if (json_is_null(option)) return std::nullopt;
  if (json_is_string(option)) return json_string_value(option);
  if (json_is_object(option)) return compactText(option);
  throw InputError(quoted(member::kOption) + " must be an object, a string or null");
}

Json recordMember(const Json& object) {
  json_t* record = requireMember(object, member::kRecord);
  if (!json_is_object(record)) throw InputError(quoted(member::kRecord) + " must be an object");
  return Json(json_incref(record));
}

EngineAnswer engineAnswer(const Json& element) {
  if (!json_is_object(element.get())) throw InputError(quoted(member::kEngine) + " must hold objects");
  const json_t* group = requireMember(element, member::kGroup);
  const json_int_t number = json_integer_value(group);
  if (!json_is_integer(group) || number < 0 || number >= kMostGroups) {
    throw InputError(quoted(member::kGroup) + " must be 0 to " + std::to_string(kMostGroups - 1));
  }
  auto name = hexMember(element, member::kNameHex);
  return {.group = static_cast<int>(number), .name = name ? *std::move(name) : stringMember(element, member::kName)};
}

std::optional<std::vector<EngineAnswer>> engineMember(const Json& object) {
  const json_t* engine = json_object_get(object.get(), member::kEngine);
  if (engine == nullptr) return std::nullopt;
  if (!json_is_array(engine)) throw InputError(quoted(member::kEngine) + " must be an array");
  std::vector<EngineAnswer> answers;
  for (size_t i = 0; i < json_array_size(engine); ++i) {
    answers.push_back(engineAnswer(Json(json_incref(json_array_get(engine, i)))));
  }
  return answers;
}

void readTarget(const Json& object, TraceCall& call) {
  const bool hasSession = json_object_get(object.get(), member::kSession) != nullptr;
  const bool hasSensor = json_object_get(object.get(), member::kSensor) != nullptr;
  if (hasSession == hasSensor) throw InputError("a dispatch needs either \"session\" or \"sensor\"");
  if (hasSession) {
    call.session = sessionMember(object);
  } else {
    call.sensor = sensorMember(object);
  }
}

Json recordedMembers(const Json& object) {
  if (json_object_get(object.get(), member::kReturned) == nullptr) return nullptr;
  Json recorded(json_object());
  for (const char* key : {member::kReturned, member::kProperties, member::kResult}) {
    if (json_t* value = json_object_get(object.get(), key)) addMember(recorded, key, Json(json_incref(value)));
  }
  return recorded;
}

}  // namespace

bool isNote(const Json& object) {
  return json_object_get(object.get(), member::kCall) == nullptr &&
         json_object_get(object.get(), member::kNote) != nullptr;
}

std::string noteText(const Json& note) {
  const std::string why = textMember(note.get(), member::kWhy);
  return textMember(note.get(), member::kNote) + (why.empty() ? "" : ": " + why);
}

bool isRelease(const Json& object) {
  return textMember(object.get(), member::kCall) == kRelease;
}

std::optional<int64_t> releasedList(const Json& release) {
  const json_t* list = requireMember(release, member::kList);
  if (json_is_null(list)) return std::nullopt;
  if (json_integer_value(list) > 0) return json_integer_value(list);
  if (textMember(release.get(), member::kList) == kUnknownList) return 0;
  throw InputError(quoted(member::kList) + " must be the number of a list, null or " + quoted(kUnknownList));
}

TraceCall readCall(const Json& object) {
  TraceCall call;
  call.kind = callMember(object);
  call.recorded = recordedMembers(object);
  if (const json_t* at = json_object_get(object.get(), member::kAt)) call.atMicroseconds = json_integer_value(at);
  call.list = json_integer_value(json_object_get(object.get(), member::kList));
  switch (call.kind) {
    case CallKind::open:
      call.session = sessionMember(object);
      call.sensor = sensorMember(object);
      call.isResumed = json_object_get(object.get(), member::kResumed) != nullptr;
      break;
    case CallKind::setOption:
      call.session = sessionMember(object);
      call.option = optionMember(object);
      break;
    case CallKind::dispatch:
      readTarget(object, call);
      call.record = recordMember(object);
      call.engine = engineMember(object);
      call.truth = Json(json_incref(json_object_get(object.get(), member::kTruth)));
      break;
    case CallKind::close:
      call.session = sessionMember(object);
      break;
    case CallKind::uninit:
      break;
  }
  return call;
}

}  // namespace senseloom::tool
