#include "c_client.h"

#include <senseloom.h>
#include <stddef.h>
#include <string.h>

#define EXPECT(condition) \
  if (!(condition)) return __LINE__

/* An activity record of one item. */
struct record {
  uint32_t timestamp[2];
  int16_t count;
  uint16_t item;
};

static int useSessions(void) {
  void* const walker = ctx_open_session("PHYAC");
  void* const runner = ctx_open_session("PHYAC");
  ctx_option_t* list = NULL;
  void* out = NULL;
  int outlen = 0;
  int32_t value = 0;
  struct record records[2] = {{{11, 12}, 1, 0x0013}, {{21, 22}, 1, 0x0023}};

  EXPECT(walker != NULL && runner != NULL && walker != runner);
  EXPECT(getSensor("PHYAC") != NULL && getSensor("phyac") == NULL);

  EXPECT(ctx_set_option(walker, 0, "{\"logN\": 1, \"classMask\": 8}", &list) == 0);
  EXPECT(list != NULL && list->count == 4);
  EXPECT(list->properties[0].id == 41 && list->properties[1].id == 43);
  EXPECT(list->properties[2].id == 44 && list->properties[3].id == 42);
  EXPECT(list->properties[1].size == 4);
  memcpy(&value, list->properties[1].value, sizeof value);
  EXPECT(value == 0x20001); /* spans of 2 records at most and 1 at least */
  EXPECT(ctx_option_release(list) == 0);

  EXPECT(ctx_dispatch_data(walker, &records[0], 12, &out, &outlen) == 0);
  EXPECT(out == NULL && outlen == 0);
  EXPECT(ctx_dispatch_data(walker, &records[1], 12, &out, &outlen) == 1);
  EXPECT(outlen == 12 && memcmp(out, "\x15\0\0\0\x16\0\0\0\x01\0\x13\0", 12) == 0);

  EXPECT(ctx_close_session(runner, &list) == 1);
  EXPECT(list != NULL && list->count == 4);
  EXPECT(ctx_option_release(list) == 0);
  EXPECT(ctx_close_session(walker, &list) == 0 && list == NULL);
  EXPECT(ctx_close_session(walker, &list) == -1);
  ctx_uninit();
  return 0;
}

static int useAudioBridge(void) {
  EXPECT(device == NULL && !gIsActivated);
  EXPECT(audio_hal_init() && device != NULL && !gIsActivated);
  EXPECT(audio_hal_activate() && device != NULL && gIsActivated);
  EXPECT(audio_hal_deactivate() && device == NULL && !gIsActivated);
  return 0;
}

static int useArray(void) {
  varray_t array;
  double removed = 0;
  int i;

  EXPECT(_va_init(NULL, 8) == NULL && _va_init(&array, 0) == NULL);
  EXPECT(_va_init(&array, (int)sizeof(double)) != NULL);
  for (i = 0; i < 17; ++i) {
    double* const slot = va_new(&array);
    EXPECT(slot != NULL && *slot == 0);
    *slot = i + 0.5;
  }
  EXPECT(array.count == 17 && array.capacity == 32 && array.elemSize == 8);
  EXPECT(_va_del(&array, 17, &removed) == NULL && _va_del(&array, 3, NULL) == NULL);
  EXPECT(_va_del(&array, 3, &removed) == &removed && removed == 3.5);
  EXPECT(array.count == 16 && ((double*)array.data)[3] == 4.5 && ((double*)array.data)[15] == 16.5);
  va_free(&array);
  EXPECT(array.count == 0 && array.capacity == 0 && array.elemSize == 0 && array.data == NULL);
  EXPECT(va_new(&array) == NULL);
  va_free(&array);
  return 0;
}

int runClientInC(void) {
  int line = useSessions();
  if (line == 0) line = useAudioBridge();
  if (line == 0) line = useArray();
  return line;
}
