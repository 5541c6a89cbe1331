#pragma once

#include <memory>

#include "proc/proc.h"

namespace senseloom {

// The first stage of a chain: gathers batches of a fixed number of elements, in the order in which they arrive.
class ProcNM final : public Proc {
 public:
  using CheckSeqFunc = int (*)(const void*);

  // A batch of 0 or fewer elements holds nothing and refuses every offer. `checkSeq` tells an element's sequence number
  // and may be null.
  ProcNM(int elementSize, EqualFunc equal, CheckSeqFunc checkSeq, int bufferLength);
  ProcNM(int elementSize, EqualFunc equal, int bufferLength) : ProcNM(elementSize, equal, nullptr, bufferLength) {}

  // Elements beyond the room of the batch are dropped and not kept for the next batch, on purpose.
  bool accept(const void* data, int count) override;
  uint8_t* buffer() override { return batch.get(); }
  int length() const override { return filled; }
  int bufferLength() const override { return capacity; }
  void reset() override { filled = 0; }

  // Carried for the owner of the chain. Gathering never calls it: gaps and repeats in the sequence are taken as they
  // come.
  const CheckSeqFunc checkSeqFunc;

 private:
  int filled = 0;
  const int capacity;
  const std::unique_ptr<uint8_t[]> batch;
};

}  // namespace senseloom
