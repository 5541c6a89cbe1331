// The gesture engine on the host. An input is the samples of one record. Whatever they are, an engine that has seen
// them before finds the same in them again, and knows a drawing afterwards as well as before.

#include <recogniser.h>

#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <vector>

#include "target.h"

namespace {

void require(bool condition, const char* what) {
  if (condition) return;
  std::fprintf(stderr, "%s\n", what);
  std::abort();
}

}  // namespace

void fuzz::gesture(const uint8_t* data, size_t size) {
  std::vector<gesture::Group> record(size / sizeof(gesture::Group));
  if (record.empty()) return;
  std::memcpy(record.data(), data, record.size() * sizeof(gesture::Group));

  gesture::Recogniser recogniser;
  const char* names[2];
  for (const char*& name : names) {
    for (size_t i = 0; i + 1 < record.size(); ++i) {
      require(recogniser.take(record[i].data(), false) == nullptr, "a gesture before the last group");
    }
    name = recogniser.take(record.back().data(), true);
  }
  require(names[0] == names[1], "another gesture in the same record");
  const bool sensible = record.size() >= gesture::kLeastGroups && record.size() <= gesture::kMostGroups;
  require(sensible || names[0] == nullptr, "a gesture in a record that is too short or too long");
  require((names[0] != nullptr) == gesture::recognise(record).has_value(), "a name without a digit, or none with one");
}
