#pragma once

#include <jansson.h>

#include <memory>

namespace senseloom {

struct JsonRelease {
  void operator()(json_t* json) const { json_decref(json); }
};
using JsonRoot = std::unique_ptr<json_t, JsonRelease>;

// Thrown in place of std::bad_alloc, whose constructor not every C++ run-time exports.
struct OutOfMemory {};

// What a JSON text stands for; null for null and for text that is not JSON. Throws OutOfMemory when there is not as
// much memory as reading it can take: a client must not hear that its text was no good. Numbers are read as in the "C"
// locale, whatever the caller's is.
JsonRoot readJson(const char* text);

}  // namespace senseloom
