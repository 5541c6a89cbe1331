// How much of the heap an open session holds. Prints a line for each case: the sizes of a session's objects in bytes,
// its share of the tables that know all sessions, what the heap itself adds to each block, and the number of its
// blocks.
#include <malloc.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <cstddef>
#include <cstdio>
#include <cstdlib>
#include <iterator>

#include "client.h"

namespace {

// The blocks in use. malloc() and its like are defined below on top of the C library's own, to see each.
struct Block {
  const void* address;
  size_t size;
};
std::array<Block, 65536> blocks;
size_t blockCount = 0;

void* noted(void* address, size_t size) {
  if (address != nullptr) blocks.at(blockCount++) = {address, size};
  return address;
}

void forget(const void* address) {
  // What is freed was mostly allocated recently.
  for (size_t i = blockCount; i > 0; --i) {
    if (blocks[i - 1].address != address) continue;
    blocks[i - 1] = blocks[--blockCount];
    return;
  }
}

size_t asked() {
  size_t sum = 0;
  for (size_t i = 0; i < blockCount; ++i) sum += blocks[i].size;
  return sum;
}

// Each block comes with a word of the heap's own.
size_t held() {
  size_t sum = 0;
  for (size_t i = 0; i < blockCount; ++i)
    sum += malloc_usable_size(const_cast<void*>(blocks[i].address)) + sizeof(size_t);
  return sum;
}

}  // namespace

extern "C" {
void* __libc_malloc(size_t size);
void* __libc_calloc(size_t count, size_t size);
void* __libc_realloc(void* address, size_t size);
void __libc_free(void* address);

void* malloc(size_t size) noexcept {
  return noted(__libc_malloc(size), size);
}
void* calloc(size_t count, size_t size) noexcept {
  return noted(__libc_calloc(count, size), count * size);
}
void* realloc(void* address, size_t size) noexcept {
  forget(address);
  return noted(__libc_realloc(address, size), size);
}
void free(void* address) noexcept {
  forget(address);
  __libc_free(address);
}
}

namespace {

constexpr size_t kSessions = 1000;

struct Case {
  const char* title;
  const char* sensor;
  const char* option;  // null: none is set
};
constexpr Case kCases[] = {
    {"flick", "GSFLK", nullptr},
    {"dead reckoning", "PDR", nullptr},
    {"activity", "PHYAC", nullptr},
    {"activity, batches of 1", "PHYAC", R"({"logN": 0})"},
};

void measure(const Case& each) {
  std::array<void*, kSessions> handles;
  const size_t askedBefore = asked();
  const size_t heldBefore = held();
  const size_t blocksBefore = blockCount;
  // Any session but those that make a table grow.
  size_t objects = SIZE_MAX;
  for (void*& handle : handles) {
    const size_t before = asked();
    handle = ctx_open_session(each.sensor);
    bench::require(handle != nullptr, "a session could not be opened");
    objects = std::min(objects, asked() - before);
  }
  if (each.option != nullptr) {
    // One client's option makes the sensor start all sessions over, with what they need for it.
    const size_t before = asked();
    ctx_option_t* list = nullptr;
    bench::require(ctx_set_option(handles[0], 0, each.option, &list) == 0, "an option was refused");
    ctx_option_release(list);
    objects += (asked() - before) / kSessions;
  }
  const auto askedOfEach = static_cast<double>(asked() - askedBefore) / kSessions;
  const auto heldOfEach = static_cast<double>(held() - heldBefore) / kSessions;
  std::printf("%s|%zu|%.1f|%.1f|%zu\n", each.title, objects, askedOfEach - static_cast<double>(objects),
              heldOfEach - askedOfEach, (blockCount - blocksBefore) / kSessions);
}

}  // namespace

int main() {
  for (const Case& each : kCases) {
    // A fresh process, since tables do not shrink.
    if (fork() == 0) {
      { const bench::Client first("STAP"); }  // makes what is made but once
      measure(each);
      return 0;
    }
    int status = 0;
    wait(&status);
    bench::require(status == 0, "a process failed");
  }
}
