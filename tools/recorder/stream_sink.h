#pragma once

#include <sys/stat.h>

#include <string>

#include "own_descriptor.h"
#include "trace_sink.h"

namespace senseloom::trace {

// A pipe or a character device, which gets each line as it comes. A reader that falls behind is waited for; one that
// does not read for a second is given up until it reads again.
class StreamSink final : public TraceSink {
 public:
  // The descriptor belongs to this object.
  explicit StreamSink(int file) : descriptor(file) {}

  const char* append(std::string_view lines) override;
  bool takesAllParts() const override { return true; }

 private:
  const char* writeAll(std::string& text);

  OwnDescriptor descriptor;
  bool isStuck = false;
  std::string rest;  // of a line that was begun, and has to be ended before another one
};

// Opens a pipe that somebody reads, or a device.
OpenedSink openStream(const std::string& name, const struct stat& status);

}  // namespace senseloom::trace
