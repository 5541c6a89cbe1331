#include "trace/followed_bytes.h"

#include <fcntl.h>
#include <poll.h>
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

constexpr int kPatience = 100;  // milliseconds

[[noreturn]] void failToRead() {
  throw InputError(std::string("cannot be read: ") + std::strerror(errno));
}

void refuseCompressed(std::string_view start) {
  if (!start.starts_with(kGzipMark) && !start.starts_with(kZstdMark)) return;
  throw InputError("what is compressed cannot be followed, but it can be read when it is complete");
}

// What pipes and files have in common.
class FollowedBytes : public ByteStream {
 public:
  FollowedBytes(int file, BeforeWait toCall) : descriptor(file), beforeWait(std::move(toCall)) {}
  ~FollowedBytes() override { close(descriptor); }
  FollowedBytes(const FollowedBytes&) = delete;
  FollowedBytes& operator=(const FollowedBytes&) = delete;

  size_t read(char* bytes, size_t room) override {
    while (!isInterrupted()) {
      const size_t count = readWhatIsThere(bytes, room);
      if (count > 0 && !std::exchange(isBegun, true)) refuseCompressed({bytes, count});
      if (count > 0) return count;
      if (isAtEnd) return 0;
      const bool isMoreWanted = beforeWait();
      if (!isInterrupted()) wait(isMoreWanted);
    }
    return 0;
  }

 protected:
  // Does not wait. Sets `isAtEnd` when nothing will come any more.
  virtual size_t readWhatIsThere(char* bytes, size_t room) = 0;
  // For a tenth of a second at most. `isMoreWanted` is what was said before the wait.
  virtual void wait(bool isMoreWanted) = 0;

  const int descriptor;
  bool isAtEnd = false;

 private:
  const BeforeWait beforeWait;
  bool isBegun = false;
};

class FollowedPipe final : public FollowedBytes {
 public:
  using FollowedBytes::FollowedBytes;

 private:
  // A named pipe without a writer looks as if it were at its end, but not to poll() before the first one has come.
  size_t readWhatIsThere(char* bytes, size_t room) override {
    if (!hasNews(0)) return 0;
    const ssize_t count = ::read(descriptor, bytes, room);
    if (count < 0 && errno != EINTR && errno != EAGAIN) failToRead();
    isAtEnd = count == 0;
    return count < 0 ? 0 : static_cast<size_t>(count);
  }
  void wait(bool /*isMoreWanted*/) override { hasNews(kPatience); }

  bool hasNews(int patience) const {
    pollfd input{.fd = descriptor, .events = POLLIN, .revents = 0};
    return poll(&input, 1, patience) > 0;
  }
};

class FollowedFile final : public FollowedBytes {
 public:
  using FollowedBytes::FollowedBytes;

 private:
  size_t readWhatIsThere(char* bytes, size_t room) override {
    struct stat file {};
    if (fstat(descriptor, &file) != 0) failToRead();
    if (file.st_size < position) throw InputError("the file became shorter than what was read of it");
    const ssize_t count = pread(descriptor, bytes, room, position);
    if (count < 0) failToRead();
    // A recording writes the first byte of what it adds last, so in front of a byte of 0 everything is whole.
    const auto length = static_cast<size_t>(std::find(bytes, bytes + count, '\0') - bytes);
    position += static_cast<off_t>(length);
    if (length > 0) isAtEnd = false;
    return length;
  }
  void wait(bool isMoreWanted) override {
    isAtEnd = !isMoreWanted;
    if (isMoreWanted) poll(nullptr, 0, kPatience);
  }

  off_t position = std::max<off_t>(0, lseek(descriptor, 0, SEEK_CUR));
};

}  // namespace

std::unique_ptr<ByteStream> followBytes(const std::string& file, BeforeWait beforeWait) {
  const int descriptor = file == "-" ? dup(STDIN_FILENO) : open(file.c_str(), O_RDONLY | O_CLOEXEC | O_NONBLOCK);
  struct stat status {};
  if (descriptor < 0 || fstat(descriptor, &status) != 0) throw InputError(std::strerror(errno));
  if (S_ISREG(status.st_mode)) return std::make_unique<FollowedFile>(descriptor, std::move(beforeWait));
  return std::make_unique<FollowedPipe>(descriptor, std::move(beforeWait));
}

}  // namespace senseloom::tool
