#include "trace_sink.h"

#include <fcntl.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <cstring>
#include <new>

#include "mapped_file.h"
#include "stream_sink.h"
#include "trace_order.h"

namespace senseloom::trace {
namespace {

constexpr int kFlags = O_CLOEXEC | O_NOCTTY | O_NONBLOCK;  // opening a pipe that nobody reads does not wait
constexpr mode_t kOwnerOnly = S_IRUSR | S_IWUSR;           // it holds what the sensors saw

const char* errorText() {
  return std::strerror(errno);
}

OpenedSink refuse(int descriptor, const char* trouble) {
  close(descriptor);
  return {nullptr, trouble};
}

OpenedSink mapped(int descriptor, const std::string& name) {
  if (const char* trouble = takeLock(descriptor)) return refuse(descriptor, trouble);
  auto* sink = new (std::nothrow) MappedFile(descriptor, name);
  return sink != nullptr ? OpenedSink{sink, nullptr} : refuse(descriptor, "out of memory");
}

// The old file stays whole for whoever has it open, and is gone from its folder only when it is known to be the one
// that the user wants to have replaced.
OpenedSink replace(int old, const std::string& name, const std::string& replaces) {
  if (const char* trouble = takeLock(old)) return refuse(old, trouble);
  if (replaces.empty() || identityOf(name) != replaces) return refuse(old, "the file is not empty");
  if (unlink(name.c_str()) != 0) return refuse(old, errorText());
  close(old);
  return openNewFile(name);
}

}  // namespace

const char* takeLock(int descriptor) {
  const bool isTaken = flock(descriptor, LOCK_EX | LOCK_NB) != 0 && errno == EWOULDBLOCK;
  return isTaken ? "another recording is written to the file" : nullptr;
}

OpenedSink openNewFile(const std::string& name) {
  const int descriptor = open(name.c_str(), O_RDWR | O_CREAT | O_EXCL | kFlags, kOwnerOnly);
  return descriptor < 0 ? OpenedSink{nullptr, errorText()} : mapped(descriptor, name);
}

OpenedSink openSink(const std::string& name, const std::string& replaces) {
  struct stat status {};
  if (stat(name.c_str(), &status) == 0 && !S_ISREG(status.st_mode)) return openStream(name, status);
  const int descriptor = open(name.c_str(), O_RDWR | O_CREAT | kFlags, kOwnerOnly);
  if (descriptor < 0) return {nullptr, errorText()};
  if (fstat(descriptor, &status) != 0) return refuse(descriptor, errorText());
  return status.st_size == 0 ? mapped(descriptor, name) : replace(descriptor, name, replaces);
}

}  // namespace senseloom::trace
