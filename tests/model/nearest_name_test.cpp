#include "model/nearest_name.h"

#include <gtest/gtest.h>

namespace senseloom::model {
namespace {

TEST(EditDistance, CountsInsertionsDeletionsAndReplacements) {
  EXPECT_EQ(editDistance("", ""), 0U);
  EXPECT_EQ(editDistance("level", "level"), 0U);
  EXPECT_EQ(editDistance("", "mode"), 4U);
  EXPECT_EQ(editDistance("mode", ""), 4U);
  EXPECT_EQ(editDistance("levle", "level"), 2U);
  EXPECT_EQ(editDistance("classmask", "classMask"), 1U);
  EXPECT_EQ(editDistance("logNN", "logN"), 1U);
  EXPECT_EQ(editDistance("kitten", "sitting"), 3U);
}

TEST(NearestName, IsTheFirstOfThoseWithTheLeastDistance) {
  EXPECT_EQ(nearestName("log", {"mode", "logN", "logM"}), "logN");
  EXPECT_EQ(nearestName("weight", {"mode", "weightVar"}), "weightVar");
  EXPECT_EQ(nearestName("any", {}), "");
  EXPECT_EQ(nearestName("stap", {"LIFT", "STAP"}), "STAP");
}

}  // namespace
}  // namespace senseloom::model
