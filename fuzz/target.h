#pragma once

#include <comparison.h>

#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <cstdlib>

// What fuzz targets do with an input. Those of the library make it a sequence of calls, in which the library has to do
// what the model says.
namespace fuzz {

// The targets. A build of one as a fuzzer names it in FUZZ_TARGET.
void options(const uint8_t* data, size_t size);
void records(const uint8_t* data, size_t size);
void sequences(const uint8_t* data, size_t size);
void gesture(const uint8_t* data, size_t size);
void hub(const uint8_t* data, size_t size);

inline oracle::Call openCall(int session, int sensor) {
  oracle::Call call;
  call.what = oracle::Call::open;
  call.session = session;
  call.sensor = sensor;
  return call;
}

inline oracle::Call optionCall(int session, std::string text) {
  oracle::Call call;
  call.what = oracle::Call::setOption;
  call.session = session;
  call.option.verbatim = std::move(text);
  return call;
}

// The sensor that a byte stands for: a letter, so that people can write inputs, too.
inline int sensorOf(uint8_t letter) {
  return static_cast<uint8_t>(letter - 'a') % oracle::kSensors;
}

inline void check(const oracle::Sequence& sequence) {
  const auto found = oracle::compare(sequence);
  if (!found) return;
  std::fprintf(stderr, "call %zu: %s\n%s", found->call + 1, found->text.c_str(), oracle::toTrace(sequence).c_str());
  std::abort();
}

}  // namespace fuzz
