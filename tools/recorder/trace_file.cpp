#include "trace_file.h"

#include <android/log.h>
#include <fcntl.h>
#include <sys/file.h>
#include <sys/uio.h>
#include <unistd.h>

#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <cstring>

#include "trace/trace_form.h"

namespace senseloom::trace {
namespace {

constexpr char kTag[] = "senseloom-trace";
constexpr char kVariable[] = "SENSELOOM_TRACE";

// Why an opened file cannot be the trace; null if it can. A pipe may block its writer or raise a signal. A file with
// content belongs to somebody: it may be the trace of an earlier run that crashed.
const char* objection(int descriptor, const struct stat& file) {
  if (S_ISCHR(file.st_mode)) return nullptr;
  if (!S_ISREG(file.st_mode)) return "neither a file nor a device";
  if (flock(descriptor, LOCK_EX | LOCK_NB) != 0 && errno == EWOULDBLOCK) return "another process writes the file";
  return file.st_size == 0 ? nullptr : "the file is not empty";
}

}  // namespace

bool TraceFile::isWanted() noexcept {
  if (owner == 0) open();
  // A child shares the file and the sessions, so its calls would look like its parent's.
  return isNamed && owner == getpid();
}

void TraceFile::write(std::string_view line) noexcept {
  if (descriptor < 0) return lose(trouble);
  char note[80];
  const int noteLength =
      lost == 0 ? 0
                : std::snprintf(note, sizeof note, "{\"%s\":\"lines missing here: %zu\"}\n", tool::member::kNote, lost);
  if (append({note, static_cast<size_t>(noteLength)}, line)) {
    lost = 0;
  } else {
    lose(descriptor < 0 ? trouble : std::strerror(errno));
  }
}

void TraceFile::lose(const char* reason) noexcept {
  if (lost++ == 0) __android_log_print(ANDROID_LOG_WARN, kTag, "calls are not recorded: %s", reason);
}

void TraceFile::reportLost() const noexcept {
  if (lost == 0 || owner != getpid()) return;
  __android_log_print(ANDROID_LOG_WARN, kTag, "lines missing at the end of the trace: %zu", lost);
}

void TraceFile::open() noexcept {
  owner = getpid();
  const char* name = std::getenv(kVariable);
  isNamed = name != nullptr && *name != '\0';
  if (!isNamed) return;
  // Without O_NONBLOCK, opening a pipe that nobody reads would wait.
  const int file = ::open(name, O_WRONLY | O_CREAT | O_APPEND | O_CLOEXEC | O_NOCTTY | O_NONBLOCK, S_IRUSR | S_IWUSR);
  if (file < 0 || fstat(file, &opened) != 0) {
    trouble = std::strerror(errno);
  } else if (const char* reason = objection(file, opened)) {
    trouble = reason;
    close(file);
  } else {
    descriptor = file;
  }
  rlimit limit{};
  getrlimit(RLIMIT_FSIZE, &limit);
  mostBytes = limit.rlim_cur;
}

// Writes both, or nothing.
bool TraceFile::append(std::string_view note, std::string_view line) noexcept {
  struct stat now {};
  if (!isStillOpen(now)) {
    descriptor = -1;
    trouble = "the program closed the file";
    return false;
  }
  // Beyond the limit a write raises a signal, which would end the program.
  const size_t size = note.size() + line.size();
  if (mostBytes != RLIM_INFINITY && static_cast<rlim_t>(now.st_size) + size > mostBytes) {
    errno = EFBIG;
    return false;
  }
  const iovec parts[] = {{const_cast<char*>(note.data()), note.size()}, {const_cast<char*>(line.data()), line.size()}};
  const ssize_t written = writev(descriptor, parts, 2);
  if (written == static_cast<ssize_t>(size)) return true;
  if (written >= 0 && ftruncate(descriptor, now.st_size) == 0) errno = ENOSPC;  // the disk became full
  return false;
}

// Services close all descriptors that they do not know when they go to the background, and the numbers are soon in use
// for something else.
bool TraceFile::isStillOpen(struct stat& now) const noexcept {
  return fstat(descriptor, &now) == 0 && now.st_dev == opened.st_dev && now.st_ino == opened.st_ino;
}

}  // namespace senseloom::trace
