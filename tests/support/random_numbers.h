#pragma once

#include <gtest/gtest.h>

#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <random>
#include <string>

// The numbers of a randomised test. The seed is printed: a new one each time, or SENSELOOM_TEST_SEED of the
// environment, to repeat a failure.
class RandomNumbers {
 public:
  RandomNumbers() : seed(chooseSeed()), engine(seed), trace(__FILE__, __LINE__, "seed " + std::to_string(seed)) {
    std::printf("SENSELOOM_TEST_SEED=%lu\n", static_cast<unsigned long>(seed));
    testing::Test::RecordProperty("seed", std::to_string(seed));
  }

  uint32_t below(uint32_t bound) { return next() % bound; }
  uint32_t next() { return static_cast<uint32_t>(engine()); }

 private:
  static uint32_t chooseSeed() {
    const char* given = std::getenv("SENSELOOM_TEST_SEED");
    return given != nullptr ? static_cast<uint32_t>(std::strtoul(given, nullptr, 10)) : std::random_device{}();
  }

  const uint32_t seed;
  std::mt19937 engine;
  const testing::ScopedTrace trace;  // shows the seed with each failure
};
