// Each operation is written once, as a template on the unit, and the functions of both widths are
// entries of one line. The templates stand in unnamed namespaces: elsewhere each would leave a
// symbol of its own in the object.
#include "strutil.h"

#include <limits.h>

// The target's division is a routine of the compiler's runtime that gives the quotient and the
// remainder at once. Called by name: unoptimised builds, and Clang, would call one for each.
#if defined(__ARM_EABI__) && !defined(__ARM_FEATURE_IDIV) && !defined(__ARM_BIG_ENDIAN)
#define STRUTIL_IDIVMOD __aeabi_idivmod
extern "C" uint64_t STRUTIL_IDIVMOD(int dividend, int divisor) noexcept;
#endif

// What is particular to compilers, with what serves any other beside it. It keeps calls that they
// invent out of the object, whatever the user's options, and it says what options cannot be asked
// of every user: how loops over units come out fast on a Cortex-M0+.
#if defined(__clang__)
// Clang without minsize repeats every small loop four times, and inlines each function called.
#pragma clang attribute push
#pragma clang attribute(__attribute__((no_builtin)), apply_to = function)
#pragma clang attribute(__attribute__((no_stack_protector)), apply_to = function)
#pragma clang attribute(__attribute__((nothrow)), apply_to = hasType(functionType))
#pragma clang attribute(__attribute__((minsize)), apply_to = function)
#elif defined(__GNUC__)
// GCC's -ftree-pre, -fivopts, -ftree-scev-cprop and -fpartial-inlining keep more values than the
// core has low registers, work out after a loop what the loop knew, or put a call before it.
#pragma GCC push_options
#pragma GCC optimize("no-tree-loop-distribute-patterns", "no-tree-vectorize", "no-stack-protector")
#pragma GCC optimize("no-tree-pre", "no-ivopts", "no-tree-scev-cprop", "no-partial-inlining")
#endif

#if defined(__clang__)
#define STRUTIL_INLINE [[gnu::always_inline, gnu::flatten]] inline  // minsize inlines no lambda
#elif defined(__GNUC__)
#define STRUTIL_INLINE [[gnu::always_inline]] inline
#else
#define STRUTIL_INLINE inline
#endif

#if defined(__clang__) || defined(__GNUC__)
#define STRUTIL_RARELY(condition) __builtin_expect(!!(condition), 0)
#define STRUTIL_OPAQUE(value) __asm__("" : "+r"(value))  // hides where the value comes from
#define STRUTIL_ALIASING [[gnu::may_alias]]
#else
#define STRUTIL_RARELY(condition) (condition)
#define STRUTIL_OPAQUE(value)               \
  do {                                      \
    const volatile unsigned hidden = value; \
    value = hidden;                         \
  } while (false)
#endif

namespace {

// Narrow text is read and written as bytes, so that nothing depends on the sign of a plain char.
using Byte = uint8_t;

Byte* units(char* str) { return reinterpret_cast<Byte*>(str); }
const Byte* units(const char* str) { return reinterpret_cast<const Byte*>(str); }
WCHAR* units(WCHAR* str) { return str; }
const WCHAR* units(const WCHAR* str) { return str; }

char* text(const Byte* str) { return reinterpret_cast<char*>(const_cast<Byte*>(str)); }
WCHAR* text(const WCHAR* str) { return const_cast<WCHAR*>(str); }

// Bounds of a walk: how many more units it may take.
struct Count {
  int left = INT_MAX;

