#pragma once

#include "proc/proc.h"

namespace senseloom {

// Reduces each complete batch of the stage before it to one element.
class ProcMixer : public ProcOnTop {
 public:
  // The result is made as soon as the batch before it is complete, and goes with that.
  int length() const override { return prev->length() == prev->bufferLength() ? 1 : 0; }

 protected:
  explicit ProcMixer(std::unique_ptr<Proc> previous)
      : ProcMixer(std::move(previous), Result(new uint8_t[static_cast<size_t>(previous->elemSize)])) {}

  // Writes the element that stands for the complete batch of `prev` to buffer().
  virtual void mix() = 0;

 private:
  using Result = std::unique_ptr<uint8_t[]>;
  ProcMixer(std::unique_ptr<Proc>&& previous, Result memory)
      : ProcOnTop(std::move(previous), memory.get(), 1), result(std::move(memory)) {}

  bool process() final {
    mix();
    return true;
  }

  const Result result;
};

}  // namespace senseloom
