// The interface of senseloom.h for C++20: sessions and property lists that clean up after themselves, results with
// types. Header-only; it needs neither exceptions nor run-time type information, and the conventions of senseloom.h
// hold.
//
//   auto session = senseloom::Session::open("PHYAC");
//   if (!session) return;
//   if (const auto negotiated = session.setOption(R"({"logN": 3, "mode": 1})")) {
//     for (const auto property : negotiated.properties) configureSensor(property.id(), property.bytes());
//   }
//   const auto dispatched = session.dispatch(record);
//   if (dispatched.outcome == senseloom::DispatchOutcome::delivered) use(dispatched.result);
//
// Nothing throws: an object that failed to come about is empty, and an empty session refuses every call.
#ifndef SENSELOOM_HPP
#define SENSELOOM_HPP

#if __cplusplus <= 201703L
#error "senseloom.hpp needs C++20: compile with -std=c++20, or use senseloom.h."
#else

#include <climits>
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <memory>
#include <optional>
#include <span>
#include <string>

#include "senseloom.h"

namespace senseloom {
// Compiled into the programs that include it, so a later, different version must have different symbols.
inline namespace v1 {

// One setting that the sensor is to run with, as an entry of a property list. It refers to the list and must not
// outlive it. The value is the library's: it is stale after the next setOption() or close() of any session of the same
// sensor, and after ctx_uninit(). Id and size stay.
class Property {
 public:
  explicit Property(const ctx_property_t& listed) noexcept : entry(&listed) {}

  std::int32_t id() const noexcept { return entry->id; }
  // Length of the value in bytes.
  std::size_t size() const noexcept { return static_cast<std::size_t>(entry->size); }

  // The value; nothing for the bytes of a gesture template, the one property that is no integer.
  std::optional<std::int32_t> asInt() const noexcept {
    std::int32_t number = 0;
    if (id() == kTemplateBytes || size() != sizeof number) return std::nullopt;
    std::memcpy(&number, entry->value, sizeof number);
    return number;
  }

  // The value byte by byte; integers are in the platform's byte order.
  std::span<const std::uint8_t> bytes() const noexcept {
    return {static_cast<const std::uint8_t*>(entry->value), size()};
  }

 private:
  static constexpr std::int32_t kTemplateBytes = 123;

  const ctx_property_t* entry;
};

// A property list, which it owns, or none. It can be kept as long as wanted; the values of its properties cannot.
class PropertyList {
 public:
  class Iterator {
   public:
    using value_type = Property;
    using difference_type = std::ptrdiff_t;

    Iterator() noexcept = default;
    explicit Iterator(const ctx_property_t* listed) noexcept : entry(listed) {}

    Property operator*() const noexcept { return Property(*entry); }
    Iterator& operator++() noexcept {
      ++entry;
      return *this;
    }
    Iterator operator++(int) noexcept { return Iterator(entry++); }
    bool operator==(const Iterator&) const noexcept = default;

   private:
    const ctx_property_t* entry = nullptr;
  };

  // No list.
  PropertyList() noexcept = default;
  // Takes over a list that the C interface made, or NULL for none.
  explicit PropertyList(ctx_option_t* made) noexcept : list(made) {}

  // Whether there is a list. One without properties is a list, too.
  explicit operator bool() const noexcept { return list != nullptr; }
  std::size_t size() const noexcept { return list != nullptr ? static_cast<std::size_t>(list->count) : 0; }
  Property operator[](std::size_t index) const noexcept { return Property(list->properties[index]); }
  Iterator begin() const noexcept { return Iterator(list != nullptr ? list->properties : nullptr); }
  Iterator end() const noexcept { return Iterator(list != nullptr ? list->properties + list->count : nullptr); }

 private:
  struct Release {
    void operator()(ctx_option_t* owned) const noexcept { ctx_option_release(owned); }
  };
  std::unique_ptr<ctx_option_t, Release> list;
};

// What became of an option. Refused means that it is not JSON or not acceptable to the sensor, which stays as it was,
// or that a step after the merge failed. The list is the sensor's new one; after a refusal there is none, but for one
// case: when a session could not be rebuilt the sensor is to run with the new list all the same.
struct OptionResult {
  bool accepted;
  PropertyList properties;

  explicit operator bool() const noexcept { return accepted; }
};

enum class DispatchOutcome {
  delivered,
  nothing,  // nothing to deliver now
  refused,  // the session is empty, or its kind does not take such a record
};

// What became of a record. A delivered result, which may be empty, is either the record that was passed in, where it
// stands, or storage of the session: valid until the session's next record, or until the session is closed.
struct DispatchResult {
  DispatchOutcome outcome;
  std::span<const std::uint8_t> result;
};

enum class CloseOutcome {
  sensorStopped,   // it was the sensor's last session
  sessionsRemain,  // the sensor is to run with the new property list, unless there was no memory for one
  failed,          // the session was empty, the sensor could not be stopped, or a session that remains not rebuilt
};

struct CloseResult {
  CloseOutcome outcome;
  PropertyList properties;
};

// A session on a sensor, or none. Movable: a session that was moved from is empty.
class Session {
 public:
  // An empty session.
  Session() noexcept = default;

  // Opens a session; see ctx_open_session() for the names. Empty when that failed.
  [[nodiscard]] static Session open(const char* sensor) noexcept { return Session(ctx_open_session(sensor)); }
  [[nodiscard]] static Session open(const std::string& sensor) noexcept { return open(sensor.c_str()); }

  explicit operator bool() const noexcept { return session != nullptr; }
  // For the C interface. Closing is left to this object.
  void* handle() const noexcept { return session.get(); }

  // Gives the session its option, a JSON object, and negotiates: all sessions of the sensor start over.
  OptionResult setOption(const char* option) noexcept {
    ctx_option_t* list = nullptr;
    const int returned = ctx_set_option(session.get(), 0, option, &list);
    return {returned == 0, PropertyList(list)};
  }
  OptionResult setOption(const std::string& option) noexcept { return setOption(option.c_str()); }

  // Passes one record to the session. The library does not write to it.
  [[nodiscard]] DispatchResult dispatch(std::span<const std::uint8_t> record) noexcept {
    if (record.size() > INT_MAX) return {DispatchOutcome::refused, {}};
    std::uint8_t none = 0;  // the library takes a record of no bytes, but no null pointer
    void* data = record.empty() ? &none : const_cast<std::uint8_t*>(record.data());
    void* result = nullptr;
    int length = 0;
    const int returned = ctx_dispatch_data(session.get(), data, static_cast<int>(record.size()), &result, &length);
    if (returned != 1) return {returned == 0 ? DispatchOutcome::nothing : DispatchOutcome::refused, {}};
    if (length == 0) return {DispatchOutcome::delivered, {}};  // `none` handed back goes no further
    return {DispatchOutcome::delivered, {static_cast<const std::uint8_t*>(result), static_cast<std::size_t>(length)}};
  }

  // Closes the session, which is empty from then on whatever the outcome. Destroying it, or assigning another to it,
  // closes it too.
  CloseResult close() noexcept { return closeHandle(session.release()); }

 private:
  explicit Session(void* opened) noexcept : session(opened) {}

  static CloseResult closeHandle(void* handle) noexcept {
    ctx_option_t* list = nullptr;
    const int returned = ctx_close_session(handle, &list);
    const auto outcome = returned == 0   ? CloseOutcome::sensorStopped
                         : returned == 1 ? CloseOutcome::sessionsRemain
                                         : CloseOutcome::failed;
    return {outcome, PropertyList(list)};
  }

  struct Close {
    void operator()(void* handle) const noexcept { closeHandle(handle); }
  };
  std::unique_ptr<void, Close> session;
};

}  // namespace v1
}  // namespace senseloom

#endif
#endif
