// Hands recorded movements to the hand-drawn gesture sensor, each as one record, and prints what the library found.
//
// A line of the input is a movement: its samples, six numbers each, with blanks between them; acceleration in mm/s²,
// angular rate in mrad/s. Of a movement with more samples than a record holds, every nth is taken. A line of the output
// is the class that a session was handed, 0 for none, and the microseconds of processor time that it took.
//
// With --hub, the samples, 52 a second, go through the sensor hub, and what it hands over is dispatched; the line has
// the last class then.

#include <android/log.h>
#include <hub.h>
#include <senseloom.h>

#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <cstring>
#include <ctime>
#include <iostream>
#include <optional>
#include <sstream>
#include <string>
#include <vector>

namespace {

constexpr std::size_t kAxes = 6;
constexpr std::size_t kHead = 12;
constexpr std::size_t kMostGroups = 170;

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

// The records that the hub makes of a movement.
std::vector<std::vector<unsigned char>> recordsOfHub(const std::vector<std::int64_t>& values, std::int64_t start) {
  constexpr std::int64_t kSamplesASecond = 52;
  hub::Hub hub;
  hub.configure("GSPX", {});
  std::vector<std::vector<unsigned char>> records;
  const auto keep = [&](const hub::Records& made) {
    for (const hub::Record& record : made) records.push_back(record.bytes);
  };
  for (std::size_t i = 0; i < values.size() / kAxes; ++i) {
    const auto value = [&](std::size_t axis) { return static_cast<std::int32_t>(values[i * kAxes + axis]); };
    keep(hub.take({.time = start + static_cast<std::int64_t>(i) * 1'000'000 / kSamplesASecond,
                   .acceleration = {value(0), value(1), value(2)},
                   .rate = hub::Axes{value(3), value(4), value(5)},
                   .pressure = std::nullopt}));
  }
  keep(hub.finish());
  return records;
}

// In microseconds. What else the machine does is not counted.
double processorTime() {
  timespec time{};
  clock_gettime(CLOCK_PROCESS_CPUTIME_ID, &time);
  return static_cast<double>(time.tv_sec) * 1e6 + static_cast<double>(time.tv_nsec) / 1e3;
}

// The class that a session is handed for a record; 0 for none.
int classOf(void* session, std::vector<unsigned char>& record) {
  void* result = nullptr;
  int length = 0;
  std::uint16_t found = 0;
  if (ctx_dispatch_data(session, record.data(), static_cast<int>(record.size()), &result, &length) == 1) {
    std::memcpy(&found, static_cast<const unsigned char*>(result) + 8, sizeof found);
  }
  return found;
}

}  // namespace

int main(int argc, char** argv) {
  const bool hasHub = argc == 2 && std::strcmp(argv[1], "--hub") == 0;
  __android_log_set_minimum_priority(ANDROID_LOG_SILENT);
  void* const session = ctx_open_session("GSPX");
  ctx_option_t* properties = nullptr;
  if (session == nullptr || ctx_set_option(session, 0, "{}", &properties) < 0) return 1;
  int number = 0;
  for (std::string line; std::getline(std::cin, line);) {
    ++number;
    const auto values = readMovement(line);
    if (values.size() < kAxes) {
      std::fprintf(stderr, "line %d: not a sample of six numbers\n", number);
      return 2;
    }
    // Different records have different timestamps.
    constexpr std::int64_t kHour = 3'600'000'000;
    auto records = hasHub
                       ? recordsOfHub(values, kHour * number)
                       : std::vector<std::vector<unsigned char>>{recordOf(values, static_cast<std::uint64_t>(number))};
    int found = 0;
    const double before = processorTime();
    for (auto& record : records) {
      const int another = classOf(session, record);
      if (another != 0) found = another;
    }
    std::printf("%d %.1f\n", found, processorTime() - before);
  }
  ctx_option_release(properties);
  ctx_close_session(session, &properties);
  ctx_option_release(properties);
  return 0;
}
