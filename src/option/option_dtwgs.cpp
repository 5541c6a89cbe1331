#include "option/option_dtwgs.h"

#include <android/log.h>

#include <algorithm>
#include <cstddef>
#include <cstring>

#include "bytes.h"
#include "option/integer_option.h"
#include "option/json_text.h"

namespace senseloom {
namespace {

constexpr const OptionKey& kModeKey = kDTWGS.keys[kDTWGS.key("mode")];
constexpr const OptionKey& kMaskKey = kDTWGS.keys[kDTWGS.key("classMask")];
constexpr const OptionKey& kLevelKey = kDTWGS.keys[kDTWGS.key("level")];
constexpr const OptionKey& kIndexKey = kDTWGS.keys[kDTWGS.key("index")];

int32_t read(const json_t* root, const OptionKey& key) {
  return readInteger(root, key.name, key.defaultValue);
}

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
  const JsonRoot root = readJson(text);
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

  const Settings given = {
      .mode = read(root.get(), kModeKey),
      .classMask = read(root.get(), kMaskKey),
      .level = read(root.get(), kLevelKey),
      .index = read(root.get(), kIndexKey),
  };
  if (given.mode != kEnroll && given.mode != kMatch) return refuse(kModeKey, given.mode);
  if (given.mode == kMatch && !kMaskKey.range.contains(given.classMask)) return refuse(kMaskKey, given.classMask);
  if (given.mode == kMatch && !kLevelKey.range.contains(given.level)) return refuse(kLevelKey, given.level);
  if (given.mode == kEnroll && !kIndexKey.range.contains(given.index)) return refuse(kIndexKey, given.index);

  settings = given;
  levelMirror = 0;
  templateNumberMirrors = {};
  bit0Count = bit1Count = 0;
  valid = true;
  return 0;
}

void OptionDTWGS::merge(const Option& other) {
  const Settings& theirs = static_cast<const OptionDTWGS&>(other).settings;
  settings.classMask |= theirs.classMask;
  settings.level = std::min(settings.level, theirs.level);
  if (bitAt(theirs.mode, 0) && ++bit0Count > 1) valid = false;
  if (bitAt(theirs.mode, 1) && ++bit1Count > 1) valid = false;
  settings.mode |= theirs.mode;
}

std::unique_ptr<Option> OptionDTWGS::clone() const {
  auto copy = std::make_unique<OptionDTWGS>();
  copy->settings = settings;
  copy->settings.index = 0;  // never merged, on purpose: which slot a session enrolls concerns that session alone
  return copy;
}

void OptionDTWGS::setProperty(ctx_option_t** out) {
  if (out != nullptr) *out = makeList();
}

ctx_option_t* OptionDTWGS::makeList() {
  if (!valid) {
    __android_log_print(ANDROID_LOG_DEBUG, kLogTag, "option invalid");
    return nullptr;
  }
  switch (settings.mode) {
    case kEnroll:
    case 2:  // no string can set it, but it is another way of enrolling
      return newOption(0);
    case kMatch:
      return makeMatchingList();
    default:
      __android_log_print(ANDROID_LOG_DEBUG, kLogTag, "option mode incompatible: %d", settings.mode);
      return nullptr;
  }
}

ctx_option_t* OptionDTWGS::makeMatchingList() {
  const auto isListed = [this](size_t slot) {
    return bitAt(settings.classMask, static_cast<int32_t>(slot)) && tempInst.slots[slot].templateLength > 0;
  };
  ctx_option_t* list = newOption(1 + (isListed(0) ? 2 : 0) + (isListed(1) ? 2 : 0));
  levelMirror = settings.level;
  int entry = 0;
  fillOptionAt(list, entry++, 121, &levelMirror, sizeof levelMirror);
  for (size_t slot = 0; slot < tempInst.slots.size(); ++slot) {
    if (!isListed(slot)) continue;
    templateNumberMirrors[slot] = static_cast<int32_t>(slot);
    fillOptionAt(list, entry++, 122, &templateNumberMirrors[slot], sizeof templateNumberMirrors[slot]);
    // Points into the store, so that its bytes change when any later option string brings a template.
    auto& stored = tempInst.slots[slot];
    fillOptionAt(list, entry++, 123, stored.templateData.data(), stored.templateLength);
  }
  return list;
}

}  // namespace senseloom
