/*
 * Makes calls that a trace cannot say beside some that it can. Returns the number of results that are not the
 * library's.
 */
#include <senseloom.h>
#include <stddef.h>
#include <stdint.h>

static int wrong;

static void expect(int returned, int expected) {
  if (returned != expected) ++wrong;
}

int main(void) {
  ctx_option_t* list;
  ctx_option_t* untouched = (ctx_option_t*)1;
  void* result;
  int result_len;
  uint8_t record[10] = {1, 0, 0, 0, 0, 0, 0, 0, 2, 0};

  expect(ctx_open_session(NULL) == NULL, 1);
  expect(ctx_open_session("T\xc4P") == NULL, 1);
  void* session = ctx_open_session("LIFT");
  expect(session != NULL, 1);

  expect(ctx_set_option(NULL, 0, "{}", &untouched), -1);
  expect(ctx_set_option(record, 0, "{}", &list), -1);
  expect(ctx_set_option(session, 0, "{}", NULL), -1);
  expect(ctx_set_option(session, 0, NULL, &untouched), -1);
  expect(untouched == (ctx_option_t*)1, 1);
  expect(ctx_set_option(session, 0, "\"\t\\", &list), -1);
  expect(ctx_set_option(session, 0, "{\"\xff\":1}", &list), -1);
  expect(ctx_set_option(session, 1, "{\"\xc3\xa4\":1}", &list), 0);
  ctx_option_release(list);

  expect(ctx_dispatch_data(NULL, record, sizeof record, &result, &result_len), -1);
  expect(ctx_dispatch_data(session, NULL, sizeof record, &result, &result_len), -1);
  expect(ctx_dispatch_data(session, record, -1, &result, &result_len), -1);
  expect(ctx_dispatch_data(session, record, sizeof record, NULL, &result_len), -1);
  expect(ctx_dispatch_data(session, record, sizeof record, &result, NULL), -1);
  expect(ctx_dispatch_data(session, record, 0, &result, &result_len), 1);
  expect(ctx_dispatch_data(session, record, sizeof record, &result, &result_len), 1);
  expect(result == record && result_len == sizeof record, 1);

  expect(ctx_close_session(NULL, &list), -1);
  expect(ctx_close_session(session, NULL), -1);
  expect(ctx_close_session(session, &list), 0);
  expect(ctx_close_session(session, &list), -1);
  ctx_uninit();
  return wrong;
}
