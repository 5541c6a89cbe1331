#pragma once

#include <cstddef>
#include <cstdint>
#include <span>
#include <string>
#include <string_view>

#include "trace/engine_answer.h"

namespace senseloom::tool {

// One line of a trace, a JSON object, put together member by member. It is written by hand and into one buffer: a
// service that is recorded waits for it.
class TraceLine {
 public:
  void clear() { buffer.clear(); }
  bool isEmpty() const { return buffer.empty(); }
  // What there is so far.
  std::string_view text() const { return buffer; }

  // A text becomes a string. JSON cannot hold what is not UTF-8, so a text beyond ASCII becomes its bytes, in a member
  // with "Hex" at the end of its name.
  void addText(std::string_view key, std::string_view text);
  void addInteger(std::string_view key, int64_t value);
  void addNull(std::string_view key);
  // {"hex":"..."}, the form that the bytes of records have in a trace.
  void addBytes(std::string_view key, std::span<const uint8_t> bytes);

  // What is added up to the matching end becomes part of the object or array. An element is an object in an array.
  void beginArray(std::string_view key);
  void endArray() { buffer += ']'; }
  void beginObject(std::string_view key);
  void beginElement();
  void endObject() { buffer += '}'; }

  // "returned": what the library returned; for an open, whether it returned a handle.
  void addReturned(int value);
  void addOpened(bool hasHandle);
  // An element of "properties": {"id","size","value"} with the value as hexadecimal digits.
  void addProperty(int32_t id, std::span<const uint8_t> value);

  // "engine": {"group","name"} for each group of samples that a gesture was recognised at.
  void addEngine(std::span<const EngineAnswer> answers);

  // A string of hexadecimal digits.
  void addHexText(std::string_view key, std::span<const uint8_t> bytes);

  // "threads": numbers of threads.
  void addThreads(std::span<const int> threads);

  // The whole line, with its line feed. Nothing is added to it after that.
  std::string_view finish();

 private:
  void separate();
  void addKey(std::string_view key);
  void addQuoted(std::string_view text);
  void addHex(std::span<const uint8_t> bytes);
  void addNumber(int64_t value);

  std::string buffer;
};

}  // namespace senseloom::tool
