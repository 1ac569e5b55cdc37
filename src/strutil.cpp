// Each operation is implemented once, mostly as a template on the unit type, in an unnamed
// namespace (no symbols). The exported functions at the end of the file call these templates.
#include "strutil.h"

#include <limits.h>

#if defined(__arm__) && !defined(__thumb__) && __ARM_ARCH < 6  // links, but no Cortex-M can run it
#error "A32 code: give the C++ compiler the processor, such as -mcpu=cortex-m0plus, or -mthumb"
#endif

// From the compiler's runtime: the quotient is the low word, the remainder the high one. It is
// declared before the attributes below, because Clang allows no_builtin on definitions only.
extern "C" uint64_t __aeabi_idivmod(int dividend, int divisor) noexcept;  // NOLINT: the ABI's name

// Two codes in one source
// The fast code unrolls its loops, the small code does not. Builds for size (-Os, -Oz) and builds
// without optimisation (-O0) get the small code, all others get the fast one. With GCC this file
// also sets its own optimisation level, so a Debug build has the machine code of a release.
#if defined(__OPTIMIZE__) && !defined(__OPTIMIZE_SIZE__)
#define STRUTIL_FAST 1
#else
#define STRUTIL_FAST 0
#endif

// Options for this file, because users' flags cannot be relied on. First those that keep promises:
// no call of a C library, no constant data, no unwind tables. Without any of these lines
// tests/check-object fails, with the compiler that the line names, or the test that it names.
#if defined(__clang__)
#pragma clang attribute push
#pragma clang attribute(__attribute__((no_builtin)), apply_to = function)  // strlen (Clang 22)
#pragma clang attribute(__attribute__((no_stack_protector)), apply_to = function)
#pragma clang attribute(__attribute__((nothrow)), apply_to = hasType(functionType))  // unwinding
#elif defined(__GNUC__)
#pragma GCC push_options
#if STRUTIL_FAST
#pragma GCC optimize("O2", "inline", "no-ipa-sra")  // sra: GCC 14 makes other code at -Og
#else
#pragma GCC optimize("Os", "inline")  // without "inline", -O0 would inline nothing
#endif
#pragma GCC optimize("no-stack-protector", "no-exceptions")
// Loops become library calls, or vectors with constant data. The first also costs 2.4 %, 388 bytes.
#pragma GCC optimize("no-tree-loop-optimize", "no-tree-slp-vectorize")
// Wrong code from GCC 12 at "-Os -fno-inline-small-functions -fno-inline-functions-called-once": a
// caller keeps values in r1 to r3 across a call that overwrites them. The test is suite_calls.
#pragma GCC optimize("no-ipa-ra")
#endif

// Then those that save cycles or bytes. A figure says how much more the fast code takes WITHOUT the
// line: cycles as the geometric mean of the benchmark's calls of 4 units and more, bytes of all
// functions, with GCC 12 or Clang 19 for the Cortex-M0+.
#if defined(__clang__)
// Clang would unroll the unrolled loops again: 5.1 %, 2,966 bytes.
#pragma clang attribute(__attribute__((minsize)), apply_to = function)
#define STRUTIL_INLINE [[gnu::always_inline, gnu::flatten]] inline  // flatten, for lambdas: 74 %
#elif defined(__GNUC__)
// These three optimisations keep more values at once than there are low registers: 0.3, 0.5, 0.6 %.
#pragma GCC optimize("no-tree-pre", "no-move-loop-invariants", "no-schedule-insns")
#pragma GCC optimize("no-if-conversion")     // 0.2 %, and 2.6 % of the small code
#pragma GCC optimize("no-partial-inlining")  // 0.6 % and 192 bytes: a call in front of a loop
#define STRUTIL_INLINE [[gnu::always_inline]] inline
#endif

#if defined(__GNUC__) && !STRUTIL_FAST                 // GCC's fast code would take 264 bytes more
#define STRUTIL_LAMBDA __attribute__((always_inline))  // without it, GCC 8 has captures in memory
#else
#define STRUTIL_LAMBDA
#endif

#if defined(__GNUC__)                                               // GCC and Clang
#define STRUTIL_UNLIKELY(condition) __builtin_expect(condition, 0)  // GCC 2.2 %, Clang 0.8 %
#define STRUTIL_OPAQUE(value) __asm__("" : "+r"(value))  // hides the value from the optimiser
#else
#define STRUTIL_INLINE inline
#define STRUTIL_UNLIKELY(condition) (condition)
#define STRUTIL_OPAQUE(value) value = const_cast<const volatile unsigned&>(value)
#endif

