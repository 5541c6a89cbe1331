#pragma once

#include <string>

#include "trace/json.h"

namespace senseloom::tool {

// The value that a JSON text stands for, or null.
inline Json parsed(const std::string& text) {
  return Json(json_loads(text.c_str(), 0, nullptr));
}

}  // namespace senseloom::tool
