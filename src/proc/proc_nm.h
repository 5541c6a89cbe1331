#pragma once

#include <memory>

#include "proc/proc.h"

namespace senseloom {

// Gathers batches of a fixed number of elements, in the order in which they arrive.
class ProcNM final : public ProcFirst {
 public:
  using CheckSeqFunc = int (*)(const void*);

  // A batch of 0 or fewer elements holds nothing and refuses every offer. `checkSeq` tells an element's sequence number
  // and may be null.
  ProcNM(int elementSize, EqualFunc equal, CheckSeqFunc checkSeq, int bufferLength);
  ProcNM(int elementSize, EqualFunc equal, int bufferLength) : ProcNM(elementSize, equal, nullptr, bufferLength) {}

  int length() const override { return filled; }

  // Carried for the owner of the chain. Gathering never calls it: gaps and repeats in the sequence are taken as they
  // come.
  const CheckSeqFunc checkSeqFunc;

 private:
  using Batch = std::unique_ptr<uint8_t[]>;
  ProcNM(int elementSize, EqualFunc equal, CheckSeqFunc checkSeq, int bufferLength, Batch memory)
      : ProcFirst(elementSize, equal, memory.get(), bufferLength), checkSeqFunc(checkSeq), batch(std::move(memory)) {}

  // Elements beyond the room of the batch are dropped and not kept for the next batch, on purpose.
  bool gather(const void* data, int count) override;
  void drop() override { filled = 0; }

  int filled = 0;
  const Batch batch;
};

}  // namespace senseloom
