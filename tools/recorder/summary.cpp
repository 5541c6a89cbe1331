#include "summary.h"

#include <fcntl.h>
#include <sys/mman.h>
#include <unistd.h>

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <cstring>

#include "summary_memory.h"

namespace senseloom::trace {
namespace {

// Returns the number before.
uint32_t addOne(uint32_t& number) {
  return __atomic_fetch_add(&number, 1, __ATOMIC_RELAXED);
}

template <size_t size>
void store(char (&place)[size], const char* text) {
  const size_t length = std::min(std::strlen(text), size - 1);
  std::memcpy(place, text, length);  // it was all zeros
}

}  // namespace

Summary::~Summary() {
  if (memory != nullptr) munmap(memory, sizeof *memory);
}

void Summary::connect(const std::string& file) {
  if (file.empty()) return;
  const int descriptor = open(file.c_str(), O_RDWR | O_CLOEXEC);
  if (descriptor < 0) return;
  void* mapped = mmap(nullptr, sizeof *memory, PROT_READ | PROT_WRITE, MAP_SHARED, descriptor, 0);
  close(descriptor);
  if (mapped == MAP_FAILED) return;
  if (memory != nullptr) munmap(memory, sizeof *memory);
  memory = static_cast<summary_memory*>(mapped);
}

void Summary::called() const {
  if (memory != nullptr) addOne(memory->calls);
}

void Summary::recorded() const {
  if (memory != nullptr) addOne(memory->recorded);
}

void Summary::lost(const char* why) const {
  if (memory != nullptr && addOne(memory->lost) == 0) store(memory->why, why);
}

void Summary::breached(const std::string& breach) const {
  if (memory != nullptr && addOne(memory->breaches) == 0) store(memory->breach, breach.c_str());
}

void Summary::opened(const std::string& file) const {
  if (memory == nullptr) return;
  const uint32_t index = addOne(memory->files);
  if (index < SENSELOOM_SUMMARY_FILES) store(memory->file[index], file.c_str());
}

}  // namespace senseloom::trace
