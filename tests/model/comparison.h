#pragma once

#include <array>
#include <optional>
#include <string>

#include "client.h"

namespace oracle {

// How often what happened on a sensor, to see that a test is no idle one.
struct Tally {
  int opened = 0;
  int notOpened = 0;
  int lists = 0;
  int refusedOptions = 0;
  int results = 0;
  int nothings = 0;
  int refusedRecords = 0;
};
using Tallies = std::array<Tally, kSensors>;

struct Difference {
  size_t call;  // index in the sequence; its length: the closing of what it left open
  std::string text;
};

// Makes the calls of a sequence on the library and on the model, closes what it leaves open, and leaves the library as
// it was. Returns the first difference, if there is one. Calls for sessions that are not open are left out.
std::optional<Difference> compare(const Sequence& sequence, Mistake mistake = Mistake::none,
                                  Tallies* tallies = nullptr);

}  // namespace oracle
