#pragma once

#include <cstddef>
#include <memory>
#include <string>

namespace senseloom::tool {

// The bytes of a file, as they come.
class ByteStream {
 public:
  virtual ~ByteStream() = default;

  // Waits for bytes, and gives up to `room` of them; 0 at the end, and when the user interrupts the wait. Throws
  // InputError.
  virtual size_t read(char* bytes, size_t room) = 0;

  // Bytes of the whole file; 0 if that is not known, as that of compressed files.
  virtual size_t size() const { return 0; }
};

// Opens a file; "-" is standard input. What is compressed by gzip or zstd, as its first bytes tell, is given as it was
// before. Nothing but pipes and devices is waited for, and those until their end. Throws InputError.
std::unique_ptr<ByteStream> openBytes(const std::string& file);

}  // namespace senseloom::tool
