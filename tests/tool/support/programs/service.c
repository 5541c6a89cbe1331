/*
 * Does what services do and a recording has to bear: makes calls from a child process, and closes descriptors that it
 * does not know to use their numbers itself. The argument names a file of its own. Returns 0 when nothing but its own
 * text got into that.
 */
#define _POSIX_C_SOURCE 200809L
#include <fcntl.h>
#include <senseloom.h>
#include <stddef.h>
#include <stdint.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

static void dispatch(void* session, uint8_t number) {
  uint8_t record[10] = {number, 0, 0, 0, 0, 0, 0, 0, 1, 0};
  void* result;
  int result_len;
  ctx_dispatch_data(session, record, sizeof record, &result, &result_len);
}

int main(int argc, char** argv) {
  if (argc != 2) return 1;
  void* session = ctx_open_session("LIFT");
  dispatch(session, 1);

  const pid_t child = fork();
  if (child == 0) {
    dispatch(session, 2);
    _exit(0);
  }
  waitpid(child, NULL, 0);
  dispatch(session, 3);

  for (int i = 3; i < 64; ++i) close(i);
  const int own = open(argv[1], O_WRONLY | O_CREAT | O_TRUNC, S_IRUSR | S_IWUSR);
  dispatch(session, 4);
  ctx_option_t* list;
  ctx_close_session(session, &list);

  struct stat file;
  return own == 3 && write(own, "own\n", 4) == 4 && fstat(own, &file) == 0 && file.st_size == 4 ? 0 : 2;
}
