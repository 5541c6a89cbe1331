#include "trace/class_names.h"

#include <fstream>
#include <sstream>

#include "input_error.h"

namespace senseloom::tool {

ClassNames readClassNames(const std::string& text) {
  ClassNames names;
  std::ifstream file(text);
  if (text.find(',') == std::string::npos && file) {
    for (std::string line; std::getline(file, line);) names.push_back(line);
    if (names.empty()) throw InputError(text + ": no names of classes are in it");
    return names;
  }
  std::istringstream parts(text);
  for (std::string part; std::getline(parts, part, ',');) names.push_back(part);
  return names;
}

std::string className(const Sensor& sensor, const ClassNames& names, int64_t number) {
  if (number < 0) return "";
  const auto index = static_cast<size_t>(number);
  if (!names.empty()) return index < names.size() ? names[index] : "";
  return index < sensor.classNames.size() ? std::string(1, sensor.classNames[index]) : "";
}

}  // namespace senseloom::tool
