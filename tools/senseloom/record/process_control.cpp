#include "record/process_control.h"

#include <fcntl.h>
#include <sys/mman.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <system_error>
#include <vector>

#include "input_error.h"

namespace senseloom::tool {
namespace {

constexpr size_t kBell = sizeof(uint32_t);  // the bytes of an order that the process looks at

// The file that is the memory, by its name among the descriptors of the process.
std::string findMemory(pid_t process) {
  const std::string title = "process " + std::to_string(process);
  const std::string wanted = "/memfd:" + std::string(trace::kControlName) + " (deleted)";
  std::error_code error;
  std::filesystem::directory_iterator descriptors("/proc/" + std::to_string(process) + "/fd", error);
  if (error) {
    const bool isGone = error.value() == ENOENT;
    throw InputError(isGone ? "there is no " + title : title + ": " + std::strerror(error.value()));
  }
  for (const auto& entry : descriptors) {
    if (std::filesystem::read_symlink(entry, error) == wanted) return entry.path();
  }
  throw InputError(
      title +
      " has not called libsenseloom through the recording library: it can be put in the library's place, or "
      "loaded by LD_AUDIT");
}

}  // namespace

ProcessControl::ProcessControl(pid_t id) : process(id) {
  const std::string file = findMemory(process);
  descriptor = open(file.c_str(), O_RDWR | O_CLOEXEC);
  void* mapped =
      descriptor < 0 ? MAP_FAILED : mmap(nullptr, sizeof *memory, PROT_READ | PROT_WRITE, MAP_SHARED, descriptor, 0);
  const int error = errno;
  if (mapped == MAP_FAILED) {
    if (descriptor >= 0) close(descriptor);
    throw InputError("process " + std::to_string(process) + ": " + std::strerror(error));
  }
  memory = static_cast<trace::ControlMemory*>(mapped);
  if (memory->format == trace::ControlMemory::kFormat) return;
  munmap(memory, sizeof *memory);
  close(descriptor);
  throw InputError("process " + std::to_string(process) + " has a recording library of another version");
}

ProcessControl::~ProcessControl() {
  munmap(memory, sizeof *memory);
  close(descriptor);
}

// One that has ended, but whose parent has not heard of it yet, is a zombie.
bool ProcessControl::isAlive() const {
  std::string stat;
  std::getline(std::ifstream("/proc/" + std::to_string(process) + "/stat"), stat);
  const size_t name = stat.rfind(") ");
  return name != std::string::npos && stat.compare(name, 4, ") Z ") != 0 && stat.compare(name, 4, ") X ") != 0;
}

void ProcessControl::give(const std::string& order) {
  const std::string line = order + '\n';
  if (line.size() >= sizeof memory->order) throw InputError("the name of the file is too long");
  std::memset(memory->order + kBell, 0, sizeof memory->order - kBell);
  std::memcpy(memory->order + kBell, line.data() + kBell, line.size() - kBell);
  uint32_t bell;
  std::memcpy(&bell, line.data(), kBell);
  __atomic_store_n(reinterpret_cast<uint32_t*>(memory->order), bell, __ATOMIC_RELEASE);
}

std::string ProcessControl::answer() const {
  const std::string text(memory->order, strnlen(memory->order, sizeof memory->order));
  const bool isAnswer = text.compare(0, 3, "ok:") == 0 || text.compare(0, 3, "no:") == 0;
  return isAnswer && text.back() == '\n' ? text.substr(0, text.size() - 1) : "";
}

void ProcessControl::takeBack() {
  if (answer().empty()) give("off");
}

// While the process makes the lines anew, or adds one, they are read again.
std::string ProcessControl::state() const {
  while (true) {
    const uint32_t version = memory->version.load();
    const uint32_t size = memory->stateSize.load();
    std::string lines(size, '\0');
    const ssize_t count = pread(descriptor, lines.data(), size, static_cast<off_t>(trace::kStateStart));
    const bool isWhole = count == static_cast<ssize_t>(size) && memory->version.load() == version;
    if ((version % 2 == 0 && isWhole) || !isAlive()) return lines;
  }
}

const trace::SessionCounts* ProcessControl::countsOf(uint32_t session) const {
  const auto* found = std::find_if(std::begin(memory->counts), std::end(memory->counts),
                                   [=](const trace::SessionCounts& counts) { return counts.session == session; });
  return found == std::end(memory->counts) ? nullptr : found;
}

}  // namespace senseloom::tool
