#pragma once

#include <cstdint>

#include "proc/proc_on_top.h"

namespace senseloom {

// Rewrites every element of a complete batch in place, by kMask(element, maskArg).
template <class Previous, void (*kMask)(void*, int)>
class ProcMask : public ProcOnTop<Previous> {
 public:
  template <class... Arguments>
  explicit ProcMask(int arg, Arguments... ofPrevious) : ProcOnTop<Previous>(ofPrevious...), maskArg(arg) {}

  bool accept(const void* data, int count) {
    if (!this->prev.accept(data, count)) return false;
    uint8_t* element = this->buffer();
    for (int left = this->length(); left > 0; --left, element += Previous::kElementSize) kMask(element, maskArg);
    return true;
  }

 private:
  int maskArg;
};

}  // namespace senseloom
