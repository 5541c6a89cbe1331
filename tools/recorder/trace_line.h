#pragma once

#include <cstddef>
#include <cstdint>
#include <span>
#include <string>
#include <string_view>

#include "senseloom.h"

namespace senseloom::trace {

// One line of a trace, a JSON object, put together member by member. It is written by hand and into one buffer, since a
// service waits for it.
class TraceLine {
 public:
  void clear() { buffer.clear(); }
  bool isEmpty() const { return buffer.empty(); }

  // A text becomes a string. JSON can not hold what is not UTF-8, so a text beyond ASCII becomes its bytes, in a member
  // with "Hex" at the end of its name.
  void addText(std::string_view key, std::string_view text);
  void addInteger(std::string_view key, int64_t value);
  void addNull(std::string_view key);
  // {"hex":"..."}, the form that records have in a trace.
  void addBytes(std::string_view key, std::span<const uint8_t> bytes);
  // An array of {"id","size","value"} with the value as hexadecimal digits.
  void addProperties(std::string_view key, const ctx_option_t& list);

  // The whole line, with its line feed. Nothing is added to it after that.
  std::string_view finish();

 private:
  void addKey(std::string_view key);
  void addQuoted(std::string_view text);

  std::string buffer;
};

}  // namespace senseloom::trace
