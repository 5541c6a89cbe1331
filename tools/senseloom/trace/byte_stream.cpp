#include "trace/byte_stream.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstring>
#include <string_view>
#include <utility>

#include "input_error.h"
#include "terminal/interrupt.h"
#include "trace/decompression.h"

namespace senseloom::tool {
namespace {

// A file as it is, with a look ahead at its first bytes.
class PlainBytes final : public ByteStream {
 public:
  explicit PlainBytes(int file) : descriptor(file) {
    while (start.size() < kZstdMark.size()) {
      char bytes[4];
      const size_t count = readFile(bytes, kZstdMark.size() - start.size());
      if (count == 0) break;
      start.append(bytes, count);
    }
  }
  ~PlainBytes() override { close(descriptor); }
  PlainBytes(const PlainBytes&) = delete;
  PlainBytes& operator=(const PlainBytes&) = delete;

  bool beginsWith(std::string_view bytes) const { return start.compare(0, bytes.size(), bytes) == 0; }

  size_t read(char* bytes, size_t room) override {
    if (start.empty()) return readFile(bytes, room);
    const size_t count = std::min(room, start.size());
    std::memcpy(bytes, start.data(), count);
    start.erase(0, count);
    return count;
  }

  size_t size() const override {
    struct stat file {};
    return fstat(descriptor, &file) == 0 && S_ISREG(file.st_mode) ? static_cast<size_t>(file.st_size) : 0;
  }

 private:
  size_t readFile(char* bytes, size_t room) const {
    ssize_t count;
    do {
      if (isInterrupted()) return 0;
      count = ::read(descriptor, bytes, room);
    } while (count < 0 && errno == EINTR);
    if (count < 0) throw InputError(std::string("cannot be read: ") + std::strerror(errno));
    return static_cast<size_t>(count);
  }

  const int descriptor;
  std::string start;
};

}  // namespace

std::unique_ptr<ByteStream> openBytes(const std::string& file) {
  const int descriptor = file == "-" ? dup(STDIN_FILENO) : open(file.c_str(), O_RDONLY | O_CLOEXEC);
  if (descriptor < 0) throw InputError(std::strerror(errno));
  auto plain = std::make_unique<PlainBytes>(descriptor);
  if (plain->beginsWith(kGzipMark)) return gunzipped(std::move(plain));
  if (plain->beginsWith(kZstdMark)) return unzstded(std::move(plain));
  return plain;
}

}  // namespace senseloom::tool
