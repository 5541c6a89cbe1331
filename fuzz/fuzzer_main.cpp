// The entry point that libFuzzer knows by its name.

#include "target.h"

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
  fuzz::FUZZ_TARGET(data, size);
  return 0;
}
