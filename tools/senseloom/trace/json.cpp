#include "trace/json.h"

#include <cstdlib>
#include <new>
#include <utility>

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

}  // namespace senseloom::tool
