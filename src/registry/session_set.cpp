#include "registry/session_set.h"

#include <algorithm>
#include <utility>

namespace senseloom {

void SessionSet::reserveOne() {
  if (2 * (count + 1) <= mask + 1) return;
  constexpr size_t kFewestSlots = 16;
  SessionSet larger;
  larger.mask = std::max(2 * (mask + 1), kFewestSlots) - 1;
  larger.owned = std::make_unique<Session*[]>(larger.mask + 1);
  larger.slots = larger.owned.get();
  for (size_t i = 0; i <= mask; ++i) {
    if (slots[i] != nullptr) larger.insert(slots[i]);
  }
  *this = std::move(larger);
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

}  // namespace senseloom
