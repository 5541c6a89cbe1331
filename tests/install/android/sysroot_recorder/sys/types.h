#pragma once
#include <stddef.h>
#include <stdint.h>
typedef int pid_t;
typedef int clockid_t;
typedef unsigned short mode_t;
typedef long ssize_t;
typedef long long off_t;  // with _FILE_OFFSET_BITS=64
