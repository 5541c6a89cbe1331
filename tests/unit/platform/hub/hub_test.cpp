#include <gtest/gtest.h>
#include <hub.h>
#include <resampler.h>
#include <rotation.h>

#include <array>
#include <cmath>
#include <cstring>
#include <span>
#include <string>
#include <utility>
#include <vector>

#include "movements.h"

namespace {

hub::Sample sampleAt(std::int64_t milliseconds, const hub::Axes& acceleration = kLying) {
  return {.time = milliseconds * 1000, .acceleration = acceleration, .rate = hub::Axes{}, .pressure = {}};
}

std::vector<hub::Sample> resampled(const std::vector<hub::Sample>& samples) {
  hub::Resampler resampler;
  std::vector<hub::Sample> result;
  for (const hub::Sample& sample : samples) {
    const auto taken = resampler.take(sample);
    result.insert(result.end(), taken.intervals.begin(), taken.intervals.end());
  }
  return result;
}

TEST(Resampler, LeavesASteadyValueAsItIsAtAnyRate) {
  for (const int interval : {5, 7, 10, 20, 33, 50}) {
    std::vector<hub::Sample> samples;
    for (int time = 0; time <= 1'000; time += interval) samples.push_back(sampleAt(time));
    const auto result = resampled(samples);
    ASSERT_EQ(result.size(), static_cast<size_t>(samples.back().time / 20'000)) << interval;
    for (const hub::Sample& sample : result) EXPECT_EQ(sample.acceleration, kLying);
    EXPECT_EQ(result.front().time, 20'000);
  }
}

TEST(Resampler, InterpolatesASlowSensorAndSmoothesAFastOne) {
  const auto slow = resampled({sampleAt(0, {0, 0, 0}), sampleAt(40, {400, 0, -400})});
  ASSERT_EQ(slow.size(), 2U);
  EXPECT_EQ(slow[0].acceleration, (hub::Axes{100, 0, -100}));
  EXPECT_EQ(slow[1].acceleration, (hub::Axes{300, 0, -300}));
  const auto fast = resampled({sampleAt(0, {0, 0, 0}), sampleAt(5, {800, 0, 0}), sampleAt(10, {0, 0, 0}),
                               sampleAt(15, {800, 0, 0}), sampleAt(20, {0, 0, 0})});
  ASSERT_EQ(fast.size(), 1U);
  EXPECT_EQ(fast[0].acceleration, (hub::Axes{400, 0, 0}));
}

TEST(Resampler, LeavesOutSamplesThatAreNotLater) {
  EXPECT_EQ(
      resampled({sampleAt(0), sampleAt(0, {1, 1, 1}), sampleAt(20), sampleAt(19, {1, 1, 1}), sampleAt(40)}).size(), 2U);
}

TEST(Resampler, StartsOverBehindAGapOrWithOtherSensors) {
  hub::Resampler resampler;
  EXPECT_FALSE(resampler.take(sampleAt(0)).startedOver);
  EXPECT_FALSE(resampler.take(sampleAt(300)).startedOver);
  EXPECT_TRUE(resampler.take(sampleAt(601)).startedOver);
  hub::Sample other = sampleAt(621);
  other.rate.reset();
  EXPECT_TRUE(resampler.take(other).startedOver);
}

TEST(Resampler, CutsValuesThatNoPhoneSenses) {
  const auto result = resampled({sampleAt(0, {INT32_MAX, INT32_MIN, 0}), sampleAt(20, {INT32_MAX, INT32_MIN, 0})});
  EXPECT_EQ(result.at(0).acceleration, (hub::Axes{hub::kMostValue, -hub::kMostValue, 0}));
}

// A hub with one sensor, which runs with integers as its properties.
class Running {
 public:
  Running(std::string name, const std::vector<std::pair<std::int32_t, std::int32_t>>& integers)
      : sensor(std::move(name)) {
    configure(integers);
  }
  void configure(const std::vector<std::pair<std::int32_t, std::int32_t>>& integers) {
    std::vector<std::array<std::uint8_t, 4>> values(integers.size());
    std::vector<hub::Property> properties;
    for (size_t i = 0; i < integers.size(); ++i) {
      std::memcpy(values[i].data(), &integers[i].second, 4);
      properties.push_back({.id = integers[i].first, .value = values[i]});
    }
    hub.configure(sensor, properties);
  }
  // Swings for so many samples, and returns the bytes behind the timestamps of the records that this makes.
  std::vector<std::vector<std::uint8_t>> swing(int samples, double perSecond, double amplitude) {
    std::vector<std::vector<std::uint8_t>> records;
    for (int i = 0; i < samples; ++i) {
      for (const hub::Record& record : hub.take(sampleAt(now * 20, swinging(now, perSecond, amplitude)))) {
        EXPECT_EQ(record.sensor, sensor);
        records.emplace_back(record.bytes.begin() + 8, record.bytes.end());
        std::memcpy(&timestamp, record.bytes.data(), sizeof timestamp);
      }
      ++now;
    }
    return records;
  }
  // There is nothing for a while.
  void pause() { now += 50; }

  hub::Hub hub;
  std::uint64_t timestamp = 0;  // of the last record

 private:
  std::string sensor;
  std::int64_t now = 0;  // sample
};

using Bytes = std::vector<std::uint8_t>;

TEST(Hub, ReportsADecisionARecordByDefault) {
  Running phyac("PHYAC", {{41, 0}, {43, 1 << 16 | 1}, {44, 1}, {42, -1}});
  const auto records = phyac.swing(161, 1.8, 3'000);
  // A sample is the end of an interval from the second on. Class 2 with the numbers 0, 1, 2.
  EXPECT_EQ(records, (std::vector<Bytes>{{1, 0, 0x02, 0}, {1, 0, 0x12, 0}, {1, 0, 0x22, 0}}));
  EXPECT_EQ(phyac.timestamp, 160U * 20);
}

TEST(Hub, ReportsAsManyDecisionsARecordAndAsOftenAsTheListAsksFor) {
  Running phyac("PHYAC", {{43, 64 << 16 | 8}, {44, 4}});  // four in the time of eight: each second one
  const auto records = phyac.swing(129 + 16 * 8, 0, 0);
  EXPECT_EQ(records, (std::vector<Bytes>{{4, 0, 0x01, 0, 0x11, 0, 0x21, 0, 0x31, 0}}));
}

TEST(Hub, ChangesASensorByTheNextListAndEndsItByStop) {
  Running phyac("PHYAC", {{43, 1}, {44, 1}});
  EXPECT_EQ(phyac.swing(129, 0, 0).size(), 1U);
  phyac.configure({{43, 2}, {44, 2}});
  EXPECT_EQ(phyac.swing(32, 0, 0).size(), 1U);
  phyac.hub.stop("PHYAC");
  EXPECT_EQ(phyac.swing(320, 0, 0).size(), 0U);
}

TEST(Hub, StartsOverBehindAGap) {
  Running phyac("PHYAC", {});
  EXPECT_EQ(phyac.swing(129, 0, 0).size(), 1U);
  phyac.pause();
  EXPECT_EQ(phyac.swing(128, 0, 0).size(), 0U);
  EXPECT_EQ(phyac.swing(1, 0, 0).size(), 1U);
}

TEST(Hub, ReportsInstantActivitiesThatSomebodyAskedFor) {
  Running still("ISACT", {{151, 1}});
  EXPECT_EQ(still.swing(65, 0, 0), (std::vector<Bytes>{{1, 0, 0, 0}}));
  Running running("ISACT", {{151, 4}});
  EXPECT_EQ(running.swing(65, 0, 0).size(), 0U);
}

TEST(Hub, ReportsEveryStepOrEachHundred) {
  Running every("SCOUN", {{141, 1}, {142, 1}});
  const auto steps = every.swing(3'200, 2, 2'000);
  ASSERT_GE(steps.size(), 120U);
  EXPECT_EQ(steps[99], (Bytes{100, 0, 0, 0}));
  Running hundreds("SCOUN", {{141, 0}, {142, 1}});
  EXPECT_EQ(hundreds.swing(3'200, 2, 2'000), (std::vector<Bytes>{{100, 0, 0, 0}}));
}

TEST(Hub, GoesOnCountingStepsWithANewList) {
  Running steps("SCOUN", {{141, 0}, {142, 1}});
  EXPECT_EQ(steps.swing(1'600, 2, 2'000).size(), 0U);
  steps.configure({{141, 0}, {142, 2}});
  EXPECT_EQ(steps.swing(1'600, 2, 2'000).size(), 1U);
}

TEST(Hub, ReportsShakesByTheSensitivityAskedFor) {
  EXPECT_EQ(Running("SHAKI", {{81, 2}}).swing(100, 5, 10'500), (std::vector<Bytes>{{1, 0}}));
  EXPECT_EQ(Running("SHAKI", {{81, 1}}).swing(100, 5, 10'500).size(), 0U);
}

TEST(Hub, HandsADrawingOverAsOneRecord) {
  hub::Hub hub;
  hub.configure("GSPX", {});
  std::vector<hub::Record> records;
  for (int i = 0; i < 300; ++i) {
    hub::Sample sample = sampleAt(i * 20);
    sample.rate = hub::Axes{i >= 50 && i < 150 ? 1'000 : 0, 0, 0};
    for (hub::Record& record : hub.take(sample)) records.push_back(std::move(record));
  }
  ASSERT_EQ(records.size(), 1U);
  const auto& bytes = records[0].bytes;
  std::uint16_t size = 0;
  std::memcpy(&size, bytes.data() + 10, sizeof size);
  EXPECT_EQ(bytes.size(), 12U + size);
  EXPECT_EQ(size % 12, 0);
  EXPECT_EQ(bytes[8], 0);  // prx
  EXPECT_EQ(bytes[9], 0);
}

// A movement that goes round once, or up and down: still before and after it.
hub::Sample gestureAt(int sample, bool isRound) {
  hub::Sample made = sampleAt(sample * 20);
  made.rate = hub::Axes{};
  if (sample < 50 || sample >= 150) return made;
  const auto turn = static_cast<std::int32_t>(std::lround(2'000 * std::cos((sample - 50) * 0.0628)));
  made.acceleration[isRound ? 0 : 1] += swinging(sample - 50, 0.5, 3'000)[2] - 9'807;
  made.rate = isRound ? hub::Axes{turn, 1'000, -turn} : hub::Axes{0, -turn, 1'000};
  return made;
}

std::vector<hub::Record> recordsOfGesture(hub::Hub& hub, bool isRound, int from = 0) {
  std::vector<hub::Record> records;
  for (int i = 0; i < 300; ++i) {
    hub::Sample sample = gestureAt(i, isRound);
    sample.time += from * 20'000;
    for (hub::Record& record : hub.take(sample)) records.push_back(std::move(record));
  }
  return records;
}

TEST(Hub, EnrolsATemplateAndMatchesIt) {
  hub::Hub hub;
  hub.configure("DTWGS", {});
  const auto enrolled = recordsOfGesture(hub, true);
  ASSERT_EQ(enrolled.size(), 1U);
  const Bytes& bytes = enrolled[0].bytes;
  ASSERT_EQ(bytes.size(), 8U + 2 + 2 + 144);
  EXPECT_EQ(Bytes(bytes.begin() + 8, bytes.begin() + 12), (Bytes{3, 0, 0, 144}));

  const Bytes second{1, 0, 0, 0};
  const Bytes level{0, 0, 0, 0};
  hub::Property list[] = {{121, level}, {122, second}, {123, std::span(bytes).subspan(12)}};
  hub.configure("DTWGS", list);
  const auto matched = recordsOfGesture(hub, true, 300);
  ASSERT_EQ(matched.size(), 1U);
  EXPECT_EQ(Bytes(matched[0].bytes.begin() + 8, matched[0].bytes.end()), (Bytes{2, 0}));
  EXPECT_EQ(recordsOfGesture(hub, false, 600).size(), 0U);

  const Bytes foreign(144, 100);
  list[2].value = foreign;
  EXPECT_THROW(hub.configure("DTWGS", list), hub::Refused);
  EXPECT_EQ(recordsOfGesture(hub, true, 900).size(), 1U);  // as before
}

// What an item of dead reckoning holds, in the order of its fields.
struct Item {
  std::int32_t time;
  std::int32_t x;
  std::int32_t y;
  std::int32_t floor;
  std::int32_t heading;
  std::int32_t distance;
  std::int32_t steps;
};

// Walks 30 s straight on, turns left by a quarter, and walks another 30 s, 60 steps each. The last item.
Item walkRoundACorner(const std::vector<std::pair<std::int32_t, std::int32_t>>& integers,
                      std::int32_t lowerPressure = 0) {
  Running pdr("PDR", integers);
  std::vector<hub::Record> records;
  for (int i = 0; i < 3'050; ++i) {
    hub::Sample sample = sampleAt(i * 20, swinging(i, 2, 2'000));
    const bool turns = i >= 1'500 && i < 1'550;
    sample.rate = hub::Axes{0, 0, turns ? 1'571 : 0};
    sample.pressure = 101'325 - (i < 1'500 ? 0 : lowerPressure);
    for (hub::Record& record : pdr.hub.take(sample)) records.push_back(std::move(record));
  }
  Item item{};
  if (records.empty()) return item;
  EXPECT_EQ(records.back().bytes.size(), 10U + 28);
  std::memcpy(&item, records.back().bytes.data() + 10, sizeof item);
  return item;
}

TEST(Hub, WalksFromTheStartThatIsGivenByStepsOfTheHeightThatIsGiven) {
  const Item end = walkRoundACorner({{181, 200}, {182, 300}, {183, 1'000}, {184, -500}, {185, 2}, {186, 0}, {187, 1}});
  EXPECT_NEAR(end.steps, 121, 2);
  EXPECT_EQ(end.distance, (end.steps * 828 + 5) / 10);
  EXPECT_NEAR(end.heading, 1'571, 2);
  EXPECT_NEAR(end.x, 1'000 - 5'000, 150);
  EXPECT_NEAR(end.y, -500 + 5'000, 150);
  EXPECT_EQ(end.floor, 2);
}

TEST(Hub, WalksByUsualHeightsIfNoneAreGiven) {
  const Item end =
      walkRoundACorner({{181, 1'000}, {182, 5'000}, {183, 32'767}, {184, 32'767}, {185, 32'767}, {187, 2}}, 36);
  EXPECT_EQ(end.distance, (end.steps * 703 + 5) / 10);
  EXPECT_NEAR(end.x, -4'220, 150);
  EXPECT_EQ(end.floor, 1);  // 36 Pa are 2.99 m
}

TEST(Hub, KnowsNoPlaceWithoutSixAxes) {
  const Item end = walkRoundACorner({{187, 0}});
  EXPECT_NEAR(end.steps, 121, 2);
  EXPECT_EQ(end.x, 32'767);
  EXPECT_EQ(end.y, 32'767);
  EXPECT_EQ(end.heading, 32'767);
  EXPECT_GT(end.distance, 8'000);
}

TEST(Direction, IsRightAllAround) {
  for (int degrees = -180; degrees <= 180; degrees += 7) {
    const double angle = degrees * 3.14159265358979 / 180;
    const auto direction = hub::directionOf(static_cast<std::int64_t>(angle * 1e9));
    EXPECT_NEAR(static_cast<double>(direction.cosine), 1e6 * std::cos(angle), 5) << degrees;
    EXPECT_NEAR(static_cast<double>(direction.sine), 1e6 * std::sin(angle), 5) << degrees;
  }
}

TEST(Hub, RefusesWhatItCannotSenseByName) {
  for (const std::string sensor : {"STAP", "GSFLK", "GSETH", "LPE_P", "LIFT", "SPIN"}) {
    try {
      hub::Hub().configure(sensor, {});
      ADD_FAILURE() << sensor;
    } catch (const hub::Refused& refused) {
      EXPECT_EQ(std::string(refused.what()).find("the hub cannot sense " + sensor + ": "), 0U) << refused.what();
    }
  }
}

}  // namespace
