#pragma once
#include <stdint.h>
#define PT_NOTE 4
#define NT_GNU_BUILD_ID 3
typedef uint16_t Elf32_Half;
typedef uint32_t Elf32_Addr, Elf32_Off, Elf32_Word;
typedef struct {
  Elf32_Word p_type;
  Elf32_Off p_offset;
  Elf32_Addr p_vaddr, p_paddr;
  Elf32_Word p_filesz, p_memsz, p_flags, p_align;
} Elf32_Phdr;
typedef struct {
  Elf32_Word n_namesz, n_descsz, n_type;
} Elf32_Nhdr;
