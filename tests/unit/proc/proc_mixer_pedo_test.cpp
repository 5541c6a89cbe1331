#include "proc/proc_mixer_pedo.h"

#include <gtest/gtest.h>

#include "bytes_of.h"
#include "proc/proc_nm.h"

namespace senseloom {
namespace {

Bytes resultOf(Proc& stage) {
  return {stage.buffer(), stage.buffer() + 4};
}

TEST(MixerPedo, KeepsTheMostRecentValueOfEachBatch) {
  ProcMixerPedo stage(std::make_unique<ProcNM>(4, nullptr, 3));
  const Bytes first = bytesOf(int32_t{7}, int32_t{-2}, int32_t{-2147483647});
  EXPECT_FALSE(stage.accept(first.data(), 2));
  EXPECT_TRUE(stage.accept(first.data() + 8, 1));
  EXPECT_EQ(resultOf(stage), bytesOf(int32_t{-2147483647}));
  stage.reset();
  const Bytes second = bytesOf(int32_t{1}, int32_t{2}, int32_t{0x01020304}, int32_t{4});
  EXPECT_TRUE(stage.accept(second.data(), 4));
  EXPECT_EQ(resultOf(stage), bytesOf(int32_t{0x01020304}));
}

}  // namespace
}  // namespace senseloom
