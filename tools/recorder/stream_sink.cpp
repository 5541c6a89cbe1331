#include "stream_sink.h"

#include <fcntl.h>
#include <poll.h>
#include <unistd.h>

#include <cerrno>
#include <cstring>
#include <new>
#include <utility>

namespace senseloom::trace {
namespace {

constexpr int kStreamFlags = O_CLOEXEC | O_NOCTTY | O_NONBLOCK;
constexpr int kPatience = 1000;  // milliseconds

}  // namespace

const char* StreamSink::append(std::string_view lines) {
  if (!descriptor.isOpen()) return "the program closed the file";
  if (!rest.empty()) {
    if (const char* trouble = writeAll(rest)) return trouble;
  }
  std::string text(lines);
  const char* trouble = writeAll(text);
  if (trouble == nullptr || text.size() == lines.size()) return trouble;
  rest = std::move(text);  // it will be whole in the end
  return nullptr;
}

// Takes off the text what could be written.
const char* StreamSink::writeAll(std::string& text) {
  while (!text.empty()) {
    const ssize_t count = ::write(descriptor.get(), text.data(), text.size());
    if (count > 0) {
      text.erase(0, static_cast<size_t>(count));
      isStuck = false;
      continue;
    }
    if (errno == EINTR) continue;
    if (errno != EAGAIN) return std::strerror(errno);
    pollfd waiting{.fd = descriptor.get(), .events = POLLOUT, .revents = 0};
    if (isStuck || poll(&waiting, 1, kPatience) <= 0) {
      isStuck = true;
      return "nobody reads the pipe";
    }
  }
  return nullptr;
}

OpenedSink openStream(const std::string& name, const struct stat& status) {
  if (!S_ISFIFO(status.st_mode) && !S_ISCHR(status.st_mode)) {
    return {nullptr, S_ISDIR(status.st_mode) ? std::strerror(EISDIR) : "neither a file nor a pipe nor a device"};
  }
  int file = open(name.c_str(), O_WRONLY | kStreamFlags);
  if (file < 0) return {nullptr, std::strerror(errno)};
  if (S_ISFIFO(status.st_mode)) {
    // Whoever reads a pipe as well gets no signal when the other reader is gone.
    close(file);
    file = open(name.c_str(), O_RDWR | kStreamFlags);
    if (file < 0) return {nullptr, std::strerror(errno)};
    if (const char* trouble = takeLock(file)) {
      close(file);
      return {nullptr, trouble};
    }
  }
  auto* sink = new (std::nothrow) StreamSink(file);
  if (sink != nullptr) return {sink, nullptr};
  close(file);
  return {nullptr, "out of memory"};
}

}  // namespace senseloom::trace
