#include "explain/log_capture.h"

#include <android/log.h>

#include <utility>

namespace senseloom::tool {
namespace {

// The logger is a plain function and knows of no object.
model::Log lines;

void keep(const __android_logger_data* data, const char* message) {
  lines.push_back({data->priority, data->tag == nullptr ? "" : data->tag, message});
}

}  // namespace

LogCapture::LogCapture() : priorityBefore(__android_log_set_minimum_priority(ANDROID_LOG_DEBUG)) {
  __android_log_set_logger(keep);
}

LogCapture::~LogCapture() {
  __android_log_set_logger(__android_log_stderr_logger);
  __android_log_set_minimum_priority(priorityBefore);
  lines.clear();
}

model::Log LogCapture::take() {
  return std::exchange(lines, {});
}

}  // namespace senseloom::tool
