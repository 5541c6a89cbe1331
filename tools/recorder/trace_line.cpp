#include "trace_line.h"

#include <algorithm>
#include <cstdio>

#include "trace/hex.h"

namespace senseloom::trace {
namespace {

std::span<const uint8_t> bytesOf(const void* data, size_t size) {
  return {static_cast<const uint8_t*>(data), size};
}

// What stands in a JSON string for an ASCII text.
std::string escaped(std::string_view text) {
  std::string string;
  for (const char c : text) {
    if (c == '"' || c == '\\') string += '\\';
    if (static_cast<uint8_t>(c) >= ' ') {
      string += c;
    } else {
      char escape[7];
      std::snprintf(escape, sizeof escape, "\\u%04x", static_cast<unsigned>(c));
      string += escape;
    }
  }
  return string;
}

}  // namespace

void TraceLine::addText(std::string_view key, std::string_view text) {
  if (std::any_of(text.begin(), text.end(), [](char c) { return static_cast<uint8_t>(c) >= 0x80; })) {
    addKey(std::string(key) + "Hex");
    addQuoted(tool::toHex(bytesOf(text.data(), text.size())));
  } else {
    addKey(key);
    addQuoted(escaped(text));
  }
}

void TraceLine::addInteger(std::string_view key, int64_t value) {
  addKey(key);
  buffer += std::to_string(value);
}

void TraceLine::addNull(std::string_view key) {
  addKey(key);
  buffer += "null";
}

void TraceLine::addBytes(std::string_view key, std::span<const uint8_t> bytes) {
  addKey(key);
  buffer += "{\"hex\":";
  addQuoted(tool::toHex(bytes));
  buffer += '}';
}

void TraceLine::addProperties(std::string_view key, const ctx_option_t& list) {
  addKey(key);
  buffer += '[';
  for (int32_t i = 0; i < list.count; ++i) {
    const ctx_property_t& property = list.properties[i];
    if (i > 0) buffer += ',';
    buffer += "{\"id\":" + std::to_string(property.id) + ",\"size\":" + std::to_string(property.size) + ",\"value\":";
    addQuoted(tool::toHex(bytesOf(property.value, static_cast<size_t>(property.size))));
    buffer += '}';
  }
  buffer += ']';
}

std::string_view TraceLine::finish() {
  buffer += "}\n";
  return buffer;
}

void TraceLine::addKey(std::string_view key) {
  buffer += buffer.empty() ? '{' : ',';
  addQuoted(key);
  buffer += ':';
}

void TraceLine::addQuoted(std::string_view text) {
  buffer += '"';
  buffer += text;
  buffer += '"';
}

}  // namespace senseloom::trace