  bool take(int count) {
    if (left < count) return false;
    left -= count;
    return true;
  }
};

struct Endless {
  static bool take(int) { return true; }
};

// A small build shares what a fast one repeats: a function that serves several of the library's,
// rather than a copy in each; a loop with a bound also for those without; one step a turn.
#if defined(__OPTIMIZE_SIZE__)
#define STRUTIL_CORE inline
using Whole = Count;
enum { stepsATurn = 1 };
#else
#define STRUTIL_CORE STRUTIL_INLINE
using Whole = Endless;
enum { stepsATurn = 4 };
#endif

// As an integer: of a pointer that moves, Clang makes several, each with an offset of its own.
template <typename Unit>
void advance(Unit*& at, uintptr_t count) {
  at = reinterpret_cast<Unit*>(reinterpret_cast<uintptr_t>(at) + count * sizeof(Unit));
}

// The loop of all walks. Four steps a turn: the arithmetic and the jump back, and the test of the
// bound, cost half as much as the rest of a simple step.
template <typename Bound, typename GoesOn, typename... Unit>
STRUTIL_INLINE bool steps(Bound bound, const GoesOn& goesOn, Unit*&... at) {
  if constexpr (stepsATurn == 4) {
    for (; bound.take(4); (..., advance(at, 4))) {
      if (STRUTIL_RARELY(!goesOn(at[0]...))) return true;
      if (STRUTIL_RARELY(!goesOn(at[1]...))) return (..., advance(at, 1)), true;
      if (STRUTIL_RARELY(!goesOn(at[2]...))) return (..., advance(at, 2)), true;
      if (STRUTIL_RARELY(!goesOn(at[3]...))) return (..., advance(at, 3)), true;
    }
  }
  for (; bound.take(1); (..., advance(at, 1))) {
    if (!goesOn(*at...)) return true;
  }
  return false;
}

// What all loops over text are expressed through: passes the units that the pointers point at to
// `goesOn`, one of each, and moves all pointers on by one unit, until `goesOn` returns false or the
// bound is reached. The pointers are left at the units that ended it, or after the last ones.
// Returns whether a unit ended it, not the bound.
template <typename Bound, typename Unit, typename GoesOn>
STRUTIL_INLINE bool walk(Bound bound, Unit*& at, const GoesOn& goesOn) {
  return steps(bound, goesOn, at);
}

template <typename Bound, typename To, typename From, typename GoesOn>
STRUTIL_INLINE bool walk(Bound bound, To*& to, From*& from, const GoesOn& goesOn) {
  return steps(bound, goesOn, to, from);
}

}  // namespace

// Lengths and case mapping

namespace {

// What separates the two cases of a letter.
enum { caseBit = 'a' - 'A' };

// Whether c is one of the 26 letters from `first` on.
bool isLetterFrom(unsigned first, unsigned c) { return c - first < 26; }

template <typename Unit>
STRUTIL_CORE int length(const Unit* str) {
  if (!str) return 0;
  const Unit* end = str;
  walk(Endless{}, end, [](unsigned unit) { return unit != 0; });
  return static_cast<int>(end - str);
}

// Adds `change` to the letters from `first` on. Two tests against constants, of which most units
// need one, rather than one of a range, which needs a copy of the unit.
template <typename Unit>
STRUTIL_CORE Unit* switchCase(Unit* str, unsigned first, int change) {
  if (!str) return nullptr;
  Unit* at = str;
  walk(Endless{}, at, [=](Unit& unit) {
    if (unit < first) return unit != 0;
    if (unit < first + 26) unit = static_cast<Unit>(unit + change);
    return true;
  });
  return str;
}

}  // namespace

int StrLen(const char* str) { return length(units(str)); }
int WStrLen(const WCHAR* str) { return length(units(str)); }

int CharToLower(const int c) {
  return isLetterFrom('A', static_cast<unsigned>(c)) ? c + caseBit : c;
}

int CharToUpper(const int c) {
  return isLetterFrom('a', static_cast<unsigned>(c)) ? c - caseBit : c;
}

char* StrUpper(char* str) { return text(switchCase(units(str), 'a', -caseBit)); }
WCHAR* WStrUpper(WCHAR* str) { return switchCase(str, 'a', -caseBit); }

char* StrLower(char* str) { return text(switchCase(units(str), 'A', caseBit)); }
WCHAR* WStrLower(WCHAR* str) { return switchCase(str, 'A', caseBit); }

// Copying

namespace {

// Copies up to the terminator, or up to the bound without one, and returns where it ended.
template <typename To, typename From, typename Bound>
STRUTIL_CORE To* copyUnits(To* dst, const From* src, Bound bound) {
  walk(bound, dst, src, [](To& to, unsigned from) {
    to = static_cast<To>(from);
    return from != 0;
  });
  return dst;
}

template <typename Unit>
STRUTIL_CORE void copy(Unit* dst, const Unit* src) {
  if (!dst || dst == src) return;
  *dst = 0;
  if (src) copyUnits(dst, src, Endless{});
}

template <typename Unit>
void copyBuf(Unit* dst, int n, const Unit* src) {
  if (!dst || dst == src || n < 1) return;
  *dst = 0;
  if (src) *copyUnits(dst, src, Count{n - 1}) = 0;
}

template <typename Unit>
void nCopy(Unit* dst, const Unit* src, int n) {
  if (!dst || dst == src) return;
  *dst = 0;
  if (src) copyUnits(dst, src, Count{n});
}

}  // namespace

