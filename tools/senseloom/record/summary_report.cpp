#include "record/summary_report.h"

#include <sys/mman.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstdio>
#include <cstring>
#include <stdexcept>

#include "recorder/summary_memory.h"

namespace senseloom::tool {
namespace {

// "1 call", "2 calls".
std::string counted(uint32_t number, const char* thing) {
  return std::to_string(number) + ' ' + thing + (number == 1 ? "" : "s");
}

}  // namespace

SummaryReport::SummaryReport() : descriptor(memfd_create("senseloom-summary", MFD_CLOEXEC)) {
  void* mapped = MAP_FAILED;
  if (descriptor >= 0 && ftruncate(descriptor, sizeof *memory) == 0) {
    mapped = mmap(nullptr, sizeof *memory, PROT_READ | PROT_WRITE, MAP_SHARED, descriptor, 0);
  }
  if (mapped == MAP_FAILED) throw std::runtime_error(std::string("no memory for a summary: ") + std::strerror(errno));
  memory = static_cast<summary_memory*>(mapped);
  name = "/proc/" + std::to_string(getpid()) + "/fd/" + std::to_string(descriptor);
}

SummaryReport::~SummaryReport() {
  munmap(memory, sizeof *memory);
  close(descriptor);
}

std::vector<std::string> SummaryReport::files() const {
  std::vector<std::string> names;
  for (uint32_t i = 0; i < std::min<uint32_t>(memory->files, SENSELOOM_SUMMARY_FILES); ++i) {
    names.emplace_back(memory->file[i]);
  }
  return names;
}

UnfinishedEnd SummaryReport::unfinished(const std::string& cause) const {
  return {cause, memory->lost, memory->why};
}

bool SummaryReport::print(const std::string& program, const std::string& where) const {
  if (memory->breaches != 0) {
    std::fprintf(stderr, "senseloom: %s broke the library's contract, %s in the trace: %s\n", program.c_str(),
                 counted(memory->breaches, "note").c_str(), memory->breach);
  }
  if (memory->lost != 0) {
    std::fprintf(stderr, "senseloom: %s could not be recorded: %s\n", counted(memory->lost, "line").c_str(),
                 memory->why);
  }
  if (memory->recorded == 0) return printNothing(program);
  std::string place = where.empty() ? memory->file[0] : where;
  if (where.empty() && memory->files > 1) place += " and " + counted(memory->files - 1, "further file");
  std::fprintf(stderr, "senseloom: %s recorded in %s\n", counted(memory->recorded, "call").c_str(), place.c_str());
  return true;
}

bool SummaryReport::printNothing(const std::string& program) const {
  std::fprintf(stderr, "senseloom: nothing was recorded: ");
  if (memory->calls != 0) {
    std::fprintf(stderr, "none of %s of %s could be written\n", counted(memory->calls, "call").c_str(),
                 program.c_str());
  } else if (memory->loaded != 0) {
    std::fprintf(stderr, "%s loaded libsenseloom, but did not call it\n", program.c_str());
  } else {
    std::fprintf(stderr, "%s never loaded libsenseloom\n", program.c_str());
  }
  return false;
}

}  // namespace senseloom::tool
