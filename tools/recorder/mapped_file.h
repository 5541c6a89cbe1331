#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <utility>

#include "own_descriptor.h"
#include "trace_sink.h"

namespace senseloom::trace {

// A file that is written through memory: a line is in the file as soon as it is copied, without a system call, whatever
// becomes of the process. Room is reserved ahead, as zeros, so that a full disk shows before anything is written; a
// line begins with a zero until all of it is there. The file is not to be shortened by others while it is written: the
// process would be ended by a signal (SIGBUS).
//
// Programs close descriptors that they do not know, and use their numbers for something else. The memory stays; only
// for more room the file is opened again, by its name.
class MappedFile final : public TraceSink {
 public:
  // The descriptor is that of a locked, empty file, and belongs to this object.
  MappedFile(int file, std::string fileName) : descriptor(file), name(std::move(fileName)) {}
  ~MappedFile() override;
  MappedFile(const MappedFile&) = delete;
  MappedFile& operator=(const MappedFile&) = delete;

  const char* append(std::string_view lines) override;
  void finish() override;

 private:
  bool isOpen();
  const char* reserve(uint64_t size);
  const char* map(size_t size);
  void unmap();

  OwnDescriptor descriptor;
  const std::string name;
  uint64_t written = 0;   // bytes
  uint64_t reserved = 0;  // bytes that the file has
  char* window = nullptr;
  uint64_t windowStart = 0;
  size_t windowSize = 0;
};

}  // namespace senseloom::trace
