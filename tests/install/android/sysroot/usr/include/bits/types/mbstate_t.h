#pragma once
// For the C++ library.
typedef struct {
  unsigned char sequence[4];
} mbstate_t;
