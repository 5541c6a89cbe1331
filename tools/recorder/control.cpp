#include "control.h"

#include <fcntl.h>
#include <sys/mman.h>
#include <sys/syscall.h>
#include <unistd.h>

#include <algorithm>
#include <cstring>
#include <iterator>

namespace senseloom::trace {
namespace {

constexpr size_t kPage = 4096;
constexpr size_t kFirstRoom = 16 * kPage;

// Of the system's headers, the older ones do not have these.
constexpr unsigned kCloseOnExec = 1;
constexpr unsigned kAllowSealing = 2;
constexpr int kAddSeals = 1024 + 9;
constexpr int kSealShrink = 2;

int makeMemoryFile() {
#ifdef SYS_memfd_create
  const auto file = static_cast<int>(syscall(SYS_memfd_create, kControlName, kCloseOnExec | kAllowSealing));
  // Whoever shortened the file would end the process by a signal.
  if (file >= 0 && fcntl(file, kAddSeals, kSealShrink) == 0) return file;
  if (file >= 0) close(file);
#endif
  return -1;
}

bool reserveIn(int file, size_t start, size_t size) {
  return start + size <= mostFileBytes() &&
         fallocate(file, 0, static_cast<off_t>(start), static_cast<off_t>(size)) == 0;
}

void* mapped(int file, size_t start, size_t size) {
  void* memory = mmap(nullptr, size, PROT_READ | PROT_WRITE, MAP_SHARED, file, static_cast<off_t>(start));
  return memory == MAP_FAILED ? nullptr : memory;
}

}  // namespace

constinit Bell gBell;

Control::~Control() {
  abandon();
}

void Control::open() {
  descriptor.reset(makeMemoryFile());
  if (descriptor.get() < 0) return;
  if (reserveIn(descriptor.get(), 0, kStateStart)) {
    memory = static_cast<ControlMemory*>(mapped(descriptor.get(), 0, kStateStart));
  }
  if (memory == nullptr || !reserve(kFirstRoom)) return abandon();
  memory->format = ControlMemory::kFormat;
  answer("ok: off");
  gBell.word = reinterpret_cast<const uint32_t*>(memory->order);
}

// What the process counts goes on in memory of its own.
void Control::abandon() {
  gBell = {};
  if (state != nullptr) munmap(state, stateRoom);
  if (memory != nullptr) munmap(memory, kStateStart);
  descriptor.reset();
  memory = nullptr;
  state = nullptr;
  stateRoom = stateSize = sizeWhenAnew = 0;
}

std::optional<std::string> Control::takeOrder() {
  if (memory == nullptr) return std::nullopt;
  const std::string text(memory->order, strnlen(memory->order, sizeof memory->order));
  const size_t end = text.find('\n');
  if (end == std::string::npos) return std::nullopt;
  return text.substr(0, end);
}

void Control::answer(const std::string& text) {
  if (memory == nullptr) return;
  const size_t length = std::min(text.size(), sizeof memory->order - 2);
  std::memset(memory->order + length, 0, sizeof memory->order - length);
  std::memcpy(memory->order, text.data(), length);
  memory->order[length] = '\n';
  std::memcpy(&gBell.heard, memory->order, sizeof gBell.heard);
}

void Control::setRecording(bool isRecording) {
  if (memory != nullptr) memory->isRecording = isRecording ? 1 : 0;
}

bool Control::tell(std::string_view line) {
  if (memory == nullptr || !reserve(stateSize + line.size())) return false;
  std::memcpy(state + stateSize, line.data(), line.size());
  stateSize += line.size();
  memory->stateSize.store(static_cast<uint32_t>(stateSize), std::memory_order_release);
  return stateSize > 2 * sizeWhenAnew + kFirstRoom;
}

void Control::beginAnew() {
  if (memory == nullptr) return;
  memory->version.fetch_add(1);
  stateSize = 0;
  memory->stateSize.store(0);
}

void Control::endAnew() {
  if (memory == nullptr) return;
  sizeWhenAnew = stateSize;
  memory->version.fetch_add(1);
}

SessionCounts* Control::countsFor(uint32_t session) {
  SessionCounts* found = nullptr;
  if (memory != nullptr) {
    auto* place = std::find_if(std::begin(memory->counts), std::end(memory->counts),
                               [](const SessionCounts& counts) { return counts.session == 0; });
    if (place != std::end(memory->counts)) found = place;
  }
  if (found == nullptr && !spare.empty()) {
    found = spare.back();
    spare.pop_back();
  }
  if (found == nullptr) found = new SessionCounts{};
  found->records = 0;
  found->results = 0;
  found->session = session;
  return found;
}

// Memory of the process is not given back, since a thread may be about to count there.
void Control::forget(SessionCounts* counts) {
  counts->session = 0;
  const bool isShared = memory != nullptr && std::begin(memory->counts) <= counts && counts < std::end(memory->counts);
  if (!isShared) spare.push_back(counts);
}

bool Control::reserve(size_t size) {
  if (size <= stateRoom) return true;
  const size_t room = std::max((size + kPage - 1) / kPage * kPage, 2 * stateRoom);
  if (!descriptor.isOpen() || !reserveIn(descriptor.get(), kStateStart, room)) return false;
  void* larger = mapped(descriptor.get(), kStateStart, room);
  if (larger == nullptr) return false;
  if (state != nullptr) munmap(state, stateRoom);
  state = static_cast<char*>(larger);
  stateRoom = room;
  return true;
}

}  // namespace senseloom::trace
