#include "request.h"

namespace senseloom::model {

std::string Requested::text() const {
  const std::string number = std::to_string(value);
  if (asked != value) return number + " for " + (isDefault ? "default " : "") + std::to_string(asked);
  return isDefault ? number + " default" : number;
}

Request::Request(int kind) : ofKind(kind) {
  auto* next = values.data();
  for (const Key& key : rowOf(kind).keys) *next++ = {key.defaultValue, key.defaultValue, true};
}

}  // namespace senseloom::model
