#include "case_file.h"

#include <set>
#include <string_view>
#include <utility>

#include "call_reader.h"
#include "input_error.h"

namespace oracle {
namespace {

using senseloom::tool::addMember;
using senseloom::tool::InputError;
using senseloom::tool::Json;

// Repetition in a string: "<3 ab>" stands for "ababab".
std::string expanded(const std::string& text) {
  std::string result;
  for (size_t i = 0; i < text.size();) {
    const size_t digits = text[i] == '<' ? text.find_first_not_of("0123456789", i + 1) : std::string::npos;
    const size_t end = digits == std::string::npos ? std::string::npos : text.find('>', digits);
    if (end == std::string::npos || digits == i + 1 || text[digits] != ' ') {
      result += text[i++];
      continue;
    }
    const std::string repeated = text.substr(digits + 1, end - digits - 1);
    for (int times = std::stoi(text.substr(i + 1)); times > 0; --times) result += repeated;
    i = end + 1;
  }
  return result;
}

Json expanded(json_t* value);

// Repetition in an array: {"times":3,"of":x} stands for x, x, x.
Json expandedArray(json_t* array) {
  Json result(json_array());
  for (size_t i = 0; i < json_array_size(array); ++i) {
    json_t* element = json_array_get(array, i);
    json_t* repeated = json_object_get(element, "of");
    const json_int_t times = repeated == nullptr ? 1 : json_integer_value(json_object_get(element, "times"));
    const Json one = expanded(repeated == nullptr ? element : repeated);
    for (json_int_t n = 0; n < times; ++n) json_array_append(result.get(), one.get());
  }
  return result;
}

Json expanded(json_t* value) {
  if (json_is_string(value)) return Json(json_string(expanded(json_string_value(value)).c_str()));
  if (json_is_array(value)) return expandedArray(value);
  if (!json_is_object(value)) return Json(json_incref(value));
  Json result(json_object());
  const char* key;
  json_t* member;
  json_object_foreach(value, key, member) addMember(result, key, expanded(member));
  return result;
}

// A word that is mistyped must not leave out what it was to check.
void checkMembers(json_t* object, const std::set<std::string_view>& known) {
  const char* key;
  json_t* value;
  json_object_foreach(object, key, value) {
    if (known.count(key) == 0) throw InputError("unknown member \"" + std::string(key) + '"');
  }
}

std::set<std::string_view> membersOf(Call::What what) {
  std::set<std::string_view> members = {"call", "note", "misuse", "platform", "platformCalls", "log", "device"};
  if (what != Call::uninit) members.insert("returned");
  switch (what) {
    case Call::open:
      members.insert({"session", "sensor"});
      break;
    case Call::setOption:
      members.insert({"session", "option", "optionHex", "properties", "out"});
      break;
    case Call::dispatch:
    case Call::dispatchToSensor:
      members.insert({"session", "sensor", "record", "result", "groups"});
      break;
    case Call::close:
      members.insert({"session", "properties", "out"});
      break;
    case Call::find:
      members.insert("sensor");
      break;
    default:
      break;
  }
  return members;
}

class CaseReader {
 public:
  CaseReader(std::istream& is, const std::string& file) : name(file), stream(is) {}

  std::vector<Case> read() {
    for (std::string line; std::getline(stream, line);) {
      ++lineNumber;
      if (line.find_first_not_of(" \t\r") == std::string::npos) continue;
      located([&] { readLine(line); });
    }
    if (cases.empty()) throw InputError(name + ": no cases");
    located([&] { finish(); });
    return std::move(cases);
  }

 private:
  void readLine(const std::string& line) {
    json_error_t error;
    const Json read(json_loadb(line.data(), line.size(), JSON_REJECT_DUPLICATES, &error));
    if (read == nullptr) throw InputError(std::string("not JSON: ") + error.text);
    if (!json_is_object(read.get())) throw InputError("not a JSON object");
    Json object = expanded(read.get());
    if (json_object_get(object.get(), "case") != nullptr) {
      begin(object.get());
    } else if (cases.empty()) {
      throw InputError("a call before the first case");
    } else if (json_object_get(object.get(), "look") != nullptr) {
      readLook(std::move(object));
    } else if (json_object_get(object.get(), "call") != nullptr) {
      readCall(std::move(object));
    } else {
      checkMembers(object.get(), {"note"});
    }
  }

  void begin(json_t* object) {
    checkMembers(object, {"case", "note"});
    finish();
    const char* caseName = json_string_value(json_object_get(object, "case"));
    const char* note = json_string_value(json_object_get(object, "note"));
    if (caseName == nullptr || *caseName == '\0') throw InputError("a case without a name");
    if (note == nullptr || *note == '\0') throw InputError("case \"" + std::string(caseName) + "\" has no note");
    if (!names.insert(caseName).second) throw InputError("case \"" + std::string(caseName) + "\" is there twice");
    cases.push_back({caseName, note, lineNumber, {}, {}});
    reader = {};
  }

  // Each case is followed by its calls.
  void finish() {
    if (cases.empty()) return;
    if (cases.back().steps.empty()) throw InputError("case \"" + cases.back().name + "\" has no calls");
    cases.back().sessions = reader.sessions();
  }

  void readCall(Json object) {
    const Call call = reader.read(object.get());
    checkMembers(object.get(), membersOf(call.what));
    if (call.what != Call::uninit && json_object_get(object.get(), "returned") == nullptr) {
      throw InputError("missing \"returned\"");
    }
    cases.back().steps.push_back({lineNumber, call, -1, std::move(object)});
  }

  void readLook(Json object) {
    checkMembers(object.get(), {"look", "note", "properties"});
    const char* sensorName = json_string_value(json_object_get(object.get(), "look"));
    const int sensor = sensorName == nullptr ? -1 : sensorNamed(sensorName);
    if (sensor < 0) throw InputError("\"look\" must name a sensor");
    cases.back().steps.push_back({lineNumber, {}, sensor, std::move(object)});
  }

  // Adds to an error where it is.
  template <class Action>
  void located(Action action) {
    try {
      action();
    } catch (const InputError& error) {
      throw InputError(name + ':' + std::to_string(lineNumber) + ": " + error.what());
    }
  }

  const std::string name;
  std::istream& stream;
  int lineNumber = 0;
  std::vector<Case> cases;
  std::set<std::string> names;
  CallReader reader;
};

}  // namespace

std::vector<Case> readCases(std::istream& stream, const std::string& file) {
  return CaseReader(stream, file).read();
}

}  // namespace oracle
