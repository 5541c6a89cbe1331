#include "sweep/workers.h"

#include <android/log.h>
#include <fcntl.h>
#include <poll.h>
#include <signal.h>
#include <sys/mman.h>
#include <sys/prctl.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <atomic>
#include <cerrno>
#include <cstring>
#include <exception>
#include <new>
#include <optional>
#include <stdexcept>
#include <string>
#include <thread>
#include <vector>

#include "terminal/progress_bar.h"

namespace senseloom::tool {
namespace {

using Counter = std::atomic<uint32_t>;
static_assert(Counter::is_always_lock_free, "processes share it");

constexpr int kBarInterval = 100;  // ms
constexpr char kFailed[] = "a process that replays failed";

[[noreturn]] void fail(const char* what) {
  throw std::runtime_error(std::string(what) + ": " + std::strerror(errno));
}

bool endedWell(pid_t process) {
  int status = 0;
  while (waitpid(process, &status, 0) < 0) {
    if (errno != EINTR) fail("waitpid");
  }
  return WIFEXITED(status) && WEXITSTATUS(status) == 0;
}

// Runs in a new process, and says on the pipe why it failed. The library's log lines and the message that it writes to
// standard output would be repeated for every number.
template <class Run>
[[noreturn]] void runQuietly(int pipe, Run run) {
  prctl(PR_SET_PDEATHSIG, SIGKILL);
  __android_log_set_minimum_priority(ANDROID_LOG_SILENT);
  const int nowhere = open("/dev/null", O_WRONLY | O_CLOEXEC);
  if (nowhere >= 0) dup2(nowhere, STDOUT_FILENO);
  int status = 0;
  try {
    run();
  } catch (const std::exception& error) {
    const std::string line = std::string(error.what()) + '\n';
    status = write(pipe, line.data(), line.size()) < 0 ? 2 : 1;
  }
  _exit(status);
}

template <class Run>
pid_t start(int pipe, Run run) {
  const pid_t process = fork();
  if (process < 0) fail("a process cannot be started");
  if (process == 0) runQuietly(pipe, run);
  return process;
}

// What one worker does: takes the next number until there are no more.
void takeNumbers(const WorkPlan& plan, Counter& next, int pipe, const std::function<void(size_t)>& work) {
  for (size_t number = next++; number < plan.count; number = next++) {
    if (!plan.isolated) {
      work(number);
    } else if (!endedWell(start(pipe, [&] { work(number); }))) {
      throw std::runtime_error(kFailed);
    }
  }
}

// Waits until all writing ends of the pipe are closed, so that the workers have ended. Returns what they wrote.
std::string waitWithBar(const WorkPlan& plan, const Counter& next, int pipe) {
  std::optional<ProgressBar> bar;
  if (plan.bar != nullptr) bar.emplace(plan.bar, plan.count);
  std::string written;
  while (true) {
    if (bar) bar->show(std::min<size_t>(next, plan.count));
    pollfd waiting{.fd = pipe, .events = POLLIN, .revents = 0};
    if (poll(&waiting, 1, kBarInterval) <= 0) continue;
    std::array<char, 256> buffer;
    const ssize_t count = read(pipe, buffer.data(), buffer.size());
    if (count <= 0) return written;
    written.append(buffer.data(), static_cast<size_t>(count));
  }
}

}  // namespace

void workInProcesses(const WorkPlan& plan, const std::function<void(size_t)>& work) {
  const SharedMemory shared(sizeof(Counter));
  Counter& next = *new (shared.data()) Counter(0);
  int ends[2];
  if (pipe2(ends, O_CLOEXEC) != 0) fail("pipe");
  std::fflush(nullptr);
  std::vector<pid_t> workers;
  const size_t processors = std::max(1U, std::thread::hardware_concurrency());
  while (workers.size() < std::min(processors, plan.count)) {
    workers.push_back(start(ends[1], [&] { takeNumbers(plan, next, ends[1], work); }));
  }
  close(ends[1]);
  const std::string written = waitWithBar(plan, next, ends[0]);
  close(ends[0]);
  bool allWell = true;
  for (const pid_t worker : workers) allWell &= endedWell(worker);
  if (!allWell) throw std::runtime_error(written.empty() ? kFailed : written.substr(0, written.find('\n')));
}

SharedMemory::SharedMemory(size_t bytes)
    : memory(mmap(nullptr, bytes, PROT_READ | PROT_WRITE, MAP_SHARED | MAP_ANONYMOUS, -1, 0)), size(bytes) {
  if (memory == MAP_FAILED) fail("memory");
}

SharedMemory::~SharedMemory() {
  munmap(memory, size);
}

}  // namespace senseloom::tool