// Moves a value that a loop does not need to a high register: 0.6 % with GCC, 0.8 % with Clang. It
// stands before the loop and again after it: with one of them, Clang keeps a low register occupied.
#if defined(__thumb__) && !defined(__thumb2__) && STRUTIL_FAST
#define STRUTIL_PARK(value) __asm__("" : "+h"(value))
#else
#define STRUTIL_PARK(value) static_cast<void>(value)
#endif

namespace {

using Byte = uint8_t;  // for narrow units: nothing depends on the sign of plain char

STRUTIL_INLINE Byte* units(char* str) { return reinterpret_cast<Byte*>(str); }
STRUTIL_INLINE const Byte* units(const char* str) { return reinterpret_cast<const Byte*>(str); }
STRUTIL_INLINE WCHAR* units(WCHAR* str) { return str; }
STRUTIL_INLINE const WCHAR* units(const WCHAR* str) { return str; }

// Back to the types of the API, which returns pointers into const strings as non-const.
char* api(const Byte* str) { return reinterpret_cast<char*>(const_cast<Byte*>(str)); }
WCHAR* api(const WCHAR* str) { return const_cast<WCHAR*>(str); }

// Bounds of a loop. take() says whether it may take so many more units. takeNext() may be called
// only after a call that returned true: GCC makes one subtraction and one branch of it.
struct Count {
  enum { isCount = true };
  int left;
  STRUTIL_INLINE bool take(int count) {
    if (left < count) return false;
    left -= count;
    return true;
  }
  STRUTIL_INLINE bool takeNext() { return --left >= 0; }
};

struct Unbounded {
  enum { isCount = false };
  static bool take(int) { return true; }  // STRUTIL_INLINE would cost the small code 5 %
};

// Adds as integers, because Clang would turn one moving pointer into several: 8.5 % and 528 bytes.
template <typename Unit>
STRUTIL_INLINE void advance(Unit*& at, uintptr_t count) {
  at = reinterpret_cast<Unit*>(reinterpret_cast<uintptr_t>(at) + count * sizeof(Unit));
}

// The loop behind nearly every function. Calls `goesOn` with the unit at each pointer and advances
// all pointers by one unit, until `goesOn` returns false or the bound is reached; returns whether
// the bound ended it. The units are references: `goesOn` may write them or take their addresses.
// The pointers are the caller's own: left at the units that `goesOn` rejected, or past the last.
template <typename Bound, typename GoesOn, typename... Unit>
STRUTIL_INLINE bool walk(Bound bound, const GoesOn& goesOn, Unit*&... at) {
  if constexpr (STRUTIL_FAST) {
    // Unrolled: addition, branch and bound take half the cycles of a simple step.
    for (; bound.take(4); (..., advance(at, 4))) {
      if (STRUTIL_UNLIKELY(!goesOn(at[0]...))) return false;
      if (STRUTIL_UNLIKELY(!goesOn(at[1]...))) return (..., advance(at, 1)), false;
      if (STRUTIL_UNLIKELY(!goesOn(at[2]...))) return (..., advance(at, 2)), false;
      if (STRUTIL_UNLIKELY(!goesOn(at[3]...))) return (..., advance(at, 3)), false;
    }
  } else if constexpr (Bound::isCount) {
    if (!bound.take(1)) return true;
    do {
      if (!goesOn(*at...)) return false;
      (..., ++at);
    } while (bound.takeNext());
    return true;
  }
  for (; bound.take(1); (..., ++at)) {
    if (!goesOn(*at...)) return false;
  }
  return true;
}

// Stops Clang from hoisting a constant above the loop, where it would occupy a register: 1.0 %.
template <typename Value>
STRUTIL_INLINE Value notHoisted(Value value) {
#if defined(__clang__)
  STRUTIL_OPAQUE(value);
#endif
  return value;
}

// Lengths and case mapping

enum { caseBit = 'a' - 'A' };  // in which the two cases of a letter differ
bool isLetterFrom(unsigned first, int c) { return static_cast<unsigned>(c) - first < 26; }

template <typename Unit>
STRUTIL_INLINE int length(const Unit* str) {
  if (!str) return 0;
  const Unit* end = str;
  walk(Unbounded{}, [](unsigned unit) STRUTIL_LAMBDA { return unit != 0; }, end);
  return static_cast<int>(end - str);
}

// Adds `change` to the 26 letters from `first` on. Most units need only the first test.
template <typename Unit>
STRUTIL_INLINE Unit* mapCase(Unit* str, unsigned first, int change) {
  if (!str) return nullptr;
  Unit* at = str;
  const auto mapUnit = [=](Unit& unit) STRUTIL_LAMBDA {
    if (unit < first) return unit != 0;
    if (unit < first + 26) unit = static_cast<Unit>(unit + change);
    return true;
  };
  walk(Unbounded{}, mapUnit, at);
  return str;
}

// Copying

// Copies up to and including the terminator, or up to the bound, where it may write a terminator of
// its own. Returns a pointer to the terminator, or just past the last unit.
enum AtBound { stop, terminate };
template <typename To, typename From, typename Bound>
STRUTIL_INLINE To* copyUnits(To* dst, const From* src, Bound bound, AtBound atBound) {
  const auto copyUnit = [](To& to, From from) STRUTIL_LAMBDA { return (to = from) != 0; };
  if (walk(bound, copyUnit, dst, src) && atBound == terminate) *dst = 0;
  return dst;
}

template <typename Unit>
STRUTIL_INLINE void copy(Unit* dst, const Unit* src) {
  if (!dst || dst == src) return;
  if (src) {
    copyUnits(dst, src, Unbounded{}, stop);
  } else {
    *dst = 0;
  }
}

template <typename Unit>
void copyBuf(Unit* dst, int n, const Unit* src) {
  if (!dst || dst == src || n < 1) return;
  copyUnits(dst, src, Count{src ? n - 1 : 0}, terminate);
}

template <typename Unit>
void nCopy(Unit* dst, const Unit* src, int n) {
  if (!dst || dst == src) return;
  *dst = 0;
  if (src) copyUnits(dst, src, Count{n}, stop);
}

// Concatenation

template <typename Unit, typename Bound>
void cat(Unit* dst, const Unit* src, Bound bound) {
  if (dst && src) copyUnits(dst + length(dst), src, bound, terminate);
}

template <typename Unit>
STRUTIL_INLINE void catBuf(Unit* dst, int n, const Unit* src, int num = INT_MAX) {
  if (!dst || !src) return;
  const int off = length(dst);
  if (n <= off + 1) return;
  const int nMax = n - off - 1;
  copyUnits(dst + off, src, Count{num < nMax ? num : nMax}, terminate);
}

// Searching

// The last is for StrNICmp, whose contract makes every difference negative.
enum CaseRule { exact, anyCase, anyCaseUnordered };

// Whether two units that differ are the two cases of one letter.
STRUTIL_INLINE bool differInCaseOnly(int a, int b) {
  return !STRUTIL_UNLIKELY((a ^ b) != caseBit) && isLetterFrom('a', a | b);
}

template <typename Unit>
STRUTIL_INLINE Unit* findUnit(Unit* str, unsigned c) {
  if (!str) return nullptr;
  Unit* match = nullptr;
  const auto isNoMatch = [c, &match](Unit& unit) STRUTIL_LAMBDA {
    if (unit == 0) {
      match = nullptr;
      return false;
    }
    match = &unit;
    return unit != c;
  };
  walk(Unbounded{}, isNoMatch, str);
  return match;
}

// Searches for the first unit of `substr`, then compares the rest. If that ends at the terminator
// of `str`, no later position has room for `substr`.
template <typename Unit>
STRUTIL_INLINE const Unit* find(const Unit* str, const Unit* substr, CaseRule rule) {
  if (!str || !substr || *str == 0) return nullptr;
  const int first = *substr;
  if (first == 0) return str;
  const bool hasCases = rule == anyCase && isLetterFrom('a', first | caseBit);
  const int other = hasCases ? first ^ caseBit : first;
  for (;; ++str) {
    const Unit* match = nullptr;
    const auto isNoMatch = [=, &match](const Unit& unit) STRUTIL_LAMBDA {
      if (unit != first && unit != other) return unit != 0;
      match = &unit;
      return false;
    };
    walk(Unbounded{}, isNoMatch, str);
    if (!match) return notHoisted<const Unit*>(nullptr);
    str = match;
    const Unit* at = str + 1;
    const Unit* rest = substr + 1;
    int lastOfStr = 0;  // these two are the units that ended the comparison
    int lastOfSubstr = 0;
    const auto isSame = [=, &lastOfStr, &lastOfSubstr](int unit, int wanted) STRUTIL_LAMBDA {
      lastOfStr = unit;
      lastOfSubstr = wanted;
      if (unit != wanted) return rule == anyCase && differInCaseOnly(unit, wanted);
      if (wanted == 0) return false;  // GCC: "return wanted != 0" takes 1.4 % and 236 bytes more
      return true;
    };
    walk(Unbounded{}, isSame, at, rest);
    if (lastOfSubstr == 0) return str;
    if (lastOfStr == 0) return notHoisted<const Unit*>(nullptr);
  }
}

// Comparison

// Returns 0, or the position i + 1 of the first difference, negative if the unit of str1 is the
// smaller one. Only two units that differ are mapped to lowercase, to find which is the smaller.
template <typename Unit, typename Bound = Unbounded>
STRUTIL_INLINE int compare(const Unit* str1, const Unit* str2, CaseRule rule, Bound bound = {}) {
  if (!str1 || !str2) return (str1 ? 1 : 0) - (str2 ? 1 : 0);
  if (str1 == str2) return 0;
  const Unit* at = str1;
  STRUTIL_PARK(str1);
  bool differ = false;
  int a = 0;
  int b = 0;
  const auto isSame = [=, &differ, &a, &b](int unit1, int unit2) STRUTIL_LAMBDA {
    a = unit1;
    b = unit2;
    if (STRUTIL_UNLIKELY(a != b)) {
      if (rule != exact && differInCaseOnly(unit1, unit2)) return true;
      differ = true;
      return false;
    }
    return unit2 != 0;
  };
  walk(bound, isSame, at, str2);
  if (!differ) return notHoisted(0);
  STRUTIL_PARK(str1);
  const int position = static_cast<int>(at - str1) + 1;
  if (rule == anyCaseUnordered) return -position;
  if (rule == anyCase) {
    a = CharToLower(a);
    b = CharToLower(b);
  }
  return a < b ? -position : position;
}

// Tokenizing and splitting

// A set never contains the terminator, so a loop that skips units of a set stops at the end of the
// string without a test for it. Sets are short: unrolling would cost more than it saves.
template <typename Unit>
STRUTIL_INLINE bool contains(const Unit* set, unsigned unit) {
  for (unsigned one = *set; one != 0; one = *++set) {
    if (one == unit) return true;
  }
  return false;
}

// Returns a pointer to the first unit that is in the set, or to the terminator.
template <typename Unit>
STRUTIL_INLINE Unit* findOneOf(Unit* str, const Unit* set) {
  const unsigned only = *set;  // most sets have one unit
  if (STRUTIL_FAST && (only == 0 || set[1] == 0)) {
    const auto isOther = [only](unsigned unit) { return unit != only && unit != 0; };
    walk(Unbounded{}, isOther, str);
  } else {
    while (*str != 0 && !contains(set, *str)) ++str;
  }
  return str;
}

template <typename Unit>
STRUTIL_INLINE Unit* token(Unit* str, int* off, const Unit* dlmt) {
  if (!str || !off || !dlmt) return nullptr;
  Unit* start = str + *off;
  while (contains(dlmt, *start)) ++start;
  *off = static_cast<int>(start - str);
  if (*start == 0) return nullptr;
  Unit* end = findOneOf(start + 1, dlmt);
  if (*end != 0) *end++ = 0;
  *off = static_cast<int>(end - str);
  return start;
}

// An overload pair such as this one lets a template call the exported function of its own width.
char* strToken(char* str, int* off, const char* dlmt) { return StrToken(str, off, dlmt); }
WCHAR* strToken(WCHAR* str, int* off, const WCHAR* dlmt) { return WStrToken(str, off, dlmt); }

// The small code calls StrToken instead of repeating its loops.
template <typename Char>
int split(Char* str, const Char* dlmt, Char** wrd) {
  if (!wrd) return 0;
  int off = 0;
  int num = 0;
  const auto next = [&] {
    return STRUTIL_FAST ? api(token(units(str), &off, units(dlmt))) : strToken(str, &off, dlmt);
  };
  while (Char* const tk = next()) wrd[num++] = tk;
  return num;
}

// Trimming

void strCopy(Byte* dst, const Byte* src) { StrCopy(api(dst), api(src)); }
void strCopy(WCHAR* dst, const WCHAR* src) { WStrCopy(dst, src); }

template <typename Unit>
int trim(Unit* str, const Unit* trimSet) {
  if (!str) return 0;
  Unit* first = str;
  if (trimSet) {
    while (contains(trimSet, *first)) ++first;
  }
  Unit* end = first + length(first);
  if (trimSet) {
    while (end > first + 1 && contains(trimSet, end[-1])) --end;
  }
  *end = 0;
  if (first != str) strCopy(str, first);
  return static_cast<int>(end - first);
}

// Replacing

int strLen(const Byte* str) { return StrLen(api(str)); }
int strLen(const WCHAR* str) { return WStrLen(str); }
const Byte* strStr(const Byte* str, const Byte* sub) { return units(StrStr(api(str), api(sub))); }
const WCHAR* strStr(const WCHAR* str, const WCHAR* sub) { return WStrStr(str, sub); }

// A length that is too large for an int wraps.
template <typename Unit>
int replacedLength(const Unit* orig, const Unit* rep, const Unit* with) {
  const int len_rep = strLen(rep);
  const int len_with = strLen(with);
  unsigned length = 0;
  for (; const Unit* const ins = strStr(orig, rep); orig = ins + len_rep) {
    length += static_cast<unsigned>(ins - orig) + static_cast<unsigned>(len_with);
  }
  return static_cast<int>(length + static_cast<unsigned>(strLen(orig)));
}

// Copies while it searches for the first unit of `rep`. `result` may be `orig` if `rep` does not
// occur in it; then nothing is written.
template <typename Unit>
int replace(const Unit* orig, const Unit* rep, const Unit* with, Unit* result) {
  if (!orig || !rep || *rep == 0 || !with) return 0;
  if (!result || result == orig) return replacedLength(orig, rep, with);
  Unit* to = result;
  const unsigned first = *rep;
  for (;;) {
    const auto copyOther = [first](Unit& unit, unsigned from) STRUTIL_LAMBDA {
      if (from == first) return false;
      return (unit = static_cast<Unit>(from)) != 0;
    };
    walk(Unbounded{}, copyOther, to, orig);
    if (*orig == 0) return static_cast<int>(to - result);
    const Unit* at = orig + 1;
    const Unit* rest = rep + 1;
    for (; *rest != 0 && *at == *rest; ++rest) ++at;
    if (*rest == 0) {
      to = copyUnits(to, with, Unbounded{}, stop);
      orig = at;
    } else {
      *to++ = *orig++;
    }
  }
}

// Integer text conversion

// Calls __aeabi_idivmod by name, because Clang would call two routines for the two results.
int divide(int dividend, int divisor, int& remainder) {
#if defined(__ARM_EABI__) && !defined(__ARM_FEATURE_IDIV) && !defined(__ARM_BIG_ENDIAN)
  const uint64_t both = __aeabi_idivmod(dividend, divisor);
  remainder = static_cast<int>(both >> 32);
  return static_cast<int>(both);
#else
  remainder = dividend % divisor;
  return dividend / divisor;
#endif
}

unsigned digitOf(unsigned value) { return value < 10 ? '0' + value : 'a' - 10 + value; }

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
    int digit = 0;
    value = divide(value, radix, digit);
    if (STRUTIL_UNLIKELY(value < 0)) {
      value = -value;
      digit = -digit;
    }
    *end++ = static_cast<Unit>(digitOf(static_cast<unsigned>(digit)));
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
  const auto addDigit = [&val](unsigned unit) STRUTIL_LAMBDA {
    const unsigned digit = unit - '0';
    if (digit > 9) return false;
    val = val * 10 + digit;
    return true;
  };
  walk(Unbounded{}, addDigit, string);
  return static_cast<int>(negative ? 0 - val : val);
}

