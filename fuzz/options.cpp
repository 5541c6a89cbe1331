// Option strings. An input is a letter for the sensor, then strings with zero bytes between them, which the two
// sessions of the sensor get in turn.

#include <string>

#include "target.h"

void fuzz::options(const uint8_t* data, size_t size) {
  if (size == 0) return;
  const int sensor = sensorOf(data[0]);
  const std::string text(reinterpret_cast<const char*>(data) + 1, size - 1);
  oracle::Sequence sequence = {openCall(0, sensor), openCall(1, sensor)};
  int session = 0;
  for (size_t begin = 0; begin <= text.size(); session ^= 1) {
    const size_t end = std::min(text.find('\0', begin), text.size());
    sequence.push_back(optionCall(session, text.substr(begin, end - begin)));
    begin = end + 1;
  }
  check(sequence);
}
