#include "registry/session_set.h"

#include <algorithm>
#include <utility>

namespace senseloom {

void SessionSet::reserveOne() {
  if (2 * (count + 1) <= mask + 1) return;
  constexpr size_t kFewestSlots = 16;
  const size_t size = std::max(2 * (mask + 1), kFewestSlots);
  Session** const old = std::exchange(slots, new Session*[size]());
  const size_t oldMask = std::exchange(mask, size - 1);
  count = 0;
  for (size_t i = 0; i <= oldMask; ++i) {
    if (old[i] != nullptr) insert(old[i]);
  }
  if (old != noSlots) delete[] old;
}

void SessionSet::insert(Session* session) {
  size_t i = home(session);
  while (slots[i] != nullptr) i = next(i);
  slots[i] = session;
  ++count;
}

void SessionSet::erase(const Session* session) {
  size_t hole = home(session);
  while (slots[hole] != session) hole = next(hole);
  // Close the hole: a later session of the same run of slots moves into it, unless its search begins behind the hole.
  for (size_t i = next(hole); slots[i] != nullptr; i = next(i)) {
    const size_t distance = (i - home(slots[i])) & mask;
    if (distance >= ((i - hole) & mask)) {
      slots[hole] = slots[i];
      hole = i;
    }
  }
  slots[hole] = nullptr;
  --count;
  recent = nullptr;
}

void SessionSet::releaseUnused() {
  if (count != 0 || slots == noSlots) return;
  delete[] std::exchange(slots, noSlots);
  mask = 0;
}

}  // namespace senseloom
