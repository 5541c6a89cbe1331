#include "record/program_file.h"

#include <elf.h>
#include <sys/stat.h>
#include <sys/xattr.h>
#include <unistd.h>

#include <cerrno>
#include <cstdlib>
#include <cstring>
#include <fstream>
#include <sstream>

#include "input_error.h"

namespace senseloom::tool {
namespace {

constexpr int kMostScripts = 4;  // that interpret each other, as the kernel has it

[[noreturn]] void refuse(const std::string& file, const std::string& why) {
  throw InputError(file + ": " + why);
}

std::string findProgram(const std::string& command) {
  if (command.find('/') != std::string::npos) {
    if (access(command.c_str(), X_OK) != 0) refuse(command, std::strerror(errno));
    return command;
  }
  const char* path = std::getenv("PATH");
  std::istringstream folders(path == nullptr ? "/usr/bin:/bin" : path);
  for (std::string folder; std::getline(folders, folder, ':');) {
    std::string file = (folder.empty() ? "." : folder) + '/' + command;
    if (access(file.c_str(), X_OK) == 0) return file;
  }
  refuse(command, std::strerror(ENOENT));
}

// The privileges of root are those of everybody else, too.
void refuseForeignPrivileges(const std::string& file) {
  struct stat status {};
  if (stat(file.c_str(), &status) != 0) refuse(file, std::strerror(errno));
  const bool hasUser = (status.st_mode & S_ISUID) != 0 && status.st_uid != geteuid();
  const bool hasGroup = (status.st_mode & S_ISGID) != 0 && status.st_gid != getegid();
  const bool hasCapabilities = geteuid() != 0 && getxattr(file.c_str(), "security.capability", nullptr, 0) > 0;
  if (hasUser || hasGroup || hasCapabilities) {
    refuse(file, "it runs with the privileges of its file, so it cannot be recorded");
  }
}

std::string interpreterOf(const std::string& firstLine) {
  std::istringstream words(firstLine.substr(2));
  std::string interpreter;
  words >> interpreter;
  return interpreter;
}

template <class Header, class Segment>
bool isStatic(std::ifstream& file) {
  Header header{};
  file.seekg(0);
  file.read(reinterpret_cast<char*>(&header), sizeof header);
  for (int i = 0; file && i < header.e_phnum; ++i) {
    Segment segment{};
    file.seekg(static_cast<std::streamoff>(header.e_phoff + static_cast<size_t>(i) * header.e_phentsize));
    file.read(reinterpret_cast<char*>(&segment), sizeof segment);
    if (segment.p_type == PT_INTERP) return false;
  }
  return true;
}

int wordSizeOfFile(const std::string& name, int scripts) {
  refuseForeignPrivileges(name);
  std::ifstream file(name, std::ios::binary);
  std::string start(EI_NIDENT, '\0');
  file.read(start.data(), EI_NIDENT);
  if (start.compare(0, 2, "#!") == 0 && scripts > 0) {
    file.clear();
    file.seekg(0);
    std::getline(file, start);
    return wordSizeOfFile(interpreterOf(start), scripts - 1);
  }

  if (!file) refuse(name, std::strerror(errno == 0 ? ENOEXEC : errno));
  if (std::memcmp(start.data(), ELFMAG, SELFMAG) != 0) refuse(name, std::strerror(ENOEXEC));
  const bool isWide = start[EI_CLASS] == ELFCLASS64;
  if (isWide ? isStatic<Elf64_Ehdr, Elf64_Phdr>(file) : isStatic<Elf32_Ehdr, Elf32_Phdr>(file)) {
    refuse(name, "it is linked statically, so it cannot be recorded");
  }
  return isWide ? 64 : 32;
}

}  // namespace

int wordSizeOf(const std::string& command) {
  return wordSizeOfFile(findProgram(command), kMostScripts);
}

}  // namespace senseloom::tool
