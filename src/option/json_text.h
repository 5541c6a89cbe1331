#pragma once

#include <jansson.h>

#include <memory>

namespace senseloom {

struct JsonRelease {
  void operator()(json_t* json) const { json_decref(json); }
};
using JsonRoot = std::unique_ptr<json_t, JsonRelease>;

// What a JSON text stands for; null for null, for text that is not JSON, and when there is not as much memory as
// reading it can take. Numbers are read as in the "C" locale, whatever the caller's is.
JsonRoot readJson(const char* text);

}  // namespace senseloom
