#pragma once

#include <jansson.h>

#include <memory>
#include <string>

namespace senseloom::tool {

struct JsonRelease {
  void operator()(json_t* json) const { json_decref(json); }
};
using Json = std::unique_ptr<json_t, JsonRelease>;

// The text of an object or array on one line, without blanks.
std::string compactText(const json_t* json);

// Appends a member to an object.
void addMember(const Json& object, const char* key, Json value);

}  // namespace senseloom::tool
