#include "recorder/contract_watch.h"

#include <gtest/gtest.h>

namespace senseloom::trace {
namespace {

TEST(ContractWatchTest, LetsAThreadCallTheLibraryFromInside) {
  ContractWatch watch;
  EXPECT_FALSE(watch.entered(1, "set_option"));
  EXPECT_FALSE(watch.entered(1, "dispatch"));
  watch.left(1);
  watch.left(1);
  EXPECT_FALSE(watch.entered(2, "dispatch"));
}

TEST(ContractWatchTest, TellsOncePerPairAndCall) {
  ContractWatch watch;
  watch.entered(1, "set_option");
  const auto breach = watch.entered(2, "dispatch");
  ASSERT_TRUE(breach);
  EXPECT_STREQ(breach->kind, "two threads");
  EXPECT_EQ(breach->threads, (std::array{1, 2}));
  watch.left(2);
  EXPECT_FALSE(watch.entered(2, "dispatch"));
  watch.left(2);
  EXPECT_TRUE(watch.entered(2, "close"));
}

TEST(ContractWatchTest, KnowsWhetherAThreadWasAlone) {
  ContractWatch watch;
  watch.entered(1, "set_option");
  watch.entered(2, "dispatch");
  EXPECT_FALSE(watch.left(2));
  EXPECT_FALSE(watch.left(1));
  watch.entered(1, "set_option");
  watch.entered(1, "dispatch");
  EXPECT_TRUE(watch.left(1));
  EXPECT_TRUE(watch.left(1));
}

TEST(ContractWatchTest, ForgetsAClosedHandleThatIsOpenedAgain) {
  ContractWatch watch;
  int handle;
  watch.closed(&handle, 3, 1);
  watch.opened(&handle);
  EXPECT_FALSE(watch.usedClosed(&handle, "dispatch", 1));
  watch.closed(&handle, 4, 1);
  EXPECT_EQ(watch.usedClosed(&handle, "dispatch", 2)->text,
            "the handle of session s4 is used after it was closed in thread 1: dispatch in thread 2");
}

TEST(ContractWatchTest, KnowsAListThatIsHandedOutAgain) {
  ContractWatch watch;
  int list;
  EXPECT_FALSE(watch.listReleased(nullptr, 1).breach);
  EXPECT_FALSE(watch.listReleased(nullptr, 1).breach);
  EXPECT_FALSE(watch.listReleased(&list, 1).breach);
  watch.listGiven(&list);
  EXPECT_FALSE(watch.listReleased(&list, 1).breach);
  EXPECT_TRUE(watch.listReleased(&list, 2).breach);
}

TEST(ContractWatchTest, KnowsTheNumberOfAListUntilItIsReleased) {
  ContractWatch watch;
  int lists[70];
  for (int i = 0; i < 70; ++i) EXPECT_EQ(watch.listGiven(&lists[i]), i + 1);
  for (int i = 70; i-- > 0;) EXPECT_EQ(watch.listReleased(&lists[i], 1).list, i + 1);
  EXPECT_EQ(watch.listReleased(&lists[0], 1).list, 1) << "released twice";
  EXPECT_EQ(watch.listReleased(nullptr, 1).list, 0);
  int unknown;
  EXPECT_EQ(watch.listReleased(&unknown, 1).list, 0);
  EXPECT_EQ(watch.listGiven(&lists[0]), 71) << "the memory is another list's";
  EXPECT_EQ(watch.listReleased(&lists[0], 1).list, 71);
}

// What the process was given it can still release.
TEST(ContractWatchTest, KnowsInAChildProcessWhatTheParentWasGiven) {
  ContractWatch watch;
  int list;
  watch.listGiven(&list);
  watch.entered(1, "set_option");
  watch.inChild();
  EXPECT_FALSE(watch.entered(2, "dispatch")) << "of the threads only the one that forked is left";
  EXPECT_EQ(watch.listReleased(&list, 2).list, 1);
}

TEST(ContractWatchTest, KnowsWhoseMemoryARecordIsIn) {
  ContractWatch watch;
  uint8_t storage[20];
  uint8_t record[10];
  watch.resultGiven(1, storage, 10, record, 1);
  EXPECT_FALSE(watch.recordGiven(storage, 10, 1)) << "it is still good";
  watch.resultEnded(1);
  EXPECT_FALSE(watch.recordGiven(record, 10, 1));
  EXPECT_FALSE(watch.recordGiven(storage + 10, 10, 1));
  EXPECT_TRUE(watch.recordGiven(storage + 9, 10, 1));
  // The session uses its storage again.
  watch.resultGiven(1, storage, 10, record, 2);
  EXPECT_FALSE(watch.recordGiven(storage, 10, 2));
  // A record that is handed back is the caller's, and memory of a closed session may be anybody's.
  watch.resultEnded(1);
  watch.closed(storage, 1, 2);
  watch.resultGiven(2, record, 10, record, 2);
  watch.resultEnded(2);
  EXPECT_FALSE(watch.recordGiven(storage, 10, 2));
  EXPECT_FALSE(watch.recordGiven(record, 10, 2));
}

}  // namespace
}  // namespace senseloom::trace
