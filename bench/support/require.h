#pragma once

#include <cstdio>
#include <cstdlib>

namespace bench {

// A measurement of something that did not work is worth nothing.
inline void require(bool holds, const char* what) {
  if (holds) return;
  std::fprintf(stderr, "%s\n", what);
  std::exit(1);
}

}  // namespace bench
