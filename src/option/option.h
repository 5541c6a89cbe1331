#pragma once

#include <cstdint>
#include <memory>

#include "senseloom.h"

namespace senseloom {

// The tag of every log line about sessions and options that names no other.
inline constexpr const char* kLogTag = "libsenseloom";

// What one client asked of a sensor or, as the sensor's merged option, what all its clients asked together.
class Option {
 public:
  virtual ~Option() = default;

  // Takes the settings of a JSON option string. Returns 0 when the option is usable (rejected values were logged and
  // replaced), -1 when the string was refused; the settings are then as before.
  virtual int parse(const char* text) = 0;

  // Folds the settings of another option of the same kind into this one. The property list's values are not touched.
  virtual void merge(const Option& other) = 0;

  // A new option of the same kind with the same settings.
  virtual std::unique_ptr<Option> clone() const = 0;

  // Stores a new property list, which describes this option and points into it, in `*out`; null when it cannot be
  // made. The caller releases it with ctx_option_release().
  virtual void setProperty(ctx_option_t** out) = 0;

  // A list of `n` entries of id 0, size 0 and value null, for ctx_option_release(); null when n is negative or memory
  // ran out.
  static ctx_option_t* newOption(int n);

  // Writes one entry of a list. Does nothing when the list is null or has no such entry.
  static void fillOptionAt(ctx_option_t* list, int index, int id, void* value, int size);
};

}  // namespace senseloom
