/* The header stands alone in a C99 program, and its layouts are what callers count on. */
#include <senseloom.h>

#include <stddef.h>

/* C99 has no static assertion: an array type of a negative size does not compile. */
#define ASSERT_STATICALLY(name, condition) typedef char name[(condition) ? 1 : -1]

ASSERT_STATICALLY(property_size, sizeof(ctx_property_t) == 8 + sizeof(void*));
ASSERT_STATICALLY(property_members, offsetof(ctx_property_t, id) == 0 && offsetof(ctx_property_t, size) == 4 &&
                                        offsetof(ctx_property_t, value) == 8);
ASSERT_STATICALLY(list_members,
                  offsetof(ctx_option_t, count) == 0 && offsetof(ctx_option_t, properties) == sizeof(void*));
ASSERT_STATICALLY(array_size, sizeof(varray_t) == 12 + sizeof(void*) + (sizeof(void*) - 4));
ASSERT_STATICALLY(array_members, offsetof(varray_t, count) == 0 && offsetof(varray_t, capacity) == 4 &&
                                     offsetof(varray_t, elemSize) == 8 &&
                                     offsetof(varray_t, data) == 8 + sizeof(void*));
ASSERT_STATICALLY(flag_size, sizeof gIsActivated == 1);