void StrCopy(char* dst, const char* src) { copy(units(dst), units(src)); }
void WStrCopy(WCHAR* dst, const WCHAR* src) { copy(dst, src); }

void StrCopyBuf(char* dst, int n, const char* src) { copyBuf(units(dst), n, units(src)); }
void WStrCopyBuf(WCHAR* dst, int n, const WCHAR* src) { copyBuf(dst, n, src); }

void StrNCopy(char* dst, const char* src, int n) { nCopy(units(dst), units(src), n); }
void WStrNCopy(WCHAR* dst, const WCHAR* src, int n) { nCopy(dst, src, n); }

// Concatenation

namespace {

template <typename Unit>
void cat(Unit* dst, const Unit* src) {
  if (!dst || !src) return;
  copyUnits(dst + length(dst), src, Endless{});
}

template <typename Unit>
STRUTIL_CORE void nCatBuf(Unit* dst, int n, const Unit* src, int num) {
  if (!dst || !src) return;
  const int off = length(dst);
  if (n <= off + 1) return;
  const int nMax = n - off - 1;
  *copyUnits(dst + off, src, Count{num < nMax ? num : nMax}) = 0;
}

}  // namespace

void StrCat(char* dst, const char* src) { cat(units(dst), units(src)); }
void WStrCat(WCHAR* dst, const WCHAR* src) { cat(dst, src); }

void StrCatBuf(char* dst, int n, const char* src) { nCatBuf(units(dst), n, units(src), INT_MAX); }
void WStrCatBuf(WCHAR* dst, int n, const WCHAR* src) { nCatBuf(dst, n, src, INT_MAX); }

void WStrNCat(WCHAR* dst, const WCHAR* src, int num) { nCatBuf(dst, INT_MAX, src, num); }

void WStrNCatBuf(WCHAR* dst, int n, const WCHAR* src, int num) { nCatBuf(dst, n, src, num); }

// Searching

namespace {

// Whether two units that differ are the two cases of a letter.
STRUTIL_INLINE bool areCases(int a, int b) {
  if (STRUTIL_RARELY((a ^ b) != caseBit)) return false;
  return isLetterFrom('a', static_cast<unsigned>(a | b));
}

template <typename Unit>
STRUTIL_CORE Unit* findUnit(Unit* str, unsigned c) {
  if (!str) return nullptr;
  unsigned last = 0;
  walk(Endless{}, str, [c, &last](unsigned unit) {
    last = unit;
    return !STRUTIL_RARELY(unit == c) && !STRUTIL_RARELY(unit == 0);
  });
  return last == 0 ? nullptr : str;
}

// Looks for the first unit of substr before it compares the rest. Where the rest fails at the
// terminator of str, no later place has room for substr.
template <typename Unit>
STRUTIL_CORE const Unit* find(const Unit* str, const Unit* substr, bool ignoreCase) {
  if (!str || !substr || *str == 0) return nullptr;
  const int first = *substr;
  if (first == 0) return str;
  const int other = ignoreCase && areCases(first, first ^ caseBit) ? first ^ caseBit : first;
  for (;; ++str) {
    int a = 0;
    int b = 0;
    walk(Endless{}, str, [=, &a](int unit) {
      a = unit;
      return unit != first && unit != other && unit != 0;
    });
    if (a == 0) return nullptr;
    const Unit* at = str + 1;
    const Unit* rest = substr + 1;
    walk(Endless{}, at, rest, [=, &a, &b](int unit, int wanted) {
      a = unit;
      b = wanted;
      if (STRUTIL_RARELY(a != b)) return ignoreCase && areCases(unit, wanted);
      if (STRUTIL_RARELY(wanted == 0)) return false;
      return true;
    });
    if (b == 0) return str;
    if (a == 0) return nullptr;
  }
}

}  // namespace

