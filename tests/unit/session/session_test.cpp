#include "session/session.h"

#include <gtest/gtest.h>

#include <algorithm>

#include "allocations.h"
#include "fake_option.h"
#include "fake_proc.h"

namespace senseloom {
namespace {

using Events = std::vector<std::string>;

constexpr char kName[] = "a sensor";

// A kind that adds nothing of its own.
class PlainSession final : public Session {
 public:
  using Session::Session;
  int postProcess(void* data, int len, void** out, int* outLen) noexcept override {
    return passThrough(data, len, out, outLen);
  }
  void setChain(std::unique_ptr<Proc> chain) { proc = std::move(chain); }
};

class SessionBase : public testing::Test {
 protected:
  fake::Stage stage;
  Events& events = stage.events;
  std::unique_ptr<fake::NamedOption> ownOption = std::make_unique<fake::NamedOption>("option", events);
  fake::NamedOption& option = *ownOption;
  std::unique_ptr<PlainSession> session = std::make_unique<PlainSession>(kName, std::move(ownOption));
};

TEST_F(SessionBase, CarriesItsSensorNameAndOption) {
  EXPECT_EQ(session->name, static_cast<const char*>(kName)) << "the constant itself, not a copy";
  EXPECT_EQ(&session->ownOption(), &option);
  EXPECT_EQ(events, Events{});
}

TEST_F(SessionBase, HasItsOptionParseAndReturnsTheResult) {
  for (const int result : {0, -1, 7}) {
    option.parseResult = result;
    EXPECT_EQ(session->parseOption("{}"), result);
  }
  session->parseOption(nullptr);
  EXPECT_EQ(events, (Events{"option parses {}", "option parses {}", "option parses {}", "option parses null"}));
}

TEST_F(SessionBase, HasNothingToBuildUnlessItsKindDoes) {
  EXPECT_EQ(session->buildProc(), 0);
  EXPECT_EQ(events, Events{});
}

TEST_F(SessionBase, HandsOutTheClientsOwnRecord) {
  char record[3];
  void* out = nullptr;
  int outLen = 0;
  EXPECT_EQ(session->postProcess(record, 3, &out, &outLen), 1);
  EXPECT_EQ(out, record);
  EXPECT_EQ(outLen, 3);
}

TEST_F(SessionBase, DestroysItsOptionAndThenItsChain) {
  session->setChain(std::make_unique<fake::StageProc>(stage));
  session.reset();
  EXPECT_EQ(events, (Events{"option destroyed", "destroyed"}));
}

TEST_F(SessionBase, WithoutAChainDestroysItsOptionAlone) {
  session.reset();
  EXPECT_EQ(events, Events{"option destroyed"});
}

TEST(ResultBuffer, IsZeroFilledMemoryOfItsSize) {
  const ResultBuffer<7> buffer;
  EXPECT_EQ(Bytes(buffer.bytes().begin(), buffer.bytes().end()), Bytes(7, 0));
  std::fill(buffer.bytes().begin(), buffer.bytes().end(), uint8_t{1});
  EXPECT_EQ(Bytes(buffer.bytes().begin(), buffer.bytes().end()), Bytes(7, 1));
}

TEST(ResultBuffer, ThrowsWhenMemoryRunsOut) {
  const fake::FailingAllocation first(1);
  EXPECT_THROW(fake::use(ResultBuffer<7>().bytes().data()), std::bad_alloc);
}

}  // namespace
}  // namespace senseloom
