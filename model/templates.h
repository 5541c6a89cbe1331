#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <string>

namespace senseloom::model {

// The gesture templates that option strings store. All sessions share them.
class Templates {
 public:
  static constexpr size_t kSlots = 2;

  // Stores the template that a text holds: four hexadecimal digits of length, then two for each byte. False, with
  // nothing stored, when it is no such text or has more than 900 bytes.
  bool store(size_t slot, const std::string& text);

  // The length that the text declared, whatever it held; 0: nothing stored.
  size_t length(size_t slot) const { return slots[slot].length; }
  std::string bytes(size_t slot, size_t length) const;

  bool operator==(const Templates&) const = default;

 private:
  static constexpr int kMostBytes = 900;
  struct Slot {
    std::array<uint8_t, kMostBytes> data{};
    size_t length = 0;
    bool operator==(const Slot&) const = default;
  };
  std::array<Slot, kSlots> slots;
};

}  // namespace senseloom::model
