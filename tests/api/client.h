#pragma once

#include <fake_platform.h>
#include <gtest/gtest.h>
#include <senseloom.h>

#include <algorithm>
#include <array>
#include <cstdint>
#include <cstdio>
#include <cstring>
#include <initializer_list>
#include <memory>
#include <optional>
#include <ostream>
#include <string>
#include <utility>
#include <vector>

// What the tests of the shared library see the library through: its calls with their outcome as values that compare.
namespace api {

using fake::LogLine;
using fake::platform;
using Log = std::vector<LogLine>;
using Bytes = std::vector<uint8_t>;

constexpr std::array<const char*, 12> kSensors = {"PHYAC", "STAP",  "GSFLK", "SHAKI", "ISACT", "SCOUN",
                                                  "GSPX",  "DTWGS", "GSETH", "LPE_P", "PDR",   "LIFT"};

// Names the tests of a suite that runs once for every sensor.
inline std::string sensorName(const ::testing::TestParamInfo<const char*>& info) {
  return info.param;
}

// --- log lines

constexpr int kDebug = 3;
constexpr int kInfo = 4;
constexpr int kError = 6;

inline LogLine debug(std::string text) {
  return {kDebug, "libsenseloom", std::move(text)};
}
inline LogLine error(std::string text) {
  return {kError, "libsenseloom", std::move(text)};
}

inline std::string addressText(const void* address) {
  std::array<char, 32> text{};
  std::snprintf(text.data(), text.size(), "%p", address);
  return text.data();
}

// The lines of a negotiation among these sessions, in their order.
inline Log negotiation(const std::string& sensor, const std::vector<void*>& sessions) {
  Log lines;
  for (size_t i = 0; i < sessions.size(); ++i) {
    lines.push_back({kInfo, "Libsl",
                     "The " + std::to_string(i) + " of " + std::to_string(sessions.size()) + " session of sensor " +
                         sensor + " has " + addressText(sessions[i]) + " option!\n"});
  }
  return lines;
}

// Joins log lines, or whatever tests list.
template <class Item>
std::vector<Item> operator+(std::vector<Item> items, const std::vector<Item>& more) {
  items.insert(items.end(), more.begin(), more.end());
  return items;
}

// --- property lists

struct Property {
  int32_t id;
  Bytes value;
  bool operator==(const Property&) const = default;
};
using Properties = std::vector<Property>;

inline void PrintTo(const Property& property, std::ostream* out) {
  *out << property.id << " = " << ::testing::PrintToString(property.value);
}

template <class Integer>
void append(Bytes& bytes, Integer value) {
  const size_t end = bytes.size();
  bytes.resize(end + sizeof value);
  std::memcpy(bytes.data() + end, &value, sizeof value);
}

inline Property property(int32_t id, int32_t value) {
  Property made{.id = id, .value = {}};
  append(made.value, value);
  return made;
}

// The list of these identifiers with one int32_t each.
inline Properties properties(std::initializer_list<std::pair<int32_t, int32_t>> pairs) {
  Properties list;
  for (const auto& [id, value] : pairs) list.push_back(property(id, value));
  return list;
}

struct Release {
  void operator()(ctx_option_t* list) const { EXPECT_EQ(ctx_option_release(list), 0); }
};
using List = std::unique_ptr<ctx_option_t, Release>;

inline Properties read(const List& list) {
  Properties entries;
  for (int32_t i = 0; i < list->count; ++i) {
    const ctx_property_t& entry = list->properties[i];
    const auto* bytes = static_cast<const uint8_t*>(entry.value);
    entries.push_back({entry.id, Bytes(bytes, bytes + entry.size)});
  }
  return entries;
}

// The outcome of a call that negotiates.
struct Negotiated {
  int result;
  std::optional<Properties> list;  // none: null
  bool operator==(const Negotiated&) const = default;
};

inline void PrintTo(const Negotiated& outcome, std::ostream* out) {
  *out << outcome.result << ' ' << ::testing::PrintToString(outcome.list);
}

// A call whose list is kept, for tests of how long its values last.
struct Kept {
  int result;
  List list;
};

// What `*out` is before a call, to see that it is written or left alone.
inline ctx_option_t* somewhere() {
  static ctx_option_t one;
  return &one;
}

inline Kept setAndKeep(void* handle, const std::string& text) {
  ctx_option_t* list = somewhere();
  constexpr int32_t kNotRead = 0x5EED;
  const int result = ctx_set_option(handle, kNotRead, text.c_str(), &list);
  return {result, List(list)};
}

inline Kept closeAndKeep(void* handle) {
  ctx_option_t* list = somewhere();
  const int result = ctx_close_session(handle, &list);
  return {result, List(list)};
}

inline Negotiated outcomeOf(const Kept& call) {
  return {call.result, call.list != nullptr ? std::optional(read(call.list)) : std::nullopt};
}

inline Negotiated setOption(void* handle, const std::string& text) {
  return outcomeOf(setAndKeep(handle, text));
}
inline Negotiated closeSession(void* handle) {
  return outcomeOf(closeAndKeep(handle));
}

inline const Negotiated kFailed{-1, std::nullopt};
inline const Negotiated kStopped{0, std::nullopt};

// --- records

// A record: its timestamp, then these integers.
template <class... Integers>
Bytes record(uint64_t timestamp, Integers... values) {
  Bytes bytes;
  append(bytes, timestamp);
  (append(bytes, values), ...);
  return bytes;
}

inline Bytes activity(uint64_t timestamp, const std::vector<uint16_t>& items) {
  Bytes bytes = record(timestamp, static_cast<int16_t>(items.size()));
  for (const uint16_t item : items) append(bytes, item);
  return bytes;
}

// The outcome of a dispatched record.
struct Delivery {
  int result;
  Bytes record;     // of a delivery: the result's bytes
  bool handedBack;  // ... and whether it is the caller's own memory
  bool operator==(const Delivery&) const = default;
};

inline void PrintTo(const Delivery& delivery, std::ostream* out) {
  *out << delivery.result << (delivery.handedBack ? " handed back " : " ") << ::testing::PrintToString(delivery.record);
}

inline Delivery handedBack(Bytes record) {
  return {1, std::move(record), true};
}
inline Delivery made(Bytes record) {
  return {1, std::move(record), false};
}
inline const Delivery kNothing{0, {}, false};
inline const Delivery kRefused{-1, {}, false};

// Dispatches a record in a memory block of just its size, so that AddressSanitizer sees a read beyond it, at an address
// off by `misalignment` bytes. What must not be written is watched: the record, and without a delivery `*out` and
// `*outlen`.
inline Delivery dispatch(void* handle, const Bytes& record, size_t misalignment = 0) {
  const std::unique_ptr<uint8_t[]> block(new uint8_t[misalignment + record.size()]);
  uint8_t* const data = block.get() + misalignment;
  std::copy(record.begin(), record.end(), data);

  constexpr int kUnwritten = -77;
  int elsewhere = 0;
  void* out = &elsewhere;
  int outLength = kUnwritten;
  const int result = ctx_dispatch_data(handle, data, static_cast<int>(record.size()), &out, &outLength);
  EXPECT_TRUE(std::equal(record.begin(), record.end(), data));
  if (result != 1) {
    EXPECT_EQ(out, &elsewhere);
    EXPECT_EQ(outLength, kUnwritten);
    return {result, {}, false};
  }
  const auto* bytes = static_cast<const uint8_t*>(out);
  return {1, Bytes(bytes, bytes + outLength), out == data};
}

}  // namespace api
