#pragma once

#include <array>
#include <atomic>
#include <cstddef>
#include <cstdint>

#include "control_memory.h"

namespace senseloom::trace {

// The sessions whose records pass without more ado, while nothing is recorded: they are only counted. Without a lock,
// since a program that breaks the library's contract may be here with several threads at once; it may lose counts.
class QuickSessions {
 public:
  // Where to count for this handle, if nothing else is to be done; null: go the long way. One branch for the caller.
  SessionCounts* find(const void* handle, bool isQuiet) const {
    const Slot& slot = slots[indexOf(handle)];
    const bool isKnown = slot.key.load(std::memory_order_acquire) == keyOf(handle);
    return static_cast<int>(isKnown) & static_cast<int>(isQuiet) ? slot.counts.load(std::memory_order_relaxed)
                                                                 : nullptr;
  }
  void set(const void* handle, SessionCounts* counts) {
    Slot& slot = slots[indexOf(handle)];
    slot.key.store(0, std::memory_order_release);
    slot.counts.store(counts, std::memory_order_release);
    slot.key.store(keyOf(handle), std::memory_order_release);
  }
  void forget(const void* handle) {
    Slot& slot = slots[indexOf(handle)];
    if (slot.key == keyOf(handle)) slot.key = 0;
  }
  void forgetAll() {
    for (Slot& slot : slots) slot.key = 0;
  }

  static void count(SessionCounts& counts, bool gaveResult) {
    const auto addTo = [](std::atomic<uint32_t>& number, uint32_t more) {
      number.store(number.load(std::memory_order_relaxed) + more, std::memory_order_relaxed);
    };
    addTo(counts.records, 1);
    addTo(counts.results, gaveResult ? 1 : 0);
  }

 private:
  struct Slot {
    std::atomic<uintptr_t> key;  // never 0, but for an empty slot
    std::atomic<SessionCounts*> counts;
  };
  static constexpr size_t kSlots = 256;

  static uintptr_t keyOf(const void* handle) { return reinterpret_cast<uintptr_t>(handle) | 1; }
  static size_t indexOf(const void* handle) {
    return static_cast<uint32_t>(reinterpret_cast<uintptr_t>(handle) >> 4) * 2654435769U >> 24;
  }

  std::array<Slot, kSlots> slots{};
};

inline constinit QuickSessions gQuickSessions;

}  // namespace senseloom::trace
