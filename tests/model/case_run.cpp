#include "case_run.h"

#include <fake_platform.h>

#include <algorithm>
#include <array>
#include <cstring>
#include <memory>
#include <set>
#include <utility>
#include <vector>

#include "client.h"
#include "kinds/option_data.h"
#include "trace/hex.h"
#include "trace/record_codec.h"

namespace oracle {
namespace {

using senseloom::tool::addMember;
using senseloom::tool::compactText;
using senseloom::tool::Json;

constexpr const char* kNegotiationTag = "I/Libsl: ";

std::string hexOf(const std::string& bytes) {
  return senseloom::tool::toHex({reinterpret_cast<const uint8_t*>(bytes.data()), bytes.size()});
}

Json textJson(const std::string& text) {
  return Json(json_stringn(text.data(), text.size()));
}

void append(const Json& array, Json value) {
  json_array_append_new(array.get(), value.release());
}

// A member of an object as text, to be compared and shown; empty when it is not there.
std::string memberText(const json_t* object, const char* key) {
  const json_t* value = json_object_get(object, key);
  if (value == nullptr) return "";
  const std::unique_ptr<char, decltype(&std::free)> text(json_dumps(value, JSON_COMPACT | JSON_ENCODE_ANY), std::free);
  return text.get();
}

// --- property lists

// As in a trace.
Json rawProperties(const PropertyList& list) {
  Json array(json_array());
  for (const Property& property : list) {
    append(array, Json(json_pack("{s:i,s:i,s:s}", "id", property.id, "size", static_cast<int>(property.value.size()),
                                 "value", hexOf(property.value).c_str())));
  }
  return array;
}

constexpr int32_t kSpans = 43;
constexpr int32_t kTemplateNumber = 122;
constexpr int32_t kTemplateBytes = 123;

Json valueOf(const Property& property) {
  if (property.value.size() != sizeof(int32_t)) return textJson(hexOf(property.value));
  int32_t value;
  std::memcpy(&value, property.value.data(), sizeof value);
  if (property.id == kSpans) return Json(json_pack("[i,i]", value >> 16 & 0xFFFF, value & 0xFFFF));
  return Json(json_integer(value));
}

// By name. Two spans in one value are shown apart. A template's number and its bytes are one member, "template1" or
// "template2".
Json namedProperties(int sensor, const PropertyList& list) {
  Json object(json_object());
  for (const Property& property : list) {
    if (property.id == kTemplateNumber) continue;
    const bool isTemplate = property.id == kTemplateBytes;
    const std::string name = isTemplate ? "template" + std::to_string(property.slot + 1)
                                        : senseloom::tool::propertyName(kSensorNames[sensor], property.id);
    addMember(object, name.c_str(), isTemplate ? textJson(hexOf(property.value)) : valueOf(property));
  }
  return object;
}

Json propertiesAs(const json_t* expected, int sensor, const PropertyList& list) {
  return json_is_array(expected) ? rawProperties(list) : namedProperties(sensor, list);
}

// --- results

// By field when the fields tell all bytes; a result that replaces a field of its record tells the rest with that.
Json resultAs(const json_t* expected, int sensor, const Bytes& record, const Bytes& result) {
  const auto& layout = *senseloom::tool::findSensor(kSensorNames[sensor]);
  Json hex(json_pack("{s:s}", "hex", senseloom::tool::toHex(result).c_str()));
  if (json_object_get(expected, "hex") != nullptr) return hex;
  Json fields = senseloom::tool::decodeResult(layout, result);
  if (fields == nullptr) return hex;
  bool tellsAll = false;
  if (layout.resultValue == nullptr) {
    tellsAll = senseloom::tool::encodeRecord(layout, fields.get()) == result;
  } else {
    Bytes same = record;
    if (same.size() == result.size()) std::copy_n(result.begin() + 8, layout.valueSize, same.begin() + 8);
    tellsAll = same == result;
  }
  return tellsAll ? std::move(fields) : std::move(hex);
}

// --- log lines

// Has a name in place of an address, which differs from run to run.
std::string withName(std::string text, const void* address, const std::string& name) {
  std::array<char, 32> written{};
  std::snprintf(written.data(), written.size(), "%p", address);
  const std::string digits = written.data();
  const size_t at = text.find(' ' + digits);
  const char after = at == std::string::npos ? '\0' : text[std::min(at + 1 + digits.size(), text.size() - 1)];
  if (after == ' ' || after == '\n') text.replace(at + 1, digits.size(), '{' + name + '}');
  return text;
}

std::string letterOf(int priority) {
  constexpr const char* kLetters = "??VDIWEF";
  return {priority >= 0 && priority < 8 ? kLetters[priority] : '?'};
}

// --- a run

class Run {
 public:
  explicit Run(const Case& is) : one(is) { model.deviceAddress = fake::platform().deviceAddress(); }
  ~Run() {
    for (auto& [sensor, list] : lists) ctx_option_release(list);
    client.restore();
  }
  Run(const Run&) = delete;
  Run& operator=(const Run&) = delete;

