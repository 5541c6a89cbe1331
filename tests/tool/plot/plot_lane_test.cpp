#include "plot/plot_lane.h"

#include <gtest/gtest.h>

namespace senseloom::tool {
namespace {

RecordHues record(size_t hue, uint32_t height = 0) {
  RecordHues hues{.height = height, .records = 1};
  hues.counts[hue] = 1;
  return hues;
}

TEST(PlotLane, AddsUpWhatABinReceivesAndKnowsTheLast) {
  PlotLane lane("a");
  lane.receive(3, record(1, 9));
  lane.receive(3, record(2, 4));
  EXPECT_EQ(lane.at(3).received.records, 2U);
  EXPECT_EQ(lane.at(3).received.height, 9U);
  EXPECT_EQ(lane.at(3).last.counts[1], 0U);
  EXPECT_EQ(lane.at(3).last.counts[2], 1U);
}

TEST(PlotLane, JoinsEachTwoBins) {
  PlotLane lane("a");
  lane.receive(4, record(1));
  lane.receive(5, record(2));
  lane.at(4).presence = PlotLane::Presence::opens;
  lane.at(7).asks = true;
  lane.at(6).isRefused = true;
  lane.at(0).negotiates = true;
  lane.addNote(7, {.text = "note"});
  lane.at(Timeline::kBins).presence = PlotLane::Presence::closes;
  lane.fold();
  EXPECT_EQ(lane.at(2).received.records, 2U);
  EXPECT_EQ(lane.at(2).last.counts[2], 1U);
  EXPECT_EQ(lane.at(2).presence, PlotLane::Presence::opens);
  EXPECT_TRUE(lane.at(3).asks);
  EXPECT_TRUE(lane.at(3).isRefused);
  EXPECT_TRUE(lane.at(0).negotiates);
  EXPECT_EQ(lane.allNotes().at(0).bin, 3U);
  EXPECT_EQ(lane.at(Timeline::kBins / 2).presence, PlotLane::Presence::closes);
  EXPECT_EQ(lane.at(Timeline::kBins).presence, PlotLane::Presence::same);
  EXPECT_EQ(lane.at(4).received.records, 0U);
}

TEST(PlotLane, KeepsABoundedNumberOfNotes) {
  PlotLane lane("a");
  for (size_t i = 0; i < 1000; ++i) lane.addNote(i, {.text = "note"});
  EXPECT_EQ(lane.allNotes().size(), 64U);
}

}  // namespace
}  // namespace senseloom::tool
