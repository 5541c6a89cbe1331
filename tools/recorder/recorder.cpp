#include "recorder.h"

#include <cerrno>
#include <cstddef>
#include <new>
#include <string>

namespace senseloom::trace {
namespace {

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
      line.addText("call", "open");
      line.addText("session", sessionName(number));
    } else {
      line.addText("note", "open of a sensor that does not exist");
    }
    if (sensor != nullptr) {
      line.addText("sensor", sensor);
    } else {
      line.addNull("sensor");
    }
    if (handle != nullptr) {
      line.addText("returned", "handle");
    } else {
      line.addNull("returned");
    }
    end();
  });
}

void Recorder::beforeSetOption(void* handle, const char* option, ctx_option_t** out) noexcept {
  attempt([=, this] {
    if (!begin("set_option", handle, out != nullptr)) return;
    if (option != nullptr) {
      line.addText("option", option);
    } else {
      line.addNull("option");
      hasResult = false;
    }
  });
}

void Recorder::beforeDispatch(void* handle, const void* data, int len, void** out, const int* outlen) noexcept {
  attempt([=, this] {
    if (!begin("dispatch", handle, data != nullptr && len >= 0 && out != nullptr && outlen != nullptr)) return;
    line.addBytes("record", {static_cast<const uint8_t*>(data), static_cast<size_t>(len)});
  });
}

void Recorder::beforeClose(void* handle, ctx_option_t** out) noexcept {
  attempt([=, this] { begin("close", handle, out != nullptr); });
}

void Recorder::negotiated(int returned, ctx_option_t** out) noexcept {
  attempt([=, this] {
    if (line.isEmpty()) return;
    line.addInteger("returned", returned);
    if (hasResult && *out != nullptr) line.addProperties("properties", **out);
    end();
  });
}

void Recorder::dispatched(int returned, void** out, const int* outlen) noexcept {
  attempt([=, this] {
    if (line.isEmpty()) return;
    line.addInteger("returned", returned);
    if (hasResult && returned == 1) {
      line.addBytes("result", {static_cast<const uint8_t*>(*out), static_cast<size_t>(*outlen)});
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
    line.addText("call", "uninit");
    end();
  });
}

// Makes a step towards a line. The program's errno is what the library left of it.
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

// Begins the line of a call on a session; returns whether it is a call that can be made again.
bool Recorder::begin(const char* call, void* handle, bool hasArguments) {
  line.clear();
  if (!file.isWanted()) return false;
  const auto session = numbers.find(handle);
  hasResult = session != numbers.end() && hasArguments;
  if (hasResult) {
    line.addText("call", call);
    line.addText("session", sessionName(session->second));
  } else {
    line.addText("note", std::string(call) +
                             (session == numbers.end() ? " on a handle that is not open" : " without an argument"));
  }
  return hasResult;
}

void Recorder::end() {
  file.write(line.finish());
  line.clear();
}

}  // namespace senseloom::trace
