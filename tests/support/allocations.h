#pragma once

#include <cstddef>

// What the program allocates by operator new, malloc(), calloc() and realloc(), told from within; shared libraries are
// not watched. For programs of senseloom_watch_allocations().
namespace fake {

// Counts the allocations during its life.
class AllocationCount {
 public:
  AllocationCount();
  size_t made() const;

 private:
  size_t before;
};

// Lets allocations go uncounted during its life: those of a fake on the path that is watched.
class UncountedAllocations {
 public:
  UncountedAllocations();
  ~UncountedAllocations();
  UncountedAllocations(const UncountedAllocations&) = delete;
  UncountedAllocations& operator=(const UncountedAllocations&) = delete;
};

// Lets one allocation during its life fail: the first, the second, ...
class FailingAllocation {
 public:
  explicit FailingAllocation(size_t which);
  ~FailingAllocation();
  FailingAllocation(const FailingAllocation&) = delete;
  FailingAllocation& operator=(const FailingAllocation&) = delete;
  // Whether it came to that allocation.
  bool happened() const;
};

// Does nothing. Memory that nobody uses may not be allocated at all.
void use(const void* memory);

// Arrays made with operator new[] and not deleted with operator delete[] yet.
long liveArrays();

}  // namespace fake
