#include "registry/session_set.h"

#include <gtest/gtest.h>

#include <new>
#include <ostream>
#include <set>
#include <vector>

#include "library_memory.h"
#include "random_numbers.h"

namespace senseloom {
namespace {

// The set looks at addresses alone, so no session needs to be there.
Session* sessionAt(uintptr_t address) {
  return reinterpret_cast<Session*>(address);
}

// A set that gives its memory back, as one does whose sessions are all closed.
class ClosingSet : public SessionSet {
 public:
  ClosingSet() { members.reserve(1000); }  // no allocation of the test's is to be counted
  ~ClosingSet() {
    for (const Session* member : members) erase(member);
    releaseUnused();
  }

  void add(Session* session) {
    reserveOne();
    addReserved(session);
  }
  void addReserved(Session* session) {
    insert(session);
    members.push_back(session);
  }
  void remove(Session* session) {
    erase(session);
    std::erase(members, session);
  }

 private:
  std::vector<Session*> members;
};

// Candidates for members, at equal distances or at random.
struct Candidates {
  const char* name;
  uintptr_t distance;  // 0: at random
};
void PrintTo(const Candidates& candidates, std::ostream* out) {
  *out << candidates.name;
}

constexpr uint32_t kCandidates = 600;

class RandomSet : public testing::TestWithParam<Candidates> {
 protected:
  void SetUp() override {
    std::set<uintptr_t> addresses;
    while (addresses.size() < kCandidates) {
      const uintptr_t distance = GetParam().distance;
      addresses.insert(distance == 0 ? uintptr_t{random.next()} << 4 | 0x10 : 0x1000 + distance * addresses.size());
    }
    for (const uintptr_t address : addresses) candidates.push_back(sessionAt(address));
  }

  // Whether all candidates are found or not as they should be, and nothing beside them is found.
  bool isAsExpected() {
    for (Session* candidate : candidates) {
      if (set.find(candidate) != (expected.contains(candidate) ? candidate : nullptr)) return false;
      if (set.find(reinterpret_cast<char*>(candidate) + 1) != nullptr) return false;
    }
    return true;
  }

  RandomNumbers random;
  std::vector<Session*> candidates;
  std::set<Session*> expected;
  ClosingSet set;
};

TEST_P(RandomSet, HoldsWhatWasInsertedAndNotErased) {
  // The share of insertions rises and falls, so that the set is filled and emptied again.
  for (const uint32_t share : {90U, 50U, 10U, 60U, 0U}) {
    for (int step = 0; step < 3000; ++step) {
      Session* candidate = candidates[random.below(kCandidates)];
      if (random.below(100) < share) {
        if (expected.insert(candidate).second) set.add(candidate);
      } else if (expected.erase(candidate) != 0) {
        set.remove(candidate);
      }
      ASSERT_EQ(set.find(candidate), expected.contains(candidate) ? candidate : nullptr) << share << ' ' << step;
      if (step % 100 == 0) {
        ASSERT_TRUE(isAsExpected()) << share << ' ' << step;
      }
    }
    ASSERT_TRUE(isAsExpected()) << share;
  }
}

INSTANTIATE_TEST_SUITE_P(Addresses, RandomSet,
                         testing::Values(Candidates{"Dense", 16}, Candidates{"OfALine", 64},
                                         Candidates{"OfAPage", 4096}, Candidates{"OfALargePage", 65536},
                                         Candidates{"OfAMegabyte", 1 << 20}, Candidates{"Random", 0}),
                         [](const auto& tested) { return std::string(tested.param.name); });

TEST(SessionSet, FindsNothingAtFirst) {
  ClosingSet set;
  EXPECT_EQ(set.find(sessionAt(16)), nullptr);
  EXPECT_EQ(set.find(nullptr), nullptr);
  set.reserveOne();
  EXPECT_EQ(set.find(sessionAt(16)), nullptr);
  EXPECT_EQ(set.find(nullptr), nullptr);
}

TEST(SessionSet, RoomThatWasNotUsedIsKept) {
  ClosingSet set;
  set.reserveOne();
  const memory::AllocationCount allocations;
  for (int i = 0; i < 100; ++i) set.reserveOne();
  EXPECT_EQ(allocations.made(), 0U);
  set.addReserved(sessionAt(16));
  EXPECT_EQ(set.find(sessionAt(16)), sessionAt(16));
}

TEST(SessionSet, RoomOfErasedSessionsIsUsedAgain) {
  ClosingSet set;
  set.add(sessionAt(16));
  const memory::AllocationCount allocations;
  for (uintptr_t i = 2; i < 1000; ++i) {
    set.remove(sessionAt(16 * (i - 1)));
    set.add(sessionAt(16 * i));
  }
  EXPECT_EQ(allocations.made(), 0U);
}

TEST(SessionSet, StaysAsItWasWhenItCannotGrow) {
  ClosingSet set;
  int failures = 0;
  for (uintptr_t i = 1; i <= 100; ++i) {
    {
      const memory::FailingAllocation first(1);
      try {
        set.reserveOne();
      } catch (const std::bad_alloc&) {
        ++failures;
      }
    }
    for (uintptr_t earlier = 1; earlier < i; ++earlier) {
      ASSERT_EQ(set.find(sessionAt(16 * earlier)), sessionAt(16 * earlier)) << i;
    }
    set.add(sessionAt(16 * i));
  }
  EXPECT_GE(failures, 2);
}

}  // namespace
}  // namespace senseloom
