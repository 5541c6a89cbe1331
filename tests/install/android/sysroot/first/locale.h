#pragma once
#ifdef __cplusplus
extern "C" {
#endif
// Since API level 21.
#define LC_ALL_MASK 0x1fbf
typedef struct __locale_t* locale_t;
locale_t newlocale(int, const char*, locale_t);
locale_t uselocale(locale_t);
void freelocale(locale_t);
#ifdef __cplusplus
}
#endif
