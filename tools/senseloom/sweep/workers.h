#pragma once

#include <cstddef>
#include <cstdio>
#include <functional>

namespace senseloom::tool {

// How often and where the work is done.
struct WorkPlan {
  size_t count;              // numbers from 0 on to work on
  bool isolated = false;     // each in a process of its own
  std::FILE* bar = nullptr;  // where a progress bar is drawn; null: nowhere
};

// Calls `work` for each number, in processes of which one runs on each processor: the library is used by one thread of
// a process at a time. What `work` leaves in shared memory is there afterwards. Throws std::runtime_error if a process
// failed.
void workInProcesses(const WorkPlan& plan, const std::function<void(size_t)>& work);

// An array in memory that processes share, from before they are started.
class SharedMemory {
 public:
  explicit SharedMemory(size_t bytes);
  ~SharedMemory();
  SharedMemory(const SharedMemory&) = delete;
  SharedMemory& operator=(const SharedMemory&) = delete;

  void* data() const { return memory; }

 private:
  void* memory;
  size_t size;
};

}  // namespace senseloom::tool
