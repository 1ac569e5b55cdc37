// Texts as the tests see them, memory that shows what is read and written, and what is told of a
// failure.
#pragma once

#include <algorithm>
#include <climits>
#include <string>
#include <type_traits>
#include <vector>

#include "doctest.h"
#include "strutil.h"

using namespace std::string_literals;

template <typename Unit>
constexpr bool isWide = std::is_same_v<Unit, WCHAR>;

// Whether the library is sanitized; the tests themselves never are, which would take most of the
// time.
#if defined(SANITIZED)
constexpr bool isSanitized = true;
#else
constexpr bool isSanitized = false;
#endif
// The longest sweeps are not for an emulated board, nor for sanitizers.
#if defined(__arm__)
constexpr bool isBoard = true;
#else
constexpr bool isBoard = false;
#endif
constexpr bool isFast = !isBoard && !isSanitized;

// The units of a text of either width, by value. No text holds the unit 0, so that one stands for
// a null pointer.
using Units = std::u16string;
inline const Units null(1, u'\0');

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

// Printable units themselves, the others as numbers; of a long text both ends.
inline std::string show(const Units& units) {
  if (units == null) return "null";
  std::string shown = "[";
  for (size_t i = 0; i < units.size(); ++i) {
    if (i == 50 && units.size() > 100) {
      shown += "] " + std::to_string(units.size() - 100) + " units [";
      i = units.size() - 50;
    }
    const char16_t unit = units[i];
    shown += unit >= ' ' && unit <= '~' ? std::string(1, static_cast<char>(unit))
                                        : '<' + std::to_string(unit) + '>';
  }
  return shown + "]";
}

inline std::string show(const std::vector<int>& numbers) {
  std::string shown;
  for (const int number : numbers) shown += ' ' + std::to_string(number);
  return shown;
}

// The fuzzer has a failure told in another way.
inline void (*tell)(const char* file, int line, const std::string& failure) =
    [](const char* file, int line, const std::string& failure) {
      ADD_FAIL_CHECK_AT(file, line, failure);
    };

// A number below n, of a sequence that is the same in each run.
inline unsigned nextNumber(unsigned n) {
  static uint32_t state = 1;
  state = state * 1664525 + 1013904223;
  return (state >> 8) % n;
}

// Units at any alignment. Under AddressSanitizer the memory ends with them. Elsewhere units that
// every function takes for text lie around them, which must stay; and arguments come to the same
// few addresses again, with other units, as a firmware's buffers do.
template <typename Unit>
class Memory {
 public:
  // The first `count` units of a text, its terminator counted, in so many units of memory.
  Memory(const Units& text, size_t count, size_t size)
      : units(places[used][0]), before(places[used][1]) {
    static unsigned made = 0;
    start = margin + (++made >> (4 + used)) % 4 + (size == 0 ? 1 : 0);  // for no null pointer
    ++used;
    const unsigned some = nextNumber(8);
    const bool keepsUnits = nextNumber(2) == 0;  // what the last call left behind the text
    constexpr Unit canaries[] = {'a', 'A', ',', ' '};
    before = units;
    before.resize(start + size + margin);
    for (size_t i = 0; i < before.size(); ++i) {
      if (!keepsUnits || i < start || i >= start + size) before[i] = canaries[(some + i) / 2 % 4];
    }
    std::copy_n(text.c_str(), count, before.data() + start);
    if (isSanitized) units = std::vector<Unit>();  // so that it ends where it should
    units.assign(before.begin(), before.end());
  }
  ~Memory() { --used; }
  Memory(const Memory&) = delete;
  Memory& operator=(const Memory&) = delete;

  Unit* get() { return units.data() + start; }

  // Whether this is written now, and nothing else.
  bool holds(const Units& written) {
    std::copy(written.begin(), written.end(), before.data() + start);
    return units == before;
  }
  std::string shown() { return show(units); }
  std::string wanted() { return show(before); }

 private:
  static constexpr size_t margin = isSanitized ? 0 : 4;

  // The argument in brackets, with what lies around it.
  std::string show(const std::vector<Unit>& memory) {
    Units all;
    for (const Unit unit : memory) all += static_cast<std::make_unsigned_t<Unit>>(unit);
    const size_t end = all.size() - margin;
    return ::show(all.substr(0, start)) + ::show(all.substr(start, end - start)) +
           ::show(all.substr(end));
  }

  static inline std::vector<Unit> places[5][2];
  static inline size_t used = 0;
  std::vector<Unit>& units;
  std::vector<Unit>& before;
  size_t start = 0;
};

// n units of all kinds, without a separator, in an order that does not repeat. Wide, some of them
// are surrogate pairs.
inline Units longText(size_t n) {
  Units text;
  for (unsigned state = 1; text.size() < n; state = state * 75 % 65537) {
    text += u"aZ_\u00e1mA{zM@\u0080\u00c1"[state % 12];
    if (text.back() == u'\u00c1') text += u'\u00d1';
  }
  return text.substr(0, n);
}
