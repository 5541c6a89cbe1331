#pragma once

#include <jansson.h>

#include <cstdint>
#include <initializer_list>
#include <limits>
#include <string>
#include <string_view>

// What the fields of a record in a trace must be. All functions throw InputError, with the name of the field.
namespace senseloom::tool {

// What error messages call a field.
std::string quotedField(std::string_view field);

// An object must have these fields and no others. Null pointers among them stand for no field.
void checkFields(json_t* object, std::initializer_list<const char*> fields);

int64_t integerField(const json_t* value, std::string_view field, int64_t low, int64_t high);

template <class Integer>
Integer integerField(const json_t* value, std::string_view field) {
  using Limits = std::numeric_limits<Integer>;
  return static_cast<Integer>(integerField(value, field, Limits::min(), Limits::max()));
}

}  // namespace senseloom::tool
