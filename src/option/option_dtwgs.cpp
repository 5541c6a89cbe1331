#include "option/option_dtwgs.h"

#include <android/log.h>

#include <algorithm>
#include <cstddef>
#include <cstring>

#include "bytes.h"
#include "option/described_option.h"

namespace senseloom {
namespace {

const OptionKey& kModeKey = kDTWGSKeys[0];
const OptionKey& kMaskKey = kDTWGSKeys[1];
const OptionKey& kLevelKey = kDTWGSKeys[2];
const OptionKey& kIndexKey = kDTWGSKeys[3];

// Only 0-9 and a-f give their value; anything else, uppercase included, gives a wrong one. Templates are written by the
// enrolling side, which uses lowercase.
int hexDigit(char c) {
  return c >= 'a' && c <= 'z' ? c - 'a' + 10 : c - '0';
}

int hexNumber(const char* digits, size_t count) {
  int number = 0;
  for (size_t i = 0; i < count; ++i) number = number * 16 + hexDigit(digits[i]);
  return number;
}

// Logs a rejected value; the result of the parse that it ends.
int refuse(const OptionKey& key, int32_t value) {
  __android_log_print(ANDROID_LOG_ERROR, kLogTag, key.message, value);
  return -1;
}

}  // namespace

constinit OptionDTWGS::DTWGSTemp OptionDTWGS::tempInst{};

bool OptionDTWGS::DTWGSTemp::setTemplate(int which, const char* text) {
  constexpr size_t kLengthDigits = 4;
  const size_t digits = text != nullptr ? std::strlen(text) : 0;
  if (digits < kLengthDigits) return false;
  const int length = hexNumber(text, kLengthDigits);
  const size_t bytes = (digits - kLengthDigits) / 2;  // an odd last digit is dropped
  if (length < 0 || length > kCapacity || bytes > kCapacity) return false;

  Slot& slot = slots[which == 1 ? 0 : 1];
  // The declared length is what callers get; whether as many bytes follow is not checked, on purpose.
  slot.templateLength = length;
  for (size_t i = 0; i < bytes; ++i) {
    slot.templateData[i] = static_cast<uint8_t>(hexNumber(text + kLengthDigits + 2 * i, 2));
  }
  return true;
}

int OptionDTWGS::parse(const char* text) {
  const JsonRoot root(json_loads(text, 0, nullptr));
  if (root == nullptr) return -1;

  // Templates are stored before anything is checked, and so even when the rest of the string is refused.
  bool templatesStored = true;
  for (int slot = 1; slot <= 2; ++slot) {
    const json_t* value = json_object_get(root.get(), kDTWGSStringKeys[slot - 1]);
    if (json_is_string(value) && !tempInst.setTemplate(slot, json_string_value(value))) {
      __android_log_print(ANDROID_LOG_ERROR, kLogTag, "Invalid template%d value", slot);
      templatesStored = false;
    }
  }
  if (!templatesStored) return -1;

  const Settings read = {
      .mode = readInteger(root.get(), kModeKey.name, kModeKey.defaultValue),
      .classMask = readInteger(root.get(), kMaskKey.name, kMaskKey.defaultValue),
      .level = readInteger(root.get(), kLevelKey.name, kLevelKey.defaultValue),
      .index = readInteger(root.get(), kIndexKey.name, kIndexKey.defaultValue),
  };
  if (read.mode != kEnroll && read.mode != kMatch) return refuse(kModeKey, read.mode);
  if (read.mode == kMatch && !kMaskKey.range.contains(read.classMask)) return refuse(kMaskKey, read.classMask);
  if (read.mode == kMatch && !kLevelKey.range.contains(read.level)) return refuse(kLevelKey, read.level);
  if (read.mode == kEnroll && !kIndexKey.range.contains(read.index)) return refuse(kIndexKey, read.index);

  settings = read;
  levelMirror = 0;
  templateNumberMirrors = {};
  bit0Count = bit1Count = 0;
  valid = true;
  return 0;
}

void OptionDTWGS::merge(const Option& other) {
  const Settings& that = static_cast<const OptionDTWGS&>(other).settings;
  settings.classMask |= that.classMask;
  settings.level = std::min(settings.level, that.level);
  if (bitAt(that.mode, 0) && ++bit0Count > 1) valid = false;
  if (bitAt(that.mode, 1) && ++bit1Count > 1) valid = false;
  settings.mode |= that.mode;
}

std::unique_ptr<Option> OptionDTWGS::clone() const {
  auto copy = std::make_unique<OptionDTWGS>();
  copy->settings = settings;
  copy->settings.index = 0;  // which slot a session enrolls is its own affair and never merged, on purpose
  return copy;
}

void OptionDTWGS::setProperty(ctx_option_t** out) {
  if (out == nullptr) return;
  *out = nullptr;
  if (!valid) {
    __android_log_print(ANDROID_LOG_DEBUG, kLogTag, "option invalid");
    return;
  }
  switch (settings.mode) {
    case kEnroll:
    case 2:  // no string can set it, but it is another way of enrolling
      *out = newOption(0);
      return;
    case kMatch:
      break;
    default:
      __android_log_print(ANDROID_LOG_DEBUG, kLogTag, "option mode incompatible: %d", settings.mode);
      return;
  }

  const auto wanted = [this](int slot) {
    return bitAt(settings.classMask, slot) && tempInst.slots[static_cast<size_t>(slot)].templateLength > 0;
  };
  *out = newOption(1 + (wanted(0) ? 2 : 0) + (wanted(1) ? 2 : 0));
  levelMirror = settings.level;
  int entry = 0;
  fillOptionAt(*out, entry++, 121, &levelMirror, sizeof levelMirror);
  for (int i = 0; i < 2; ++i) {
    if (!wanted(i)) continue;
    auto& slot = tempInst.slots[static_cast<size_t>(i)];
    int32_t& number = templateNumberMirrors[static_cast<size_t>(i)];
    number = i;
    fillOptionAt(*out, entry++, 122, &number, sizeof number);
    fillOptionAt(*out, entry++, 123, slot.templateData.data(), slot.templateLength);
  }
}

}  // namespace senseloom
