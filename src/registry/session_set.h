#pragma once

#include <cstddef>
#include <cstdint>

#include "session/session.h"

namespace senseloom {

// A set of sessions by address: a hash table with open addressing. Every record passes through its look-up, which takes
// the same time however many sessions are open.
//
// An empty set has no memory. It has no destructor, either: the one set of the process must be whole for callers that
// close their sessions, or go on using them, while the process ends.
class SessionSet {
 public:
  constexpr SessionSet() = default;
  SessionSet(const SessionSet&) = delete;
  SessionSet& operator=(const SessionSet&) = delete;

  // The session at that address; null when none of the set is.
  Session* find(const void* handle) {
    if (handle == recent) return recent;  // most often a session gets several records in a row
    size_t i = home(handle);
    while (slots[i] != nullptr && slots[i] != handle) i = next(i);
    return recent = slots[i];
  }

  // Makes room for one session more. Throws std::bad_alloc, with the set as it was.
  void reserveOne();
  // Adds a session, for which reserveOne() made room.
  void insert(Session* session);
  // Removes a session of the set.
  void erase(const Session* session);
  // Gives the memory of an empty set back.
  void releaseUnused();

 private:
  // The slot where the search for an address begins. Addresses are multiples of a power of 2; the multiplication
  // carries what differs in them into the bits that are kept.
  size_t home(const void* handle) const { return (reinterpret_cast<uintptr_t>(handle) * 2654435769U >> 12) & mask; }
  size_t next(size_t slot) const { return (slot + 1) & mask; }

  // What an empty set searches: one slot, always free.
  static inline constinit Session* noSlots[1] = {};

  Session** slots = noSlots;  // null where free; at least half are, so that searches are short
  size_t mask = 0;            // number of slots, a power of 2, minus 1
  size_t count = 0;
  Session* recent = nullptr;  // what find() found last
};

}  // namespace senseloom
