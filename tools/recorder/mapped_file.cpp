#include "mapped_file.h"

#include <fcntl.h>
#include <sys/file.h>
#include <sys/mman.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstring>

namespace senseloom::trace {
namespace {

constexpr uint64_t kFilePage = 4096;
constexpr uint64_t kAhead = 1 << 20;  // bytes that are reserved, and mapped, at once

uint64_t roundedUp(uint64_t size) {
  return (size + kFilePage - 1) / kFilePage * kFilePage;
}

// Not every file system can reserve room; zeros that are written have it.
bool writeZeros(int file, uint64_t from, uint64_t to) {
  static constexpr char kZeros[kFilePage]{};
  while (from < to) {
    const ssize_t count = pwrite(file, kZeros, static_cast<size_t>(std::min<uint64_t>(sizeof kZeros, to - from)),
                                 static_cast<off_t>(from));
    if (count <= 0) return false;
    from += static_cast<uint64_t>(count);
  }
  return true;
}

bool extend(int file, uint64_t from, uint64_t to) {
  if (fallocate(file, 0, static_cast<off_t>(from), static_cast<off_t>(to - from)) == 0) return true;
  if ((errno == EOPNOTSUPP || errno == ENOSYS) && writeZeros(file, from, to)) return true;
  const int error = errno;
  // What was reserved of it.
  if (ftruncate(file, static_cast<off_t>(from)) == 0) errno = error;
  return false;
}

}  // namespace

MappedFile::~MappedFile() {
  unmap();
}

const char* MappedFile::append(std::string_view lines) {
  const uint64_t end = written + lines.size();
  if (end > reserved) {
    if (const char* trouble = reserve(end)) return trouble;
  }
  if (end > windowStart + windowSize) {
    if (const char* trouble = map(lines.size())) return trouble;
  }
  char* place = window + (written - windowStart);
  std::memcpy(place + 1, lines.data() + 1, lines.size() - 1);
  __atomic_store_n(place, lines[0], __ATOMIC_RELEASE);
  written = end;
  return nullptr;
}

void MappedFile::finish() {
  if (isOpen() && ftruncate(descriptor.get(), static_cast<off_t>(written)) == 0) reserved = written;
}

// Whether the descriptor is, or could be made anew.
bool MappedFile::isOpen() {
  return descriptor.isOpen() || (descriptor.reopen(open(name.c_str(), O_RDWR | O_CLOEXEC | O_NOCTTY | O_NONBLOCK)) &&
                                 flock(descriptor.get(), LOCK_EX | LOCK_NB) == 0);
}

// Reserves ahead, or if there is not so much room what the lines take.
const char* MappedFile::reserve(uint64_t size) {
  if (!isOpen()) return "the program closed the file, and it is gone";
  const uint64_t most = mostFileBytes();
  if (size > most) return std::strerror(EFBIG);
  uint64_t wanted = std::min(reserved + std::max(kAhead, roundedUp(size - reserved)), most);
  if (!extend(descriptor.get(), reserved, wanted)) {
    wanted = std::min(roundedUp(size), most);
    if (!extend(descriptor.get(), reserved, wanted)) return std::strerror(errno);
  }
  reserved = wanted;
  return nullptr;
}

// Moves the window on, so that it has room for as many bytes more.
const char* MappedFile::map(size_t size) {
  if (!isOpen()) return "the program closed the file, and it is gone";
  unmap();
  windowStart = written / kFilePage * kFilePage;
  const auto room = static_cast<size_t>(roundedUp(std::max<uint64_t>(written - windowStart + size, kAhead)));
  void* memory =
      mmap(nullptr, room, PROT_READ | PROT_WRITE, MAP_SHARED, descriptor.get(), static_cast<off_t>(windowStart));
  if (memory == MAP_FAILED) return std::strerror(errno);
  window = static_cast<char*>(memory);
  windowSize = room;
  return nullptr;
}

void MappedFile::unmap() {
  if (window != nullptr) munmap(window, windowSize);
  window = nullptr;
  windowSize = 0;
}

}  // namespace senseloom::trace
