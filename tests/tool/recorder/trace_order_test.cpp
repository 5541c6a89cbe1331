#include "recorder/trace_order.h"

#include <gtest/gtest.h>

namespace senseloom::trace {
namespace {

TEST(TraceOrderText, IsTheNameAloneWithoutMore) {
  const auto order = readOrder("my trace.jsonl");
  ASSERT_TRUE(order);
  EXPECT_EQ(order->file, "my trace.jsonl");
  EXPECT_EQ(order->maxSize, 0U);
  EXPECT_FALSE(order->followForks);
  EXPECT_EQ(order->text(), "my trace.jsonl");
}

TEST(TraceOrderText, IsReadAsItWasWritten) {
  const TraceOrder given{
      .file = "/a b/%p", .maxSize = 5'000'000'000, .followForks = true, .replaces = "1:2", .summary = "/proc/7/fd/3"};
  EXPECT_EQ(given.text(), "max-size=5000000000 follow-forks=1 replaces=1:2 summary=/proc/7/fd/3 /a b/%p");
  const auto order = readOrder(given.text());
  ASSERT_TRUE(order);
  EXPECT_EQ(order->text(), given.text());
}

TEST(TraceOrderText, NamesAFile) {
  EXPECT_FALSE(readOrder(""));
  EXPECT_FALSE(readOrder("follow-forks=1 "));
  EXPECT_EQ(readOrder("max-size=1")->file, "max-size=1");
}

TEST(TraceNames, HoldTheProcess) {
  EXPECT_EQ(nameFor("/x/%p.%p", 17), "/x/17.17");
  EXPECT_EQ(nameFor("100%", 17), "100%");
}

TEST(TraceNames, OfPartsHaveTheNumberBeforeTheExtension) {
  EXPECT_EQ(numberedName("/a.b/trace.jsonl", 2), "/a.b/trace.2.jsonl");
  EXPECT_EQ(numberedName("trace.jsonl.gz", 3), "trace.3.jsonl.gz");
  EXPECT_EQ(numberedName("/a.b/trace.zst", 2), "/a.b/trace.2.zst");
  EXPECT_EQ(numberedName("/a.b/trace", 2), "/a.b/trace.2");
  EXPECT_EQ(numberedName("/a.b/.trace", 2), "/a.b/.trace.2");
}

}  // namespace
}  // namespace senseloom::trace
