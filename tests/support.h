// What every test file uses: the twins by width, texts and destinations in memory of all
// alignments, and what is told of a failure.
#pragma once

#include <algorithm>
#include <string>
#include <type_traits>
#include <vector>

#include "doctest.h"
#include "strutil.h"

using namespace std::string_literals;

// twin::Len<char> is StrLen, twin::Len<WCHAR> is WStrLen.
// NOLINTBEGIN(bugprone-macro-parentheses): these are names.
#define NAMED_TWIN(name, narrow, wide)          \
  namespace twin {                              \
  template <typename Unit>                      \
  constexpr auto name = [] {                    \
    if constexpr (std::is_same_v<Unit, char>) { \
      return &narrow;                           \
    } else {                                    \
      return &wide;                             \
    }                                           \
  }();                                          \
  }
#define TWIN(name) NAMED_TWIN(name, Str##name, WStr##name)
// NOLINTEND(bugprone-macro-parentheses)

template <typename Unit>
constexpr bool isWide = std::is_same_v<Unit, WCHAR>;

// The longest sweeps are the host's alone: the board is emulated.
#if defined(__arm__)
constexpr bool isBoard = true;
#else
constexpr bool isBoard = false;
#endif

// The units of a text of either width, by value.
using Units = std::u16string;
using Sizes = std::initializer_list<size_t>;

// Wide tests take the units that narrow ones have above 127 as units with the same low byte: as "a"
// with the highest bit, as "A" or "Z" within half of a surrogate pair.
template <typename Unit>
Units lift(Units units) {
  for (char16_t& unit : units) {
    if (!isWide<Unit> || unit < 128 || unit > 255) continue;
    const int low = unit - 128;
    unit = static_cast<char16_t>(low + (low < 'A' || low > 'Z' ? 0x8000
                                        : low < 'N'            ? 0xD800
                                                               : 0xDC00));
  }
  return units;
}

inline std::string show(const char* words) { return words; }
inline std::string show(const std::string& words) { return words; }
inline std::string show(long long number) { return std::to_string(number); }

// Printable units themselves, the others as numbers; of a long text both ends.
inline std::string show(const Units& units) {
  std::string shown = "\"";
  for (size_t i = 0; i < units.size(); ++i) {
    if (i == 50 && units.size() > 100) {
      shown += "\" " + std::to_string(units.size() - 100) + " units \"";
      i = units.size() - 50;
    }
    const char16_t unit = units[i];
    shown += unit >= ' ' && unit <= '~' ? std::string(1, static_cast<char>(unit))
                                        : '<' + std::to_string(unit) + '>';
  }
  return shown + "\"";
}

template <typename... Part>
std::string told(const Part&... parts) {
  std::string all;
  ((all += (all.empty() ? "" : " ") + show(parts)), ...);
  return all;
}

// The fuzzer has a failure told in another way.
inline void (*tell)(const std::string& failure) = [](const std::string& failure) {
  FAIL_CHECK(failure);
};

// The first three failures of a test case say enough.
inline bool isWorthTelling() {
  static const void* testCase = nullptr;
  static int failures = 0;
  const void* const now = doctest::getContextOptions()->currentTest;
  failures = now == testCase ? failures + 1 : 1;
  testCase = now;
  return failures <= 3;
}

// Checks that `call`, which tells what it is, has given what it should.
template <typename Call, typename Value, typename Wanted>
void expect(const Call& call, const Value& value, const Wanted& wanted) {
  if (value != wanted && isWorthTelling()) tell(told(call(), "gives", value, "and not", wanted));
}

// The next number of a sequence, the same in each run.
inline unsigned nextNumber() {
  static unsigned state = 1;
  return (state = state * 75 % 65537) >> 3;
}

// Units at any alignment. Around them is at one use the end of the memory, where the sanitizers
// catch what is read or written, and at another units that every function takes for text.
template <typename Unit>
class Memory {
 public:
  Unit* get() { return memory.data() + start; }
  int indexOf(const Unit* unit) { return unit ? static_cast<int>(unit - get()) : -1; }

 protected:
  Memory(const Units& units, size_t size) : start(nextNumber() % 4) {
    const unsigned some = nextNumber();
    const size_t whole = start + size + (some % 2 == 0 || start + size == 0 ? 3 : 0);
    before.reserve(whole);
    constexpr Unit canaries[] = {'a', 'A', ',', ' '};
    while (before.size() < whole) before.push_back(canaries[(some + before.size()) / 2 % 4]);
    std::copy(units.begin(), units.end(), before.begin() + static_cast<std::ptrdiff_t>(start));
    memory = before;
  }

  // Checks that the units are now those, and that no other has changed.
  template <typename Call>
  void check(const Call& call, const Units& written) {
    if (written.empty() && memory == before) return;
    std::vector<Unit> wanted = before;
    std::copy(written.begin(), written.end(), wanted.begin() + static_cast<std::ptrdiff_t>(start));
    if (memory != wanted) expect(call, units(memory), units(wanted));
  }

 private:
  static Units units(const std::vector<Unit>& memory) {
    Units units;
    for (const Unit unit : memory) units += static_cast<std::make_unsigned_t<Unit>>(unit);
    return units;
  }

  size_t start;
  std::vector<Unit> before;
  std::vector<Unit> memory;
};

// A text argument, or a null pointer. No function writes to one.
template <typename Unit>
class Text : public Memory<Unit> {
 public:
  explicit Text(const Units& text) : Memory<Unit>(text + u'\0', text.size() + 1) {}
  ~Text() {
    this->check([] { return "an argument that is not to be written"; }, u"");
  }
  Text(const Text&) = delete;
  Text& operator=(const Text&) = delete;
};

// So many units of a text, which has no terminator if it is longer.
template <typename Unit>
class Counted : public Memory<Unit> {
 public:
  Counted(const Units& text, int count)
      : Counted((text + u'\0').substr(0, static_cast<size_t>(count < 1 ? 1 : count))) {}

 private:
  explicit Counted(const Units& units) : Memory<Unit>(units, units.size()) {}
};

// A buffer to write to.
template <typename Unit>
class Buffer : public Memory<Unit> {
 public:
  explicit Buffer(const Units& units = {}, size_t size = 24)
      : Memory<Unit>(units, units.size() < size ? size : units.size()) {}
  using Memory<Unit>::check;
};

// n units of all kinds, without a separator, in an order that does not repeat.
inline Units longText(size_t n) {
  Units text;
  for (unsigned state = 1; text.size() < n; state = state * 75 % 65537) {
    text += u"aZ_\u00e1mA{zM@1"[state % 11];
  }
  return text;
}

// Every narrow unit but one.
inline Units allUnits(char16_t butOne = 0) {
  Units text;
  for (char16_t unit = 255; unit > 0; --unit) text += unit == butOne ? u"" : Units(1, unit);
  return text;
}

// All texts of `shortest` to `longest` units of an alphabet.
inline std::vector<Units> allTexts(const Units& alphabet, size_t longest, size_t shortest = 0) {
  std::vector<Units> texts = {u""};
  size_t first = 0;
  for (size_t i = 0; texts[i].size() < longest; ++i) {
    if (texts[i].size() < shortest) first = i + 1;
    for (const char16_t unit : alphabet) texts.push_back(texts[i] + unit);
  }
  texts.erase(texts.begin(), texts.begin() + static_cast<std::ptrdiff_t>(first));
  return texts;
}
