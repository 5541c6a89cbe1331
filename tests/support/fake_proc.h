#pragma once

#include <string>
#include <vector>

#include "bytes_of.h"
#include "proc/proc.h"

namespace fake {

// What a fake first stage is to answer, and what became of it. Outlives the stage.
struct Stage {
  Bytes batch;
  int bufferLength = 0;
  bool complete = true;             // whether an offer completes the batch
  int length = 0;                   // bufferLength once an offer completed the batch
  const void* offered = nullptr;    // the data of the last offer
  std::vector<std::string> events;  // "offered COUNT", "refused COUNT", "dropped", "destroyed"
};

class StageProc final : public senseloom::ProcFirst {
 public:
  explicit StageProc(Stage& behind, int elementSize = 1, EqualFunc equal = nullptr)
      : ProcFirst(elementSize, equal, behind.batch.data(), behind.bufferLength), stage(behind) {}
  ~StageProc() override { stage.events.push_back("destroyed"); }

  int length() const override { return stage.length; }

 private:
  bool gather(const void* data, int count) override {
    stage.offered = data;
    const bool full = stage.length == stage.bufferLength;
    stage.events.push_back((full ? "refused " : "offered ") + std::to_string(count));
    if (full || !stage.complete) return false;
    stage.length = stage.bufferLength;
    return true;
  }
  void drop() override {
    stage.events.push_back("dropped");
    stage.length = 0;
  }

  Stage& stage;
};

}  // namespace fake
