#include "explain/merge_derivation.h"

#include <gtest/gtest.h>

#include <list>
#include <string>

namespace senseloom::tool {
namespace {

// Sessions "a", "b", ... of one sensor, with their options.
class Merging : public testing::Test {
 protected:
  void add(const char* sensor, const std::string& option) {
    const OptionDescription& kind = *findOptionDescription(sensor);
    wishes.push_back(readOption(kind, option, templates).wishes.value_or(Wishes(kind)));
    participants.push_back({std::string(1, static_cast<char>('a' + participants.size())), &wishes.back()});
  }
  MergeDerivation derive(size_t starter, bool isForeign = false) {
    return deriveMerge(participants, starter, isForeign, templates);
  }

  TemplateLengths templates{};
  std::list<Wishes> wishes;
  std::vector<Participant> participants;
};

std::string propertiesOf(const MergeDerivation& derivation) {
  if (!derivation.properties) return "none";
  std::string text;
  for (const ExpectedProperty& property : *derivation.properties) {
    text += std::to_string(property.id) + '=' +
            (property.value ? std::to_string(*property.value) : std::to_string(property.size) + " bytes") + ' ';
  }
  return text;
}

TEST_F(Merging, OfMasksNamesWhoBringsBits) {
  add("STAP", R"({"classMask":1,"level":2})");
  add("STAP", R"({"classMask":2,"level":-1})");
  const MergeDerivation derivation = derive(1);
  EXPECT_EQ(derivation.keys[0].value, 3);
  EXPECT_EQ(derivation.keys[0].decidedBy, "all");
  EXPECT_EQ(derivation.keys[1].value, -1);
  EXPECT_EQ(derivation.keys[1].decidedBy, "b");
  EXPECT_EQ(propertiesOf(derivation), "101=3 102=-1 ");
}

TEST_F(Merging, OfMasksNamesTheOneThatHasThemAll) {
  add("GSFLK", R"({"classMask":1})");
  add("GSFLK", R"({"classMask":7})");
  add("GSFLK", R"({"classMask":6})");
  EXPECT_EQ(derive(0).keys[0].decidedBy, "b");
}

TEST_F(Merging, LeavesOutWhoBringsNoBits) {
  add("STAP", R"({"level":6})");
  add("STAP", R"({"classMask":1})");
  add("STAP", R"({"classMask":2})");
  EXPECT_EQ(derive(0).keys[0].decidedBy, "b, c");
}

TEST_F(Merging, OfAudioTakesTheLastSessionWhoeverSetItsOption) {
  add("LPE_P", R"({"interval":1})");
  add("LPE_P", R"({"interval":2})");
  const MergeDerivation derivation = derive(0);
  EXPECT_EQ(derivation.keys[0].value, 2);
  EXPECT_EQ(derivation.keys[0].decidedBy, "b");
  EXPECT_EQ(propertiesOf(derivation), "0=2 ");
}

TEST_F(Merging, OfDeadReckoningKeepsWhatItBeginsWith) {
  add("PDR", R"({"userHeight":170,"floorHeight":300,"N":3,"6DOF":0})");
  add("PDR", R"({"userHeight":180,"floorHeight":310,"N":5,"6DOF":1})");
  EXPECT_EQ(propertiesOf(derive(0)), "181=170 182=300 183=32767 184=32767 185=32767 186=3 187=0 ");
  EXPECT_EQ(propertiesOf(derive(1)), "181=180 182=310 183=32767 184=32767 185=32767 186=3 187=1 ");
  EXPECT_EQ(derive(1).keys[0].decidedBy, "b");
  EXPECT_EQ(derive(1).keys[5].decidedBy, "a");
}

TEST_F(Merging, OfStepModesNamesThoseAgainst) {
  add("SCOUN", R"({"mode":1,"logN":3})");
  add("SCOUN", R"({"mode":0,"logN":2})");
  EXPECT_EQ(derive(0).keys[0].value, 0);
  EXPECT_EQ(derive(0).keys[0].decidedBy, "b");
  EXPECT_EQ(propertiesOf(derive(0)), "141=0 142=2 ");
}

TEST_F(Merging, OfActivityComputesTheSpans) {
  add("PHYAC", R"({"mode":1,"logN":3,"logM":1})");
  add("PHYAC", R"({"mode":1,"logN":3,"logM":2,"continuous":1})");
  EXPECT_EQ(propertiesOf(derive(0)), "41=1 43=524296 44=4 42=-1 ");
  EXPECT_EQ(derive(0).keys[6].value, 1);
  EXPECT_EQ(derive(0).keys[6].decidedBy, "b");
}

TEST_F(Merging, OfActivityTellsWhyChangesAreNotReported) {
  add("PHYAC", R"({"mode":1,"logN":3})");
  add("PHYAC", R"({"mode":1,"logN":4})");
  EXPECT_EQ(derive(0).keys[0].value, 0);
  EXPECT_EQ(derive(0).keys[0].decidedBy, "different \"logN\"");
}

TEST_F(Merging, OfActivityTakesTheSpanAsAskedFromWhereItBegins) {
  add("PHYAC", R"({"logN":12})");
  add("PHYAC", R"({"logN":2})");
  EXPECT_EQ(propertiesOf(derive(0)), "41=0 43=268435460 44=4 42=-1 ");  // (1 << 12 << 16) | 4
  EXPECT_EQ(propertiesOf(derive(1)), "41=0 43=16777220 44=4 42=-1 ");   // (1 << 8 << 16) | 4
}

TEST_F(Merging, OfTwoEnrollingSessionsHasNoList) {
  add("DTWGS", R"({"mode":1})");
  add("DTWGS", R"({"mode":1})");
  EXPECT_EQ(propertiesOf(derive(1)), "none");
  EXPECT_EQ(derive(1).logged, "option invalid");
}

TEST_F(Merging, OfEnrollingAndMatchingHasNoList) {
  add("DTWGS", R"({"mode":1})");
  add("DTWGS", R"({"mode":4,"classMask":1})");
  EXPECT_EQ(propertiesOf(derive(1)), "none");
  EXPECT_EQ(derive(1).logged, "option mode incompatible: 5");
  EXPECT_EQ(derive(1).keys[3].value, std::nullopt);
}

TEST_F(Merging, OfSessionsWithoutAModeHasNoList) {
  add("DTWGS", "{}");
  EXPECT_EQ(derive(0).logged, "option mode incompatible: 0");
}

TEST_F(Merging, OfMatchingListsTheStoredTemplatesThatAreWanted) {
  add("DTWGS", R"({"mode":4,"classMask":2,"level":1,"template1":"0002ffee","template2":"0003a1b2c3"})");
  EXPECT_EQ(propertiesOf(derive(0)), "121=1 122=1 123=3 bytes ");
  add("DTWGS", R"({"mode":4,"classMask":1,"level":-1})");
  EXPECT_EQ(propertiesOf(derive(0)), "121=-1 122=0 123=2 bytes 122=1 123=3 bytes ");
}

TEST_F(Merging, OfOneEnrollingSessionHasAnEmptyList) {
  add("DTWGS", R"({"mode":1})");
  EXPECT_EQ(propertiesOf(derive(0)), "");
}

TEST_F(Merging, BeginsWithAForeignSessionButDoesNotMergeIt) {
  add("LPE_P", R"({"interval":1})");
  add("LPE_P", R"({"interval":2})");
  EXPECT_EQ(derive(1, true).keys[0].value, 1);
  participants.erase(participants.begin());
  EXPECT_EQ(derive(0, true).keys[0].value, 2);
  EXPECT_EQ(derive(0, true).keys[0].decidedBy, "b");
}

}  // namespace
}  // namespace senseloom::tool
