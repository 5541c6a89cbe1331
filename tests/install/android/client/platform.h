#pragma once

/* The platform's functions, for a program that loads the library: they do as they are asked, and keep nothing of it. */

/*
 * Calls of the platform by the library, and how many of them came with a stack that is not aligned to 16 bytes, of
 * which only programs for 32-bit x86 know.
 */
extern int platform_calls;
extern int misaligned_calls;