// A caller fills the register of `c` by the sign of its own plain char, and compilers trust that it
// was by that of ours: the low 8 bits count.
char* StrChr(const char* str, const char c) {
  unsigned unit = static_cast<Byte>(c);
  STRUTIL_OPAQUE(unit);
  return text(findUnit(units(str), static_cast<Byte>(unit)));
}
WCHAR* WStrChr(const WCHAR* str, const WCHAR c) { return text(findUnit(str, c)); }

char* StrStr(const char* str, const char* substr) {
  return text(find(units(str), units(substr), false));
}
WCHAR* WStrStr(const WCHAR* str, const WCHAR* substr) { return text(find(str, substr, false)); }

char* StrIStr(const char* str, const char* substr) {
  return text(find(units(str), units(substr), true));
}
WCHAR* WStrIStr(const WCHAR* str, const WCHAR* substr) { return text(find(str, substr, true)); }

// Comparison

namespace {

// Returns 0, or the position i + 1 of the first difference: negative where str1 has the smaller
// unit. Units that are equal are not mapped, and the others only to see which is the smaller.
template <typename Unit, typename Bound>
STRUTIL_CORE int compare(const Unit* str1, const Unit* str2, Bound bound, bool ignoreCase) {
  if (!str1 || !str2) return (str1 ? 1 : 0) - (str2 ? 1 : 0);
  if (str1 == str2) return 0;
  const Unit* at = str1;
  int a = 0;
  int b = 0;
  const bool stopped = walk(bound, at, str2, [=, &a, &b](int unit1, int unit2) {
    a = unit1;
    b = unit2;
    if (STRUTIL_RARELY(a != b)) return ignoreCase && areCases(unit1, unit2);
    if (STRUTIL_RARELY(unit2 == 0)) return false;
    return true;
  });
  if (!stopped || a == b) return 0;
  if (ignoreCase) {
    a = CharToLower(a);
    b = CharToLower(b);
  }
  const int position = static_cast<int>(at - str1) + 1;
  return a < b ? -position : position;
}

}  // namespace

int StrNCmp(const char* str1, const char* str2, int n) {
  return compare(units(str1), units(str2), Count{n}, false);
}
int WStrNCmp(const WCHAR* str1, const WCHAR* str2, int n) {
  return compare(str1, str2, Count{n}, false);
}

// Irregular by contract: every difference is negative, only the null rule gives a positive result.
int StrNICmp(const char* str1, const char* str2, int n) {
  const int result = compare(units(str1), units(str2), Count{n}, true);
  return str1 && str2 && result > 0 ? -result : result;
}
int WStrNICmp(const WCHAR* str1, const WCHAR* str2, int n) {
  return compare(str1, str2, Count{n}, true);
}

int StrCmp(const char* str1, const char* str2) {
  return compare(units(str1), units(str2), Whole{}, false);
}
int WStrCmp(const WCHAR* str1, const WCHAR* str2) { return compare(str1, str2, Whole{}, false); }

int StrICmp(const char* str1, const char* str2) {
  return compare(units(str1), units(str2), Whole{}, true);
}
int WStrICmp(const WCHAR* str1, const WCHAR* str2) { return compare(str1, str2, Whole{}, true); }

// Tokenizing and splitting

namespace {

// StrChr for sets, which are short: a turn of the walk costs more than it saves. No set contains
// the terminator.
template <typename Unit>
STRUTIL_CORE bool contains(const Unit* set, unsigned unit) {
  unsigned one = *set;
  if (one == unit) return unit != 0;
  if (one == 0) return false;
  while ((one = *++set) != 0) {
    if (one == unit) return true;
  }
  return false;
}

template <typename Unit>
STRUTIL_CORE Unit* token(Unit* str, int* off, const Unit* dlmt) {
  if (!str || !off || !dlmt) return nullptr;
  Unit* start = str + *off;
  while (contains(dlmt, *start)) ++start;
  *off = static_cast<int>(start - str);
  if (*start == 0) return nullptr;
  Unit* end = start + 1;
  while (*end != 0 && !contains(dlmt, *end)) ++end;
  *off = static_cast<int>(end - str);
  if (*end == 0) return start;
  *end = 0;
  ++*off;
  return start;
}

template <typename Text>
int split(Text* str, const Text* dlmt, Text** wrd) {
  if (!wrd) return 0;
  int off = 0;
  int num = 0;
  while (auto* const tk = token(units(str), &off, units(dlmt))) wrd[num++] = text(tk);
  return num;
}

}  // namespace

