// Hands recorded movements to the hand-drawn gesture sensor, each as one record, and prints what the library found.
//
// A line of the input is a movement: its samples, six numbers each, with blanks between them; acceleration in mm/s²,
// angular rate in mrad/s. Of a movement with more samples than a record holds, every nth is taken. A line of the output
// is the class that a session was handed, 0 for none, and the microseconds of processor time that it took.

#include <android/log.h>
#include <senseloom.h>

#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <cstring>
#include <ctime>
#include <iostream>
#include <sstream>
#include <string>
#include <vector>

namespace {

constexpr std::size_t kAxes = 6;
constexpr std::size_t kHead = 12;
constexpr std::size_t kMostGroups = 170;
constexpr std::size_t kGroupSize = kAxes * sizeof(std::int16_t);

// In 1/1000 of standard gravity, rounded. The offset keeps the dividend positive, so that the division rounds down.
std::int64_t milligravities(std::int64_t acceleration) {
  constexpr std::int64_t kOffset = 1'000'000;
  return (acceleration * 200'000 + 980'665 + kOffset * 1'961'330) / 1'961'330 - kOffset;
}

std::vector<std::int64_t> readMovement(const std::string& line) {
  std::istringstream stream(line);
  std::vector<std::int64_t> values;
  for (std::int64_t value = 0; stream >> value;) values.push_back(value);
  return values;
}

std::vector<unsigned char> recordOf(const std::vector<std::int64_t>& values, std::uint64_t timestamp) {
  const std::size_t samples = values.size() / kAxes;
  const std::size_t step = (samples + kMostGroups - 1) / kMostGroups;
  std::vector<unsigned char> record(kHead);
  for (std::size_t i = 0; i < samples; i += step) {
    for (std::size_t axis = 0; axis < kAxes; ++axis) {
      const std::int64_t value = values[i * kAxes + axis];
      const auto stored = static_cast<std::uint16_t>(axis < 3 ? milligravities(value) : value);
      record.push_back(static_cast<unsigned char>(stored & 0xff));
      record.push_back(static_cast<unsigned char>(stored >> 8));
    }
  }
  const auto size = static_cast<std::uint16_t>(record.size() - kHead);
  std::memcpy(record.data(), &timestamp, sizeof timestamp);
  std::memcpy(record.data() + 10, &size, sizeof size);
  return record;
}

// In microseconds. What else the machine does is not counted.
double processorTime() {
  timespec time{};
  clock_gettime(CLOCK_PROCESS_CPUTIME_ID, &time);
  return static_cast<double>(time.tv_sec) * 1e6 + static_cast<double>(time.tv_nsec) / 1e3;
}

}  // namespace

int main() {
  __android_log_set_minimum_priority(ANDROID_LOG_SILENT);
  void* const session = ctx_open_session("GSPX");
  ctx_option_t* properties = nullptr;
  if (session == nullptr || ctx_set_option(session, 0, "{}", &properties) < 0) return 1;
  std::uint64_t timestamp = 0;
  for (std::string line; std::getline(std::cin, line);) {
    auto record = recordOf(readMovement(line), ++timestamp);
    if (record.size() < kHead + kGroupSize) {
      std::fprintf(stderr, "line %d: not a sample of six numbers\n", static_cast<int>(timestamp));
      return 2;
    }
    void* result = nullptr;
    int length = 0;
    const double before = processorTime();
    const int delivered = ctx_dispatch_data(session, record.data(), static_cast<int>(record.size()), &result, &length);
    const double taken = processorTime() - before;
    std::uint16_t found = 0;
    if (delivered == 1) std::memcpy(&found, static_cast<const unsigned char*>(result) + 8, sizeof found);
    std::printf("%d %.1f\n", found, taken);
  }
  ctx_option_release(properties);
  ctx_close_session(session, &properties);
  ctx_option_release(properties);
  return 0;
}
