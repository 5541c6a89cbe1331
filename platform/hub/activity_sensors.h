// "PHYAC" and "ISACT": what the person does who carries the phone.
#pragma once

#include <cstdint>
#include <vector>

#include "activity_classifier.h"
#include "sensor.h"

namespace hub {

// Decisions with sequence numbers, as many a record as the client with the shortest batches gathers, at the distance
// that the clients ask for together. Which classes are wanted, and whether only changes are, is for the library to look
// at: the votes need all decisions.
class ActivitySensor : public Sensor {
 public:
  static constexpr char kName[] = "PHYAC";

  void configure(Properties properties) override;
  void take(const Sample& sample, Records& records) override;
  void startOver() override { classifier = PhysicalActivityClassifier(); }

 private:
  PhysicalActivityClassifier classifier;
  std::uint32_t step = 1;     // each how many-th decision is reported
  std::size_t perRecord = 1;  // decisions
  std::uint32_t skipped = 0;
  std::uint32_t sequence = 0;
  std::vector<std::uint16_t> items;  // of the next record
};

// Each decision at once, of a shorter window, as a record of its own, if a client asked for its class.
class InstantActivitySensor : public Sensor {
 public:
  static constexpr char kName[] = "ISACT";

  void configure(Properties properties) override;
  void take(const Sample& sample, Records& records) override;
  void startOver() override { classifier = InstantActivityClassifier(); }

 private:
  InstantActivityClassifier classifier;
  std::int32_t classMask = 0;
};

}  // namespace hub
