#include "trace/json.h"

#include <cstdint>
#include <cstdlib>
#include <new>
#include <utility>

#include "trace/hex.h"

namespace senseloom::tool {

std::string compactText(const json_t* json) {
  struct Free {
    void operator()(char* text) const { std::free(text); }
  };
  const std::unique_ptr<char, Free> text(json_dumps(json, JSON_COMPACT));
  if (text == nullptr) throw std::bad_alloc();
  return text.get();
}

void addMember(const Json& object, const char* key, Json value) {
  if (json_object_set_new(object.get(), key, value.release()) != 0) throw std::bad_alloc();
}

void appendElement(const Json& array, Json value) {
  if (json_array_append_new(array.get(), value.release()) != 0) throw std::bad_alloc();
}

Json textJson(const std::string& text) {
  Json string(json_stringn(text.data(), text.size()));
  if (string != nullptr) return string;
  std::string shown;
  for (const char c : text) {
    const auto byte = static_cast<uint8_t>(c);
    shown += byte < 0x80 ? std::string(1, c) : "\\x" + toHex({&byte, 1});
  }
  return Json(json_stringn(shown.data(), shown.size()));
}

std::string textMember(const json_t* object, const char* key) {
  const char* text = json_string_value(json_object_get(object, key));
  return text == nullptr ? "" : text;
}

}  // namespace senseloom::tool
