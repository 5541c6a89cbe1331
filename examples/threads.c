/* Two threads that use the library in turns: one mutex is around every call, and around the use of what it returns. */
#include <pthread.h>
#include <senseloom.h>
#include <stdio.h>

static pthread_mutex_t library = PTHREAD_MUTEX_INITIALIZER;
static int delivered;

static void* sense(void* session) {
  for (int i = 0; i < 1000; ++i) {
    uint8_t record[10] = {0, 0, 0, 0, 0, 0, 0, 0, 3, 0}; /* 8 bytes of timestamp, and class 3 in 16 bits */
    void* result;
    int len;
    pthread_mutex_lock(&library);
    if (ctx_dispatch_data(session, record, sizeof record, &result, &len) == 1) ++delivered;
    pthread_mutex_unlock(&library);
  }
  return NULL;
}

int main(void) {
  void* sessions[2] = {ctx_open_session("GSFLK"), ctx_open_session("LIFT")};
  pthread_t threads[2];
  for (int i = 0; i < 2; ++i) {
    if (sessions[i] == NULL || pthread_create(&threads[i], NULL, sense, sessions[i]) != 0) return 1;
  }
  for (int i = 0; i < 2; ++i) pthread_join(threads[i], NULL);
  for (int i = 0; i < 2; ++i) {
    ctx_option_t* list;
    if (ctx_close_session(sessions[i], &list) != 0) return 1;
  }
  printf("%d delivered\n", delivered);
  return 0;
}
