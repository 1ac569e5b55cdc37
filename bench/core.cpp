#include "core.h"

#include <algorithm>
#include <cstdio>
#include <sstream>
#include <stdexcept>

namespace {

constexpr uint32_t flashSize = 0x100000;
constexpr uint32_t ram = 0x20000000;
constexpr uint32_t ramSize = 0x10000;
constexpr uint32_t stackTop = ram + ramSize;
constexpr uint32_t returnAddress = 0x000F0000;  // flash that no image uses

void must(uc_err error) {
  if (error != UC_ERR_OK) throw std::runtime_error(uc_strerror(error));
}

// What a command prints.
std::istringstream outputOf(const std::string& command) {
  FILE* const pipe = popen(command.c_str(), "r");
  std::string output;
  for (int c = 0; pipe && (c = getc(pipe)) != EOF;) output += static_cast<char>(c);
  if (!pipe || pclose(pipe) != 0) throw std::runtime_error(command);
  return std::istringstream(output);
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

Core::Core(const std::string& image) {
  must(uc_open(UC_ARCH_ARM, static_cast<uc_mode>(UC_MODE_THUMB | UC_MODE_MCLASS), &engine));
  must(uc_ctl_set_cpu_model(engine, UC_CPU_ARM_CORTEX_M0));
  must(uc_mem_map(engine, 0, flashSize, UC_PROT_ALL));
  must(uc_mem_map(engine, ram, ramSize, UC_PROT_ALL));
  const auto add = [this](int type, void* hooked, uint64_t from, uint64_t to) {
    uc_hook hook = 0;
    must(uc_hook_add(engine, &hook, type, hooked, this, from, to));
  };
  add(UC_HOOK_CODE, reinterpret_cast<void*>(onCode), 1, 0);
  add(UC_HOOK_MEM_READ, reinterpret_cast<void*>(onRead), data, data + dataSize - 1);
  add(UC_HOOK_MEM_WRITE, reinterpret_cast<void*>(onWrite), data, data + dataSize - 1);
  add(UC_HOOK_MEM_WRITE, reinterpret_cast<void*>(onPush), data + dataSize, stackTop - 1);

  uint32_t address = 0;
  auto bytes = outputOf("arm-none-eabi-objcopy -O verilog '" + image + "' /dev/stdout");
  for (std::string word; bytes >> word;) {
    if (word[0] == '@') {
      address = static_cast<uint32_t>(std::stoul(word.substr(1), nullptr, 16));
    } else {
      const auto byte = static_cast<uint8_t>(std::stoul(word, nullptr, 16));
      must(uc_mem_write(engine, address++, &byte, 1));
    }
  }
  auto symbols = outputOf("arm-none-eabi-nm -S --defined-only --format=posix '" + image + "'");
  for (std::string line; std::getline(symbols, line);) {
    std::istringstream fields(line);
    std::string name;
    char type = 0;
    Symbol function;
    fields >> name >> type >> std::hex >> function.address >> function.size;
    if ((type != 'T' && type != 't' && type != 'W') || name[0] == '$') continue;
    functions[name] = function;
    namesByAddress[function.address] = name;
  }
}

Core::~Core() { uc_close(engine); }

const Symbol* Core::find(const std::string& name) const {
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

Run Core::call(const Symbol& function, const std::vector<uint32_t>& arguments) {
  run = {};
  branchFrom = 0;
  for (size_t i = 0; i < arguments.size(); ++i) {
    must(uc_reg_write(engine, UC_ARM_REG_R0 + static_cast<int>(i), &arguments[i]));
  }
  const uint32_t link = returnAddress | 1;
  must(uc_reg_write(engine, UC_ARM_REG_SP, &stackTop));
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
  core.at = address;
  const auto entered = core.namesByAddress.find(address);
  if (entered != core.namesByAddress.end()) core.run.functions.insert(entered->second);
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

void Core::onPush(uc_engine*, uc_mem_type, uint64_t address, int, int64_t, void* self) {
  Core& core = *static_cast<Core*>(self);
  const auto running = std::prev(core.namesByAddress.upper_bound(core.at));
  if (running->second.rfind("__", 0) == 0) return;
  core.run.stack = std::max(core.run.stack, stackTop - static_cast<uint32_t>(address));
}
