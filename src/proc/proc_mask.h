#pragma once

#include "proc/proc.h"

namespace senseloom {

// Rewrites every element of a complete batch in place, in the buffer of the stage before it.
class ProcMask final : public ProcOnTop {
 public:
  using MaskFunc = void (*)(void* element, int arg);

  ProcMask(std::unique_ptr<Proc> previous, MaskFunc mask, int arg)
      : ProcOnTop(std::move(previous)), maskFunc(mask), maskArg(arg) {}

 private:
  bool process() override;

  const MaskFunc maskFunc;
  const int maskArg;
};

}  // namespace senseloom
