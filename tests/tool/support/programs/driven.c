/*
 * Does with the library what it is told, a line of standard input at a time, and answers each with a line:
 *
 *   open NAME SENSOR      set NAME OPTION         close NAME
 *   dispatch NAME N       a record of one decision, with timestamp N and class N modulo 8
 *   repeat NAME N         N such records
 *   release NAME OPTION   sets an option, and releases the list twice
 *   keep NAME OPTION      sets an option, and keeps the list
 *   drop N                releases the Nth list that was kept; 0: NULL; one more than there are: a list of its own
 *   stale NAME OTHER      gives one session a result of another, which has had a record since
 *   race NAME OPTION      sets an option, and gives the session a record in another thread meanwhile
 *   fork                  goes on in a child process until the end of the input; the parent waits for it
 *   shut                  closes all descriptors that a service does not know
 *   limit N               no file may become longer than N bytes from here on
 *   signal N              the process gets a signal
 *   leave                 ends the process without the end of a program
 *
 * The name of a closed session keeps its handle.
 */
#define _POSIX_C_SOURCE 200809L
#include <android/log.h>
#include <pthread.h>
#include <senseloom.h>
#include <signal.h>
#include <stdint.h>
#include <stdio.h>
#include <stdlib.h>
#include <string.h>
#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>

enum { SESSIONS = 64 };

static struct {
  char name[16];
  void* handle;
} sessions[SESSIONS];

/* The handle of a name; a new name gets a place. */
static void** handle_of(const char* name) {
  int i = 0;
  while (i < SESSIONS - 1 && sessions[i].name[0] != '\0' && strcmp(sessions[i].name, name) != 0) ++i;
  strncpy(sessions[i].name, name, sizeof sessions[i].name - 1);
  return &sessions[i].handle;
}

static int dispatch(void* handle, int number, void** result, int* size) {
  uint8_t record[12] = {0, 0, 0, 0, 0, 0, 0, 0, 1, 0, 0, 0};
  memcpy(record, &number, sizeof number);
  record[10] = (uint8_t)(number & 7);
  return ctx_dispatch_data(handle, record, sizeof record, result, size);
}

static int dispatch_one(void* handle, int number) {
  void* result;
  int size;
  return dispatch(handle, number, &result, &size);
}

static int set(void* handle, const char* option, int releases) {
  ctx_option_t* list = NULL;
  const int returned = ctx_set_option(handle, 0, option, &list);
  while (releases-- > 0) ctx_option_release(list);
  return returned;
}

/* What is reachable is no leak for a sanitizer. */
static ctx_option_t* kept[64] = {NULL};
static int kept_count;

static int keep(void* handle, const char* option) {
  return ctx_set_option(handle, 0, option, &kept[++kept_count]);
}

static int drop(int number) {
  if (number > kept_count) kept[number] = calloc(1, sizeof **kept);
  return ctx_option_release(kept[number]);
}

static int close_session(void* handle) {
  ctx_option_t* list = NULL;
  const int returned = ctx_close_session(handle, &list);
  ctx_option_release(list);
  return returned;
}

static int use_stale_result(void* first, void* second) {
  void* stale;
  void* other;
  int size;
  int unused;
  int number = 0;
  while (dispatch(first, number++, &stale, &size) != 1) {
  }
  dispatch(first, number, &other, &unused);
  return ctx_dispatch_data(second, stale, size, &other, &unused);
}

/* While a session negotiates, the library logs: that is when the other thread calls it. */
static void* raced;
static pthread_t racer;

static void* race(void* nothing) {
  dispatch_one(raced, 1);
  return nothing;
}

static void log_and_race(const struct __android_logger_data* data, const char* message) {
  (void)data;
  (void)message;
  if (raced == NULL) return;
  pthread_create(&racer, NULL, race, NULL);
  pthread_join(racer, NULL);
  raced = NULL;
}

static int set_and_race(void* handle, const char* option) {
  raced = handle;
  return set(handle, option, 1);
}

static int fork_here(void) {
  const pid_t child = fork();
  if (child == 0) return 0;
  int status;
  waitpid(child, &status, 0);
  exit(WIFEXITED(status) ? WEXITSTATUS(status) : 1);
}

static int shut(void) {
  for (int i = 3; i < 64; ++i) close(i);
  return 0;
}

static int limit(rlim_t size) {
  struct rlimit most;
  getrlimit(RLIMIT_FSIZE, &most);
  most.rlim_cur = size;
  return setrlimit(RLIMIT_FSIZE, &most);
}

static int do_line(const char* verb, const char* name, const char* rest) {
  void** handle = handle_of(name);
  const int number = atoi(rest);
  if (strcmp(verb, "open") == 0) return (*handle = ctx_open_session(rest)) != NULL;
  if (strcmp(verb, "set") == 0) return set(*handle, rest, 1);
  if (strcmp(verb, "close") == 0) return close_session(*handle);
  if (strcmp(verb, "dispatch") == 0) return dispatch_one(*handle, number);
  if (strcmp(verb, "repeat") == 0) {
    for (int i = 0; i < number; ++i) dispatch_one(*handle, i);
    return number;
  }
  if (strcmp(verb, "release") == 0) return set(*handle, rest, 2);
  if (strcmp(verb, "keep") == 0) return keep(*handle, rest);
  if (strcmp(verb, "drop") == 0) return drop(atoi(name));
  if (strcmp(verb, "stale") == 0) return use_stale_result(*handle, *handle_of(rest));
  if (strcmp(verb, "race") == 0) return set_and_race(*handle, rest);
  if (strcmp(verb, "fork") == 0) return fork_here();
  if (strcmp(verb, "shut") == 0) return shut();
  if (strcmp(verb, "limit") == 0) return limit((rlim_t)atoi(name));
  if (strcmp(verb, "signal") == 0) return raise(atoi(name));
  if (strcmp(verb, "leave") == 0) _exit(0);
  return -2;
}

int main(void) {
  char line[4096];
  __android_log_set_logger(log_and_race);
  while (fgets(line, sizeof line, stdin) != NULL) {
    char verb[16] = "";
    char name[16] = "";
    int rest = 0;
    line[strcspn(line, "\n")] = '\0';
    sscanf(line, "%15s %15s %n", verb, name, &rest);
    printf("%d\n", do_line(verb, name, line + (rest == 0 ? (int)strlen(line) : rest)));
    fflush(stdout);
  }
  return 0;
}
