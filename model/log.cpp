#include "log.h"

#include <cstdarg>
#include <cstdio>

namespace senseloom::model {

const std::string& write(Log& log, int priority, const char* tag, const char* format, ...) {
  va_list arguments;
  va_start(arguments, format);
  va_list again;
  va_copy(again, arguments);
  std::string text(static_cast<size_t>(std::vsnprintf(nullptr, 0, format, arguments)), '\0');
  std::vsnprintf(text.data(), text.size() + 1, format, again);
  va_end(again);
  va_end(arguments);
  return log.emplace_back(LogLine{priority, tag, std::move(text)}).text;
}

}  // namespace senseloom::model
