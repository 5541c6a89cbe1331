// No include guard: the last NDEBUG counts.
#ifdef __cplusplus
extern "C" {
#endif
void __assert2(const char* file, int line, const char* function, const char* failed) __attribute__((__noreturn__));
#ifdef __cplusplus
}
#endif
#undef assert
#ifdef NDEBUG
#define assert(condition) ((void)0)
#else
#define assert(condition) ((condition) ? (void)0 : __assert2(__FILE__, __LINE__, __PRETTY_FUNCTION__, #condition))
#endif
