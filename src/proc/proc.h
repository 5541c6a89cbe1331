#pragma once

#include <cstddef>
#include <cstdint>
#include <memory>
#include <utility>

namespace senseloom {

class ProcFirst;

// One stage of a processing chain. The first stage of a chain gathers elements, blocks of `elemSize` bytes, into a
// batch; every other stage owns the one before it and acts on the batch once that is complete. The owner of the chain
// talks to the last stage alone:
//
//   if (last->accept(data, count)) { use bufferLength() elements at buffer(); last->reset(); }
//
// A complete chain takes nothing more until it is reset.
class Proc {
 public:
  using EqualFunc = bool (*)(const void*, const void*);

  virtual ~Proc() = default;
  Proc(const Proc&) = delete;
  Proc& operator=(const Proc&) = delete;

  // Offers `count` elements that lie back to back at `data`. True when a result is ready now; false also for null data
  // and a negative count, which change nothing.
  bool accept(const void* data, int count);

  // How many elements are at buffer() now.
  virtual int length() const = 0;
  // Drops the batch, so that gathering starts again.
  void reset();

  // Starts over as if the chain were newly made: drops the batch, and forgets those before it.
  virtual void restart() { reset(); }

  // The elements of the result.
  uint8_t* buffer() const { return elements; }
  // How many elements a complete result has.
  int bufferLength() const { return capacity; }

  const int elemSize;  // bytes of an element
  const EqualFunc equalFunc;

 protected:
  Proc(int elementSize, EqualFunc equal, ProcFirst& firstStage, uint8_t* buffer, int bufferLength)
      : elemSize(elementSize), equalFunc(equal), first(firstStage), elements(buffer), capacity(bufferLength) {}

 private:
  friend class ProcOnTop;

  // Acts on the complete batch, after the stages before it. Returns whether there still is a result.
  virtual bool finish() = 0;

  ProcFirst& first;  // of the chain: most offers do not complete a batch and concern no other stage
  uint8_t* const elements;
  const int capacity;
};

// The first stage of a chain.
class ProcFirst : public Proc {
 protected:
  ProcFirst(int elementSize, EqualFunc equal, uint8_t* buffer, int bufferLength)
      : Proc(elementSize, equal, *this, buffer, bufferLength) {}

 private:
  friend class Proc;

  // Takes `count` elements, 0 or more. True when they completed the batch.
  virtual bool gather(const void* data, int count) = 0;
  virtual void drop() = 0;
  bool finish() override { return true; }
};

inline bool Proc::accept(const void* data, int count) {
  return count >= 0 && data != nullptr && first.gather(data, count) && finish();
}

inline void Proc::reset() {
  first.drop();
}

// A stage on top of another one, whose batch is its own result unless it says otherwise.
class ProcOnTop : public Proc {
 public:
  int length() const override { return prev->length(); }
  void restart() override { prev->restart(); }

 protected:
  explicit ProcOnTop(std::unique_ptr<Proc> previous)
      : ProcOnTop(std::move(previous), previous->buffer(), previous->bufferLength()) {}
  ProcOnTop(std::unique_ptr<Proc>&& previous, uint8_t* buffer, int bufferLength)
      : Proc(previous->elemSize, previous->equalFunc, previous->first, buffer, bufferLength),
        prev(std::move(previous)) {}

  const std::unique_ptr<Proc> prev;

 private:
  // What this stage does to a complete batch of the stage before it. Returns whether there still is a result.
  virtual bool process() = 0;
  bool finish() final { return prev->finish() && process(); }
};

}  // namespace senseloom
