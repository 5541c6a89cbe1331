#include "record/recorded_program.h"

#include <dlfcn.h>
#include <fcntl.h>
#include <unistd.h>

#include <cerrno>
#include <cstdlib>
#include <cstring>
#include <filesystem>

#include "input_error.h"

namespace senseloom::tool {
namespace {

[[noreturn]] void fail(const std::string& what) {
  throw InputError(what + ": " + std::strerror(errno));
}

// The recording library is installed beside the library that the tool itself uses.
std::string traceLibrary() {
  Dl_info library{};
  dladdr(dlsym(RTLD_NEXT, "ctx_open_session"), &library);
  const auto folder = std::filesystem::canonical(library.dli_fname).parent_path();
  const std::string file = folder / "libsenseloom-trace.so";
  // If it is missing, the loader only warns and starts the program without it.
  if (access(file.c_str(), R_OK) != 0) fail(file);
  return file;
}

// An absolute name, since the program may change its folder before its first call. The file is opened here so that the
// user hears at once if it cannot be written.
std::string emptyFile(const std::string& file) {
  const int descriptor = open(file.c_str(), O_WRONLY | O_CREAT | O_TRUNC | O_NONBLOCK, S_IRUSR | S_IWUSR);
  if (descriptor < 0) fail(file);
  close(descriptor);
  return std::filesystem::absolute(file);
}

}  // namespace

void startRecorded(std::FILE* out, const std::string& file, std::vector<std::string> command) {
  std::string preload = traceLibrary();
  // What is preloaded already stays in front, since a sanitizer must come first.
  const char* others = std::getenv("LD_PRELOAD");
  if (others != nullptr && *others != '\0') preload = others + (':' + preload);
  if (setenv("SENSELOOM_TRACE", emptyFile(file).c_str(), 1) != 0 || setenv("LD_PRELOAD", preload.c_str(), 1) != 0 ||
      dup2(fileno(out), STDOUT_FILENO) < 0) {
    fail(command.front());
  }
  std::vector<char*> arguments;
  for (std::string& argument : command) arguments.push_back(argument.data());
  arguments.push_back(nullptr);
  execvp(arguments.front(), arguments.data());
  fail(command.front());
}

}  // namespace senseloom::tool
