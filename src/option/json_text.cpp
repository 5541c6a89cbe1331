#include "option/json_text.h"

#include <locale.h>

#include <cstddef>
#include <cstring>
#include <limits>

namespace senseloom {
namespace {

// jansson drops a byte, writes beyond its buffer or aborts when its memory runs out in the middle of a token, so it
// only starts when there is enough for all of the text. Nested arrays take the most, 16 pointers a character on 64 bits
// and 20 on 32, the heap's own use included.
void requireMemoryToRead(const char* text) {
  constexpr size_t kBytesPerCharacter = 24 * sizeof(void*);
  constexpr size_t kLeastBytes = 1024;
  const size_t length = std::strlen(text);
  if (length > (std::numeric_limits<size_t>::max() - kLeastBytes) / kBytesPerCharacter) throw OutOfMemory();
  json_malloc_t take = nullptr;
  json_free_t giveBack = nullptr;
  json_get_alloc_funcs(&take, &giveBack);
  void* const memory = take(kLeastBytes + kBytesPerCharacter * length);
  if (memory == nullptr) throw OutOfMemory();
  giveBack(memory);
}

// Puts the calling thread into the "C" locale: jansson aborts where a decimal point has several bytes.
class CLocale {
 public:
  CLocale() : own(newlocale(LC_ALL_MASK, "C", nullptr)) {
    if (own == nullptr) throw OutOfMemory();  // not covered: the C library of a host always has this one
    before = uselocale(own);
  }
  ~CLocale() {
    uselocale(before);
    freelocale(own);
  }
  CLocale(const CLocale&) = delete;
  CLocale& operator=(const CLocale&) = delete;

 private:
  const locale_t own;
  locale_t before;
};

}  // namespace

JsonRoot readJson(const char* text) {
  if (text == nullptr) return nullptr;
  requireMemoryToRead(text);
  const CLocale locale;
  return JsonRoot(json_loads(text, 0, nullptr));
}

}  // namespace senseloom
