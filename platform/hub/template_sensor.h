// "DTWGS": enrols a movement as a template, or matches movements with up to two templates.
#pragma once

#include <drawing.h>

#include <array>
#include <cstdint>
#include <optional>

#include "movement_finder.h"
#include "sensor.h"

namespace hub {

// An empty list asks for enrolling: each movement becomes a record whose set of classes has both bits, with the
// template behind it: its length in two bytes, the most significant first, and its bytes. In hexadecimal digits, these
// are the text that a client gives as its option "template1" or "template2". A list with a level asks for matching: a
// movement that is near enough to a template becomes a record whose set of classes has the bit of the nearest one.
class TemplateSensor : public Sensor {
 public:
  static constexpr char kName[] = "DTWGS";

  // Throws Refused for a template that is not one of this hub's.
  void configure(Properties properties) override;
  void take(const Sample& sample, Records& records) override;
  void startOver() override { finder = MovementFinder(); }
  void finish(std::int64_t time, Records& records) override;

 private:
  void use(const Movement& movement, std::int64_t time, Records& records) const;
  int nearestTemplate(const gesture::Points& points) const;

  MovementFinder finder;
  bool isEnrolling = true;
  std::uint32_t limit = 0;  // the most that a movement and a template may differ
  std::array<std::optional<gesture::Points>, 2> templates;
};

}  // namespace hub
