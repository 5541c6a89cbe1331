#include "trace/trace_line.h"

#include <algorithm>
#include <charconv>
#include <cstdio>

#include "trace/hex.h"
#include "trace/trace_form.h"

namespace senseloom::tool {
namespace {

bool isBeyondAscii(char c) {
  return static_cast<uint8_t>(c) >= 0x80;
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
  if (std::any_of(text.begin(), text.end(), isBeyondAscii)) {
    addHexText(std::string(key) + "Hex", {reinterpret_cast<const uint8_t*>(text.data()), text.size()});
  } else {
    addKey(key);
    addQuoted(escaped(text));
  }
}

void TraceLine::addInteger(std::string_view key, int64_t value) {
  addKey(key);
  addNumber(value);
}

void TraceLine::addNull(std::string_view key) {
  addKey(key);
  buffer += "null";
}

void TraceLine::addBytes(std::string_view key, std::span<const uint8_t> bytes) {
  beginObject(key);
  addHexText(member::kHex, bytes);
  endObject();
}

void TraceLine::beginArray(std::string_view key) {
  addKey(key);
  buffer += '[';
}

void TraceLine::beginObject(std::string_view key) {
  addKey(key);
  buffer += '{';
}

void TraceLine::beginElement() {
  separate();
  buffer += '{';
}

void TraceLine::addReturned(int value) {
  addInteger(member::kReturned, value);
}

void TraceLine::addOpened(bool hasHandle) {
  if (hasHandle) {
    addText(member::kReturned, kHandle);
  } else {
    addNull(member::kReturned);
  }
}

void TraceLine::addProperty(int32_t id, std::span<const uint8_t> value) {
  beginElement();
  addInteger(member::kId, id);
  addInteger(member::kSize, static_cast<int64_t>(value.size()));
  addHexText(member::kValue, value);
  endObject();
}

void TraceLine::addEngine(std::span<const EngineAnswer> answers) {
  beginArray(member::kEngine);
  for (const EngineAnswer& answer : answers) {
    beginElement();
    addInteger(member::kGroup, answer.group);
    addText(member::kName, answer.name);
    endObject();
  }
  endArray();
}

void TraceLine::addHexText(std::string_view key, std::span<const uint8_t> bytes) {
  addKey(key);
  addHex(bytes);
}

void TraceLine::addThreads(std::span<const int> threads) {
  beginArray(member::kThreads);
  for (const int thread : threads) {
    separate();
    addNumber(thread);
  }
  endArray();
}

std::string_view TraceLine::finish() {
  buffer += "}\n";
  return buffer;
}

void TraceLine::separate() {
  if (const char last = buffer.back(); last != '{' && last != '[') buffer += ',';
}

void TraceLine::addKey(std::string_view key) {
  if (buffer.empty()) buffer += '{';
  separate();
  addQuoted(key);
  buffer += ':';
}

void TraceLine::addQuoted(std::string_view text) {
  buffer += '"';
  buffer += text;
  buffer += '"';
}

void TraceLine::addHex(std::span<const uint8_t> bytes) {
  buffer += '"';
  appendHex(buffer, bytes);
  buffer += '"';
}

void TraceLine::addNumber(int64_t value) {
  char digits[20];
  buffer.append(digits, std::to_chars(digits, digits + sizeof digits, value).ptr);
}

}  // namespace senseloom::tool
