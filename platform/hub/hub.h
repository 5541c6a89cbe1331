// The sensor hub of a Linux host: makes the records of the context sensors out of what a phone's motion sensors say.
// Like the service of a platform, it knows of its clients no more than the property lists that the library hands out.
#pragma once

#include <map>
#include <memory>
#include <optional>
#include <string_view>

#include "resampler.h"
#include "sensor.h"

namespace hub {

class Hub {
 public:
  // What it needs of the samples to sense this. Throws Refused, with the reason, if it cannot sense it at all.
  struct Needs {
    bool rate;
  };
  static Needs needsOf(std::string_view sensor);

  // Starts a sensor, or changes how it runs: with the newest property list of the library. Throws Refused; what the
  // sensor did before, it goes on with then.
  void configure(std::string_view sensor, Properties properties);
  // The last client of a sensor is gone.
  void stop(std::string_view sensor);

  // Takes the next sample: those of at least 20 a second, in order of time, with an angular rate if a sensor that runs
  // needs it. Returns the records that it completes, sensor by sensor.
  Records take(const Sample& sample);
  // No more samples come. Returns what ends with that.
  Records finish();

 private:
  Resampler resampler;
  std::map<std::string_view, std::unique_ptr<Sensor>> sensors;  // those that run
  std::int64_t time = 0;                                        // of the last sample
};

}  // namespace hub
