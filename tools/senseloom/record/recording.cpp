#include "record/recording.h"

#include <fcntl.h>
#include <poll.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <cstring>
#include <filesystem>
#include <stdexcept>
#include <utility>

#include "input_error.h"

namespace senseloom::tool {
namespace {

constexpr int kPatience = 100;        // milliseconds
constexpr int kRoomOfPipe = 1 << 20;  // bytes
constexpr size_t kChunk = 1 << 16;    // bytes

[[noreturn]] void fail(const std::string& file, const std::string& why) {
  throw InputError(file + ": " + why);
}

bool isPipe(const std::string& file) {
  struct stat status {};
  return stat(file.c_str(), &status) == 0 && S_ISFIFO(status.st_mode);
}

// A file that cannot be written is told at once.
std::unique_ptr<LineOutput> openCompressed(const std::string& file) try {
  return makeCompressedOutput(file);
} catch (const std::runtime_error& error) {
  throw InputError(error.what());
}

}  // namespace

Recording::Recording(const RecordingArguments& given, int out) : arguments(given) {
  isPiped = given.file == "-" || isCompressed(given.file) || isPipe(given.file);
  if (isPiped) {
    checkPipe();
  } else {
    checkFile();
  }
  forProcess.maxSize = given.maxSize;
  forProcess.followForks = given.followForks;
  forProcess.summary = summary.file();
  if (isPiped) {
    openPipe(out);
  } else {
    // The program may change its folder before its first call.
    forProcess.file = std::filesystem::absolute(given.file);
    if (given.force) forProcess.replaces = trace::identityOf(given.file);
  }
}

Recording::~Recording() {
  if (readEnd >= 0) close(readEnd);
  if (writeEnd >= 0) close(writeEnd);
}

// The process opens the file itself. What it would find wrong the user should hear at once.
void Recording::checkFile() const {
  if (arguments.followForks && arguments.file.find("%p") == std::string::npos) {
    fail(arguments.file, "to follow forks, the name needs a %p: each process has a file of its own");
  }
  const int file = open(arguments.file.c_str(), O_RDWR | O_CLOEXEC | O_NONBLOCK | O_NOCTTY);
  if (file < 0) {
    const std::string folder = std::filesystem::absolute(arguments.file).parent_path();
    if (errno != ENOENT || access(folder.c_str(), W_OK) != 0) fail(arguments.file, std::strerror(errno));
    return;
  }
  struct stat status {};
  const bool isFile = fstat(file, &status) == 0 && S_ISREG(status.st_mode);
  const bool isLocked = isFile && flock(file, LOCK_EX | LOCK_NB) != 0;
  close(file);
  if (isLocked) fail(arguments.file, "another recording is written to the file");
  if (isFile && status.st_size != 0 && !arguments.force) {
    fail(arguments.file, "the file is not empty; --force replaces it");
  }
}

void Recording::checkPipe() const {
  if (arguments.file.find("%p") != std::string::npos || arguments.followForks) {
    fail(arguments.file, "only one process can be recorded in a pipe or in a compressed file");
  }
  if (arguments.maxSize != 0 && !isCompressed(arguments.file)) fail(arguments.file, "a pipe has no parts");
  struct stat status {};
  const bool isThere = isCompressed(arguments.file) && stat(arguments.file.c_str(), &status) == 0;
  if (isThere && status.st_size != 0 && !arguments.force) {
    fail(arguments.file, "the file is not empty; --force replaces it");
  }
}

void Recording::openPipe(int out) {
  int ends[2];
  if (pipe2(ends, O_CLOEXEC) != 0) fail("a pipe", std::strerror(errno));
  readEnd = ends[0];
  writeEnd = ends[1];
  fcntl(readEnd, F_SETPIPE_SZ, kRoomOfPipe);  // it is slower without
  forProcess.file = "/proc/" + std::to_string(getpid()) + "/fd/" + std::to_string(writeEnd);
  if (arguments.file == "-") {
    output = makeStreamOutput(out);
  } else if (isCompressed(arguments.file)) {
    output = openCompressed(arguments.file);
  } else {
    const int file = open(arguments.file.c_str(), O_WRONLY | O_CLOEXEC);  // waits for the reader
    if (file < 0) fail(arguments.file, std::strerror(errno));
    if (flock(file, LOCK_EX | LOCK_NB) != 0) fail(arguments.file, "another recording is written to it");
    output = makeStreamOutput(file);
  }
}

bool Recording::passOn() {
  if (!isPiped) {
    poll(nullptr, 0, kPatience);
    return false;
  }
  try {
    return readPipe();
  } catch (const std::runtime_error& error) {
    trouble = error.what();
    return true;
  }
}

bool Recording::readPipe() {
  pollfd waiting{.fd = readEnd, .events = POLLIN, .revents = 0};
  const int ready = poll(&waiting, 1, kPatience);
  if (ready == 0 && !isBroken()) output->flush();
  if (ready <= 0) return true;
  std::string lines(kChunk, '\0');
  const ssize_t count = read(readEnd, lines.data(), lines.size());
  if (count <= 0) return count < 0 && errno == EINTR;
  if (isBroken()) return true;
  lines.resize(static_cast<size_t>(count));
  rest += lines;
  const size_t end = rest.rfind('\n') + 1;
  passLines(std::string_view(rest).substr(0, end));
  rest.erase(0, end);
  return true;
}

void Recording::expectNoOtherWriter() {
  if (writeEnd >= 0) close(writeEnd);
  writeEnd = -1;
}

void Recording::passLines(std::string_view lines) {
  while (!lines.empty()) {
    const std::string_view line = lines.substr(0, lines.find('\n') + 1);
    lines.remove_prefix(line.size());
    const LineOfRecording kind = kindOf(line);
    if (kind == LineOfRecording::head) nextPart();
    if (kind == LineOfRecording::call) ++calls;
    hasHead = true;
    hasEnd = kind == LineOfRecording::end;
    output->write(line);
  }
}

// Each part of a compressed recording has its own file.
void Recording::nextPart() {
  calls = 0;
  if (!hasHead || !isCompressed(arguments.file)) return;
  output->finish();
  std::string next;
  do {
    next = trace::numberedName(arguments.file, ++lastNumber);
  } while (access(next.c_str(), F_OK) == 0);
  output = makeCompressedOutput(next);
}

void Recording::complete(const std::string& cause) {
  const UnfinishedEnd end = summary.unfinished(cause);
  if (isBroken()) throw std::runtime_error(trouble);
  if (isPiped) {
    if (hasHead && !hasEnd) output->write(endLine(calls, end));
    if (hasHead) output->finish();
  } else {
    for (const std::string& file : summary.files()) completeFile(file, end);
  }
}

}  // namespace senseloom::tool
