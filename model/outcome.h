#pragma once

#include <array>
#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "bytes.h"
#include "log.h"
#include "reasons.h"

namespace senseloom::model {

// What the platform answers during a call.
struct Answers {
  int get = 0;        // the loader
  int open = 0;       // the module
  bool gives = true;  // whether a successful open gives a device
  uint32_t version = 0x200;
  int activate = 0;
  int deactivate = 0;
  bool starts = true;                             // the gesture engine
  std::vector<std::optional<std::string>> names;  // its answers to the groups of samples; none left: no gesture

  bool operator==(const Answers&) const = default;
};

// Which allocations of a call fail; `rebuild` has a bit for each session of the sensor, in opening order. Room is what
// is needed before anything is begun: for twelve new sensors, for one session more, or for reading an option string. A
// text that runs out of memory in the middle all the same counts as text that is not JSON.
struct Shortage {
  bool room = false;
  bool session = false;
  bool text = false;
  bool copy = false;
  bool list = false;
  uint32_t rebuild = 0;

  bool operator==(const Shortage&) const = default;
};

struct Property {
  int32_t id;
  std::string value;  // its bytes
  int slot = -1;      // of template bytes: which template
  bool operator==(const Property&) const = default;
};
using PropertyList = std::vector<Property>;

// Six samples that the gesture engine is fed with, and whether they are their record's last.
struct SampleGroup {
  std::array<int16_t, 6> samples{};
  int count = 1;
  bool last = false;
  bool operator==(const SampleGroup&) const = default;
};

// Why a call came to what it came to. What is about an option string, and the negotiation, are there when they are
// asked for.
struct Explanation {
  Verdict verdict = {};              // on a dispatched record
  ItemCounts items = {};             // of the dispatched record, or of the session that closes
  std::vector<Remark> remarks = {};  // about an option string, and about what the platform does not do
  std::optional<Negotiation> negotiation = {};
  bool operator==(const Explanation&) const = default;
};

// What a caller and the platform see of one call, and why.
struct Outcome {
  int returned = 0;                  // of those that return a pointer or bool: 1 for non-null and true
  bool storesList = false;           // whether anything was stored through the list's address, null included
  std::optional<PropertyList> list;  // nothing: null
  enum { nothing, sameRecord, ownBuffer } delivers = nothing;
  Bytes result;  // of ownBuffer

  Log log;
  std::vector<std::string> calls;  // of the hardware loader and the device
  std::vector<SampleGroup> groups;
  int engineStarts = 0;
  int engineCloses = 0;

  Explanation why;

  bool operator==(const Outcome&) const = default;
};

}  // namespace senseloom::model
