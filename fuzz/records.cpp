// Records. An input is a letter for the sensor, a letter for its option, then records: a letter for what the gesture
// engine says of it, two bytes of length, and the bytes.

#include <algorithm>
#include <iterator>
#include <string>
#include <utility>

#include "target.h"

namespace {

constexpr size_t kMostBytes = 2100;
constexpr size_t kHead = 3;

// Options that make a difference to what is done with records.
constexpr const char* kOptions[][4] = {
    {R"({"logN":2,"mode":1,"weightVar":1})", R"({"logN":8,"weightVar":0})", R"({"logN":3,"summary":0,"classMask":6})",
     R"({"logN":5,"weightVar":0,"mode":1})"},
    {R"({"classMask":1})", R"({"classMask":2})", R"({"level":6})", "{}"},
    {R"({"classMask":1})", R"({"classMask":32})", R"({"level":6})", "{}"},
    {R"({"sensitivity":2})", R"({"sensitivity":0})", "x", "{}"},
    {R"({"classMask":1})", R"({"classMask":8})", "x", "{}"},
    {R"({"mode":0})", R"({"mode":0,"logN":3})", R"({"mode":1})", R"({"mode":0,"logN":100})"},
    {R"({"classMask":1})", R"({"classMask":32768})", R"({"classMask":1025})", "{}"},
    {R"({"mode":4,"classMask":1})", R"({"mode":4,"classMask":3})", R"({"mode":1,"classMask":-1})", R"({"mode":1})"},
    {R"({"classMask":1})", R"({"classMask":2})", "x", "{}"},
    {R"({"interval":1})", "{}", "x", "[]"},
    {R"({"N":2})", R"({"N":6})", R"({"N":1})", "{}"},
    {"{}", R"({"classMask":1})", "x", "[]"},
};
static_assert(std::size(kOptions) == oracle::kSensors, "a row for each sensor");

// What the gesture engine says: a gesture in the record's first or second group, or none that counts.
constexpr const char* kNames[] = {nullptr, "NumberOne ", "LetterA ", "LetterF ", "LetterA"};

}  // namespace

void fuzz::records(const uint8_t* data, size_t size) {
  if (size < 2) return;
  const int sensor = sensorOf(data[0]);
  // Without an option on any session of the sensor, records take another way.
  oracle::Sequence sequence = {openCall(0, sensor), openCall(1, sensor)};
  const uint8_t option = static_cast<uint8_t>(data[1] - 'a');
  if (option < 8) sequence.push_back(optionCall(option / 4, kOptions[sensor][option % 4]));
  for (size_t at = 2; at + kHead <= size;) {
    oracle::Call call;
    call.what = oracle::Call::dispatchToSensor;
    call.sensor = sensor;
    const uint8_t answer = static_cast<uint8_t>(data[at] - 'a');
    if (answer % 2 == 1) call.answers.names.emplace_back();
    if (const char* name = kNames[answer / 2 % std::size(kNames)]) call.answers.names.emplace_back(name);
    const size_t declared = (data[at + 1] + 256U * data[at + 2]) % kMostBytes;
    at += kHead;
    const size_t length = std::min(declared, size - at);
    call.record.assign(data + at, data + at + length);
    at += length;
    sequence.push_back(std::move(call));
  }
  check(sequence);
}