  // What is wrong; empty when nothing is.
  std::string make(const Step& step);

 private:
  std::string make(const Step& step, void* handle);
  std::string look(const Step& step);
  std::string difference(const Step& step, int sensor, const Outcome& actual, const char* who) const;
  std::string stateDifference(const json_t* expected) const;
  Json tell(const Step& step, int sensor, const Outcome& outcome) const;
  Json returnedOf(const Call& call, int returned) const;
  Json logOf(const json_t* expected, const Outcome& outcome) const;
  int sensorOf(const Call& call) const;

  const Case& one;
  Client client;
  Model model;
  std::map<int, ctx_option_t*> lists;  // the last one of each sensor
};

int Run::sensorOf(const Call& call) const {
  const bool hasSession = call.what == Call::setOption || call.what == Call::dispatch || call.what == Call::close;
  const bool hasHandle = call.misuse != Call::unknownHandle && call.misuse != Call::nullHandle;
  return hasSession && hasHandle ? client.sensorOf(call.session) : call.sensor;
}

Json Run::returnedOf(const Call& call, int returned) const {
  switch (call.what) {
    case Call::open:
      return returned == 1 ? textJson("handle") : Json(json_null());
    case Call::find:
      return returned == 1 ? textJson("sensor") : Json(json_null());
    case Call::audioInit:
    case Call::audioActivate:
    case Call::audioDeactivate:
      return Json(json_boolean(returned == 1));
    default:
      return Json(json_integer(returned));
  }
}

// Without the lines of a negotiation, unless they are expected, or none at all.
Json Run::logOf(const json_t* expected, const Outcome& outcome) const {
  bool hasNegotiation = json_is_array(expected) && json_array_size(expected) == 0;
  for (size_t i = 0; i < json_array_size(expected); ++i) {
    const char* line = json_string_value(json_array_get(expected, i));
    hasNegotiation = hasNegotiation || std::string(line == nullptr ? "" : line).rfind(kNegotiationTag, 0) == 0;
  }
  Json log(json_array());
  for (const auto& line : outcome.log) {
    std::string text = letterOf(line.priority) + '/' + line.tag + ": " + line.text;
    if (!hasNegotiation && text.rfind(kNegotiationTag, 0) == 0) continue;
    for (const int session : client.openSessions()) {
      text = withName(text, client.handleOf(session), one.sessions[static_cast<size_t>(session)]);
    }
    append(log, textJson(withName(text, fake::platform().deviceAddress(), "device")));
  }
  return log;
}

Json platformCallsOf(const Outcome& outcome) {
  Json calls(json_array());
  for (const std::string& call : outcome.calls) append(calls, textJson(call));
  for (int i = 0; i < outcome.engineStarts; ++i) append(calls, textJson("gesture_initial"));
  for (int i = 0; i < outcome.engineCloses; ++i) append(calls, textJson("gesture_close"));
  return calls;
}

// Each group as its samples, if it is one group and the last one is told to be the last.
Json groupsOf(const Outcome& outcome) {
  Json groups(json_array());
  for (size_t i = 0; i < outcome.groups.size(); ++i) {
    const auto& group = outcome.groups[i];
    Json samples(json_array());
    for (const int16_t sample : group.samples) append(samples, Json(json_integer(sample)));
    const bool isLast = i + 1 == outcome.groups.size();
    if (group.count == 1 && group.last == isLast) {
      append(groups, std::move(samples));
    } else {
      append(groups, Json(json_pack("{s:o,s:i,s:b}", "samples", samples.release(), "count", group.count, "last",
                                    group.last ? 1 : 0)));
    }
  }
  return groups;
}

// The outcome of a call in the words of its line.
Json Run::tell(const Step& step, int sensor, const Outcome& outcome) const {
  const Call& call = step.call;
  const auto expected = [&](const char* key) { return json_object_get(step.line.get(), key); };
  Json told(json_object());
  if (call.what != Call::uninit) addMember(told, "returned", returnedOf(call, outcome.returned));
  const bool negotiates = call.what == Call::setOption || call.what == Call::close;
  if (negotiates && !outcome.storesList) addMember(told, "out", textJson("untouched"));
  if (outcome.list) addMember(told, "properties", propertiesAs(expected("properties"), sensor, *outcome.list));
  if (outcome.delivers == Outcome::sameRecord) addMember(told, "result", textJson("own record"));
  if (outcome.delivers == Outcome::ownBuffer) {
    addMember(told, "result", resultAs(expected("result"), sensor, call.record, outcome.result));
  }
  const auto addList = [&](const char* key, Json list) {
    if (expected(key) != nullptr || json_array_size(list.get()) > 0) addMember(told, key, std::move(list));
  };
  addList("log", logOf(expected("log"), outcome));
  addList("platformCalls", platformCallsOf(outcome));
  addList("groups", groupsOf(outcome));
  return told;
}

std::string differenceIn(const char* key, const json_t* expected, const json_t* actual, const std::string& who) {
  const std::string wanted = memberText(expected, key);
  const std::string got = memberText(actual, key);
  if (wanted == got) return "";
  const auto words = [](const std::string& text) { return text.empty() ? "nothing" : text; };
  return "  " + who + ": \"" + key + "\"\n    expected " + words(wanted) + "\n    actual   " + words(got) + '\n';
}

std::string Run::difference(const Step& step, int sensor, const Outcome& actual, const char* who) const {
  const Json told = tell(step, sensor, actual);
  std::string text;
  for (const char* key : {"returned", "out", "properties", "result", "log", "platformCalls", "groups"}) {
    text += differenceIn(key, step.line.get(), told.get(), who);
  }
  return text;
}

// The exported globals.
std::string Run::stateDifference(const json_t* expected) const {
  if (json_object_get(expected, "device") == nullptr) return "";
  std::string state = device == nullptr ? "closed" : gIsActivated ? "active" : "open";
  if (device == nullptr && gIsActivated) state = "closed, but gIsActivated";
  if (device != nullptr && device != fake::platform().deviceAddress()) state = "wrong address";
  const Json told(json_pack("{s:s}", "device", state.c_str()));
  return differenceIn("device", expected, told.get(), "library");
}

std::string Run::look(const Step& step) {
  Outcome shown;
  std::string complaint;
  const auto found = lists.find(step.looksAt);
  if (found == lists.end()) return "  there was no list\n";
  shown.list = propertiesOf(found->second, complaint);
  const Json told(json_object());
  addMember(told, "properties",
            propertiesAs(json_object_get(step.line.get(), "properties"), step.looksAt, *shown.list));
  return complaint + differenceIn("properties", step.line.get(), told.get(), "library");
}

std::string Run::make(const Step& step, void* handle) {
  const Call& call = step.call;
  const int sensor = sensorOf(call);
  const Observation observation = client.make(call, handle);
  std::string text;
  if (!observation.complaint.empty()) text += "  library: " + observation.complaint + '\n';
  const Outcome expected = makeOnModel(model, call, handle, observation.opened);
  text += difference(step, sensor, observation.outcome, "library") + difference(step, sensor, expected, "model");
  if (call.what == Call::close && call.misuse == Call::none) client.noteClosed(call, handle);
  if (observation.list != nullptr) ctx_option_release(std::exchange(lists[sensor], observation.list));
  return text + stateDifference(step.line.get());
}

std::string Run::make(const Step& step) {
  if (step.looksAt >= 0) return look(step);
  const std::vector<void*> handles = client.targets(step.call);
  if (handles.empty()) {
    return step.call.what == Call::open            ? "  the session is open already\n"
           : step.call.misuse == Call::staleHandle ? "  the session is still open\n"
                                                   : "  the session is not open\n";
  }
  std::string text;
  for (void* handle : handles) text += make(step, handle);
  return text;
}

}  // namespace

std::string run(const Case& one, const std::string& file) {
  Run it(one);
  for (const Step& step : one.steps) {
    const std::string text = it.make(step);
    if (text.empty()) continue;
    return file + ':' + std::to_string(step.lineNumber) + ": " + one.name + " (" + one.note + ")\n  " +
           compactText(step.line.get()) + '\n' + text;
  }
  return "";
}

}  // namespace oracle
