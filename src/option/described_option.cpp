#include "option/described_option.h"

#include <android/log.h>

#include <algorithm>

namespace senseloom {
namespace {

// The value that a key's setting takes.
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

DescribedOption::DescribedOption(const OptionDescription& description) : described(description) {
  for (size_t i = 0; i < described.keys.size(); ++i) settings[i] = described.keys[i].defaultValue;
}

DescribedOption::DescribedOption(const DescribedOption& other)
    : Option(other), settings(other.settings), described(other.described) {}

int DescribedOption::parse(const char* text) {
  if (text == nullptr && !described.nullIsUnparsable) return -1;

  const JsonRoot root(json_loads(text, 0, nullptr));
  if (root == nullptr) {
    if (described.unparsableMessage != nullptr) {
      __android_log_print(ANDROID_LOG_ERROR, described.logTag, described.unparsableMessage,
                          text != nullptr ? text : "(null)");
    }
    return described.unparsableResult;
  }

  Values read{};
  for (size_t i = 0; i < described.keys.size(); ++i) {
    const OptionKey& key = described.keys[i];
    read[i] = readInteger(root.get(), key.name, key.defaultValue);
    settings[i] = accept(key, described.logTag, read[i]);
  }
  mirrors = {};
  adjust(read);
  return 0;
}

void DescribedOption::setProperty(ctx_option_t** out) {
  if (out == nullptr) return;
  *out = newOption(static_cast<int>(described.properties.size()));
  for (size_t i = 0; i < described.properties.size(); ++i) {
    const OptionProperty& property = described.properties[i];
    mirrors[i] = property.key == OptionProperty::kComputed ? computeProperty(property.id)
                                                           : settings[static_cast<size_t>(property.key)];
    fillOptionAt(*out, static_cast<int>(i), property.id, &mirrors[i], static_cast<int>(sizeof mirrors[i]));
  }
}

}  // namespace senseloom
