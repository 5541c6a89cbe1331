#pragma once

#include <array>
#include <string>

#include "client.h"
#include "model/model.h"

namespace oracle {

// The last property list of each sensor, which has to show the same until the sensor's next negotiation.
class HeldLists {
 public:
  HeldLists() = default;
  ~HeldLists();
  HeldLists(const HeldLists&) = delete;
  HeldLists& operator=(const HeldLists&) = delete;

  // Takes the list that a call handed out. The model is in the state after the call.
  void take(int sensor, const Observation& observation, const Model& model);

  // What a list shows that it should not, after a call; empty when all is well.
  std::string difference(const Model& model);

 private:
  struct Held {
    ctx_option_t* list = nullptr;
    PropertyList properties;
    int negotiations = 0;
  };
  std::array<Held, kSensors> lists;
};

}  // namespace oracle