// Width conversion

template <typename To, typename From>
STRUTIL_INLINE void copyCount(To* des, const From* src, int count) {
  const auto copyUnit = [](To& to, From from) STRUTIL_LAMBDA { return to = from, true; };
  walk(Count{count}, copyUnit, des, src);
}

// Copies two units at once where both arrays are word-aligned. If they overlap, this is still the
// copy unit by unit, since they are an even number of units apart.
STRUTIL_INLINE void copyWords(WORD* des, const WCHAR* src, int len) {
  if (!src || !des || len < 1) return;
#if defined(__GNUC__)
  struct [[gnu::may_alias]] Pair {
    uint32_t units;
  };
  if ((reinterpret_cast<uintptr_t>(src) | reinterpret_cast<uintptr_t>(des)) % sizeof(Pair) == 0) {
    const void* const from = src;
    copyCount(static_cast<Pair*>(static_cast<void*>(des)), static_cast<const Pair*>(from),
              len >> 1);
    if ((len & 1) != 0) des[len - 1] = src[len - 1];
    return;
  }
#endif
  copyCount(des, src, len);
}

STRUTIL_INLINE Byte* toPrintable(const WCHAR* src, Byte* des, int bufsize) {
  *des = 0;
  if (!src || bufsize < 1) return des;
  Byte* at = des;
  unsigned unit = 0;
  const auto copyPrintable = [&unit](Byte& to, unsigned from) STRUTIL_LAMBDA {
    unit = from;
    if (unit < ' ' || unit > '~') return false;
    to = static_cast<Byte>(unit);
    return true;
  };
  const auto room = [&] { return bufsize - 1 - static_cast<int>(at - des); };  // less terminator
  while (!walk(Count{room()}, copyPrintable, at, src) && unit != 0) {
    int shift = 12;  // of the first digit
    while (shift > 0 && unit >> shift == 0) shift -= 4;
    if (room() < 6 + (shift >> 2)) break;  // "&(0x", the digits and ")"
    *at++ = '&';
    *at++ = '(';
    *at++ = '0';
    *at++ = 'x';
    for (; shift >= 0; shift -= 4) *at++ = static_cast<Byte>(digitOf(unit >> shift & 15));
    *at++ = ')';
    ++src;
  }
  *at = 0;
  return des;
}

