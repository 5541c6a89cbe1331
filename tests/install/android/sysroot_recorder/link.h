#pragma once
#include <elf.h>
#include <stddef.h>
#ifdef __cplusplus
extern "C" {
#endif
#define ElfW(type) Elf32_##type
struct dl_phdr_info {
  Elf32_Addr dlpi_addr;
  const char* dlpi_name;
  const Elf32_Phdr* dlpi_phdr;
  Elf32_Half dlpi_phnum;
};
int dl_iterate_phdr(int (*)(struct dl_phdr_info*, size_t, void*), void*);  // on x86 in all versions
#ifdef __cplusplus
}
#endif
