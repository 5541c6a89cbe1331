#include "call.h"

#include <jansson.h>

#include <cstdlib>
#include <memory>

namespace oracle {
namespace {

struct Release {
  void operator()(json_t* json) const { json_decref(json); }
};
using Json = std::unique_ptr<json_t, Release>;

constexpr const char* kCallNames[] = {"open",
                                      "set_option",
                                      "dispatch",
                                      "dispatch",
                                      "close",
                                      "uninit",
                                      "audio_hal_init",
                                      "audio_hal_activate",
                                      "audio_hal_deactivate",
                                      "getSensor"};
constexpr const char* kMisuseNames[] = {
    "",          "null name",       "long name",    "null out",       "null length",
    "null data", "negative length", "stale handle", "unknown handle", "null handle"};

void add(const Json& object, const char* key, json_t* value) {
  json_object_set_new(object.get(), key, value);
}

// JSON text is UTF-8; bytes that are not, which only raw option strings have, are written as if they were Latin-1.
json_t* textOf(const std::string& text) {
  if (json_t* json = json_stringn(text.data(), text.size())) return json;
  std::string utf8;
  for (const char c : text) {
    const auto byte = static_cast<uint8_t>(c);
    if (byte < 0x80) {
      utf8 += c;
    } else {
      utf8 += static_cast<char>(0xC0 | byte >> 6);
      utf8 += static_cast<char>(0x80 | (byte & 0x3F));
    }
  }
  return json_string(utf8.c_str());
}

json_t* recordOf(const Bytes& bytes) {
  constexpr const char* kDigits = "0123456789abcdef";
  std::string hex;
  for (const uint8_t byte : bytes) {
    hex += kDigits[byte >> 4];
    hex += kDigits[byte & 15];
  }
  return json_pack("{s:s}", "hex", hex.c_str());
}

json_t* answersOf(const Answers& answers) {
  const Answers usual;
  Json object(json_object());
  if (answers.get != usual.get) add(object, "get", json_integer(answers.get));
  if (answers.open != usual.open) add(object, "open", json_integer(answers.open));
  if (answers.gives != usual.gives) add(object, "gives", json_boolean(answers.gives));
  if (answers.version != usual.version) add(object, "version", json_integer(answers.version));
  if (answers.activate != usual.activate) add(object, "activate", json_integer(answers.activate));
  if (answers.deactivate != usual.deactivate) add(object, "deactivate", json_integer(answers.deactivate));
  if (answers.starts != usual.starts) add(object, "starts", json_boolean(answers.starts));
  if (!answers.names.empty()) {
    Json names(json_array());
    for (const auto& name : answers.names) json_array_append_new(names.get(), name ? textOf(*name) : json_null());
    add(object, "names", names.release());
  }
  return object.release();
}

Json objectOf(const Call& call) {
  Json object(json_object());
  add(object, "call", json_string(nameOf(call.what)));
  switch (call.what) {
    case Call::open:
    case Call::setOption:
    case Call::dispatch:
    case Call::close:
      add(object, "session", json_sprintf("s%d", call.session));
      break;
    default:
      break;
  }
  switch (call.what) {
    case Call::open:
    case Call::dispatchToSensor:
    case Call::find:
      add(object, "sensor", call.otherName ? textOf(*call.otherName) : json_string(kSensorNames[call.sensor]));
      break;
    default:
      break;
  }
  if (call.what == Call::setOption) {
    add(object, "option", call.option.isNull ? json_null() : textOf(call.option.text()));
  }
  if (call.what == Call::dispatch || call.what == Call::dispatchToSensor) add(object, "record", recordOf(call.record));
  if (call.misuse != Call::none) add(object, "misuse", json_string(nameOf(call.misuse)));
  if (call.answers != Answers{}) add(object, "platform", answersOf(call.answers));
  return object;
}

std::string textOf(const Json& json) {
  const std::unique_ptr<char, decltype(&std::free)> text(json_dumps(json.get(), JSON_COMPACT), std::free);
  return text.get();
}

}  // namespace

std::string OptionText::text() const {
  if (verbatim) return *verbatim;
  std::string text = "{";
  for (const auto& [key, value] : members) {
    if (text.size() > 1) text += ',';
    text += '"' + key + "\":" + value;
  }
  return text + '}';
}

const char* nameOf(Call::What what) {
  return kCallNames[what];
}
const char* nameOf(Call::Misuse misuse) {
  return kMisuseNames[misuse];
}

bool isTraceable(const Call& call) {
  return call.misuse == Call::none && !call.otherName && call.what <= Call::uninit;
}

std::string toJson(const Call& call) {
  return textOf(objectOf(call));
}

std::string toTrace(const Sequence& sequence) {
  std::string trace;
  Json notes(json_array());
  const auto write = [&](const Call& call) {
    const Json object = objectOf(call);
    if (json_array_size(notes.get()) > 0) {
      add(object, "before", notes.release());
      notes.reset(json_array());
    }
    trace += textOf(object) + '\n';
  };
  for (const Call& call : sequence) {
    if (isTraceable(call)) {
      write(call);
    } else {
      json_array_append_new(notes.get(), objectOf(call).release());
    }
  }
  if (json_array_size(notes.get()) > 0) write({});  // they need a call to stand in
  return trace;
}

}  // namespace oracle