constexpr char emptyText[] = "";  // the library's only constant data

}  // namespace

int StrLen(const char* str) noexcept { return length(units(str)); }
int WStrLen(const WCHAR* str) noexcept { return length(units(str)); }
int CharToLower(const int c) noexcept { return isLetterFrom('A', c) ? c + caseBit : c; }
int CharToUpper(const int c) noexcept { return isLetterFrom('a', c) ? c - caseBit : c; }
char* StrUpper(char* str) noexcept { return api(mapCase(units(str), 'a', -caseBit)); }
WCHAR* WStrUpper(WCHAR* str) noexcept { return mapCase(str, 'a', -caseBit); }
char* StrLower(char* str) noexcept { return api(mapCase(units(str), 'A', caseBit)); }
WCHAR* WStrLower(WCHAR* str) noexcept { return mapCase(str, 'A', caseBit); }

void StrCopy(char* dst, const char* src) noexcept { copy(units(dst), units(src)); }
void WStrCopy(WCHAR* dst, const WCHAR* src) noexcept { copy(dst, src); }
void StrCopyBuf(char* dst, int n, const char* src) noexcept { copyBuf(units(dst), n, units(src)); }
void WStrCopyBuf(WCHAR* dst, int n, const WCHAR* src) noexcept { copyBuf(dst, n, src); }
void StrNCopy(char* dst, const char* src, int n) noexcept { nCopy(units(dst), units(src), n); }
void WStrNCopy(WCHAR* dst, const WCHAR* src, int n) noexcept { nCopy(dst, src, n); }

