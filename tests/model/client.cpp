#include "client.h"

#include <fake_platform.h>

#include <algorithm>
#include <cstdio>
#include <cstring>
#include <memory>
#include <string_view>
#include <utility>

// The library's one message on standard output is a call of the platform like the others.
extern "C" int puts(const char* text) {
  if (std::string_view(text).substr(0, 12) != "deactivating")
    return std::fputs(text, stdout) < 0 ? EOF : std::fputc('\n', stdout);
  fake::platform().calls.push_back(std::string("puts ") + text);
  return 0;
}

namespace oracle {
namespace {

constexpr int kUntouched = -12345;
constexpr uint8_t kBlock[48] = {128,  0,    0,    0,    12,   0,    20,   0,    24,   0,    0, 0, 76,   0,    0, 0,
                                0xFE, 0xFF, 0xFF, 0xFF, 0xFF, 0xFF, 0xFF, 0xFF, 21,   0,    0, 0, 0xCC, 0x3C, 0, 0,
                                0x70, 0x7D, 0,    0,    0x99, 0x19, 0,    0,    0xCC, 0x0C, 0, 0, 64,   0,    4, 0};

void* const kUntouchedPointer = const_cast<int*>(&kUntouched);

// The name that a call opens or finds a sensor by.
std::string sensorNameOf(const Call& call) {
  const std::string name = call.otherName.value_or(kSensorNames[call.sensor]);
  return call.misuse == Call::longName ? name + "ABCDE" : name;
}

}  // namespace

void setAnswers(const Answers& answers) {
  auto& platform = fake::platform();
  platform.getResult = answers.get;
  platform.openResult = answers.open;
  platform.openGivesDevice = answers.gives;
  platform.deviceVersion = answers.version;
  platform.activateResult = answers.activate;
  platform.deactivateResult = answers.deactivate;
  platform.gestureStarts = answers.starts;
  platform.gestureNames.assign(answers.names.begin(), answers.names.end());
}

model::Log logged() {
  model::Log log;
  for (const auto& [priority, tag, text] : fake::platform().takeLog()) log.push_back({priority, tag, text});
  return log;
}

namespace {

// What the platform was called for and what it logged since the last call.
void observePlatform(Observation& observation) {
  auto& platform = fake::platform();
  Outcome& outcome = observation.outcome;
  outcome.log = logged();
  outcome.calls = std::exchange(platform.calls, {});
  for (const auto& [samples, count, last] : std::exchange(platform.groups, {})) {
    outcome.groups.push_back({samples, count, last});
  }
  outcome.engineStarts = static_cast<int>(platform.gestureInitials.size());
  outcome.engineCloses = std::exchange(platform.gestureCloses, 0);
  for (const auto& arguments : std::exchange(platform.gestureInitials, {})) {
    if (arguments != std::array<int, 2>{}) observation.complaint += "the engine was started with other than zeros; ";
  }
  if (std::count(outcome.calls.begin(), outcome.calls.end(), "activate") > 0) {
    auto block = platform.activationBlock;
    block[10] = block[11] = 0;  // padding
    if (!std::equal(block.begin(), block.end(), kBlock)) observation.complaint += "a wrong activation block; ";
  }
}

}  // namespace

PropertyList propertiesOf(const ctx_option_t* list, std::string& complaint) {
  PropertyList properties;
  int32_t number = -1;  // of the template whose bytes come next
  for (int32_t i = 0; i < list->count; ++i) {
    const ctx_property_t& entry = list->properties[i];
    if (entry.value == nullptr || entry.size <= 0) {
      complaint += "an entry without a value; ";
      continue;
    }
    Property property{entry.id, std::string(static_cast<const char*>(entry.value), static_cast<size_t>(entry.size))};
    if (entry.id == 122) std::memcpy(&number, entry.value, sizeof number);
    if (entry.id == 123) property.slot = number;
    properties.push_back(std::move(property));
  }
  return properties;
}

Client::Client() {
  if (getSensor("LIFT") != nullptr) return;
  // The first sensors ever.
  ctx_option_t* list = nullptr;
  ctx_close_session(ctx_open_session("LIFT"), &list);
  ctx_uninit();
}

std::vector<void*> Client::targets(const Call& call) const {
  if (call.misuse == Call::nullHandle) return {nullptr};
  if (call.misuse == Call::unknownHandle) return {kUntouchedPointer};
  switch (call.what) {
    case Call::setOption:
    case Call::dispatch:
    case Call::close: {
      const auto found = sessions.find(call.session);
      if (found == sessions.end() || found->second.isOpen == (call.misuse == Call::staleHandle)) return {};
      return {found->second.handle};
    }
    case Call::dispatchToSensor: {
      std::vector<void*> handles;
      for (const int session : opened) {
        const Session& one = sessions.at(session);
        if (one.sensor == call.sensor && one.handle != nullptr) handles.push_back(one.handle);
      }
      return handles;
    }
    case Call::open: {
      const auto found = sessions.find(call.session);
      if (found != sessions.end() && found->second.isOpen && found->second.handle != nullptr) return {};
      return {nullptr};
    }
    default:
      return {nullptr};
  }
}

Observation Client::make(const Call& call, void* handle) {
  setAnswers(call.answers);
  Observation observation;
  auto& returned = observation.outcome.returned;
  switch (call.what) {
    case Call::open:
      observation = open(call);
      break;
    case Call::setOption:
    case Call::close:
      observation = negotiate(call, handle);
      break;
    case Call::dispatch:
    case Call::dispatchToSensor:
      observation = dispatch(call, handle);
      break;
    case Call::uninit:
      ctx_uninit();
      break;
    case Call::audioInit:
      returned = audio_hal_init() ? 1 : 0;
      break;
    case Call::audioActivate:
      returned = audio_hal_activate() ? 1 : 0;
      break;
    case Call::audioDeactivate:
      returned = audio_hal_deactivate() ? 1 : 0;
      break;
    case Call::find:
      returned = getSensor(call.misuse == Call::nullName ? nullptr : sensorNameOf(call).c_str()) != nullptr ? 1 : 0;
      break;
  }
  observePlatform(observation);
  return observation;
}

Observation Client::open(const Call& call) {
  const std::string name = sensorNameOf(call);
  void* const session = ctx_open_session(call.misuse == Call::nullName ? nullptr : name.c_str());
  noteOpened(call, session);
  Observation observation;
  observation.outcome.returned = session != nullptr ? 1 : 0;
  observation.opened = session;
  return observation;
}

Observation Client::negotiate(const Call& call, void* handle) {
  const std::string text = call.option.text();
  gaveTemplates = gaveTemplates || text.find("template") != std::string::npos;
  auto* const untouched = static_cast<ctx_option_t*>(kUntouchedPointer);
  ctx_option_t* list = untouched;
  ctx_option_t** out = call.misuse == Call::nullOut ? nullptr : &list;
  Observation observation;
  observation.outcome.returned =
      call.what == Call::close ? ctx_close_session(handle, out)
                               : ctx_set_option(handle, kUntouched, call.option.isNull ? nullptr : text.c_str(), out);
  observation.outcome.storesList = list != untouched;
  if (list != untouched && list != nullptr) {
    observation.list = list;
    observation.outcome.list = propertiesOf(list, observation.complaint);
  }
  return observation;
}

Observation Client::dispatch(const Call& call, void* handle) {
  Observation observation;
  // At an odd address, and at the end of its block, so that a sanitizer sees any access beyond it.
  const std::unique_ptr<uint8_t[]> block(new uint8_t[1 + call.record.size()]);
  uint8_t* const record = block.get() + 1;
  std::copy(call.record.begin(), call.record.end(), record);

  void* result = kUntouchedPointer;
  int length = kUntouched;
  const int len = call.misuse == Call::negativeLength ? -1 : static_cast<int>(call.record.size());
  const int returned = ctx_dispatch_data(handle, call.misuse == Call::nullData ? nullptr : record, len,
                                         call.misuse == Call::nullOut ? nullptr : &result,
                                         call.misuse == Call::nullLength ? nullptr : &length);
  observation.outcome.returned = returned;
  if (!std::equal(call.record.begin(), call.record.end(), record)) {
    observation.complaint += "the client's record was changed; ";
  }
  if (returned != 1) {
    if (result != kUntouchedPointer || length != kUntouched) observation.complaint += "stored a result without one; ";
  } else if (result == record) {
    observation.outcome.delivers = Outcome::sameRecord;
    if (length != len) observation.complaint += "the length of the client's own record is wrong; ";
  } else if (result == kUntouchedPointer || result == nullptr || length < 0) {
    observation.complaint += "stored no result; ";
  } else {
    observation.outcome.delivers = Outcome::ownBuffer;
    const auto* bytes = static_cast<const uint8_t*>(result);
    observation.outcome.result.assign(bytes, bytes + length);
    const auto isOthers = [&](const auto& other) { return other.first != handle && other.second == result; };
    if (std::any_of(buffers.begin(), buffers.end(), isOthers)) observation.complaint += "the buffer is another's; ";
    const void*& buffer = buffers[handle];
    if (buffer != nullptr && buffer != result) observation.complaint += "the session's buffer has moved; ";
    buffer = result;
  }
  return observation;
}

void Client::noteOpened(const Call& call, void* handle) {
  std::erase(opened, call.session);
  sessions[call.session] = {handle, call.sensor, true};
  opened.push_back(call.session);
  buffers.erase(handle);
  openedGestures = openedGestures || call.sensor == gspx;
}

void Client::noteClosed(const Call& call, const void* handle) {
  for (auto& [name, session] : sessions) {
    // A stale handle can have become that of another session.
    const bool isMeant = call.misuse == Call::staleHandle ? session.handle == handle : name == call.session;
    if (!session.isOpen || !isMeant) continue;
    session.isOpen = false;
    std::erase(opened, name);
    buffers.erase(handle);
    return;
  }
}

void Client::restore() {
  setAnswers({});
  ctx_option_t* list = nullptr;
  for (const int name : opened) {
    ctx_close_session(sessions.at(name).handle, &list);
    ctx_option_release(list);
    list = nullptr;
  }
  sessions.clear();
  opened.clear();
  buffers.clear();
  restoreLibrary(std::exchange(gaveTemplates, false), std::exchange(openedGestures, false));
}

void restoreLibrary(bool gaveTemplates, bool openedGestures) {
  setAnswers({});
  ctx_option_t* list = nullptr;
  ctx_uninit();
  if (gaveTemplates) {
    const std::string empty = "\"0000" + std::string(1800, '0') + '"';
    void* handle = ctx_open_session("DTWGS");
    ctx_set_option(handle, 0, (R"({"template1":)" + empty + R"(,"template2":)" + empty + '}').c_str(), &list);
    ctx_close_session(handle, &list);
  }
  if (openedGestures) {
    uint8_t record[24] = {1};
    void* result = nullptr;
    int length = 0;
    void* handle = ctx_open_session("GSPX");
    ctx_dispatch_data(handle, record, sizeof record, &result, &length);
    record[0] = 0;  // the timestamp that counts as known at the beginning, now without a gesture
    ctx_dispatch_data(handle, record, sizeof record, &result, &length);
    ctx_close_session(handle, &list);
  }
  ctx_uninit();
  if (device != nullptr) {
    audio_hal_activate();
    audio_hal_deactivate();
  }
  Observation ignored;
  observePlatform(ignored);
}

Outcome makeOnModel(Model& model, const Call& call, const void* handle, const void* opened) {
  model.answers = call.answers;
  const std::string name = sensorNameOf(call);
  const char* sensor = call.misuse == Call::nullName ? nullptr : name.c_str();
  const bool hasOut = call.misuse != Call::nullOut;
  switch (call.what) {
    case Call::open:
      return model.open(sensor, opened);
    case Call::setOption:
      return model.setOption(handle, call.option.isNull ? nullptr : call.option.text().c_str(), hasOut);
    case Call::dispatch:
    case Call::dispatchToSensor: {
      const uint8_t nothing = 0;
      const uint8_t* data = call.record.empty() ? &nothing : call.record.data();
      return model.dispatch(handle, call.misuse == Call::nullData ? nullptr : data,
                            call.misuse == Call::negativeLength ? -1 : static_cast<int>(call.record.size()), hasOut,
                            call.misuse != Call::nullLength);
    }
    case Call::close:
      return model.close(handle, hasOut);
    case Call::uninit:
      return model.uninit();
    case Call::audioInit:
      return model.audioInit();
    case Call::audioActivate:
      return model.audioActivate();
    case Call::audioDeactivate:
      return model.audioDeactivate();
    case Call::find:
      return model.find(sensor);
  }
  return {};
}

// --- differences in words

namespace {

std::string words(int number) {
  return std::to_string(number);
}
std::string words(bool yes) {
  return yes ? "yes" : "no";
}
std::string words(const std::string& text) {
  return text;
}
std::string words(const model::LogLine& line) {
  return std::to_string(line.priority) + ' ' + line.tag + ": \"" + line.text + '"';
}
std::string words(const model::SampleGroup& group) {
  std::string text = std::to_string(group.count) + (group.last ? " last:" : ":");
  for (const int16_t sample : group.samples) text += ' ' + std::to_string(sample);
  return text;
}
std::string words(uint8_t byte) {
  constexpr const char* kDigits = "0123456789abcdef";
  return {kDigits[byte >> 4], kDigits[byte & 15]};
}
std::string words(const Property& property) {
  std::string text = std::to_string(property.id) + '=';
  for (const char byte : property.value) text += words(static_cast<uint8_t>(byte));
  return text;
}
template <class Element>
std::string words(const std::vector<Element>& elements) {
  std::string text = "[";
  for (const Element& element : elements) text += ' ' + words(element);
  return text + " ]";
}
std::string words(const std::optional<PropertyList>& list) {
  return list ? words(*list) : "null";
}

template <class Value>
void compare(std::string& text, const char* what, const Value& expected, const Value& actual) {
  if (expected == actual) return;
  text += std::string(what) + ": expected " + words(expected) + ", but it is " + words(actual) + "; ";
}

}  // namespace

std::string difference(const Outcome& expected, const Outcome& actual) {
  std::string text;
  compare(text, "returned", expected.returned, actual.returned);
  compare(text, "stores a list", expected.storesList, actual.storesList);
  compare(text, "list", expected.list, actual.list);
  compare(text, "delivers", static_cast<int>(expected.delivers), static_cast<int>(actual.delivers));
  compare(text, "result", expected.result, actual.result);
  compare(text, "log", expected.log, actual.log);
  compare(text, "calls of the platform", expected.calls, actual.calls);
  compare(text, "groups fed to the engine", expected.groups, actual.groups);
  compare(text, "starts of the engine", expected.engineStarts, actual.engineStarts);
  compare(text, "closes of the engine", expected.engineCloses, actual.engineCloses);
  return text;
}

}  // namespace oracle
