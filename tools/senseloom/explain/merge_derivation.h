#pragma once

#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "explain/option_reading.h"
#include "explain/wishes.h"

namespace senseloom::tool {

// A session whose wishes are merged.
struct Participant {
  std::string name;
  const Wishes* wishes;
};

// The outcome for one key.
struct MergedKey {
  std::optional<int32_t> value;  // nothing: the key is not merged
  std::string decidedBy;         // the sessions whose wish it is
};

// An entry that the library's property list is to have.
struct ExpectedProperty {
  int32_t id;
  std::optional<int32_t> value = {};  // nothing: the bytes of a gesture template, `size` of them
  size_t size = sizeof(int32_t);
};

// How the wishes of a sensor's sessions become one: told from the description of the sensor's options, beside the
// library.
struct MergeDerivation {
  std::vector<MergedKey> keys;
  std::optional<std::vector<ExpectedProperty>> properties;  // nothing: the library can make no list
  std::string conflict;                                     // why it can not, and
  std::string logged;                                       // ... the line that it logs about that
};

// The participants are in opening order. The merge begins with the wishes of the one at `starter`, which stands outside
// of the merge itself if `starterIsForeign`: the sensors were made anew since it was opened.
MergeDerivation deriveMerge(const std::vector<Participant>& participants, size_t starter, bool starterIsForeign,
                            const TemplateLengths& templates);

}  // namespace senseloom::tool
