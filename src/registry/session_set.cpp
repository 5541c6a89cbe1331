#include "registry/session_set.h"

#include <utility>

namespace senseloom {

void SessionSet::reserveOne() {
  if (slots != nullptr && 2 * (count + 1) <= capacity()) return;
  constexpr uint32_t kFirstShift = 32 - 4;  // 16 slots
  SessionSet larger;
  larger.shift = slots == nullptr ? kFirstShift : shift - 1;
  larger.slots = std::make_unique<Session*[]>(larger.capacity());
  if (slots != nullptr) {
    for (size_t i = 0; i < capacity(); ++i) {
      if (slots[i] != nullptr) larger.insert(slots[i]);
    }
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
    const size_t distance = (i - home(slots[i])) & (capacity() - 1);
    if (distance >= ((i - hole) & (capacity() - 1))) {
      slots[hole] = slots[i];
      hole = i;
    }
  }
  slots[hole] = nullptr;
  --count;
}

}  // namespace senseloom
