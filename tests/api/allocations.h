#pragma once

// The heap calls of the program and of all its libraries, which allocation_test.cpp puts itself in the place of.
namespace api {

struct Allocations {
  bool counted = false;  // whether heap calls count now
  int made = 0;          // memory blocks asked for
  int live = 0;          // ... that were got and not released
  int failing = -1;      // which one of `made` gets none, from 0; negative: every one does
  int negotiationLines = 0;
};
inline constinit Allocations allocations;

// While one is in scope heap calls do not count.
class AllocationsUncounted {
 public:
  AllocationsUncounted() { allocations.counted = false; }
  ~AllocationsUncounted() { allocations.counted = before_; }
  AllocationsUncounted(const AllocationsUncounted&) = delete;
  AllocationsUncounted& operator=(const AllocationsUncounted&) = delete;

 private:
  const bool before_ = allocations.counted;
};

}  // namespace api
