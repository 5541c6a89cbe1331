#include "support.h"

#include <android/log.h>

#include <cstdlib>
#include <utility>

namespace {

std::vector<LogLine> log_lines;

void record(const __android_logger_data* data, const char* text) {
  log_lines.push_back({data->priority, data->tag, text});
}

void setVariable(const std::string& name, const char* value) {
  if (value != nullptr) {
    setenv(name.c_str(), value, 1);
  } else {
    unsetenv(name.c_str());
  }
}

}  // namespace

ScopedVariable::ScopedVariable(const char* variable, const char* value) : name(variable) {
  if (const char* const old = std::getenv(variable)) before = old;
  setVariable(name, value);
}

ScopedVariable::~ScopedVariable() {
  setVariable(name, before ? before->c_str() : nullptr);
}

// By itself the log leaves out what is below INFO.
ScopedLog::ScopedLog() : minimumBefore(__android_log_set_minimum_priority(ANDROID_LOG_VERBOSE)) {
  __android_log_set_logger(record);
}

ScopedLog::~ScopedLog() {
  __android_log_set_logger(__android_log_stderr_logger);
  __android_log_set_minimum_priority(minimumBefore);
  log_lines.clear();
}

std::vector<LogLine> ScopedLog::take() {
  return std::exchange(log_lines, {});
}
