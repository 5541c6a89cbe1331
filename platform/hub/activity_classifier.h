// Tells what a person does who carries the phone.
#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>

#include "resampler.h"
#include "running_sums.h"

namespace hub {

enum class Activity : std::uint8_t { unknown, still, onFoot, running };

// Variances of the acceleration's magnitude, in (mm/s²)².
struct ActivityModel {
  std::int64_t onFoot;   // less: still
  std::int64_t running;  // less: on foot
  std::int64_t unknown;  // less: running; nobody who was learned from moved more than that
};
extern const ActivityModel kLearnedActivity;  // see scripts/learn_activity.py

// Decides by the variance of the acceleration's magnitude in a window of time, smoothed over a tenth of a second: the
// signal power that accelerometer studies of daily movement have told activities apart by since Bouten et al., "A
// triaxial accelerometer and portable data processing unit for the assessment of daily physical activity" (1997). It
// does not matter how the phone is turned.
template <std::size_t kWindow>
class ActivityClassifier {
 public:
  static constexpr std::size_t kHop = 16;  // intervals from one decision to the next: 0.32 s

  explicit ActivityClassifier(const ActivityModel& learned = kLearnedActivity) : model(learned) {}

  // Takes the acceleration in the next interval. A decision each kHop intervals, from the first whole window on.
  std::optional<Activity> take(const Axes& acceleration);
  // Of the window that the last decision is about.
  std::int64_t variance() const { return window.variance() / std::int64_t{kSmoothed * kSmoothed}; }

 private:
  static constexpr std::size_t kSmoothed = 5;

  ActivityModel model;
  RunningSums<kSmoothed> smoothed;
  RunningSums<kWindow - kSmoothed + 1> window;
  std::size_t sinceDecision = kHop - 1;
};

using PhysicalActivityClassifier = ActivityClassifier<128>;  // 2.56 s
using InstantActivityClassifier = ActivityClassifier<64>;    // 1.28 s

}  // namespace hub
