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
  EXPECT_FALSE(watch.listReleased(nullptr, 1));
  EXPECT_FALSE(watch.listReleased(nullptr, 1));
  EXPECT_FALSE(watch.listReleased(&list, 1));
  watch.listGiven(&list);
  EXPECT_FALSE(watch.listReleased(&list, 1));
  EXPECT_TRUE(watch.listReleased(&list, 2));
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
