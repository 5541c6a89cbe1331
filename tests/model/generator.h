#pragma once

#include <cstdint>

#include "call.h"

namespace oracle {

// Where the generator takes its decisions from: a random number generator, or the input of a fuzzer.
class Choices {
 public:
  virtual ~Choices() = default;
  // A number from 0 to bound - 1.
  virtual uint32_t below(uint32_t bound) = 0;
  // Whether there is nothing left to decide with.
  virtual bool isExhausted() const { return false; }

  bool oneIn(uint32_t bound) { return below(bound) == 0; }
};

// The same numbers for a seed in every build.
class RandomChoices final : public Choices {
 public:
  explicit RandomChoices(uint64_t seed) : state(seed) {}
  uint32_t below(uint32_t bound) override;

 private:
  uint64_t state;
};

// Makes up a sequence of calls on a few sensors: mostly what a client would do, and some of what it should not.
Sequence makeSequence(Choices& choices);

}  // namespace oracle
