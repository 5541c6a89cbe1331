#pragma once
// For the C++ library alone, whose headers wrap all of these.
#define FP_INFINITE 1
#define FP_NAN 2
#define FP_NORMAL 4
#define FP_SUBNORMAL 8
#define FP_ZERO 16
#define fpclassify(x) __builtin_fpclassify(FP_NAN, FP_INFINITE, FP_NORMAL, FP_SUBNORMAL, FP_ZERO, x)
#define isfinite(x) __builtin_isfinite(x)
#define isinf(x) __builtin_isinf(x)
#define isnan(x) __builtin_isnan(x)
#define isnormal(x) __builtin_isnormal(x)
#define signbit(x) __builtin_signbit(x)

#ifdef __cplusplus
extern "C" {
#endif
// The functions for one floating type: their names end in `suffix`.
#define DECLARE_MATH(real, suffix)                                                                                \
  real acos##suffix(real), acosh##suffix(real), asin##suffix(real), asinh##suffix(real), atan##suffix(real),      \
      atan2##suffix(real, real), atanh##suffix(real), cbrt##suffix(real), ceil##suffix(real),                     \
      copysign##suffix(real, real), cos##suffix(real), cosh##suffix(real), erf##suffix(real), erfc##suffix(real), \
      exp##suffix(real), exp2##suffix(real), expm1##suffix(real), fabs##suffix(real), fdim##suffix(real, real),   \
      floor##suffix(real), fma##suffix(real, real, real), fmax##suffix(real, real), fmin##suffix(real, real),     \
      fmod##suffix(real, real), frexp##suffix(real, int*), hypot##suffix(real, real), ldexp##suffix(real, int),   \
      lgamma##suffix(real), log##suffix(real), log10##suffix(real), log1p##suffix(real), log2##suffix(real),      \
      logb##suffix(real), modf##suffix(real, real*), nan##suffix(const char*), nearbyint##suffix(real),           \
      nextafter##suffix(real, real), nexttoward##suffix(real, long double), pow##suffix(real, real),              \
      remainder##suffix(real, real), remquo##suffix(real, real, int*), rint##suffix(real), round##suffix(real),   \
      scalbln##suffix(real, long), scalbn##suffix(real, int), sin##suffix(real), sinh##suffix(real),              \
      sqrt##suffix(real), tan##suffix(real), tanh##suffix(real), tgamma##suffix(real), trunc##suffix(real);       \
  int ilogb##suffix(real);                                                                                        \
  long lrint##suffix(real), lround##suffix(real);                                                                 \
  long long llrint##suffix(real), llround##suffix(real);
DECLARE_MATH(double, )
DECLARE_MATH(float, f)
DECLARE_MATH(long double, l)
#undef DECLARE_MATH
#ifdef __cplusplus
}
#endif
