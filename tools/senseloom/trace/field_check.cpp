#include "trace/field_check.h"

#include <algorithm>
#include <vector>

#include "input_error.h"
#include "model/nearest_name.h"

namespace senseloom::tool {

std::string quotedField(std::string_view field) {
  return "record field \"" + std::string(field) + '"';
}

void checkFields(json_t* object, std::initializer_list<const char*> fields) {
  const char* key;
  json_t* value;
  std::vector<std::string_view> known;
  for (const char* field : fields) {
    if (field != nullptr) known.emplace_back(field);
  }
  json_object_foreach(object, key, value) {
    if (std::find(known.begin(), known.end(), key) != known.end()) continue;
    throw InputError("unknown " + quotedField(key) + "; the nearest is \"" +
                     std::string(model::nearestName(key, known)) + '"');
  }
  for (const char* field : fields) {
    if (field != nullptr && json_object_get(object, field) == nullptr) {
      throw InputError("missing " + quotedField(field));
    }
  }
}

int64_t integerField(const json_t* value, std::string_view field, int64_t low, int64_t high) {
  if (!json_is_integer(value) || json_integer_value(value) < low || json_integer_value(value) > high) {
    throw InputError(quotedField(field) + " must be an integer from " + std::to_string(low) + " to " +
                     std::to_string(high));
  }
  return json_integer_value(value);
}

}  // namespace senseloom::tool
