#include "allocations.h"

#include <cstdlib>
#include <new>

// The linker sends the program's calls of the C functions to the __wrap_ ones.
extern "C" {
void* __real_malloc(size_t size);
void* __real_calloc(size_t count, size_t size);
void* __real_realloc(void* memory, size_t size);
void* __wrap_malloc(size_t size);
void* __wrap_calloc(size_t count, size_t size);
void* __wrap_realloc(void* memory, size_t size);
}

namespace {

size_t allocations = 0;
size_t until_failure = 0;  // allocations left, the one that fails included; 0: none fails
bool counted = true;
long live_arrays = 0;

// Takes note of an allocation; false when it is to fail.
bool note() {
  if (!counted) return true;
  ++allocations;
  return until_failure == 0 || --until_failure != 0;
}

void* newMemory(size_t size) {
  void* memory = note() ? __real_malloc(size != 0 ? size : 1) : nullptr;
  if (memory == nullptr) throw std::bad_alloc();
  return memory;
}

}  // namespace

namespace fake {

AllocationCount::AllocationCount() : before(allocations) {}
size_t AllocationCount::made() const {
  return allocations - before;
}

UncountedAllocations::UncountedAllocations() {
  counted = false;
}
UncountedAllocations::~UncountedAllocations() {
  counted = true;
}

FailingAllocation::FailingAllocation(size_t which) {
  until_failure = which;
}
FailingAllocation::~FailingAllocation() {
  until_failure = 0;
}
bool FailingAllocation::happened() const {
  return until_failure == 0;
}

void use(const void*) {}

long liveArrays() {
  return live_arrays;
}

}  // namespace fake

void* __wrap_malloc(size_t size) {
  return note() ? __real_malloc(size) : nullptr;
}
void* __wrap_calloc(size_t count, size_t size) {
  return note() ? __real_calloc(count, size) : nullptr;
}
void* __wrap_realloc(void* memory, size_t size) {
  return note() ? __real_realloc(memory, size) : nullptr;
}

void* operator new(size_t size) {
  return newMemory(size);
}
void* operator new[](size_t size) {
  void* memory = newMemory(size);
  ++live_arrays;
  return memory;
}
void operator delete(void* memory) noexcept {
  std::free(memory);
}
void operator delete(void* memory, size_t) noexcept {
  std::free(memory);
}
void operator delete[](void* memory) noexcept {
  if (memory != nullptr) --live_arrays;
  std::free(memory);
}
void operator delete[](void* memory, size_t) noexcept {
  operator delete[](memory);
}
