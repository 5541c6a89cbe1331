/*
 * Memory by which `senseloom record` learns what became of the recording: it makes it, and the auditing and the
 * recording library of every process that it records write to it. The layout is the same in both word sizes. Numbers
 * are added to atomically.
 */
#ifndef SENSELOOM_SUMMARY_MEMORY_H
#define SENSELOOM_SUMMARY_MEMORY_H

#include <stdint.h>

/* The word of an order (trace_order.h) that names the memory, as a file to be opened. */
#define SENSELOOM_SUMMARY_WORD "summary="

enum { SENSELOOM_SUMMARY_FILES = 16 };

struct summary_memory {
  uint32_t loaded;   /* processes that loaded the library */
  uint32_t calls;    /* made of the library, in all processes */
  uint32_t recorded; /* of these */
  uint32_t lost;     /* lines that could not be written */
  uint32_t breaches; /* of the library's contract, each kind once per pair of threads */
  uint32_t files;    /* opened; may be more than have room below */
  char why[128];     /* the first reason why lines were lost */
  char breach[256];  /* the first breach */
  char file[SENSELOOM_SUMMARY_FILES][1024];
};

#endif
