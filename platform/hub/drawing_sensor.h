// "GSPX": movements that may be drawings, for the gesture engine to decide.
#pragma once

#include "movement_finder.h"
#include "sensor.h"

namespace hub {

class DrawingSensor : public Sensor {
 public:
  static constexpr char kName[] = "GSPX";

  // Its list is empty: which classes are wanted is for the library to look at.
  void configure(Properties /*properties*/) override {}
  void take(const Sample& sample, Records& records) override;
  void startOver() override { finder = MovementFinder(); }
  void finish(std::int64_t time, Records& records) override;

 private:
  MovementFinder finder;
};

}  // namespace hub
