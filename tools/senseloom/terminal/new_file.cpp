#include "terminal/new_file.h"

#include <fcntl.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <cstring>
#include <filesystem>
#include <stdexcept>
#include <system_error>

namespace senseloom::tool {
namespace {

[[noreturn]] void fail(const std::string& name, const char* why) {
  throw std::runtime_error(name + ": cannot be written: " + why);
}

[[noreturn]] void failBySystem(const std::string& name) {
  fail(name, std::strerror(errno));
}

// What a link leads to is replaced, not the link.
std::string targetOf(const std::string& name) {
  std::error_code error;
  const auto target = std::filesystem::canonical(name, error);
  return error ? name : target.string();
}

std::string partNameOf(const std::string& name) {
  struct stat status {};
  const bool isOtherThing = stat(name.c_str(), &status) == 0 && !S_ISREG(status.st_mode);
  return isOtherThing ? name : name + ".part";
}

// Whether there is nothing in the file, and nobody else who writes it; what is not a file may be written by many.
void requireUnused(int descriptor, const std::string& name) {
  struct stat status {};
  if (fstat(descriptor, &status) != 0) failBySystem(name);
  if (!S_ISREG(status.st_mode)) return;
  if (flock(descriptor, LOCK_EX | LOCK_NB) != 0) fail(name, "another program writes it");
  if (status.st_size != 0) fail(name, "it holds what was left unfinished");
}

}  // namespace

NewFile::NewFile(const std::string& fileName, mode_t mode, Rest uncommitted)
    : name(targetOf(fileName)), partName(partNameOf(name)), rest(uncommitted) {
  // The name could be given to another file even so.
  if (access(name.c_str(), F_OK) == 0 && access(name.c_str(), W_OK) != 0) failBySystem(name);
  const int descriptor = open(partName.c_str(), O_WRONLY | O_CREAT | O_CLOEXEC, mode);
  if (descriptor < 0) failBySystem(name);
  file.reset(fdopen(descriptor, "w"));
  if (file == nullptr) failBySystem(name);
  requireUnused(descriptor, partName);
}

NewFile::~NewFile() {
  if (file == nullptr || partName == name) return;
  struct stat status {};
  const bool isEmpty = std::fflush(file.get()) == 0 && fstat(fileno(file.get()), &status) == 0 && status.st_size == 0;
  if (isEmpty || rest == Rest::removed) unlink(partName.c_str());
}

void NewFile::write(std::string_view bytes) {
  if (std::fwrite(bytes.data(), 1, bytes.size(), file.get()) != bytes.size()) failBySystem(name);
}

void NewFile::flush() {
  if (std::fflush(file.get()) != 0) failBySystem(name);
}

void NewFile::commit() {
  flush();
  if (partName != name && std::rename(partName.c_str(), name.c_str()) != 0) failBySystem(name);
  if (std::fclose(file.release()) != 0) failBySystem(name);
}

}  // namespace senseloom::tool
