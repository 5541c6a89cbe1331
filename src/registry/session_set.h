#pragma once

#include <cstddef>
#include <cstdint>
#include <memory>

#include "session/session.h"

namespace senseloom {

// A set of sessions by address: a hash table with open addressing. Every record passes through its look-up, which takes
// the same time however many sessions are open.
class SessionSet {
 public:
  constexpr SessionSet() = default;

  // The session at that address; null when none of the set is.
  Session* find(const void* handle) const {
    if (slots == nullptr) return nullptr;
    for (size_t i = home(handle);; i = next(i)) {
      if (slots[i] == handle || slots[i] == nullptr) return slots[i];
    }
  }

  // Makes room for one session more. Throws std::bad_alloc, with the set as it was.
  void reserveOne();
  // Adds a session, for which reserveOne() made room.
  void insert(Session* session);
  // Removes a session of the set.
  void erase(const Session* session);

 private:
  // The slot where the search for an address begins. Addresses differ little in their upper bits and not at all in their
  // lowest; the multiplication carries the difference into the bits that are kept.
  size_t home(const void* handle) const {
    return static_cast<size_t>((static_cast<uint32_t>(reinterpret_cast<uintptr_t>(handle) >> 4) * 2654435769U) >> shift);
  }
  size_t next(size_t slot) const { return (slot + 1) & (capacity() - 1); }
  size_t capacity() const { return size_t{1} << (32 - shift); }

  std::unique_ptr<Session*[]> slots;  // null where free; at least half are, so that searches are short
  uint32_t shift = 32;                // the table has 2^(32 - shift) slots
  size_t count = 0;
};

}  // namespace senseloom
