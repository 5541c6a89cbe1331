#pragma once

#include <cstddef>
#include <cstdint>

#include "kinds/sensor_table.h"
#include "trace/json.h"

namespace senseloom::tool {

// How the items of a record are written in a trace: as an array, one element an item.
struct ItemCodec {
  const char* field;  // the array's name
  size_t size;        // bytes of one item
  size_t most;        // items that a record can count
  void (*encode)(json_t* element, uint8_t* bytes);
  Json (*decode)(const uint8_t* bytes);
};

// Null for records without items.
const ItemCodec* itemCodec(Items items);

}  // namespace senseloom::tool
