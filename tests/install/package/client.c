/* A client of an installed library. The audio and the gesture sensor reach for the libraries of the platform. */
#include <senseloom.h>
#include <stddef.h>

int main(void) {
  void* audio = ctx_open_session("LPE_P");
  void* gesture = ctx_open_session("GSPX");
  ctx_option_t* list;
  if (audio == NULL || gesture == NULL || !gIsActivated) return 1;
  if (ctx_set_option(audio, 0, "{\"interval\": 1000}", &list) != 0 || list->count != 1) return 2;
  ctx_option_release(list);
  if (ctx_close_session(gesture, &list) != 0) return 3;
  if (ctx_close_session(audio, &list) != 0 || gIsActivated) return 4;
  return 0;
}
