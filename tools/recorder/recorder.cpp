#include "recorder.h"

#include <cerrno>
#include <cstddef>
#include <new>
#include <span>
#include <string>

namespace senseloom::trace {

using tool::CallKind;
using tool::callName;
using tool::TraceLine;
namespace member = tool::member;

namespace {

std::span<const uint8_t> bytesOf(const void* data, int32_t size) {
  return {static_cast<const uint8_t*>(data), static_cast<size_t>(size)};
}

void addProperties(TraceLine& line, const ctx_option_t& list) {
  line.beginArray(member::kProperties);
  for (int32_t i = 0; i < list.count; ++i) {
    const ctx_property_t& property = list.properties[i];
    line.addProperty(property.id, bytesOf(property.value, property.size));
  }
  line.endArray();
}

std::string sessionName(uint32_t number) {
  return 's' + std::to_string(number);
}

}  // namespace

void Recorder::opened(const char* sensor, bool exists, void* handle) noexcept {
  attempt([=, this] {
    if (!file.isWanted()) return;
    line.clear();
    if (exists) {
      const uint32_t number = ++sessions;
      if (handle != nullptr) numbers[handle] = number;
      line.addText(member::kCall, callName(CallKind::open));
      line.addText(member::kSession, sessionName(number));
    } else {
      line.addText(member::kNote, "open of a sensor that does not exist");
    }
    if (sensor != nullptr) {
      line.addText(member::kSensor, sensor);
    } else {
      line.addNull(member::kSensor);
    }
    line.addOpened(handle != nullptr);
    end();
  });
}

void Recorder::beforeSetOption(void* handle, const char* option, ctx_option_t** out) noexcept {
  attempt([=, this] {
    if (!begin(CallKind::setOption, handle, out != nullptr)) return;
    if (option != nullptr) {
      line.addText(member::kOption, option);
    } else {
      line.addNull(member::kOption);
      hasResult = false;
    }
  });
}

void Recorder::beforeDispatch(void* handle, const void* data, int len, void** out, const int* outlen) noexcept {
  attempt([=, this] {
    if (!begin(CallKind::dispatch, handle, data != nullptr && len >= 0 && out != nullptr && outlen != nullptr)) return;
    line.addBytes(member::kRecord, bytesOf(data, len));
  });
}

void Recorder::beforeClose(void* handle, ctx_option_t** out) noexcept {
  attempt([=, this] { begin(CallKind::close, handle, out != nullptr); });
}

void Recorder::negotiated(int returned, ctx_option_t** out) noexcept {
  attempt([=, this] {
    if (line.isEmpty()) return;
    line.addReturned(returned);
    if (hasResult && *out != nullptr) addProperties(line, **out);
    end();
  });
}

void Recorder::dispatched(int returned, void** out, const int* outlen) noexcept {
  attempt([=, this] {
    if (line.isEmpty()) return;
    line.addReturned(returned);
    if (hasResult && returned == 1) {
      line.addBytes(member::kResult, bytesOf(*out, *outlen));
    }
    end();
  });
}

void Recorder::closed(void* handle, int returned, ctx_option_t** out) noexcept {
  if (out != nullptr) numbers.erase(handle);
  negotiated(returned, out);
}

void Recorder::uninitialised() noexcept {
  attempt([this] {
    if (!file.isWanted()) return;
    line.clear();
    line.addText(member::kCall, callName(CallKind::uninit));
    end();
  });
}

// Makes a step towards a line, and leaves errno as the library left it.
template <class Step>
void Recorder::attempt(Step step) noexcept {
  const int error = errno;
  try {
    step();
  } catch (const std::bad_alloc&) {
    line.clear();
    file.lose("out of memory");
  }
  errno = error;
}

// Begins the line of a call on a session. Returns whether a replay can make the call again.
bool Recorder::begin(CallKind call, void* handle, bool hasArguments) {
  line.clear();
  if (!file.isWanted()) return false;
  const auto session = numbers.find(handle);
  hasResult = session != numbers.end() && hasArguments;
  if (hasResult) {
    line.addText(member::kCall, callName(call));
    line.addText(member::kSession, sessionName(session->second));
  } else {
    line.addText(member::kNote,
                 std::string(callName(call)) +
                     (session == numbers.end() ? " on a handle that is not open" : " without an argument"));
  }
  return hasResult;
}

void Recorder::end() {
  file.write(line.finish());
  line.clear();
}

}  // namespace senseloom::trace
