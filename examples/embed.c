/* Two clients of the physical-activity sensor: one wants each batch of four decisions voted, the other every decision.
 */
#include <senseloom.h>
#include <stdint.h>
#include <stdio.h>
#include <string.h>

static void set_option(void* session, const char* option) {
  ctx_option_t* list;
  if (ctx_set_option(session, 0, option, &list) != 0) fprintf(stderr, "refused: %s\n", option);
  if (list == NULL) return;
  for (int32_t i = 0; i < list->count; ++i) { /* what the sensor is to run with now */
    int32_t value;
    memcpy(&value, list->properties[i].value, sizeof value);
    printf("  property %d = %d\n", (int)list->properties[i].id, (int)value);
  }
  ctx_option_release(list);
}

static void dispatch(const char* name, void* session, uint8_t* record, int len) {
  void* result;
  int result_len;
  if (ctx_dispatch_data(session, record, len, &result, &result_len) != 1) return; /* nothing for this client now */
  uint16_t item;
  memcpy(&item, (uint8_t*)result + 10, sizeof item);
  printf("%s: class %d\n", name, item & 15);
}

int main(void) {
  void* voter = ctx_open_session("PHYAC");
  void* logger = ctx_open_session("PHYAC");
  if (voter == NULL || logger == NULL) return 1;
  set_option(voter, "{\"logN\": 2}");
  set_option(logger, "{\"logN\": 0}");

  const uint8_t classes[] = {3, 3, 5, 3};
  for (uint8_t i = 0; i < sizeof classes; ++i) {
    /* 8 bytes of timestamp, a 16-bit count, and one decision: the class in the low 4 bits of 16 */
    uint8_t record[12] = {i, 0, 0, 0, 0, 0, 0, 0, 1, 0, classes[i], 0};
    dispatch("voter", voter, record, sizeof record);
    dispatch("logger", logger, record, sizeof record);
  }

  ctx_option_t* list;
  if (ctx_close_session(voter, &list) == 1) ctx_option_release(list); /* the logger alone decides now */
  ctx_close_session(logger, &list);                                   /* the last one: the sensor stops */
  ctx_uninit();
  return 0;
}
