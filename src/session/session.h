#pragma once

#include <cstdint>

#include "option/option.h"

namespace senseloom {

// One client's subscription to one sensor. Its address is the handle that the client has.
class Session {
 public:
  virtual ~Session() = default;
  Session(const Session&) = delete;
  Session& operator=(const Session&) = delete;

  // Takes the client's option string. Returns 0 when it was accepted, -1 when it was refused.
  virtual int parseOption(const char* text) { return option->parse(text); }

  // Takes one record of `len` bytes. Returns 1 with a result in `*out` and its length in `*outLen`; 0 when there is
  // nothing to deliver and -1 when the record is refused, both with `*out` and `*outLen` untouched. A result is the
  // client's own record, or storage of the session that stays valid until its next record.
  virtual int postProcess(void* data, int len, void** out, int* outLen) noexcept = 0;

  // Starts over with the session's own option and the sensor's merged one, after a negotiation. Returns a negative
  // value, with the session as it was, when that failed.
  virtual int buildProc() { return 0; }

  const char* const name;  // registry name of the session's sensor; static
  Option* const option;    // what the client asked for; a part of the session

 protected:
  Session(const char* sensorName, Option& own) : name(sensorName), option(&own) {}

  // Hands out the client's own record.
  static int passThrough(void* data, int len, void** out, int* outLen) {
    *out = data;
    *outLen = len;
    return 1;
  }

  const void* proc = nullptr;  // the processing chain, a part of the session; null in kinds without one and until built
};

// A session with the option of its kind, which it holds itself: a session is one block of memory.
template <class OptionClass>
class SessionOf : public Session {
 protected:
  SessionOf() : Session(OptionClass::kind.sensor, wanted) {}

  OptionClass wanted;
};

}  // namespace senseloom