void StrCat(char* dst, const char* src) noexcept { cat(units(dst), units(src), Unbounded{}); }
void WStrCat(WCHAR* dst, const WCHAR* src) noexcept { cat(dst, src, Unbounded{}); }
void StrCatBuf(char* dst, int n, const char* src) noexcept { catBuf(units(dst), n, units(src)); }
void WStrCatBuf(WCHAR* dst, int n, const WCHAR* src) noexcept { catBuf(dst, n, src); }
void WStrNCat(WCHAR* dst, const WCHAR* src, int num) noexcept { cat(dst, src, Count{num}); }
void WStrNCatBuf(WCHAR* dst, int n, const WCHAR* src, int num) noexcept {
  catBuf(dst, n, src, num);
}

// A caller whose plain char is signed sign-extends `c` to 32 bits, another one zero-extends it, and
// the compiler assumes this file's own way. Hiding the value makes it take the low 8 bits of `c`.
char* StrChr(const char* str, const char c) noexcept {
  unsigned unit = static_cast<Byte>(c);
  STRUTIL_OPAQUE(unit);
  return api(findUnit(units(str), static_cast<Byte>(unit)));
}
WCHAR* WStrChr(const WCHAR* str, const WCHAR c) noexcept { return api(findUnit(str, c)); }
char* StrStr(const char* str, const char* substr) noexcept {
  return api(find(units(str), units(substr), exact));
}
WCHAR* WStrStr(const WCHAR* str, const WCHAR* substr) noexcept {
  return api(find(str, substr, exact));
}
char* StrIStr(const char* str, const char* substr) noexcept {
  return api(find(units(str), units(substr), anyCase));
}
WCHAR* WStrIStr(const WCHAR* str, const WCHAR* substr) noexcept {
  return api(find(str, substr, anyCase));
}

