#include "resampler.h"

#include <algorithm>

namespace hub {
namespace {

std::int32_t limited(std::int32_t value) {
  return std::clamp(value, -kMostValue, kMostValue);
}

bool haveSameSensors(const Sample& a, const Sample& b) {
  return a.rate.has_value() == b.rate.has_value() && a.pressure.has_value() == b.pressure.has_value();
}

}  // namespace

Resampler::Taken Resampler::take(const Sample& sample) {
  if (previous && sample.time <= previous->time) return {};
  if (!previous || sample.time - previous->time > kGap || !haveSameSensors(*previous, sample)) {
    const bool startedOver = previous.has_value();
    previous = sample;
    begin = integrated = sample.time;
    areas = {};
    return {.intervals = {}, .startedOver = startedOver};
  }
  std::size_t count = 0;
  while (begin + kInterval <= sample.time) {
    integrateTo(begin + kInterval, sample);
    ended[count++] = endInterval();
  }
  integrateTo(sample.time, sample);
  previous = sample;
  return {.intervals = std::span(ended).first(count)};
}

Resampler::Channels Resampler::channelsOf(const Sample& sample) {
  Channels channels{};
  for (std::size_t axis = 0; axis < 3; ++axis) {
    channels[axis] = limited(sample.acceleration[axis]);
    if (sample.rate) channels[3 + axis] = limited((*sample.rate)[axis]);
  }
  if (sample.pressure) channels[6] = limited(*sample.pressure);
  return channels;
}

// On the straight line from the previous sample to the next.
Resampler::Channels Resampler::valuesAt(std::int64_t time, const Sample& next) const {
  Channels values = channelsOf(*previous);
  const Channels after = channelsOf(next);
  const std::int64_t duration = next.time - previous->time;
  for (std::size_t i = 0; i < kChannels; ++i) values[i] += (after[i] - values[i]) * (time - previous->time) / duration;
  return values;
}

void Resampler::integrateTo(std::int64_t time, const Sample& next) {
  const Channels from = valuesAt(integrated, next);
  const Channels to = valuesAt(time, next);
  for (std::size_t i = 0; i < kChannels; ++i) areas[i] += (from[i] + to[i]) * (time - integrated);
  integrated = time;
}

Sample Resampler::endInterval() {
  const auto mean = [&](std::size_t channel) { return static_cast<std::int32_t>(areas[channel] / (2 * kInterval)); };
  begin += kInterval;
  Sample sample{
      .time = begin, .acceleration = {mean(0), mean(1), mean(2)}, .rate = std::nullopt, .pressure = std::nullopt};
  if (previous->rate) sample.rate = Axes{mean(3), mean(4), mean(5)};
  if (previous->pressure) sample.pressure = mean(6);
  areas = {};
  return sample;
}

}  // namespace hub
