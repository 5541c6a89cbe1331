#pragma once

#include <sys/resource.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cstdint>

namespace senseloom::trace {

// Bytes that a file may have. Beyond them, growing it raises a signal.
inline uint64_t mostFileBytes() {
  rlimit limit{};
  getrlimit(RLIMIT_FSIZE, &limit);
  return limit.rlim_cur == RLIM_INFINITY ? UINT64_MAX : limit.rlim_cur;
}

// A file descriptor in somebody else's process. Services close all descriptors that they do not know when they go to
// the background, and the numbers are soon in use for something else, so before each use it has to be seen whether it
// is still ours.
class OwnDescriptor {
 public:
  OwnDescriptor() = default;
  explicit OwnDescriptor(int file) : descriptor(file) {
    if (fstat(file, &opened) != 0) descriptor = -1;
  }
  ~OwnDescriptor() { reset(); }
  OwnDescriptor(const OwnDescriptor&) = delete;
  OwnDescriptor& operator=(const OwnDescriptor&) = delete;

  int get() const { return descriptor; }
  bool isOpen() const { return descriptor >= 0 && isSame(descriptor); }

  // Takes another descriptor of the same file, and closes one of any other.
  bool reopen(int file) {
    if (file < 0) return false;
    if (!isSame(file)) {
      ::close(file);
      return false;
    }
    descriptor = file;
    return true;
  }
  void reset() {
    if (isOpen()) ::close(descriptor);
    descriptor = -1;
  }
  void reset(int file) {
    reset();
    descriptor = file >= 0 && fstat(file, &opened) == 0 ? file : -1;
  }

 private:
  bool isSame(int file) const {
    struct stat now {};
    return fstat(file, &now) == 0 && now.st_dev == opened.st_dev && now.st_ino == opened.st_ino;
  }

  int descriptor = -1;
  struct stat opened {};
};

}  // namespace senseloom::trace
