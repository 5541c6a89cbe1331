#include "proc/proc_mixer.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <string>
#include <vector>

#include "proc/proc_nm.h"

namespace senseloom {
namespace {

using Events = std::vector<std::string>;

// Mixes a batch down to its first element, with a count of the mixes in place of the first letter.
class CountingMixer final : public ProcMixer {
 public:
  CountingMixer(std::unique_ptr<Proc> previous, Events& story) : ProcMixer(std::move(previous)), events(story) {}

 private:
  void mix() override {
    events.push_back("mix");
    std::copy_n(prev->buffer(), elemSize, buffer());
    buffer()[0] = ++mixes;
  }

  Events& events;
  uint8_t mixes = '0';
};

class Mixer : public testing::Test {
 protected:
  std::string result() { return {reinterpret_cast<const char*>(stage.buffer()), 3}; }

  Events events;
  CountingMixer stage{std::make_unique<ProcNM>(3, nullptr, 2), events};
};

TEST_F(Mixer, HasNoResultAtFirst) {
  EXPECT_EQ(stage.length(), 0);
  EXPECT_EQ(stage.bufferLength(), 1);
}

TEST_F(Mixer, MixesACompleteBatchIntoOneElement) {
  EXPECT_TRUE(stage.accept("abcdef", 2));
  EXPECT_EQ(stage.length(), 1);
  EXPECT_EQ(stage.bufferLength(), 1);
  EXPECT_EQ(result(), "1bc");
  EXPECT_EQ(events, Events{"mix"});
}

TEST_F(Mixer, WaitsForTheBatch) {
  EXPECT_FALSE(stage.accept("abc", 1));
  EXPECT_EQ(stage.length(), 0);
  EXPECT_EQ(events, Events{});
}

TEST_F(Mixer, RefusesMoreUntilItIsReset) {
  EXPECT_TRUE(stage.accept("abcdef", 2));
  EXPECT_FALSE(stage.accept("ghijkl", 2));
  EXPECT_EQ(result(), "1bc");
  EXPECT_EQ(stage.length(), 1);
  EXPECT_EQ(events, Events{"mix"});

  stage.reset();
  EXPECT_EQ(stage.length(), 0);
  EXPECT_TRUE(stage.accept("ghijkl", 2));
  EXPECT_EQ(result(), "2hi");
  EXPECT_EQ(events, (Events{"mix", "mix"}));
}

}  // namespace
}  // namespace senseloom
