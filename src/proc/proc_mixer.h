#pragma once

#include "proc/proc.h"

namespace senseloom {

// Reduces each complete batch of the stage before it to one element.
class ProcMixer : public ProcOnTop {
 public:
  bool accept(const void* data, int count) override;
  uint8_t* buffer() override { return result.get(); }
  int length() const override { return mixed ? 1 : 0; }
  int bufferLength() const override { return 1; }
  void reset() override;

 protected:
  explicit ProcMixer(std::unique_ptr<Proc> previous)
      : ProcOnTop(std::move(previous)), result(new uint8_t[static_cast<size_t>(elemSize)]) {}

  // Writes the element that stands for the batch of `prev` into `result`.
  virtual void mix() = 0;

  const std::unique_ptr<uint8_t[]> result;

 private:
  bool mixed = false;  // whether `result` holds an element not yet reset
};

}  // namespace senseloom
