// A service that uses the library until its process is gone: the first argument says where it uses and closes its
// sessions. One build of it is linked with the library, the other loads it from the path in the second argument.

#include <sys/mman.h>
#include <sys/prctl.h>
#include <sys/wait.h>
#include <unistd.h>

#include <atomic>
#include <csignal>
#include <cstdint>
#include <cstring>
#include <iterator>
#include <string_view>
#include <thread>

#include "library.h"

namespace {

std::string_view scenario;  // empty in the process that only waits for the service
bool* done = nullptr;       // shared with that process: whether what was to happen at the end has happened

Library library;
constexpr const char* kSensors[] = {"STAP", "PHYAC", "GSPX", "LPE_P"};
void* handles[10000];
int sessions = 0;

int dispatch(void* handle, uint64_t timestamp) {
  uint8_t record[24] = {};
  std::memcpy(record, &timestamp, sizeof timestamp);
  record[8] = 1;
  record[10] = 12;
  void* out = nullptr;
  int length = 0;
  return library.dispatch(handle, record, sizeof record, &out, &length);
}

void open(int count) {
  for (sessions = 0; sessions < count; ++sessions) {
    handles[sessions] = library.open(kSensors[static_cast<size_t>(sessions) % std::size(kSensors)]);
    REQUIRE(handles[sessions] != nullptr);
  }
}

void negotiate(void* handle) {
  ctx_option_t* list = nullptr;
  REQUIRE(library.setOption(handle, 0, "{}", &list) == 0);
  library.release(list);
}

// Takes hold of memory that was freed before, and writes to it.
void reuseFreedMemory() {
  static void* blocks[512];
  for (size_t i = 0; i < std::size(blocks); ++i) {
    const size_t size = size_t{8} << i % 10;
    blocks[i] = std::memset(std::malloc(size), 0xA5, size);
  }
}

void useAndClose() {
  reuseFreedMemory();
  for (int i = 0; i < sessions; ++i) REQUIRE(dispatch(handles[i], 1) >= 0);
  void* const late = library.open("STAP");
  REQUIRE(late != nullptr);
  negotiate(late);
  REQUIRE(dispatch(late, 2) == 1);
  handles[sessions++] = late;
  for (int i = 0; i < sessions; ++i) {
    ctx_option_t* list = nullptr;
    REQUIRE(library.close(handles[i], &list) >= 0);
    library.release(list);
    REQUIRE(library.close(handles[i], &list) == -1);
  }
  library.uninit();
  *done = true;
}

std::atomic<int> dispatches = 0;

void dispatchForEver() {
  for (uint64_t timestamp = 1;; ++timestamp) {
    for (int i = 0; i < sessions; ++i, ++dispatches) REQUIRE(dispatch(handles[i], timestamp) >= 0);
  }
}

// Waits until the other thread has dispatched to every session, from now on.
void watchTheOtherThread() {
  const int enough = dispatches + 2 * sessions;
  while (dispatches < enough) std::this_thread::yield();
}

void reached(std::string_view place) {
  if (scenario == place) useAndClose();
  if (scenario != "thread") return;
  watchTheOtherThread();
  *done = place == "destructor function";  // the last of the places
}

[[gnu::destructor]] void destructorFunction() {
  reached("destructor function");
}

struct StaticObject {
  ~StaticObject() { reached("static object"); }
} static_object;

void runService([[maybe_unused]] const char* path) {
  std::atexit([] { reached("atexit before loading"); });
#ifdef LINKED
  library = {nullptr,           ctx_open_session,   ctx_set_option, ctx_dispatch_data,
             ctx_close_session, ctx_option_release, ctx_uninit,     getSensor};
#else
  library = loadLibrary(path);
#endif
  std::atexit([] { reached("atexit after loading"); });

  if (scenario == "thread") {
    open(std::size(handles));
    std::thread(dispatchForEver).detach();
    return;
  }
  open(40);
  for (int i = 0; i < sessions; ++i) negotiate(handles[i]);
  if (scenario != "_exit") return;
  *done = true;
  _exit(0);
}

}  // namespace

int main(int argc, char** argv) {
  REQUIRE(argc > 1);
  void* const shared = mmap(nullptr, sizeof *done, PROT_READ | PROT_WRITE, MAP_SHARED | MAP_ANONYMOUS, -1, 0);
  REQUIRE(shared != MAP_FAILED);
  done = static_cast<bool*>(shared);
  if (const pid_t service = fork(); service != 0) {
    int status = -1;
    REQUIRE(waitpid(service, &status, 0) == service);
    REQUIRE(status == 0);
    REQUIRE(*done);
    return 0;
  }
  prctl(PR_SET_PDEATHSIG, SIGKILL);  // whoever waits may lose patience
  scenario = argv[1];
  runService(argv[argc - 1]);
}
