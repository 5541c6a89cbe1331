#pragma once

#include <benchmark/benchmark.h>

#include <cstdint>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "client.h"

namespace bench {

// What contenders deliver their results to: one that keeps all, to compare, and one that only looks at each, to
// measure.
class Transcript {
 public:
  void operator()(const void* result, int length) {
    const auto* bytes = static_cast<const uint8_t*>(result);
    heard.emplace_back(bytes, bytes + length);
  }
  bool operator==(const Transcript&) const = default;

 private:
  std::vector<std::vector<uint8_t>> heard;
};

class Glance {
 public:
  void operator()(const void* result, int length) {
    total += static_cast<size_t>(length) + static_cast<const uint8_t*>(result)[length - 2];
  }
  size_t seen() const { return total; }

 private:
  size_t total = 0;
};

// Several ways of doing the same, measured in one run. Each is a function object that makes one pass over the input; a
// contender is entered with what makes it, given what it is to deliver to.
class Contest {
 public:
  Contest(std::string title, size_t operationsOfPass) : name(std::move(title)), operations(operationsOfPass) {}

  // The first that enters sets the results that all others must have.
  template <class Make>
  void enter(const char* contender, Make make) {
    Transcript heard;
    {
      auto pass = make(heard);
      pass();
    }
    if (!expected) expected = heard;
    require(heard == *expected, (name + ": other results of " + contender).c_str());
    enterFloor(contender, make);
  }

  // One that delivers nothing and is measured for comparison only.
  template <class Make>
  void enterFloor(const char* contender, Make make) {
    const auto run = [make, count = operations](benchmark::State& state) {
      Glance glance;
      auto pass = make(glance);
      for (auto _ : state) once(pass);
      benchmark::DoNotOptimize(glance.seen());
      state.SetItemsProcessed(state.iterations() * static_cast<int64_t>(count));
    };
    benchmark::RegisterBenchmark((name + "|" + contender).c_str(), run);
  }

 private:
  // Not inlined, so that a pass has all registers for itself.
  template <class Pass>
  [[gnu::noinline]] static void once(Pass& pass) {
    pass();
  }

  const std::string name;
  const size_t operations;
  std::optional<Transcript> expected;
};

}  // namespace bench
