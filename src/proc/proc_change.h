#pragma once

#include "proc/proc.h"

namespace senseloom {

// Lets a complete batch through only when it differs from what was last let through; drops it otherwise. The first
// batch always passes. What is remembered survives reset() and goes only with restart().
class ProcChange final : public ProcOnTop {
 public:
  explicit ProcChange(std::unique_ptr<Proc> previous)
      : ProcOnTop(std::move(previous)), last(new uint8_t[static_cast<size_t>(elemSize)]) {}

  void restart() override {
    remembers = false;
    ProcOnTop::restart();
  }

 private:
  bool process() override;
  bool differs() const;

  const std::unique_ptr<uint8_t[]> last;  // the last element of the last batch let through
  bool remembers = false;                 // whether there was one
};

}  // namespace senseloom
