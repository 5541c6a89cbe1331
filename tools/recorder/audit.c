/*
 * Loaded into a program by LD_AUDIT, it has the dynamic linker take the recording library for every libsenseloom that
 * the program asks for: linked or by dlopen(), by name or by path. The recording library in turn needs a library of a
 * name that does not exist, for which the linker is given the one that the program would have had.
 *
 * It lives in a namespace of its own, with a C library of its own, and must not depend on any other library.
 */
#define _GNU_SOURCE
#include <dlfcn.h>
#include <elf.h>
#include <fcntl.h>
#include <limits.h>
#include <link.h>
#include <stdbool.h>
#include <stdlib.h>
#include <string.h>
#include <sys/mman.h>
#include <sys/stat.h>
#include <unistd.h>

#include "recorder_names.h"
#include "summary_memory.h"

/* The linker keeps neither answer, but reads it after the next question. */
static char recorder[PATH_MAX];
static char library[PATH_MAX];
static struct stat library_file; /* zeros until it is known */

static void find_recorder(void) {
  Dl_info self;
  if (dladdr(recorder, &self) == 0) return;
  const char* slash = strrchr(self.dli_fname, '/');
  const size_t folder = slash == NULL ? 0 : (size_t)(slash - self.dli_fname) + 1;
  if (folder + sizeof SENSELOOM_RECORDER_FILE > sizeof recorder) return;
  memcpy(recorder, self.dli_fname, folder);
  memcpy(recorder + folder, SENSELOOM_RECORDER_FILE, sizeof SENSELOOM_RECORDER_FILE);
}

/* Tells `senseloom record` that the program uses the library at all. */
static void tell_of_loading(void) {
  const char* order = getenv("SENSELOOM_TRACE");
  const char* word = order == NULL ? NULL : strstr(order, SENSELOOM_SUMMARY_WORD);
  char name[64];
  if (word == NULL) return;
  word += strlen(SENSELOOM_SUMMARY_WORD);
  const size_t length = strcspn(word, " ");
  if (length >= sizeof name) return;
  memcpy(name, word, length);
  name[length] = '\0';
  const int file = open(name, O_RDWR | O_CLOEXEC);
  if (file < 0) return;
  struct summary_memory* summary = mmap(NULL, sizeof *summary, PROT_READ | PROT_WRITE, MAP_SHARED, file, 0);
  close(file);
  if (summary == MAP_FAILED) return;
  __atomic_fetch_add(&summary->loaded, 1, __ATOMIC_RELAXED);
  munmap(summary, sizeof *summary);
}

/* Whether the linker would take the file: it goes on with its search after a file of the other word size. */
static bool is_library(const char* name, struct stat* status) {
  unsigned char ident[EI_NIDENT];
  const int file = open(name, O_RDONLY | O_CLOEXEC);
  if (file < 0) return false;
  const bool is_read = fstat(file, status) == 0 && read(file, ident, sizeof ident) == (ssize_t)sizeof ident;
  close(file);
  return is_read && memcmp(ident, ELFMAG, SELFMAG) == 0 &&
         ident[EI_CLASS] == (sizeof(void*) == 8 ? ELFCLASS64 : ELFCLASS32);
}

/* Whether the recording library stands in the library's place already, with the library beside it under another name.
 */
static bool is_recorder(const char* name) {
  char beside[PATH_MAX + sizeof SENSELOOM_REAL_FILE];
  strcpy(beside, name);
  strcpy(strrchr(beside, '/') + 1, SENSELOOM_REAL_FILE);
  return access(beside, F_OK) == 0;
}

/* Whether a file that the linker is about to open is the library. Of several different ones in a process the first one
 * is recorded, since the recording library can stand in for one only. */
static bool is_the_library(const char* name) {
  struct stat found;
  if (!is_library(name, &found)) return false;
  if (library_file.st_ino != 0) {
    return found.st_dev == library_file.st_dev && found.st_ino == library_file.st_ino;
  }
  if (realpath(name, library) == NULL || is_recorder(library)) return false;
  library_file = found;
  tell_of_loading();
  return true;
}

unsigned int la_version(unsigned int version) {
  find_recorder();
  return version < LAV_CURRENT ? version : LAV_CURRENT;
}

/* A name without a folder is asked about first as it is, and then once for each folder that is searched. */
char* la_objsearch(const char* name, uintptr_t* cookie, unsigned int flag) {
  (void)cookie;
  (void)flag;
  const char* slash = strrchr(name, '/');
  const char* base = slash == NULL ? name : slash + 1;
  if (slash == NULL && strcmp(base, SENSELOOM_REAL_FILE) == 0 && *library != '\0') return library;
  const bool is_named_so = strncmp(base, SENSELOOM_FILE, strlen(SENSELOOM_FILE)) == 0;
  return slash != NULL && is_named_so && is_the_library(name) ? recorder : (char*)name;
}