char* StrToken(char* str, int* off, const char* dlmt) {
  return text(token(units(str), off, units(dlmt)));
}
WCHAR* WStrToken(WCHAR* str, int* off, const WCHAR* dlmt) { return token(str, off, dlmt); }

int StrSplit(char* str, const char* dlmt, char** wrd) { return split(str, dlmt, wrd); }
int WStrSplit(WCHAR* str, const WCHAR* dlmt, WCHAR** wrd) { return split(str, dlmt, wrd); }

// Trimming

namespace {

// Pairs such as these let a template call the twin of its own width.
int strLen(const Byte* str) { return StrLen(text(str)); }
int strLen(const WCHAR* str) { return WStrLen(str); }

void strCopy(Byte* dst, const Byte* src) { StrCopy(text(dst), text(src)); }
void strCopy(WCHAR* dst, const WCHAR* src) { WStrCopy(dst, src); }

template <typename Unit>
int trim(Unit* str, const Unit* trimSet) {
  if (!str) return 0;
  const Unit emptySet = 0;
  if (!trimSet) trimSet = &emptySet;
  Unit* first = str;
  while (contains(trimSet, *first)) ++first;
  Unit* end = first + strLen(first);
  while (end > first + 1 && contains(trimSet, end[-1])) --end;
  *end = 0;
  const int kept = static_cast<int>(end - first);
  strCopy(str, first);
  return kept;
}

}  // namespace

int StrTrim(char* str, const char* trimSet) { return trim(units(str), units(trimSet)); }
int WStrTrim(WCHAR* str, const WCHAR* trimSet) { return trim(str, trimSet); }

// Replacing

namespace {

const Byte* strStr(const Byte* str, const Byte* substr) {
  return units(StrStr(text(str), text(substr)));
}
const WCHAR* strStr(const WCHAR* str, const WCHAR* substr) { return WStrStr(str, substr); }

template <typename Unit>
int replace(const Unit* orig, const Unit* rep, const Unit* with, Unit* result) {
  if (!orig || !rep || *rep == 0 || !with) return 0;
  const int len_rep = strLen(rep);
  Unit* tmp = result;
  int length = 0;
  int count = 0;
  for (; const Unit* const ins = strStr(orig, rep); ++count) {
    const int len_front = static_cast<int>(ins - orig);
    if (tmp) tmp = copyUnits(copyUnits(tmp, orig, Count{len_front}), with, Endless{});
    length += len_front;
    orig = ins + len_rep;
  }
  if (count > 0) length += count * strLen(with);
  if (tmp) strCopy(tmp, orig);
  return length + strLen(orig);
}

}  // namespace

int StrReplace(const char* orig, const char* rep, const char* with, char* result) {
  return replace(units(orig), units(rep), units(with), units(result));
}
int WStrReplace(const WCHAR* orig, const WCHAR* rep, const WCHAR* with, WCHAR* result) {
  return replace(orig, rep, with, result);
}

// Integer text conversion

namespace {

struct Division {
  int quotient;
  int remainder;
};

Division divide(int dividend, int divisor) {
#if defined(STRUTIL_IDIVMOD)
  const uint64_t both = STRUTIL_IDIVMOD(dividend, divisor);
  return {static_cast<int>(both), static_cast<int>(both >> 32)};
#else
  return {dividend / divisor, dividend % divisor};
#endif
}

template <typename Unit>
Unit digitOf(unsigned value) {
  return static_cast<Unit>(value < 10 ? '0' + value : 'a' - 10 + value);
}

// The most negative int has no positive counterpart: its first division is of the value itself.
template <typename Unit>
Unit* fromInt(int value, Unit* string, int radix) {
  if (!string) return nullptr;
  *string = 0;
  if (radix < 1 || (radix == 1 && value != 0)) return string;
  const bool negative = value < 0;
  if (negative && value != INT_MIN) value = -value;
  Unit* end = string;
  do {
    Division by = divide(value, radix);
    if (STRUTIL_RARELY(by.quotient < 0)) by = {-by.quotient, -by.remainder};
    *end++ = digitOf<Unit>(static_cast<unsigned>(by.remainder));
    value = by.quotient;
  } while (value != 0);
  if (negative) *end++ = '-';
  *end = 0;
  for (Unit* start = string; start < --end; ++start) {
    const Unit unit = *start;
    *start = *end;
    *end = unit;
  }
  return string;
}

template <typename Unit>
int toInt(const Unit* string) {
  if (!string) return 0;
  while (*string == ' ' || *string == '\t') ++string;
  const bool negative = *string == '-';
  if (negative) ++string;
  unsigned val = 0;
  walk(Endless{}, string, [&val](unsigned unit) {
    const unsigned digit = unit - '0';
    if (digit > 9) return false;
    val = val * 10 + digit;
    return true;
  });
  return static_cast<int>(negative ? 0 - val : val);
}

}  // namespace

