#include "option/option.h"

#include <cstddef>
#include <cstdlib>
#include <limits>

// The list's layout is binding for callers of the 32-bit library: 4 bytes of count, 12 bytes an entry.
static_assert(sizeof(void*) != 4 || (sizeof(ctx_property_t) == 12 && offsetof(ctx_property_t, id) == 0 &&
                                     offsetof(ctx_property_t, size) == 4 && offsetof(ctx_property_t, value) == 8));
static_assert(sizeof(void*) != 4 || (sizeof(ctx_option_t) == 4 && offsetof(ctx_option_t, properties) == 4));

namespace senseloom {

ctx_option_t* Option::newOption(int n) {
  constexpr size_t kMostEntries =
      (std::numeric_limits<size_t>::max() - offsetof(ctx_option_t, properties)) / sizeof(ctx_property_t);
  if (n < 0 || static_cast<size_t>(n) > kMostEntries) return nullptr;
  const size_t size = offsetof(ctx_option_t, properties) + static_cast<size_t>(n) * sizeof(ctx_property_t);
  auto* list = static_cast<ctx_option_t*>(std::calloc(1, size));
  if (list != nullptr) list->count = n;
  return list;
}

void Option::fillOptionAt(ctx_option_t* list, int index, int id, void* value, int size) {
  if (list == nullptr || index < 0 || index >= list->count) return;
  list->properties[index] = {.id = id, .size = size, .value = value};
}

}  // namespace senseloom
