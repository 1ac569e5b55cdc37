#include "core.h"

#include <fcntl.h>
#include <gelf.h>
#include <unistd.h>

#include <algorithm>
#include <stdexcept>

namespace {

constexpr uint32_t flashSize = 0x100000;
constexpr uint32_t ram = 0x20000000;
constexpr uint32_t ramSize = 0x10000;
constexpr uint32_t returnAddress = 0x000F0000;  // flash that no image uses

void must(uc_err error) {
  if (error != UC_ERR_OK) throw std::runtime_error(uc_strerror(error));
}

uint64_t bitCount(uint32_t bits) { return static_cast<uint64_t>(__builtin_popcount(bits)); }

// The cost of an instruction; of a conditional branch, that of one not taken.
uint64_t costOf(uint16_t op, uint32_t size) {
  const uint64_t listed = bitCount(op & 0xFF);
  if (size == 4) return 3;                                   // BL, MRS, MSR, barriers
  if ((op & 0xFF00) == 0xBD00) return 3 + listed + 1;        // POP with PC
  if ((op & 0xFE00) == 0xB400 || (op & 0xFE00) == 0xBC00) {  // PUSH, POP
    return 1 + bitCount(op & 0x1FF);
  }
  if ((op & 0xF000) == 0xC000) return 1 + listed;  // LDM, STM
  if ((op & 0xF800) == 0x4800) return 2;           // LDR from a literal
  if (op >= 0x5000 && op < 0xA000) return 2;       // loads and stores
  if ((op & 0xF800) == 0xE000) return 2;           // B
  if ((op & 0xFF00) == 0x4700) return 2;           // BX, BLX
  if ((op & 0xFD87) == 0x4487) return 2;           // ADD or MOV to PC
  return 1;
}

bool isConditionalBranch(uint16_t op) { return (op & 0xF000) == 0xD000 && (op & 0x0E00) != 0x0E00; }

}  // namespace

Core::Core(const std::string& elf) {
  must(uc_open(UC_ARCH_ARM, static_cast<uc_mode>(UC_MODE_THUMB | UC_MODE_MCLASS), &engine));
  must(uc_ctl_set_cpu_model(engine, UC_CPU_ARM_CORTEX_M0));
  must(uc_mem_map(engine, 0, flashSize, UC_PROT_ALL));
  must(uc_mem_map(engine, ram, ramSize, UC_PROT_ALL));
  uc_hook hook = 0;
  must(uc_hook_add(engine, &hook, UC_HOOK_CODE, reinterpret_cast<void*>(onCode), this, 1, 0));
  must(uc_hook_add(engine, &hook, UC_HOOK_MEM_READ, reinterpret_cast<void*>(onRead), this, data,
                   data + dataSize - 1));
  must(uc_hook_add(engine, &hook, UC_HOOK_MEM_WRITE, reinterpret_cast<void*>(onWrite), this, data,
                   data + dataSize - 1));

  elf_version(EV_CURRENT);
  const int file = open(elf.c_str(), O_RDONLY | O_CLOEXEC);
  Elf* const image = elf_begin(file, ELF_C_READ, nullptr);
  if (!image || elf_kind(image) != ELF_K_ELF) throw std::runtime_error("no image " + elf);
  size_t segments = 0;
  elf_getphdrnum(image, &segments);
  size_t length = 0;
  const char* const bytes = elf_rawfile(image, &length);
  for (size_t i = 0; i < segments; ++i) {
    GElf_Phdr segment;
    gelf_getphdr(image, static_cast<int>(i), &segment);
    if (segment.p_type != PT_LOAD || segment.p_filesz == 0) continue;
    must(uc_mem_write(engine, segment.p_vaddr, bytes + segment.p_offset, segment.p_filesz));
  }
  for (Elf_Scn* section = elf_nextscn(image, nullptr); section;
       section = elf_nextscn(image, section)) {
    GElf_Shdr header;
    gelf_getshdr(section, &header);
    if (header.sh_type != SHT_SYMTAB) continue;
    Elf_Data* const symbols = elf_getdata(section, nullptr);
    for (size_t i = 0; i < header.sh_size / header.sh_entsize; ++i) {
      GElf_Sym symbol;
      gelf_getsym(symbols, static_cast<int>(i), &symbol);
      if (GELF_ST_TYPE(symbol.st_info) != STT_FUNC) continue;
      functions[elf_strptr(image, header.sh_link, symbol.st_name)] = {
          static_cast<uint32_t>(symbol.st_value), static_cast<uint32_t>(symbol.st_size)};
    }
  }
  elf_end(image);
  close(file);
}

Core::~Core() { uc_close(engine); }

const Function* Core::find(const std::string& name) const {
  const auto found = functions.find(name);
  return found == functions.end() ? nullptr : &found->second;
}

void Core::give(uint32_t address, const std::vector<uint8_t>& bytes) {
  must(uc_mem_write(engine, address, bytes.data(), bytes.size()));
  std::fill_n(readable.begin() + (address - data), bytes.size(), true);
}

std::vector<uint8_t> Core::read(uint32_t address, size_t size) const {
  std::vector<uint8_t> bytes(size);
  must(uc_mem_read(engine, address, bytes.data(), size));
  return bytes;
}

Run Core::call(const Function& function, const std::vector<uint32_t>& arguments) {
  run = {};
  branchFrom = 0;
  for (size_t i = 0; i < arguments.size(); ++i) {
    must(uc_reg_write(engine, UC_ARM_REG_R0 + static_cast<int>(i), &arguments[i]));
  }
  const uint32_t stack = ram + ramSize;
  const uint32_t link = returnAddress | 1;
  must(uc_reg_write(engine, UC_ARM_REG_SP, &stack));
  must(uc_reg_write(engine, UC_ARM_REG_LR, &link));
  constexpr size_t limit = 1000000;
  const uc_err error = uc_emu_start(engine, function.address | 1, returnAddress, 0, limit);
  uint32_t end = 0;
  must(uc_reg_read(engine, UC_ARM_REG_PC, &end));
  must(uc_reg_read(engine, UC_ARM_REG_R0, &run.result));
  run.ended = error == UC_ERR_OK && end == returnAddress;
  return run;
}

void Core::onCode(uc_engine* engine, uint64_t address, uint32_t size, void* self) {
  Core& core = *static_cast<Core*>(self);
  if (core.branchFrom != 0 && address != core.branchFrom + 2) ++core.run.cycles;
  uint16_t op = 0;
  must(uc_mem_read(engine, address, &op, sizeof op));
  core.run.cycles += costOf(op, size);
  core.branchFrom = isConditionalBranch(op) ? static_cast<uint32_t>(address) : 0;
}

void Core::onRead(uc_engine*, uc_mem_type, uint64_t address, int size, int64_t, void* self) {
  Core& core = *static_cast<Core*>(self);
  const auto first = core.readable.begin() + static_cast<std::ptrdiff_t>(address - data);
  if (std::find(first, first + size, false) != first + size) core.run.readsPast = true;
}

void Core::onWrite(uc_engine*, uc_mem_type, uint64_t address, int size, int64_t, void* self) {
  Core& core = *static_cast<Core*>(self);
  std::fill_n(core.readable.begin() + static_cast<std::ptrdiff_t>(address - data), size, true);
}