char* IntToStr(int value, char* string, int radix) {
  return text(fromInt(value, units(string), radix));
}
WCHAR* IntToWStr(int value, WCHAR* string, int radix) { return fromInt(value, string, radix); }

int StrToInt(const char* string) { return toInt(units(string)); }
int WStrToInt(const WCHAR* string) { return toInt(string); }

// Width conversion

namespace {

template <typename To, typename From>
STRUTIL_CORE void copyCount(To*& des, const From*& src, int count) {
  walk(Count{count}, des, src, [](To& to, From from) {
    to = from;
    return true;
  });
}

#if defined(STRUTIL_ALIASING)
// Two units in one word. Word by word is also unit by unit, forward, where the arrays overlap: both
// being aligned, they are an even number of units apart.
struct STRUTIL_ALIASING Pair {
  uint32_t units;
};

bool isAligned(const void* pair) { return reinterpret_cast<uintptr_t>(pair) % sizeof(Pair) == 0; }
#endif

// The library's only constant data.
constexpr char emptyText[] = "";

}  // namespace

void BytesToWords(const char* src, WORD* des, int len) {
  const Byte* from = units(src);
  if (from && des) copyCount(des, from, len);
}

WCHAR* StrToWStr(const char* src, WCHAR* des, int bufsize) {
  if (!des) return nullptr;
  *des = 0;
  if (src) *copyUnits(des, units(src), Count{bufsize < 1 ? 0 : bufsize - 1}) = 0;
  return des;
}

char* WStrToStr(const WCHAR* src, char* des, int bufsize) {
  if (!des) return const_cast<char*>(emptyText);
  Byte* at = units(des);
  const auto room = [&] {  // the terminator's unit included
    return bufsize - static_cast<int>(at - units(des));
  };
  unsigned unit = 0;
  const auto copyPrintable = [&](Byte& to, unsigned from) {
    unit = from;
    if (unit < ' ' || unit > '~') return false;
    to = static_cast<Byte>(unit);
    return true;
  };
  if (!src) bufsize = 0;
  while (bufsize > 0 && walk(Count{room() - 1}, at, src, copyPrintable) && unit != 0) {
    int shift = 12;  // of the first digit
    while (shift > 0 && unit >> shift == 0) shift -= 4;
    if (room() < (shift >> 2) + 7) break;
    *at++ = '&';
    *at++ = '(';
    *at++ = '0';
    *at++ = 'x';
    for (; shift >= 0; shift -= 4) *at++ = digitOf<Byte>(unit >> shift & 15);
    *at++ = ')';
    ++src;
  }
  *at = 0;
  return des;
}

void WStrToWords(const WCHAR* src, WORD* des, int len) {
  if (!src || !des || len < 1) return;
#if defined(STRUTIL_ALIASING)
  if (isAligned(src) && isAligned(des)) {
    Pair* to = static_cast<Pair*>(static_cast<void*>(des));
    const Pair* from = static_cast<const Pair*>(static_cast<const void*>(src));
    copyCount(to, from, len >> 1);
    des = static_cast<WORD*>(static_cast<void*>(to));
    src = static_cast<const WCHAR*>(static_cast<const void*>(from));
    if ((len & 1) != 0) *des = *src;
    return;
  }
#endif
  copyCount(des, src, len);
}

#if defined(__clang__)
#pragma clang attribute pop
#elif defined(__GNUC__)
#pragma GCC pop_options
#endif
