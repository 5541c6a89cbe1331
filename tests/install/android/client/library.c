#include "library.h"

#include <dlfcn.h>
#include <stdio.h>
#include <stdlib.h>

static void* find(void* handle, const char* name) {
  void* const found = dlsym(handle, name);
  if (found == NULL) {
    fprintf(stderr, "%s\n", dlerror());
    exit(1);
  }
  return found;
}

struct library load_library(const char* path) {
  struct library library = {.handle = dlopen(path, RTLD_NOW)};
  if (library.handle == NULL) {
    fprintf(stderr, "%s\n", dlerror());
    exit(1);
  }
  /* C has no conversion from a pointer to an object; the platform has. */
#define LIBRARY_FUNCTION(name) *(void**)&library.name = find(library.handle, #name);
  LIBRARY_FUNCTIONS(LIBRARY_FUNCTION)
#undef LIBRARY_FUNCTION
  return library;
}

const struct sensor_calls sensor_calls[SENSORS] = {
    {"PHYAC",
     {"{\"logN\":3,\"logM\":1}", "{\"logN\":2,\"mode\":1,\"summary\":0}"},
     {1, 0, 0, 0, 0, 0, 0, 0, 6, 0, 0x51, 0, 0x62, 0, 0x71, 0, 0x82, 0, 0x91, 0, 0xA1, 0},
     22},
    {"STAP", {"{\"classMask\":1,\"level\":-2}", "{\"classMask\":9}"}, {1, 0, 0, 0, 0, 0, 0, 0, 1}, 10},
    {"GSFLK", {"{\"classMask\":32,\"level\":7}", "{\"level\":2}"}, {1, 0, 0, 0, 0, 0, 0, 0, 6}, 10},
    {"SHAKI", {"{\"sensitivity\":0}", "{\"sensitivity\":3}"}, {1, 0, 0, 0, 0, 0, 0, 0, 1}, 10},
    {"ISACT", {"{\"classMask\":1}", "{\"classMask\":6}"}, {1, 0, 0, 0, 0, 0, 0, 0, 2}, 12},
    {"SCOUN", {"{\"mode\":0,\"logN\":2}", "{\"mode\":0}"}, {1, 0, 0, 0, 0, 0, 0, 0, 100}, 12},
    {"GSPX",
     {"{\"classMask\":1024}", "{\"classMask\":1025}"},
     {1, 0, 0, 0, 0, 0, 0, 0, 0, 0, 14, 0, 1, 2, 3, 4, 5, 6, 7, 8, 9, 10, 11, 12, 13, 14},
     26},
    {"DTWGS",
     {"{\"mode\":4,\"classMask\":3,\"template1\":\"0003a1b2c3\"}",
      "{\"mode\":4,\"classMask\":2,\"level\":-1,\"template2\":\"0001ff\"}"},
     {1, 0, 0, 0, 0, 0, 0, 0, 1},
     10},
    {"GSETH", {"{\"classMask\":1}", "{\"classMask\":2}"}, {1, 0, 0, 0, 0, 0, 0, 0, 2}, 10},
    {"LPE_P", {"{\"interval\":1}", "{\"interval\":2}"}, {1, 0, 0, 0, 0, 0, 0, 0, 1}, 10},
    {"PDR", {"{\"N\":1,\"userHeight\":170,\"6DOF\":1}", "{\"N\":2}"}, {1, 0, 0, 0, 0, 0, 0, 0, 1, 0, 1, 2, 3, 4}, 38},
    {"LIFT", {"{\"classMask\":1}", "{}"}, {1, 0, 0, 0, 0, 0, 0, 0, 1}, 10},
};
