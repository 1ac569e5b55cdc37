// A Cortex-M0+ that counts cycles: Unicorn executes, this adds up the costs of the Technical
// Reference Manual's timing table, with zero wait states.
#pragma once

#include <unicorn/unicorn.h>

#include <cstdint>
#include <map>
#include <set>
#include <string>
#include <vector>

struct Symbol {
  uint32_t address = 0;
  uint32_t size = 0;
};

// What a call did. The compiler runtime's functions, which begin with "__", count for cycles alone.
struct Run {
  bool ended = false;  // returned, rather than trapped or ran on and on
  uint32_t result = 0;
  uint64_t cycles = 0;
  bool readsPast = false;           // read what the caller did not give
  uint32_t stack = 0;               // bytes
  std::set<std::string> functions;  // that ran
};

// A linked image in an emulated core.
class Core {
 public:
  static constexpr uint32_t data = 0x20004000;  // the callers' buffers are here
  static constexpr uint32_t dataSize = 0x8000;

  explicit Core(const std::string& image);
  ~Core();
  Core(const Core&) = delete;
  Core& operator=(const Core&) = delete;

  // All functions of the image by name.
  const std::map<std::string, Symbol>& all() const { return functions; }

  // The function of this name, or null if the image has none.
  const Symbol* find(const std::string& name) const;

  std::vector<uint8_t> read(uint32_t address, size_t size) const;

  // Puts these bytes there. In the data area nothing else may be read that was not written first.
  void give(uint32_t address, const std::vector<uint8_t>& bytes);
  void forgetGiven() { readable.assign(dataSize, false); }

  Run call(const Symbol& function, const std::vector<uint32_t>& arguments);

 private:
  static void onCode(uc_engine*, uint64_t address, uint32_t size, void* self);
  static void onRead(uc_engine*, uc_mem_type, uint64_t address, int size, int64_t, void* self);
  static void onWrite(uc_engine*, uc_mem_type, uint64_t address, int size, int64_t, void* self);
  static void onPush(uc_engine*, uc_mem_type, uint64_t address, int size, int64_t, void* self);

  uc_engine* engine = nullptr;
  std::map<std::string, Symbol> functions;
  std::map<uint64_t, std::string> namesByAddress;
  std::vector<bool> readable;
  Run run;
  uint64_t at = 0;          // the last instruction
  uint32_t branchFrom = 0;  // the same, if it was a conditional branch
};
