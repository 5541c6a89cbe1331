/* What the programs that load the library themselves do with it: one session, one record. */
#ifndef SESSION_H
#define SESSION_H

#include <senseloom.h>
#include <stdint.h>

struct functions {
  void* (*open_session)(const char*);
  int (*dispatch_data)(void*, void*, int, void**, int*);
  int (*close_session)(void*, ctx_option_t**);
};

static inline int use_session(const struct functions* library) {
  uint8_t record[10] = {1, 0, 0, 0, 0, 0, 0, 0, 2, 0};
  void* result;
  int size;
  ctx_option_t* list;
  void* session = library->open_session("LPE_P");
  if (session == 0) return 1;
  if (library->dispatch_data(session, record, sizeof record, &result, &size) != 1) return 2;
  return library->close_session(session, &list);
}

#endif
