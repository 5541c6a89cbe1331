#pragma once

#include <cstddef>

// The memory of the library while it works on a call: what it has from malloc(), calloc(), realloc() and operator new,
// by itself or through the JSON parser. What others allocate is not watched and never fails. For programs of
// senseloom_watch_memory().
namespace memory {

// Lets the allocation `which` of those to come fail, from 1; with `forEver` all later ones, too.
void failAt(size_t which, bool forEver);
// Lets each allocation fail that would leave the library with more than so many bytes.
void failAbove(size_t bytes);
// Lets no more fail. Returns whether any did.
bool stopFailing();
bool hasFailed();

// How many allocations the library has asked for so far.
size_t allocations();

// While one lives, allocations are none of the library: it has called the platform.
class Exempt {
 public:
  Exempt();
  ~Exempt();
  Exempt(const Exempt&) = delete;
  Exempt& operator=(const Exempt&) = delete;
};

// While one lives, allocations are those of the library: a test calls its classes without its entry points.
class Within {
 public:
  Within();
  ~Within();
  Within(const Within&) = delete;
  Within& operator=(const Within&) = delete;
};

// Counts the allocations during its life.
class AllocationCount : Within {
 public:
  size_t made() const { return allocations() - before; }

 private:
  const size_t before = allocations();
};

// Lets one allocation during its life fail: the first, the second, ...
class FailingAllocation : Within {
 public:
  explicit FailingAllocation(size_t which) { failAt(which, false); }
  ~FailingAllocation() { stopFailing(); }
  // Whether it came to that allocation.
  bool happened() const { return hasFailed(); }
};

// Blocks that the library has allocated and that were not freed yet, and their bytes.
size_t blocks();
size_t bytes();

}  // namespace memory
