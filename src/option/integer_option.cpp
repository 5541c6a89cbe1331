#include "option/integer_option.h"

#include <android/log.h>

#include <algorithm>

#include "option/json_text.h"

namespace senseloom {
namespace {

// The setting that a key's value leads to.
int32_t accept(const OptionKey& key, const char* tag, int32_t value) {
  if (key.range.contains(value)) return value;
  if (key.message != nullptr) __android_log_print(ANDROID_LOG_ERROR, tag, key.message, value);
  if (key.outOfRange == OutOfRange::clamped) return std::clamp(value, key.range.low, key.range.high);
  return key.outOfRange == OutOfRange::kept ? value : key.fallback;
}

}  // namespace

int32_t readInteger(const json_t* root, const char* key, int32_t fallback) {
  const json_t* value = json_object_get(root, key);
  return json_is_integer(value) ? static_cast<int32_t>(json_integer_value(value)) : fallback;
}

bool readKeys(const OptionDescription& kind, const char* text, std::span<int32_t> given, std::span<int32_t> settings) {
  if (text == nullptr && !kind.nullIsUnparsable) return false;

  const JsonRoot root = readJson(text);
  if (root == nullptr) {
    if (kind.unparsableMessage != nullptr) {
      __android_log_print(ANDROID_LOG_ERROR, kind.logTag, kind.unparsableMessage, text != nullptr ? text : "(null)");
    }
    return false;
  }

  for (size_t i = 0; i < kind.keys.size(); ++i) {
    const OptionKey& key = kind.keys[i];
    given[i] = readInteger(root.get(), key.name, key.defaultValue);
    settings[i] = accept(key, kind.logTag, given[i]);
  }
  return true;
}

ctx_option_t* makeList(const OptionDescription& kind, std::span<int32_t> values) {
  const auto count = static_cast<int>(kind.properties.size());
  ctx_option_t* list = Option::newOption(count);
  for (int i = 0; i < count; ++i) {
    const auto entry = static_cast<size_t>(i);
    Option::fillOptionAt(list, i, kind.properties[entry].id, &values[entry], static_cast<int>(sizeof values[entry]));
  }
  return list;
}

}  // namespace senseloom
