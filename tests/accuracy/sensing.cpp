// Runs the sensor hub on recordings and prints what it sensed, for sensing.py.
//
//     accuracy_sensing ON_FOOT RUNNING UNKNOWN RECORDING...
//
// The first three are the limits of the activity classifier, as in platform/hub/activity_model.inc. Of each recording:
//   activity LENGTH TRUTH DECISION COUNT    decisions from windows of so many intervals with one activity alone
//   rest SECONDS STEPS                      steps found in a stretch in which the person rested
//   shakes SENSITIVITY SECONDS COUNT        shakes found in all of it
//   steps COUNT                             steps found in all of it

#include <hub.h>

#include <activity_classifier.h>
#include <step_detector.h>

#include <array>
#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <exception>
#include <map>
#include <string>
#include <utility>
#include <vector>

#include "sense/motion_recording.h"

namespace {

using senseloom::tool::MotionRecording;

struct Interval {
  hub::Axes acceleration;
  int activity;  // what it really is; 0: unknown
};

constexpr std::array<int, 8> kActivities = {0, 1, 2, 3, 1, 2, 0, 2};  // by label

std::vector<Interval> intervalsOf(const MotionRecording& recording) {
  std::vector<Interval> intervals;
  hub::Resampler resampler;
  for (const MotionRecording::Row& row : recording.rows) {
    const bool isKnown = row.label >= 0 && row.label < static_cast<int>(kActivities.size());
    const int activity = isKnown ? kActivities[static_cast<std::size_t>(row.label)] : 0;
    for (const hub::Sample& interval : resampler.take(row.sample).intervals) {
      intervals.push_back({interval.acceleration, activity});
    }
  }
  return intervals;
}

template <std::size_t kWindow>
void printActivities(const std::vector<Interval>& intervals, const hub::ActivityModel& model) {
  hub::ActivityClassifier<kWindow> classifier(model);
  std::map<std::pair<int, int>, int> counts;
  std::size_t alike = 0;  // intervals in a row
  for (std::size_t i = 0; i < intervals.size(); ++i) {
    alike = i > 0 && intervals[i].activity == intervals[i - 1].activity ? alike + 1 : 1;
    const auto decision = classifier.take(intervals[i].acceleration);
    if (decision && alike >= kWindow && intervals[i].activity != 0) {
      ++counts[{intervals[i].activity, static_cast<int>(*decision)}];
    }
  }
  for (const auto& [pair, count] : counts)
    std::printf("activity %zu %d %d %d\n", kWindow, pair.first, pair.second, count);
}

void printRest(const std::vector<Interval>& intervals) {
  hub::StepDetector detector;
  std::size_t steps = 0;
  std::size_t length = 0;
  for (std::size_t i = 0; i <= intervals.size(); ++i) {
    if (i < intervals.size() && intervals[i].activity == 1) {
      ++length;
      steps += detector.take(intervals[i].acceleration).size();
    } else if (length > 0) {
      std::printf("rest %zu %zu\n", length / 50, steps);
      detector = hub::StepDetector();
      steps = length = 0;
    }
  }
}

std::size_t recordsOf(const MotionRecording& recording, const char* sensor, std::int32_t id, std::int32_t value) {
  std::array<std::uint8_t, sizeof value> bytes;
  std::memcpy(bytes.data(), &value, sizeof value);
  const hub::Property property{.id = id, .value = bytes};
  hub::Hub hub;
  hub.configure(sensor, {&property, 1});
  std::size_t count = 0;
  for (const MotionRecording::Row& row : recording.rows) count += hub.take(row.sample).size();
  return count;
}

void print(const char* file, const hub::ActivityModel& model) {
  const MotionRecording recording =
      senseloom::tool::readMotionRecording(file, senseloom::tool::recordingColumns("mm", "", ""), false);
  const auto intervals = intervalsOf(recording);
  std::printf("recording %s\n", file);
  printActivities<128>(intervals, model);
  printActivities<64>(intervals, model);
  printRest(intervals);
  for (std::int32_t sensitivity = 0; sensitivity < 3; ++sensitivity) {
    std::printf("shakes %d %zu %zu\n", sensitivity, intervals.size() / 50,
                recordsOf(recording, "SHAKI", 81, sensitivity));
  }
  std::printf("steps %zu\n", recordsOf(recording, "SCOUN", 141, 1));
}

}  // namespace

int main(int argc, char** argv) {
  if (argc < 5) return 2;
  const hub::ActivityModel model{
      .onFoot = std::atoll(argv[1]), .running = std::atoll(argv[2]), .unknown = std::atoll(argv[3])};
  try {
    for (int i = 4; i < argc; ++i) print(argv[i], model);
  } catch (const std::exception& error) {
    std::fprintf(stderr, "%s\n", error.what());
    return 2;
  }
  return 0;
}
