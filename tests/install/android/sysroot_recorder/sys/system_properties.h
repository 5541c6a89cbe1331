#pragma once
#ifdef __cplusplus
extern "C" {
#endif
#define PROP_VALUE_MAX 92
int __system_property_get(const char*, char*);
#ifdef __cplusplus
}
#endif
