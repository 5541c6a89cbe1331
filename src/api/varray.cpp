#include <cstdlib>
#include <cstring>
#include <limits>

#include "senseloom.h"

// The growable array is offered to callers; nothing in the library uses it.
namespace {

constexpr int32_t kFirstCapacity = 16;
constexpr int32_t kMostCapacity = 1 << 30;

// Bytes of `slots` elements; the product can leave 32 bits, which calloc() and memcpy() then see as a size too large.
size_t bytes(const varray_t* va, int32_t slots) {
  return static_cast<size_t>(slots) * static_cast<size_t>(va->elemSize);
}

uint8_t* slotAt(const varray_t* va, int32_t index) {
  return static_cast<uint8_t*>(va->data) + bytes(va, index);
}

bool grow(varray_t* va) {
  if (va->capacity >= kMostCapacity) return false;
  void* larger = std::calloc(static_cast<size_t>(va->elemSize), static_cast<size_t>(va->capacity) * 2);
  if (larger == nullptr) return false;
  std::memcpy(larger, va->data, bytes(va, va->count));
  std::free(va->data);
  va->data = larger;
  va->capacity *= 2;
  return true;
}

}  // namespace

void* _va_init(varray_t* va, int elemSize) noexcept {
  if (elemSize <= 0 || va == nullptr) return nullptr;
  // Storage that the record may hold already is overwritten, not freed: a record before its first init holds anything.
  *va = {.count = 0,
         .capacity = kFirstCapacity,
         .elemSize = elemSize,
         .data = std::calloc(static_cast<size_t>(elemSize), kFirstCapacity)};
  return va->data;
}

void* va_new(varray_t* va) noexcept {
  // No storage: never initialised, released, or an init whose allocation failed.
  if (va == nullptr || va->capacity <= 0 || va->data == nullptr) return nullptr;
  if (va->count == va->capacity && !grow(va)) return nullptr;
  return slotAt(va, va->count++);
}

void* _va_del(varray_t* va, int index, void* out) noexcept {
  // Without a destination nothing is deleted, on purpose: a removed element is always handed over.
  if (index < 0 || va == nullptr || index >= va->count || out == nullptr) return nullptr;
  uint8_t* element = slotAt(va, index);
  std::memcpy(out, element, bytes(va, 1));
  std::memmove(element, element + bytes(va, 1), bytes(va, va->count - index - 1));
  --va->count;
  return out;
}

void va_free(varray_t* va) noexcept {
  if (va == nullptr) return;
  std::free(va->data);
  *va = {};
}