int StrCmp(const char* str1, const char* str2) noexcept {
  return compare(units(str1), units(str2), exact);
}
int WStrCmp(const WCHAR* str1, const WCHAR* str2) noexcept { return compare(str1, str2, exact); }
int StrICmp(const char* str1, const char* str2) noexcept {
  return compare(units(str1), units(str2), anyCase);
}
int WStrICmp(const WCHAR* str1, const WCHAR* str2) noexcept { return compare(str1, str2, anyCase); }
int StrNCmp(const char* str1, const char* str2, int n) noexcept {
  return compare(units(str1), units(str2), exact, Count{n});
}
int WStrNCmp(const WCHAR* str1, const WCHAR* str2, int n) noexcept {
  return compare(str1, str2, exact, Count{n});
}
int StrNICmp(const char* str1, const char* str2, int n) noexcept {
  return compare(units(str1), units(str2), anyCaseUnordered, Count{n});
}
int WStrNICmp(const WCHAR* str1, const WCHAR* str2, int n) noexcept {
  return compare(str1, str2, anyCase, Count{n});
}

char* StrToken(char* str, int* off, const char* dlmt) noexcept {
  return api(token(units(str), off, units(dlmt)));
}
WCHAR* WStrToken(WCHAR* str, int* off, const WCHAR* dlmt) noexcept { return token(str, off, dlmt); }
int StrSplit(char* str, const char* dlmt, char** wrd) noexcept { return split(str, dlmt, wrd); }
int WStrSplit(WCHAR* str, const WCHAR* dlmt, WCHAR** wrd) noexcept { return split(str, dlmt, wrd); }

