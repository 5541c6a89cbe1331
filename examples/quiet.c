/* Drops the log lines of the library and keeps all others: the library calls the program's __android_log_print(). */
#include <senseloom.h>
#include <stdarg.h>
#include <stdio.h>
#include <string.h>

int __android_log_print(int priority, const char* tag, const char* format, ...) {
  static const char* const quiet[] = {"libsenseloom", "Libsl", "STY", "aware_audio"};
  for (size_t i = 0; i < sizeof quiet / sizeof quiet[0]; ++i) {
    if (strcmp(tag, quiet[i]) == 0) return 0;
  }
  va_list values;
  va_start(values, format);
  fprintf(stderr, "%d %s: ", priority, tag);
  const int length = vfprintf(stderr, format, values);
  va_end(values);
  fputc('\n', stderr);
  return length;
}

int main(void) {
  void* session = ctx_open_session("STAP");
  ctx_option_t* list;
  if (ctx_set_option(session, 0, "{\"level\": 99}", &list) != 0) return 1; /* out of range: an error is logged */
  __android_log_print(4, "mine", "%d properties", (int)list->count);
  ctx_option_release(list);
  return ctx_close_session(session, &list);
}
