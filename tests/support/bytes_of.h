#pragma once

#include <cstddef>
#include <cstdint>
#include <cstring>
#include <vector>

// Records and results as tests write them.
using Bytes = std::vector<uint8_t>;

// The integers back to back, each in as many bytes as its type has: bytesOf(uint64_t{81}, int16_t{1}, uint16_t{0x51}).
// The block is exactly as large, so that a sanitizer sees any access beyond it.
template <class... Integers>
Bytes bytesOf(Integers... values) {
  Bytes bytes((sizeof(values) + ... + 0));
  size_t end = 0;
  ((std::memcpy(bytes.data() + end, &values, sizeof values), end += sizeof values), ...);
  return bytes;
}

// `head` and then the elements of `tail`, back to back.
template <class Element>
Bytes joined(const Bytes& head, const std::vector<Element>& tail) {
  Bytes bytes(head.size() + tail.size() * sizeof(Element));
  if (!head.empty()) std::memcpy(bytes.data(), head.data(), head.size());
  if (!tail.empty()) std::memcpy(bytes.data() + head.size(), tail.data(), tail.size() * sizeof(Element));
  return bytes;
}

// The first `len` bytes, in a block of exactly as many. One of no bytes has an address, too, as long as it is moved
// only.
inline Bytes cut(const Bytes& whole, size_t len) {
  Bytes bytes(len);
  if (len != 0) std::memcpy(bytes.data(), whole.data(), len);
  if (len == 0) bytes.reserve(1);
  return bytes;
}
