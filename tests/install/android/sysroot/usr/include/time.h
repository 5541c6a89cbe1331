#pragma once
// For the C++ library.
typedef long time_t;
