#pragma once

#include <cstddef>
#include <cstdint>
#include <memory>
#include <utility>

namespace senseloom {

// One stage of a processing chain. The first stage of a chain gathers elements, blocks of `elemSize` bytes, into a
// batch; every other stage owns the one before it, offers it what it is offered itself, and acts on the batch once that
// is complete. The owner of the chain talks to the last stage alone:
//
//   if (last->accept(data, count)) { use length() elements at buffer(); last->reset(); }
//
// A complete stage takes nothing more until it is reset.
class Proc {
 public:
  using EqualFunc = bool (*)(const void*, const void*);

  Proc(int elementSize, EqualFunc equal) : elemSize(elementSize), equalFunc(equal) {}
  virtual ~Proc() = default;
  Proc(const Proc&) = delete;
  Proc& operator=(const Proc&) = delete;

  // Offers `count` elements that lie back to back at `data`. True when a result is ready now; false also for null data
  // and a negative count, which change nothing.
  virtual bool accept(const void* data, int count) = 0;
  // The elements of the result.
  virtual uint8_t* buffer() = 0;
  // How many elements are at buffer().
  virtual int length() const = 0;
  // How many elements a complete result has.
  virtual int bufferLength() const = 0;
  // Drops the batch, so that gathering starts again.
  virtual void reset() = 0;

  const int elemSize;  // bytes of an element
  const EqualFunc equalFunc;
};

// A stage on top of another one, whose batch is its own result unless it says otherwise.
class ProcOnTop : public Proc {
 public:
  uint8_t* buffer() override { return prev->buffer(); }
  int length() const override { return prev->length(); }
  int bufferLength() const override { return prev->bufferLength(); }
  void reset() override { prev->reset(); }

 protected:
  explicit ProcOnTop(std::unique_ptr<Proc> previous)
      : Proc(previous->elemSize, previous->equalFunc), prev(std::move(previous)) {}

  const std::unique_ptr<Proc> prev;
};

}  // namespace senseloom
