/* What the programs that load the library themselves do with it: two sessions, one after the other, with one record
 * each. In the second one the gesture engine is asked. */
#ifndef SESSION_H
#define SESSION_H

#include <senseloom.h>
#include <stdint.h>

struct functions {
  void* (*open_session)(const char*);
  int (*dispatch_data)(void*, void*, int, void**, int*);
  int (*close_session)(void*, ctx_option_t**);
};

static inline int use_one(const struct functions* library, const char* sensor, uint8_t* record, int record_size) {
  void* result;
  int size;
  ctx_option_t* list;
  void* session = library->open_session(sensor);
  if (session == 0) return 1;
  if (library->dispatch_data(session, record, record_size, &result, &size) != 1) return 2;
  return library->close_session(session, &list);
}

static inline int use_sessions(const struct functions* library) {
  uint8_t record[10] = {1, 0, 0, 0, 0, 0, 0, 0, 2, 0};
  uint8_t samples[24] = {1, 0, 0, 0, 0, 0, 0, 0, 0, 0, 12, 0};
  const int failure = use_one(library, "LPE_P", record, sizeof record);
  return failure != 0 ? failure : use_one(library, "GSPX", samples, sizeof samples);
}

#endif
