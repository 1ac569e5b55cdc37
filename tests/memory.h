// Strings as the tests see them, test buffers that show what a call reads and writes, and random
// numbers.
#pragma once

#include <algorithm>
#include <climits>
#include <string>
#include <type_traits>
#include <vector>

#include "strutil.h"

using namespace std::string_literals;

template <typename Unit>
constexpr bool isWide = std::is_same_v<Unit, WCHAR>;

// Whether the library is sanitized. The tests themselves never are: that would take most of the
// time.
#if defined(SANITIZED)
constexpr bool isSanitized = true;
#else
constexpr bool isSanitized = false;
#endif
// The longest sweeps run neither on an emulated board nor under sanitizers.
#if defined(__arm__)
constexpr bool isBoard = true;
#else
constexpr bool isBoard = false;
#endif
constexpr bool isFast = !isBoard && !isSanitized;

// The units of a string of either width, without its terminator. One value stands for a null
// pointer.
using Units = std::u16string;
inline const Units null = u"\0null"s;

// Narrow tests use the units 128 to 255; wide tests replace each by a unit whose low byte is an
// ASCII code (the unit - 128), so that code which looks at the low byte alone fails: A to M become
// high surrogates (0xD8xx), N to Z low surrogates (0xDCxx), the others 0x80xx.
template <typename Unit>
Units toUnitsOf(Units units) {
  if (!isWide<Unit>) return units;
  for (char16_t& unit : units) {
    if (unit < 128 || unit > 255) continue;
    const int low = unit - 128;
    const bool isLetter = low >= 'A' && low <= 'Z';
    unit = static_cast<char16_t>(low + (!isLetter ? 0x8000 : low <= 'M' ? 0xD800 : 0xDC00));
  }
  return units;
}

// Printable units as they are, others as numbers. A long string is shortened in the middle.
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

// The same seed gives the same numbers, on every machine.
class Random {
 public:
  explicit Random(unsigned seed) : state(seed) {}

  // A number below n.
  unsigned operator()(size_t n) {
    state += 0x9e3779b9;
    uint32_t mixed = (state ^ state >> 16) * 0x21f0aaad;
    mixed = (mixed ^ mixed >> 15) * 0x735a2d97;
    return static_cast<unsigned>((mixed ^ mixed >> 15) % n);
  }

 private:
  uint32_t state;
};

// A test buffer at any alignment. Under AddressSanitizer it ends exactly after its last unit.
// Otherwise guard units that look like an ordinary string surround it and must stay as they are.
template <typename Unit>
class Memory {
 public:
  // `size` units, of which the first hold `content`, after as many guard units as `offset` says,
  // which must be 1 or more. The other units are like the guard units.
  Memory(const Units& content, size_t size, unsigned offset, unsigned filler)
      : start(offset), units(start + size + guard) {
    constexpr Unit fillers[] = {'a', 'A', ',', ' ', '7', 0};
    for (size_t i = 0; i < units.size(); ++i) units[i] = fillers[(filler + i) / 2 % 6];
    std::copy(content.begin(), content.end(), units.data() + start);
    expected = units;
  }

  Unit* get() { return units.data() + start; }

  // Whether this was written at the start of the buffer, and nothing else anywhere.
  bool holds(const Units& written) {
    std::copy(written.begin(), written.end(), expected.data() + start);
    return units == expected;
  }
  std::string shown() const { return show(units); }
  std::string expectedShown() const { return show(expected); }

 private:
  static constexpr size_t guard = isSanitized ? 0 : 4;

  // The buffer, with the units before and after it apart.
  std::string show(const std::vector<Unit>& memory) const {
    Units all;
    for (const Unit unit : memory) all += static_cast<std::make_unsigned_t<Unit>>(unit);
    const size_t end = all.size() - guard;
    return ::show(all.substr(0, start)) + ::show(all.substr(start, end - start)) +
           ::show(all.substr(end));
  }

  size_t start;
  std::vector<Unit> units;
  std::vector<Unit> expected;
};

// n units of all kinds except separators, in an order that does not repeat. The wide ones include
// surrogate pairs.
template <typename Unit>
Units longString(size_t n) {
  Units string;
  for (unsigned state = 1; string.size() < n; state = state * 75 % 65537) {
    string += u"aZ_\u00e1mA{zM@\u0080\u00c1"[state % 12];
    if (string.back() == u'\u00c1') string += u'\u00d1';
  }
  return toUnitsOf<Unit>(string.substr(0, n));
}
