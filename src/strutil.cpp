// Each operation is written once, mostly as a template on the unit, by family; then follow the
// functions of the library, which call them. An unnamed namespace leaves no symbols of the
// templates.
#include "strutil.h"

#include <limits.h>

#if defined(__arm__) && !defined(__thumb__) && __ARM_ARCH < 6  // links, and hangs a Cortex-M
#error "ARM code: give the C++ compiler the processor, such as -mcpu=cortex-m0plus, or -mthumb"
#endif

// The division of a target that has none, in the compiler's runtime: gives the quotient and, above
// it, the remainder. It is declared here, since Clang puts no_builtin on definitions only.
extern "C" uint64_t __aeabi_idivmod(int dividend, int divisor) noexcept;  // NOLINT: the ABI's name

// That compilers invent no library call and no constant data, and that these loops are fast and
// small: users' flags cannot be relied on for it. Figures are of -O2 by GCC 12 and Clang 19 for the
// Cortex-M0+: bytes of all code, and cycles of all calls that the benchmark compares.
#if defined(__clang__)
#pragma clang attribute push
// The first is insurance: Clang 19 and 22 make no call of these loops. Without the others: calls of
// the C library, where users protect functions; tables for unwinding that need the C++ runtime;
// every small loop four times (2,740 bytes, 9 %).
#pragma clang attribute(__attribute__((no_builtin)), apply_to = function)
#pragma clang attribute(__attribute__((no_stack_protector)), apply_to = function)
#pragma clang attribute(__attribute__((nothrow)), apply_to = hasType(functionType))
#pragma clang attribute(__attribute__((minsize)), apply_to = function)
#define STRUTIL_INLINE [[gnu::always_inline, gnu::flatten]] inline  // flatten: of lambdas; 105 %
#elif defined(__GNUC__)
#pragma GCC push_options
#pragma GCC optimize("no-stack-protector")  // calls, where users ask for it; as does the next
#if __GNUC__ >= 12
#pragma GCC optimize("trivial-auto-var-init=uninitialized")
#endif
#pragma GCC optimize("no-exceptions")  // tables for unwinding, as above: 400 bytes
// Constant data, where there are vectors; the first also costs 400 bytes and 4 % here.
#pragma GCC optimize("no-tree-loop-optimize", "no-tree-slp-vectorize")
// Wrong code by GCC 12's "-Os -fno-inline-small-functions -fno-inline-functions-called-once": a
// caller keeps values in r1 to r3, and the called function pops its frame into them.
#pragma GCC optimize("no-ipa-ra")
// More values than the core has low registers: up to 1.7 % each, and 13 % of WStrToStr.
#pragma GCC optimize("no-tree-pre", "no-move-loop-invariants", "no-schedule-insns")
#pragma GCC optimize("no-schedule-insns2", "no-if-conversion")
#pragma GCC optimize("no-partial-inlining")  // a call before a loop: 190 bytes
#define STRUTIL_INLINE [[gnu::always_inline]] inline
#else
#define STRUTIL_INLINE inline
#endif

#if defined(__clang__) || defined(__GNUC__)
#define STRUTIL_UNLIKELY(condition) __builtin_expect(condition, 0)
#define STRUTIL_OPAQUE(value) __asm__("" : "+r"(value))  // hides where the value comes from
#define STRUTIL_ALIASING [[gnu::may_alias]]
#else
#define STRUTIL_UNLIKELY(condition) (condition)
#define STRUTIL_OPAQUE(value) value = const_cast<const volatile unsigned&>(value)
#endif

// Parks a value that a loop does not use in a high register: 24 % of a short StrCmp by GCC.
#if defined(__thumb__) && !defined(__thumb2__) && !defined(__OPTIMIZE_SIZE__)
#define STRUTIL_PARK(value) __asm__("" : "+h"(value))
#else
#define STRUTIL_PARK(value) static_cast<void>(value)
#endif

