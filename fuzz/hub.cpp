// The sensor hub on the host. An input is what a phone may say and what clients may ask for: commands of a letter, with
// bytes behind it. Whatever they are, each record has the layout that the library takes, and is taken by it.

#include <hub.h>

#include <algorithm>
#include <array>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "target.h"

namespace {

constexpr std::string_view kSensors[] = {"PHYAC", "ISACT", "SCOUN", "SHAKI", "GSPX", "DTWGS", "PDR", "STAP"};
constexpr std::array<std::int32_t, 12> kProperties = {43, 44, 151, 141, 81, 121, 122, 123, 181, 182, 183, 185};

void require(bool condition, std::string_view sensor) {
  if (condition) return;
  std::fprintf(stderr, "a record of %s has another length than it says\n", std::string(sensor).c_str());
  std::abort();
}

// Takes values off the front of the input; zeros behind its end.
class Input {
 public:
  Input(const std::uint8_t* data, std::size_t size) : bytes(data, data + size) {}
  bool isEmpty() const { return at == bytes.size(); }
  template <class Integer>
  Integer take() {
    Integer value{};
    const std::size_t size = std::min(sizeof value, bytes.size() - at);
    if (size > 0) std::memcpy(&value, bytes.data() + at, size);
    at += size;
    return value;
  }

 private:
  const std::vector<std::uint8_t> bytes;
  std::size_t at = 0;
};

template <class Integer>
Integer valueAt(const hub::Record& record, std::size_t offset) {
  Integer value{};
  require(record.bytes.size() >= offset + sizeof value, record.sensor);
  std::memcpy(&value, record.bytes.data() + offset, sizeof value);
  return value;
}

void requireLayout(const hub::Records& records) {
  for (const hub::Record& record : records) {
    const std::size_t size = record.bytes.size();
    const auto count = static_cast<std::size_t>(valueAt<std::int16_t>(record, 8));
    if (record.sensor == "PHYAC") require(size == 10 + 2 * count && count <= 256, record.sensor);
    if (record.sensor == "PDR") require(size == 10 + 28 * count, record.sensor);
    if (record.sensor == "GSPX")
      require(size == 12U + valueAt<std::uint16_t>(record, 10) && size <= 2052, record.sensor);
    if (record.sensor == "ISACT" || record.sensor == "SCOUN") require(size == 12, record.sensor);
  }
}

void configure(hub::Hub& hub, Input& input) {
  const std::string_view sensor = kSensors[input.take<std::uint8_t>() % std::size(kSensors)];
  std::vector<std::vector<std::uint8_t>> values(input.take<std::uint8_t>() % 5);
  std::vector<hub::Property> properties;
  for (auto& value : values) {
    const std::int32_t id = kProperties[input.take<std::uint8_t>() % kProperties.size()];
    value.resize(id == 123 ? 144 : 4);
    for (std::uint8_t& byte : value) byte = input.take<std::uint8_t>();
    properties.push_back({.id = id, .value = value});
  }
  try {
    hub.configure(sensor, properties);
  } catch (const hub::Refused&) {  // goes on as before
  }
}

hub::Sample sampleAt(std::int64_t time, Input& input) {
  hub::Sample sample{.time = time, .acceleration = {}, .rate = hub::Axes{}, .pressure = std::nullopt};
  for (std::int32_t& axis : sample.acceleration) axis = input.take<std::int16_t>() * 1'000;
  for (std::int32_t& axis : *sample.rate) axis = input.take<std::int16_t>() * 30'000;
  if (input.take<std::uint8_t>() % 2 == 0) sample.pressure = input.take<std::int32_t>();
  return sample;
}

}  // namespace

void fuzz::hub(const std::uint8_t* data, std::size_t size) {
  Input input(data, size);
  hub::Hub hub;
  std::int64_t time = 0;
  while (!input.isEmpty()) {
    switch (input.take<std::uint8_t>() % 4) {
      case 0:
        configure(hub, input);
        break;
      case 1:
        hub.stop(kSensors[input.take<std::uint8_t>() % std::size(kSensors)]);
        break;
      case 2:
        time += input.take<std::int32_t>();
        requireLayout(hub.take(sampleAt(time, input)));
        break;
      default:  // the same for a while, back and forth
        const hub::Sample sample = sampleAt(time, input);
        for (int i = 0; i < 200; ++i) {
          hub::Sample next = sample;
          next.time = time += 20'000;
          if (i % 10 < 5) next.acceleration[0] = -next.acceleration[0];
          requireLayout(hub.take(next));
        }
    }
  }
  requireLayout(hub.finish());
}
