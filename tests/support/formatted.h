#pragma once

#include <cstdarg>
#include <cstdio>
#include <string>

namespace fake {

// What printf() makes of a format and its arguments, which are used up.
[[gnu::format(printf, 1, 0)]] inline std::string formatted(const char* format, va_list arguments) {
  va_list again;
  va_copy(again, arguments);
  std::string text(static_cast<size_t>(std::vsnprintf(nullptr, 0, format, arguments)), '\0');
  std::vsnprintf(text.data(), text.size() + 1, format, again);
  va_end(again);
  return text;
}

}  // namespace fake
