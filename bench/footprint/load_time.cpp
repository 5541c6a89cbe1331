// How long it takes to load a library and make its first call, in microseconds of processor time: the median of several
// fresh processes. Prints a line a library: that of the library, and that of one which does nothing but depends on the
// same libraries.
#include <dlfcn.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <cstdio>
#include <ctime>

#include "require.h"
#include "senseloom.h"

namespace {

constexpr size_t kProcesses = 101;

double microseconds() {
  timespec now;
  clock_gettime(CLOCK_PROCESS_CPUTIME_ID, &now);
  return static_cast<double>(now.tv_sec) * 1e6 + static_cast<double>(now.tv_nsec) / 1e3;
}

double loadAndCall(const char* library) {
  const double start = microseconds();
  void* loaded = dlopen(library, RTLD_NOW);
  bench::require(loaded != nullptr, "the library could not be loaded");
  const auto open = reinterpret_cast<decltype(&ctx_open_session)>(dlsym(loaded, "ctx_open_session"));
  bench::require(open != nullptr, "the library lacks its function");
  open("STAP");
  return microseconds() - start;
}

double inFreshProcess(const char* library) {
  std::array<int, 2> ends;
  bench::require(pipe(ends.data()) == 0, "no pipe");
  const pid_t child = fork();
  bench::require(child >= 0, "no process");
  if (child == 0) {
    const double time = loadAndCall(library);
    _exit(write(ends[1], &time, sizeof time) == sizeof time ? 0 : 1);
  }
  double time = 0;
  bench::require(read(ends[0], &time, sizeof time) == sizeof time, "a process failed");
  waitpid(child, nullptr, 0);
  close(ends[0]);
  close(ends[1]);
  return time;
}

}  // namespace

int main(int argc, char** argv) {
  bench::require(argc == 3, "usage: bench_load_time LIBSENSELOOM LIBRARY_THAT_DOES_NOTHING");
  std::array<std::array<double, kProcesses>, 2> times;
  for (size_t i = 0; i < kProcesses; ++i) {
    for (size_t library = 0; library < times.size(); ++library) times[library][i] = inFreshProcess(argv[1 + library]);
  }
  for (auto& ofLibrary : times) {
    const auto median = ofLibrary.begin() + kProcesses / 2;
    std::nth_element(ofLibrary.begin(), median, ofLibrary.end());
    std::printf("%.0f\n", *median);
  }
}