namespace {

// Narrow text is read and written as bytes, so that nothing depends on the sign of a plain char.
using Byte = uint8_t;

STRUTIL_INLINE Byte* units(char* str) { return reinterpret_cast<Byte*>(str); }
STRUTIL_INLINE const Byte* units(const char* str) { return reinterpret_cast<const Byte*>(str); }
STRUTIL_INLINE WCHAR* units(WCHAR* str) { return str; }
STRUTIL_INLINE const WCHAR* units(const WCHAR* str) { return str; }

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

struct Unbounded {
  static bool take(int) { return true; }
};

// A small build shares what a fast one repeats: a function that serves several of the library's,
// rather than a copy in each; a loop with a bound, however great, also for those without.
#if defined(__OPTIMIZE_SIZE__)
#define STRUTIL_CORE inline
enum { isSmall = true };  // enumerators, not constants: unoptimised builds store those
using Whole = Count;
#else
#define STRUTIL_CORE STRUTIL_INLINE
enum { isSmall = false };
using Whole = Unbounded;
#endif

// As an integer: of a pointer that moves, Clang makes several, each with an offset of its own.
template <typename Unit>
STRUTIL_INLINE void advance(Unit*& at, uintptr_t count) {
  at = reinterpret_cast<Unit*>(reinterpret_cast<uintptr_t>(at) + count * sizeof(Unit));
}

template <typename... Unit>
STRUTIL_INLINE bool stopAfter(uintptr_t count, Unit*&... at) {
  (..., advance(at, count));
  return false;
}

// What all loops over text are expressed through: passes the units that the pointers point at to
// `goesOn`, one of each, and moves all pointers on by one unit, until `goesOn` returns false or the
// bound is reached, and returns whether that ended it. The pointers are left at the units that
// ended it, or after the last ones. Four steps a turn: arithmetic, jump and bound cost half a
// simple step. By value, `goesOn` would be copied by memcpy in GCC's -Og.
template <typename Bound, typename GoesOn, typename... Unit>
STRUTIL_INLINE bool walk(Bound bound, const GoesOn& goesOn, Unit*&... at) {
  for (; !isSmall && bound.take(4); (..., advance(at, 4))) {
    if (STRUTIL_UNLIKELY(!goesOn(at[0]...))) return false;
    if (STRUTIL_UNLIKELY(!goesOn(at[1]...))) return stopAfter(1, at...);
    if (STRUTIL_UNLIKELY(!goesOn(at[2]...))) return stopAfter(2, at...);
    if (STRUTIL_UNLIKELY(!goesOn(at[3]...))) return stopAfter(3, at...);
  }
  for (; bound.take(1); (..., advance(at, 1))) {
    if (!goesOn(*at...)) return false;
  }
  return true;
}

// Clang would make a constant before the loop, in a register: 55 % of a short StrCmp.
template <typename Value>
STRUTIL_INLINE Value late(Value value) {
#if defined(__clang__)
  STRUTIL_OPAQUE(value);
#endif
  return value;
}

// Lengths and case mapping

enum { caseBit = 'a' - 'A' };  // what separates the two cases of a letter

bool isLetterFrom(unsigned first, int c) { return static_cast<unsigned>(c) - first < 26; }

template <typename Unit>
STRUTIL_INLINE int length(const Unit* str) {
  if (!str) return 0;
  const Unit* end = str;
  walk(Unbounded{}, [](unsigned unit) { return unit != 0; }, end);
  return static_cast<int>(end - str);
}

// Adds `change` to the 26 letters from `first` on. Most units need only the first test.
template <typename Unit>
STRUTIL_CORE Unit* switchCase(Unit* str, unsigned first, int change) {
  if (!str) return nullptr;
  Unit* at = str;
  const auto mapUnit = [=](Unit& unit) {
    if (unit < first) return unit != 0;
    if (unit < first + 26) unit = static_cast<Unit>(unit + change);
    return true;
  };
  walk(Unbounded{}, mapUnit, at);
  return str;
}

// Copying

// Copies up to and including the terminator, or until the bound, where it may write a terminator of
// its own. Returns where the terminator is, or would be.
enum AtBound { stop, terminate };
template <typename To, typename From, typename Bound>
STRUTIL_CORE To* copyUnits(To* dst, const From* src, Bound bound, AtBound atBound) {
  const auto copyUnit = [](To& to, From from) { return (to = from) != 0; };
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

// Pairs such as these let a template call the twin of its own width.
int strLen(const Byte* str) { return StrLen(text(str)); }
int strLen(const WCHAR* str) { return WStrLen(str); }

// `length` in a fast build, a call of the function that has it in a small one.
template <typename Unit>
STRUTIL_INLINE int lengthOf(const Unit* str) {
  return isSmall ? strLen(str) : length(str);
}

template <typename Unit, typename Bound>
void cat(Unit* dst, const Unit* src, Bound bound) {
  if (dst && src) copyUnits(dst + lengthOf(dst), src, bound, terminate);
}

template <typename Unit>
STRUTIL_CORE void nCatBuf(Unit* dst, int n, const Unit* src, int num = INT_MAX) {
  if (!dst || !src) return;
  const int off = lengthOf(dst);
  if (n <= off + 1) return;
  const int nMax = n - off - 1;
  copyUnits(dst + off, src, Count{num < nMax ? num : nMax}, terminate);
}

// Searching

// The last is StrNICmp's, by its contract: every difference is negative.
enum CaseRule { exact, ignoreCase, ignoreCaseAndOrder };

// Whether two units that differ are the two cases of a letter.
STRUTIL_INLINE bool differInCaseOnly(int a, int b) {
  if (STRUTIL_UNLIKELY((a ^ b) != caseBit)) return false;
  return isLetterFrom('a', a | b);
}

template <typename Unit>
STRUTIL_INLINE Unit* findUnit(Unit* str, unsigned c) {
  if (!str) return nullptr;
  Unit* place = nullptr;
  const auto isOther = [c, &place](Unit& unit) {
    if (unit == 0) return false;
    if (unit == c) {
      place = &unit;
      return false;
    }
    return true;
  };
  walk(Unbounded{}, isOther, str);
  return place;
}

// Looks for the first unit of substr before it compares the rest. Where the rest fails at the
// terminator of str, no later place has room for substr.
template <typename Unit>
STRUTIL_CORE const Unit* find(const Unit* str, const Unit* substr, CaseRule rule) {
  if (!str || !substr || *str == 0) return nullptr;
  const int first = *substr;
  if (first == 0) return str;
  const bool hasCases = rule == ignoreCase && differInCaseOnly(first, first ^ caseBit);
  const int other = hasCases ? first ^ caseBit : first;
  for (;; ++str) {
    const Unit* place = nullptr;
    const auto isOther = [=, &place](const Unit& unit) {
      if (unit != first && unit != other) return unit != 0;
      place = &unit;
      return false;
    };
    walk(Unbounded{}, isOther, str);
    if (!place) return late<const Unit*>(nullptr);
    str = place;
    const Unit* at = str + 1;
    const Unit* rest = substr + 1;
    int a = 0;
    int b = 0;
    const auto match = [=, &a, &b](int unit, int wanted) {
      a = unit;
      b = wanted;
      if (a != b) return rule == ignoreCase && differInCaseOnly(unit, wanted);
      if (wanted == 0) return false;  // "return wanted != 0" costs GCC 236 bytes
      return true;
    };
    walk(Unbounded{}, match, at, rest);
    if (b == 0) return str;
    if (a == 0) return late<const Unit*>(nullptr);
  }
}

// Comparison

// Returns 0, or the position i + 1 of the first difference: negative where str1 has the smaller
// unit. Units that are equal are not mapped, and the others only to see which is the smaller.
template <typename Unit, typename Bound>
STRUTIL_CORE int compare(const Unit* str1, const Unit* str2, Bound bound, CaseRule rule) {
  if (!str1 || !str2) return (str1 ? 1 : 0) - (str2 ? 1 : 0);
  if (str1 == str2) return 0;
  const Unit* at = str1;
  STRUTIL_PARK(str1);
  bool differ = false;
  int a = 0;
  int b = 0;
  const auto match = [=, &differ, &a, &b](int unit1, int unit2) {
    a = unit1;
    b = unit2;
    if (STRUTIL_UNLIKELY(a != b)) {
      if (rule != exact && differInCaseOnly(unit1, unit2)) return true;
      differ = true;
      return false;
    }
    return unit2 != 0;
  };
  walk(bound, match, at, str2);
  if (!differ) return late(0);
  STRUTIL_PARK(str1);
  const int position = static_cast<int>(at - str1) + 1;
  if (rule == ignoreCaseAndOrder) return -position;
  if (rule == ignoreCase) {
    a = CharToLower(a);
    b = CharToLower(b);
  }
  return a < b ? -position : position;
}

// Tokenizing and splitting

Byte* strChr(const Byte* str, unsigned c) { return units(StrChr(text(str), static_cast<char>(c))); }
WCHAR* strChr(const WCHAR* str, unsigned c) { return WStrChr(str, static_cast<WCHAR>(c)); }

// Sets are short: a turn of the walk costs more than it saves.
template <typename Unit>
STRUTIL_INLINE bool contains(const Unit* set, unsigned unit) {
  if (isSmall) return strChr(set, unit) != nullptr;
  for (unsigned one = *set; one != 0; one = *++set) {
    if (one == unit) return true;
  }
  return false;
}

// Returns the first place whose unit is in the set, or the terminator. Most sets are of one unit.
template <typename Unit>
STRUTIL_INLINE Unit* findOneOf(Unit* str, const Unit* set) {
  const unsigned only = *set;
  if (!isSmall && (only == 0 || set[1] == 0)) {
    walk(Unbounded{}, [only](unsigned unit) { return unit != only && unit != 0; }, str);
  } else {
    while (*str != 0 && !contains(set, *str)) ++str;
  }
  return str;
}

template <typename Unit>
STRUTIL_CORE Unit* token(Unit* str, int* off, const Unit* dlmt) {
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

template <typename Text>
int split(Text* str, const Text* dlmt, Text** wrd) {
  if (!wrd) return 0;
  int off = 0;
  int num = 0;
  while (auto* const tk = token(units(str), &off, units(dlmt))) wrd[num++] = text(tk);
  return num;
}

// Trimming

void strCopy(Byte* dst, const Byte* src) { StrCopy(text(dst), text(src)); }
void strCopy(WCHAR* dst, const WCHAR* src) { WStrCopy(dst, src); }

template <typename Unit>
int trim(Unit* str, const Unit* trimSet) {
  if (!str) return 0;
  Unit* first = str;
  if (trimSet) {
    while (contains(trimSet, *first)) ++first;
  }
  Unit* end = first + lengthOf(first);
  if (trimSet) {
    while (end > first + 1 && contains(trimSet, end[-1])) --end;
  }
  *end = 0;
  const int kept = static_cast<int>(end - first);
  if (first != str) strCopy(str, first);
  return kept;
}

// Replacing

const Byte* strStr(const Byte* str, const Byte* sub) { return units(StrStr(text(str), text(sub))); }
const WCHAR* strStr(const WCHAR* str, const WCHAR* sub) { return WStrStr(str, sub); }

// A length that is too great for an int wraps.
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

// Copies while it looks for the first unit of `rep`. `result` may be `orig` where nothing is to be
// replaced, and then nothing is written.
template <typename Unit>
int replace(const Unit* orig, const Unit* rep, const Unit* with, Unit* result) {
  if (!orig || !rep || *rep == 0 || !with) return 0;
  if (!result || result == orig) return replacedLength(orig, rep, with);
  Unit* to = result;
  const unsigned first = *rep;
  for (;;) {
    const auto copyOther = [first](Unit& unit, unsigned from) {
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

// By name where there is one: unoptimised builds, and Clang, would call one for each result.
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
  const auto addDigit = [&val](unsigned unit) {
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
STRUTIL_CORE void copyCount(To*& des, const From*& src, int count) {
  const auto copyUnit = [](To& to, From from) { return to = from, true; };
  walk(Count{count}, copyUnit, des, src);
}

#if defined(STRUTIL_ALIASING)
// Two units in one word. Word by word is also unit by unit, forward, where the arrays overlap: both
// being aligned, they are an even number of units apart.
struct STRUTIL_ALIASING Pair {
  uint32_t units;
};
bool isAligned(const void* pair) { return reinterpret_cast<uintptr_t>(pair) % sizeof(Pair) == 0; }
#endif

STRUTIL_INLINE void copyWords(WORD* des, const WCHAR* src, int len) {
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

STRUTIL_INLINE Byte* toPrintable(const WCHAR* src, Byte* des, int bufsize) {
  *des = 0;
  if (!src || bufsize < 1) return des;
  Byte* at = des;
  unsigned unit = 0;
  const auto copyPrintable = [&unit](Byte& to, unsigned from) {
    unit = from;
    if (unit < ' ' || unit > '~') return false;
    to = static_cast<Byte>(unit);
    return true;
  };
  // How many units fit before the terminator.
  const auto room = [&] { return bufsize - 1 - static_cast<int>(at - des); };
  while (!walk(Count{room()}, copyPrintable, at, src) && unit != 0) {
    int shift = 12;  // of the first digit
    while (shift > 0 && unit >> shift == 0) shift -= 4;
    const int digits = (shift >> 2) + 1;
    if (room() < 4 + digits + 1) break;
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
char* StrUpper(char* str) noexcept { return text(switchCase(units(str), 'a', -caseBit)); }
WCHAR* WStrUpper(WCHAR* str) noexcept { return switchCase(str, 'a', -caseBit); }
char* StrLower(char* str) noexcept { return text(switchCase(units(str), 'A', caseBit)); }
WCHAR* WStrLower(WCHAR* str) noexcept { return switchCase(str, 'A', caseBit); }

void StrCopy(char* dst, const char* src) noexcept { copy(units(dst), units(src)); }
void WStrCopy(WCHAR* dst, const WCHAR* src) noexcept { copy(dst, src); }
void StrCopyBuf(char* dst, int n, const char* src) noexcept { copyBuf(units(dst), n, units(src)); }
void WStrCopyBuf(WCHAR* dst, int n, const WCHAR* src) noexcept { copyBuf(dst, n, src); }
void StrNCopy(char* dst, const char* src, int n) noexcept { nCopy(units(dst), units(src), n); }
void WStrNCopy(WCHAR* dst, const WCHAR* src, int n) noexcept { nCopy(dst, src, n); }

void StrCat(char* dst, const char* src) noexcept { cat(units(dst), units(src), Unbounded{}); }
void WStrCat(WCHAR* dst, const WCHAR* src) noexcept { cat(dst, src, Unbounded{}); }
void StrCatBuf(char* dst, int n, const char* src) noexcept { nCatBuf(units(dst), n, units(src)); }
void WStrCatBuf(WCHAR* dst, int n, const WCHAR* src) noexcept { nCatBuf(dst, n, src); }
void WStrNCat(WCHAR* dst, const WCHAR* src, int num) noexcept { cat(dst, src, Count{num}); }
void WStrNCatBuf(WCHAR* dst, int n, const WCHAR* src, int num) noexcept {
  nCatBuf(dst, n, src, num);
}

// A caller whose plain char is signed passes `c` extended by its sign, and one whose is not by
// zeros; the compiler trusts that all do as this module does. The low 8 bits count.
char* StrChr(const char* str, const char c) noexcept {
  unsigned unit = static_cast<Byte>(c);
  STRUTIL_OPAQUE(unit);
  return text(findUnit(units(str), static_cast<Byte>(unit)));
}
WCHAR* WStrChr(const WCHAR* str, const WCHAR c) noexcept { return text(findUnit(str, c)); }
char* StrStr(const char* str, const char* substr) noexcept {
  return text(find(units(str), units(substr), exact));
}
WCHAR* WStrStr(const WCHAR* str, const WCHAR* substr) noexcept {
  return text(find(str, substr, exact));
}
char* StrIStr(const char* str, const char* substr) noexcept {
  return text(find(units(str), units(substr), ignoreCase));
}
WCHAR* WStrIStr(const WCHAR* str, const WCHAR* substr) noexcept {
  return text(find(str, substr, ignoreCase));
}

int StrNCmp(const char* str1, const char* str2, int n) noexcept {
  return compare(units(str1), units(str2), Count{n}, exact);
}
int WStrNCmp(const WCHAR* str1, const WCHAR* str2, int n) noexcept {
  return compare(str1, str2, Count{n}, exact);
}
int StrNICmp(const char* str1, const char* str2, int n) noexcept {
  return compare(units(str1), units(str2), Count{n}, ignoreCaseAndOrder);
}
int WStrNICmp(const WCHAR* str1, const WCHAR* str2, int n) noexcept {
  return compare(str1, str2, Count{n}, ignoreCase);
}
int StrCmp(const char* str1, const char* str2) noexcept {
  return compare(units(str1), units(str2), Whole{}, exact);
}
int WStrCmp(const WCHAR* str1, const WCHAR* str2) noexcept {
  return compare(str1, str2, Whole{}, exact);
}
int StrICmp(const char* str1, const char* str2) noexcept {
  return compare(units(str1), units(str2), Whole{}, ignoreCase);
}
int WStrICmp(const WCHAR* str1, const WCHAR* str2) noexcept {
  return compare(str1, str2, Whole{}, ignoreCase);
}

char* StrToken(char* str, int* off, const char* dlmt) noexcept {
  return text(token(units(str), off, units(dlmt)));
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
  return text(fromInt(value, units(string), radix));
}
WCHAR* IntToWStr(int value, WCHAR* string, int radix) noexcept {
  return fromInt(value, string, radix);
}
int StrToInt(const char* string) noexcept { return toInt(units(string)); }
int WStrToInt(const WCHAR* string) noexcept { return toInt(string); }

void BytesToWords(const char* src, WORD* des, int len) noexcept {
  const Byte* from = units(src);
  if (from && des) copyCount(des, from, len);
}
WCHAR* StrToWStr(const char* src, WCHAR* des, int bufsize) noexcept {
  if (!des) return nullptr;
  copyUnits(des, units(src), Count{src && bufsize > 0 ? bufsize - 1 : 0}, terminate);
  return des;
}
char* WStrToStr(const WCHAR* src, char* des, int bufsize) noexcept {
  return des ? text(toPrintable(src, units(des), bufsize)) : const_cast<char*>(emptyText);
}
void WStrToWords(const WCHAR* src, WORD* des, int len) noexcept { copyWords(des, src, len); }

#if defined(__clang__)
#pragma clang attribute pop
#elif defined(__GNUC__)
#pragma GCC pop_options
#endif
