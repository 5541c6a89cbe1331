#include <activity_classifier.h>
#include <gtest/gtest.h>
#include <movement_finder.h>
#include <shake_detector.h>
#include <step_detector.h>

#include <cstdlib>
#include <optional>
#include <vector>

#include "movements.h"

namespace {

using hub::Activity;
using hub::Axes;

std::vector<int> samplesWithDecisions(int samples) {
  hub::PhysicalActivityClassifier classifier;
  std::vector<int> decided;
  for (int i = 1; i <= samples; ++i) {
    if (classifier.take(kLying)) decided.push_back(i);
  }
  return decided;
}

template <class Classifier>
Activity activityOf(double perSecond, double amplitude) {
  Classifier classifier;
  std::optional<Activity> last;
  for (int i = 0; i < 128; ++i) {
    if (const auto decision = classifier.take(swinging(i, perSecond, amplitude))) last = decision;
  }
  return last.value();
}

TEST(ActivityClassifier, DecidesAfterAWindowAndThenEachThirdOfASecond) {
  EXPECT_EQ(samplesWithDecisions(161), (std::vector<int>{128, 144, 160}));
}

TEST(ActivityClassifier, TellsActivitiesByHowStrongTheyAre) {
  EXPECT_EQ(activityOf<hub::PhysicalActivityClassifier>(0.5, 300), Activity::still);
  EXPECT_EQ(activityOf<hub::PhysicalActivityClassifier>(1.8, 3'000), Activity::onFoot);
  EXPECT_EQ(activityOf<hub::PhysicalActivityClassifier>(2.7, 10'000), Activity::running);
  EXPECT_EQ(activityOf<hub::PhysicalActivityClassifier>(1, 60'000), Activity::unknown);
  EXPECT_EQ(activityOf<hub::InstantActivityClassifier>(0.5, 300), Activity::still);
  EXPECT_EQ(activityOf<hub::InstantActivityClassifier>(1.8, 3'000), Activity::onFoot);
  EXPECT_EQ(activityOf<hub::InstantActivityClassifier>(2.7, 10'000), Activity::running);
}

int stepsIn(int samples, double perSecond, double amplitude) {
  hub::StepDetector detector;
  int steps = 0;
  for (int i = 0; i < samples; ++i) {
    steps += static_cast<int>(detector.take(swinging(i, perSecond, amplitude)).size());
  }
  return steps;
}

TEST(StepDetector, CountsEveryStepOfAWalk) {
  EXPECT_NEAR(stepsIn(3'000, 1.8, 2'000), 108, 1);
  EXPECT_NEAR(stepsIn(3'000, 2.8, 9'000), 168, 1);
}

TEST(StepDetector, CountsNothingBeforeEightInARow) {
  EXPECT_EQ(stepsIn(190, 2, 2'000), 0);  // 7.6 swings
  EXPECT_GE(stepsIn(240, 2, 2'000), 8);
}

TEST(StepDetector, TellsHowLongAgoTheFirstStepsWere) {
  hub::StepDetector detector;
  for (int i = 0; i < 400; ++i) {
    const auto steps = detector.take(swinging(i, 2, 2'000));
    if (steps.empty()) continue;
    ASSERT_EQ(steps.size(), 8U);
    for (size_t step = 1; step < 8; ++step) EXPECT_LE(std::abs(steps[step - 1] - steps[step] - 25), 1);
    EXPECT_LT(steps.back(), 25);
    return;
  }
  FAIL() << "no steps";
}

TEST(StepDetector, CountsNoTremor) {
  EXPECT_EQ(stepsIn(6'000, 1.8, 200), 0);
  EXPECT_EQ(stepsIn(6'000, 8, 3'000), 0);
}

int shakesIn(int sensitivity, double perSecond, double amplitude) {
  hub::ShakeDetector detector(sensitivity);
  int shakes = 0;
  for (int i = 0; i < 200; ++i) {
    const bool isShaking = i >= 50 && i < 150;
    Axes acceleration = kLying;
    if (isShaking) acceleration[0] = swinging(i, perSecond, amplitude)[2] - 9'807;
    shakes += detector.take(acceleration) ? 1 : 0;
  }
  return shakes;
}

TEST(ShakeDetector, FindsAShakeOnce) {
  for (int sensitivity = 0; sensitivity <= 2; ++sensitivity) EXPECT_EQ(shakesIn(sensitivity, 5, 22'000), 1);
}

TEST(ShakeDetector, FindsGentlerShakesTheHigherTheSensitivity) {
  EXPECT_EQ(shakesIn(0, 5, 15'500), 0);
  EXPECT_EQ(shakesIn(1, 5, 15'500), 1);
  EXPECT_EQ(shakesIn(1, 5, 10'500), 0);
  EXPECT_EQ(shakesIn(2, 5, 10'500), 1);
  EXPECT_EQ(shakesIn(2, 5, 6'000), 0);
}

TEST(ShakeDetector, FindsNoShakeInSlowerSwings) {
  for (int sensitivity = 0; sensitivity <= 2; ++sensitivity) EXPECT_EQ(shakesIn(sensitivity, 2.8, 25'000), 0);
}

// A movement in samples: still, moving, a pause, moving, still.
struct Course {
  int moving;
  int pause = 0;
  int movingAgain = 0;
};

std::vector<hub::Movement> movementsIn(const Course& course, bool isEnd = false) {
  hub::MovementFinder finder;
  std::vector<hub::Movement> found;
  const auto keep = [&](hub::Movement movement) {
    if (!movement.empty()) found.push_back(std::move(movement));
  };
  const auto feed = [&](int samples, std::int32_t rate) {
    for (int i = 0; i < samples; ++i) {
      keep(finder.take({.time = 0, .acceleration = kLying, .rate = hub::Axes{rate, 0, 0}, .pressure = {}}));
    }
  };
  feed(100, 10);
  feed(course.moving, 1'000);
  feed(course.pause, 10);
  feed(course.movingAgain, 1'000);
  if (!isEnd) feed(100, 10);
  keep(finder.finish());
  return found;
}

TEST(MovementFinder, HandsOverWhatIsBetweenTwoStills) {
  const auto found = movementsIn({.moving = 100});
  ASSERT_EQ(found.size(), 1U);
  EXPECT_NEAR(static_cast<double>(found[0].size()), 62, 3);  // two samples a group, and 0.2 s on both sides
  const hub::Group moving{0, 0, 1'000, 1'000, 0, 0};
  const hub::Group still{0, 0, 1'000, 10, 0, 0};
  EXPECT_EQ(found[0][20], moving);
  EXPECT_EQ(found[0].front(), still);
  EXPECT_EQ(found[0].back(), still);
}

TEST(MovementFinder, KeepsAPauseWithinADrawing) {
  EXPECT_EQ(movementsIn({.moving = 60, .pause = 65, .movingAgain = 60}).size(), 1U);
  EXPECT_EQ(movementsIn({.moving = 60, .pause = 90, .movingAgain = 60}).size(), 2U);
}

TEST(MovementFinder, LeavesOutWhatIsTooShortOrTooLong) {
  EXPECT_EQ(movementsIn({.moving = 8}).size(), 0U);
  EXPECT_EQ(movementsIn({.moving = 300}).size(), 1U);
  EXPECT_EQ(movementsIn({.moving = 360}).size(), 0U);
  EXPECT_EQ(movementsIn({.moving = 100'000}).size(), 0U);
}

TEST(MovementFinder, HandsOverWhatTheEndCutsOff) {
  EXPECT_EQ(movementsIn({.moving = 100}, true).size(), 1U);
}

}  // namespace
