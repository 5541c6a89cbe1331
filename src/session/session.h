#pragma once

#include <cstdint>
#include <cstdlib>
#include <memory>
#include <new>
#include <span>
#include <utility>

#include "option/option.h"
#include "proc/proc.h"

namespace senseloom {

// One client's subscription to one sensor. Its address is the handle that the client has.
class Session {
 public:
  // `name` is the registry name of the session's sensor and has static lifetime.
  Session(const char* sensorName, std::unique_ptr<Option> ownOption) : name(sensorName), option(std::move(ownOption)) {}
  virtual ~Session() = default;
  Session(const Session&) = delete;
  Session& operator=(const Session&) = delete;

  // Takes the client's option string. Returns 0 when it was accepted, -1 when it was refused.
  virtual int parseOption(const char* text) { return option->parse(text); }

  // Takes one record of `len` bytes. Returns 1 with a result in `*out` and its length in `*outLen`; 0 when there is
  // nothing to deliver and -1 when the record is refused, both with `*out` and `*outLen` untouched. A result is the
  // client's own record, or storage of the session that stays valid until its next record.
  virtual int postProcess(void* data, int len, void** out, int* outLen) noexcept = 0;

  // Starts over with the session's own option and the sensor's merged option, after a negotiation. Returns a negative
  // value, with the session as it was, when that failed.
  virtual int buildProc() { return 0; }

  const Option& ownOption() const { return *option; }

  const char* const name;

 protected:
  // Hands out the client's own record.
  static int passThrough(void* data, int len, void** out, int* outLen) {
    *out = data;
    *outLen = len;
    return 1;
  }

  // Declared in this order because the option goes first when a session is destroyed, then the chain.
  std::unique_ptr<Proc> proc;  // the last stage of the processing chain; null in kinds and sessions without one
  std::unique_ptr<Option> option;
};

// The memory of results that a session makes itself: zero-filled, and of malloc(), since it crosses the C interface.
template <size_t kSize>
class ResultBuffer {
 public:
  ResultBuffer() : storage(static_cast<uint8_t*>(std::calloc(1, kSize))) {
    if (storage == nullptr) throw std::bad_alloc();
  }
  std::span<uint8_t, kSize> bytes() const { return std::span<uint8_t, kSize>(storage.get(), kSize); }

 private:
  struct Free {
    void operator()(uint8_t* memory) const { std::free(memory); }
  };
  std::unique_ptr<uint8_t, Free> storage;
};

}  // namespace senseloom
