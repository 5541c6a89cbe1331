#pragma once

#include "bytes.h"
#include "outcome.h"
#include "reasons.h"
#include "request.h"

namespace senseloom::model {

// What a session does with a record of which it decides by the request and the record alone.
Verdict judgeAlone(const Request& request, Record record, Outcome& outcome);

// Dead reckoning: gathers the items of records until there are enough.
class Gathering {
 public:
  Verdict judge(const Request& request, Record record, Outcome& outcome);
  size_t pending() const { return items.size() / kItemSize; }
  void drop() { items.clear(); }

  bool operator==(const Gathering&) const = default;

 private:
  static constexpr size_t kItemSize = 28;
  static constexpr size_t kMostItems = 64;

  Bytes items;
};

}  // namespace senseloom::model
