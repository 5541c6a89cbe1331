#pragma once
#ifdef __cplusplus
extern "C" {
#endif
#define POLLOUT 4
struct pollfd {
  int fd;
  short events, revents;
};
int poll(struct pollfd*, unsigned int, int);
#ifdef __cplusplus
}
#endif
