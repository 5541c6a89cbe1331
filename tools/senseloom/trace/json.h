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
// Appends an element to an array.
void appendElement(const Json& array, Json value);

// A string. JSON cannot hold what is not UTF-8: if a text has such bytes, all beyond ASCII are shown as their numbers.
Json textJson(const std::string& text);

// The text of a member of an object; empty if it has none.
std::string textMember(const json_t* object, const char* key);

}  // namespace senseloom::tool