int StrTrim(char* str, const char* trimSet) noexcept { return trim(units(str), units(trimSet)); }
int WStrTrim(WCHAR* str, const WCHAR* trimSet) noexcept { return trim(str, trimSet); }

int StrReplace(const char* orig, const char* rep, const char* with, char* result) noexcept {
  return replace(units(orig), units(rep), units(with), units(result));
}
int WStrReplace(const WCHAR* orig, const WCHAR* rep, const WCHAR* with, WCHAR* result) noexcept {
  return replace(orig, rep, with, result);
}

char* IntToStr(int value, char* string, int radix) noexcept {
  return api(fromInt(value, units(string), radix));
}
WCHAR* IntToWStr(int value, WCHAR* string, int radix) noexcept {
  return fromInt(value, string, radix);
}
int StrToInt(const char* string) noexcept { return toInt(units(string)); }
int WStrToInt(const WCHAR* string) noexcept { return toInt(string); }

void BytesToWords(const char* src, WORD* des, int len) noexcept {
  if (src && des) copyCount(des, units(src), len);
}
WCHAR* StrToWStr(const char* src, WCHAR* des, int bufsize) noexcept {
  if (!des) return nullptr;
  copyUnits(des, units(src), Count{src && bufsize > 0 ? bufsize - 1 : 0}, terminate);
  return des;
}
char* WStrToStr(const WCHAR* src, char* des, int bufsize) noexcept {
  return des ? api(toPrintable(src, units(des), bufsize)) : const_cast<char*>(emptyText);
}
void WStrToWords(const WCHAR* src, WORD* des, int len) noexcept { copyWords(des, src, len); }

#if defined(__clang__)
#pragma clang attribute pop
#elif defined(__GNUC__)
#pragma GCC pop_options
#endif
