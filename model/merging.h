#pragma once

#include <cstdint>
#include <optional>
#include <string_view>
#include <vector>

#include "log.h"
#include "outcome.h"
#include "reasons.h"
#include "request.h"
#include "templates.h"

namespace senseloom::model {

// What the requests of a sensor's sessions become: the copy of one of them, in which others are merged.
class Merged {
 public:
  explicit Merged(const Request& first);
  void merge(const Request& other);

  int32_t value(std::string_view key) const { return values.value(key); }
  // The property list; nothing when there is none, with the reason in the log and, if `conflict` is not null, there.
  std::optional<PropertyList> render(const Templates& templates, Log& log, std::optional<Remark>& conflict) const;

  bool operator==(const Merged&) const = default;

 private:
  int32_t computed(int32_t id) const;
  std::optional<Remark> templateConflict(Log& log) const;
  PropertyList renderTemplates(const Templates& templates) const;

  Request values;
  int32_t largestLogN;  // of activity: as the first request has it given, but of the others as they were cut
  int enrolling = 0;    // merged requests that enroll a template
};

// Who decided each key. The merge started from the participant at `first`, which is among those merged in only if
// `isFirstMerged` is set: the sensors may have been made anew since it was opened.
std::vector<MergedKey> decidedKeys(const std::vector<Participant>& participants, size_t first, bool isFirstMerged,
                                   const Merged& merged);

}  // namespace senseloom::model
