// Each operation is written once, as a template on the unit, and the functions of both widths are
// entries of one line. The templates stand in unnamed namespaces: elsewhere each would leave a
// symbol of its own in the object.
#include "strutil.h"

static_assert(static_cast<char>(-1) > 0, "narrow units are 0 to 255: compile with -funsigned-char");

namespace {

// Bounds of a walk: how many more units it may take.
struct Count {
  int left;

  bool take(int units) {
    if (left < units) return false;
    left -= units;
    return true;
  }
};

struct Endless {
  static bool take(int) { return true; }
};

// Tells the compiler which way a walk mostly goes: a branch not taken is the cheaper one.
constexpr bool rarely(bool condition) { return __builtin_expect(condition, false); }

// The loop that all others are expressed through: passes the units that the pointers point at to
// `stop`, one of each, and moves all pointers on by one unit, until `stop` returns true or the
// bound is reached. The pointers are left at the units that stopped it, or after the last ones.
// Returns whether it was stopped. Four steps a turn: the arithmetic and the jump back, and the test
// of the bound, cost half as much as the rest of a simple step.
template <typename Bound, typename Stop, typename... Unit>
[[gnu::always_inline]] inline bool walk(Bound bound, Stop stop, Unit*&... at) {
  for (; bound.take(4); (..., (at += 4))) {
    if (rarely(stop(at[0]...))) return true;
    if (rarely(stop(at[1]...))) return (..., (at += 1)), true;
    if (rarely(stop(at[2]...))) return (..., (at += 2)), true;
    if (rarely(stop(at[3]...))) return (..., (at += 3)), true;
  }
  for (; bound.take(1); (..., ++at)) {
    if (stop(*at...)) return true;
  }
  return false;
}

constexpr int noLimit = 0x7fffffff;

}  // namespace

// Lengths and case mapping

namespace {

// What separates the two cases of a letter.
constexpr int caseBit = 'a' - 'A';

// Whether c is one of the 26 letters from `first` on.
template <unsigned first>
bool isLetterFrom(unsigned c) {
  return c - first < 26;
}

template <typename Unit>
[[gnu::always_inline]] inline int length(const Unit* str) {
  if (!str) return 0;
  const Unit* end = str;
  walk(
      Endless{}, [](unsigned unit) { return unit == 0; }, end);
  return static_cast<int>(end - str);
}

// Gives the letters from `first` on their other case.
template <unsigned first, typename Unit>
[[gnu::always_inline]] inline Unit* switchCase(Unit* str) {
  if (!str) return nullptr;
  Unit* at = str;
  walk(
      Endless{},
      [](Unit& unit) {
        if (!isLetterFrom<first>(unit)) return unit == 0;
        unit = static_cast<Unit>(unit ^ caseBit);
        return false;
      },
      at);
  return str;
}

}  // namespace

int StrLen(const char* str) { return length(str); }
int WStrLen(const WCHAR* str) { return length(str); }

int CharToLower(const int c) {
  return isLetterFrom<'A'>(static_cast<unsigned>(c)) ? c + caseBit : c;
}

int CharToUpper(const int c) {
  return isLetterFrom<'a'>(static_cast<unsigned>(c)) ? c - caseBit : c;
}

char* StrUpper(char* str) { return switchCase<'a'>(str); }
WCHAR* WStrUpper(WCHAR* str) { return switchCase<'a'>(str); }

char* StrLower(char* str) { return switchCase<'A'>(str); }
WCHAR* WStrLower(WCHAR* str) { return switchCase<'A'>(str); }

// Copying

namespace {

// Copies up to the terminator, or up to the bound without one, and returns where it ended.
template <typename To, typename From, typename Bound>
[[gnu::always_inline]] inline To* copyUnits(To* dst, const From* src, Bound bound) {
  walk(
      bound, [](To& to, From from) { return (to = from) == 0; }, dst, src);
  return dst;
}

template <typename Unit>
[[gnu::always_inline]] inline void copy(Unit* dst, const Unit* src) {
  if (!dst || dst == src) return;
  *dst = 0;
  if (!src) return;
  copyUnits(dst, src, Endless{});
}

template <typename Unit>
[[gnu::always_inline]] inline void copyBuf(Unit* dst, int n, const Unit* src) {
  if (!dst || dst == src || n < 1) return;
  *dst = 0;
  if (!src) return;
  *copyUnits(dst, src, Count{n - 1}) = 0;
}

template <typename Unit>
[[gnu::always_inline]] inline void nCopy(Unit* dst, const Unit* src, int n) {
  if (!dst || dst == src) return;
  *dst = 0;
  if (!src) return;
  copyUnits(dst, src, Count{n});
}

}  // namespace

void StrCopy(char* dst, const char* src) { copy(dst, src); }
void WStrCopy(WCHAR* dst, const WCHAR* src) { copy(dst, src); }

void StrCopyBuf(char* dst, int n, const char* src) { copyBuf(dst, n, src); }
void WStrCopyBuf(WCHAR* dst, int n, const WCHAR* src) { copyBuf(dst, n, src); }

void StrNCopy(char* dst, const char* src, int n) { nCopy(dst, src, n); }
void WStrNCopy(WCHAR* dst, const WCHAR* src, int n) { nCopy(dst, src, n); }

// Concatenation

namespace {

template <typename Unit>
[[gnu::always_inline]] inline void cat(Unit* dst, const Unit* src) {
  if (!dst || !src) return;
  copyUnits(dst + length(dst), src, Endless{});
}

template <typename Unit>
[[gnu::always_inline]] inline void nCatBuf(Unit* dst, int n, const Unit* src, int num) {
  if (!dst || !src) return;
  const int off = length(dst);
  if (n <= off + 1) return;
  const int nMax = n - off - 1;
  *copyUnits(dst + off, src, Count{num < nMax ? num : nMax}) = 0;
}

}  // namespace

void StrCat(char* dst, const char* src) { cat(dst, src); }
void WStrCat(WCHAR* dst, const WCHAR* src) { cat(dst, src); }

void StrCatBuf(char* dst, int n, const char* src) { nCatBuf(dst, n, src, noLimit); }
void WStrCatBuf(WCHAR* dst, int n, const WCHAR* src) { nCatBuf(dst, n, src, noLimit); }

void WStrNCat(WCHAR* dst, const WCHAR* src, int num) { nCatBuf(dst, noLimit, src, num); }

void WStrNCatBuf(WCHAR* dst, int n, const WCHAR* src, int num) { nCatBuf(dst, n, src, num); }

// Searching

namespace {

// How searches and comparisons take units: as they are, or letters without their case. Most units
// that match are the same, so the rest is asked only of two that are not.
struct Exact {
  static int map(int unit) { return unit; }
  static int other(int unit) { return unit; }  // the second unit that matches
  static bool match(int, int) { return false; }
};

struct IgnoreCase {
  static int map(int unit) { return CharToLower(unit); }
  static int other(int unit) { return match(unit, unit ^ caseBit) ? unit ^ caseBit : unit; }
  static bool match(int a, int b) {
    return (a ^ b) == caseBit && isLetterFrom<'a'>(static_cast<unsigned>(a | b));
  }
};

template <typename Unit>
[[gnu::always_inline]] inline Unit* findUnit(const Unit* str, Unit c) {
  if (!str) return nullptr;
  walk(
      Endless{}, [c](Unit unit) { return rarely(unit == c) || rarely(unit == 0); }, str);
  return *str == 0 ? nullptr : const_cast<Unit*>(str);
}

// Looks for the first unit of substr before it compares the rest. Where the rest fails at the
// terminator of str, no later place has room for substr.
template <typename Case, typename Unit>
[[gnu::always_inline]] inline Unit* find(const Unit* str, const Unit* substr) {
  if (!str || !substr || *str == 0) return nullptr;
  if (*substr == 0) return const_cast<Unit*>(str);
  const int first = *substr;
  const int other = Case::other(first);
  for (;; ++str) {
    walk(
        Endless{}, [=](int unit) { return unit == first || unit == other || unit == 0; }, str);
    if (*str == 0) return nullptr;
    const Unit* at = str + 1;
    const Unit* rest = substr + 1;
    walk(
        Endless{},
        [](int a, int b) { return rarely(a != b) ? rarely(!Case::match(a, b)) : rarely(b == 0); },
        at, rest);
    if (*rest == 0) return const_cast<Unit*>(str);
    if (*at == 0) return nullptr;
  }
}

}  // namespace

char* StrChr(const char* str, const char c) { return findUnit(str, c); }
WCHAR* WStrChr(const WCHAR* str, const WCHAR c) { return findUnit(str, c); }

char* StrStr(const char* str, const char* substr) { return find<Exact>(str, substr); }
WCHAR* WStrStr(const WCHAR* str, const WCHAR* substr) { return find<Exact>(str, substr); }

char* StrIStr(const char* str, const char* substr) { return find<IgnoreCase>(str, substr); }
WCHAR* WStrIStr(const WCHAR* str, const WCHAR* substr) { return find<IgnoreCase>(str, substr); }

// Comparison

namespace {

// Returns 0, or the position i + 1 of the first difference: negative where str1 has the smaller
// unit. Equal units map to equal values, so only unequal ones are mapped.
template <typename Case, typename Unit, typename Bound>
[[gnu::always_inline]] inline int compare(const Unit* str1, const Unit* str2, Bound bound) {
  if (!str1 || !str2) return (str1 ? 1 : 0) - (str2 ? 1 : 0);
  if (str1 == str2) return 0;
  const Unit* at = str1;
  const auto ends = [](int a, int b) {
    return rarely(a != b) ? rarely(!Case::match(a, b)) : rarely(a == 0);
  };
  if (!walk(bound, ends, at, str2)) return 0;
  const int difference = Case::map(*at) - Case::map(*str2);
  const int position = static_cast<int>(at - str1) + 1;
  return difference == 0 ? 0 : difference < 0 ? -position : position;
}

}  // namespace

int StrNCmp(const char* str1, const char* str2, int n) {
  return compare<Exact>(str1, str2, Count{n});
}
int WStrNCmp(const WCHAR* str1, const WCHAR* str2, int n) {
  return compare<Exact>(str1, str2, Count{n});
}

// Irregular by contract: every difference is negative, only the null rule gives a positive result.
int StrNICmp(const char* str1, const char* str2, int n) {
  const int result = compare<IgnoreCase>(str1, str2, Count{n});
  return str1 && str2 && result > 0 ? -result : result;
}
int WStrNICmp(const WCHAR* str1, const WCHAR* str2, int n) {
  return compare<IgnoreCase>(str1, str2, Count{n});
}

int StrCmp(const char* str1, const char* str2) { return compare<Exact>(str1, str2, Endless{}); }
int WStrCmp(const WCHAR* str1, const WCHAR* str2) { return compare<Exact>(str1, str2, Endless{}); }

int StrICmp(const char* str1, const char* str2) {
  return compare<IgnoreCase>(str1, str2, Endless{});
}
int WStrICmp(const WCHAR* str1, const WCHAR* str2) {
  return compare<IgnoreCase>(str1, str2, Endless{});
}

// Tokenizing and splitting

namespace {

// StrChr for sets, which are short: a turn of the walk costs more than it saves. No set contains
// the terminator.
template <typename Unit>
[[gnu::always_inline]] inline bool contains(const Unit* set, Unit unit) {
  if (*set == unit) return unit != 0;
  if (*set == 0) return false;
  while (*++set != 0) {
    if (*set == unit) return true;
  }
  return false;
}

template <typename Unit>
[[gnu::always_inline]] inline Unit* token(Unit* str, int* off, const Unit* dlmt) {
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

template <typename Unit>
[[gnu::always_inline]] inline int split(Unit* str, const Unit* dlmt, Unit** wrd) {
  if (!wrd) return 0;
  int off = 0;
  int num = 0;
  while (Unit* tk = token(str, &off, dlmt)) wrd[num++] = tk;
  return num;
}

}  // namespace

char* StrToken(char* str, int* off, const char* dlmt) { return token(str, off, dlmt); }
WCHAR* WStrToken(WCHAR* str, int* off, const WCHAR* dlmt) { return token(str, off, dlmt); }

int StrSplit(char* str, const char* dlmt, char** wrd) { return split(str, dlmt, wrd); }
int WStrSplit(WCHAR* str, const WCHAR* dlmt, WCHAR** wrd) { return split(str, dlmt, wrd); }

// Trimming

namespace {

// Pairs such as these let a template call the twin of its own width.
int len(const char* str) { return StrLen(str); }
int len(const WCHAR* str) { return WStrLen(str); }

void copyText(char* dst, const char* src) { StrCopy(dst, src); }
void copyText(WCHAR* dst, const WCHAR* src) { WStrCopy(dst, src); }

template <typename Unit>
[[gnu::always_inline]] inline int trim(Unit* str, const Unit* trimSet) {
  if (!str) return 0;
  const Unit emptySet = 0;
  if (!trimSet) trimSet = &emptySet;
  Unit* first = str;
  while (contains(trimSet, *first)) ++first;
  Unit* end = first + len(first);
  while (end > first + 1 && contains(trimSet, end[-1])) --end;
  *end = 0;
  const int kept = static_cast<int>(end - first);
  copyText(str, first);
  return kept;
}

}  // namespace

int StrTrim(char* str, const char* trimSet) { return trim(str, trimSet); }
int WStrTrim(WCHAR* str, const WCHAR* trimSet) { return trim(str, trimSet); }

// Replacing

namespace {

const char* search(const char* str, const char* substr) { return StrStr(str, substr); }
const WCHAR* search(const WCHAR* str, const WCHAR* substr) { return WStrStr(str, substr); }

// The building pass finds the occurrences of the counting pass again: to remember them would take
// memory that the library does not have.
template <typename Unit>
[[gnu::always_inline]] inline int replace(const Unit* orig, const Unit* rep, const Unit* with,
                                          Unit* result) {
  if (!orig || !rep || *rep == 0 || !with) return 0;
  const int len_rep = len(rep);
  int count = 0;
  for (const Unit* ins = search(orig, rep); ins; ins = search(ins + len_rep, rep)) ++count;
  if (!result) return count * (len(with) - len_rep) + len(orig);
  Unit* tmp = result;
  for (; count > 0; --count) {
    const Unit* const ins = search(orig, rep);
    tmp = copyUnits(tmp, orig, Count{static_cast<int>(ins - orig)});
    tmp = copyUnits(tmp, with, Endless{});
    orig = ins + len_rep;
  }
  copyText(tmp, orig);
  return len(result);
}

}  // namespace

int StrReplace(const char* orig, const char* rep, const char* with, char* result) {
  return replace(orig, rep, with, result);
}
int WStrReplace(const WCHAR* orig, const WCHAR* rep, const WCHAR* with, WCHAR* result) {
  return replace(orig, rep, with, result);
}

// Integer text conversion

namespace {

constexpr int mostNegative = -noLimit - 1;

// A variable radix makes one division of the quotient and the remainder. The most negative int has
// no positive counterpart: its first division is of the value itself.
template <typename Unit>
[[gnu::always_inline]] inline Unit* fromInt(int value, Unit* string, int radix) {
  if (!string) return nullptr;
  *string = 0;
  if (radix < 1 || (radix == 1 && value != 0)) return string;
  const bool negative = value < 0;
  if (negative && value != mostNegative) value = -value;
  Unit* end = string;
  do {
    int digit = value % radix;
    value = value / radix;
    if (rarely(value < 0)) {
      value = -value;
      digit = -digit;
    }
    *end++ = static_cast<Unit>(digit < 10 ? '0' + digit : 'a' - 10 + digit);
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
[[gnu::always_inline]] inline int toInt(const Unit* string) {
  if (!string) return 0;
  while (*string == ' ' || *string == '\t') ++string;
  const bool negative = *string == '-';
  if (negative) ++string;
  unsigned val = 0;
  walk(
      Endless{},
      [&val](unsigned unit) {
        const unsigned digit = unit - '0';
        if (digit > 9) return true;
        val = val * 10 + digit;
        return false;
      },
      string);
  return static_cast<int>(negative ? 0 - val : val);
}

}  // namespace

char* IntToStr(int value, char* string, int radix) { return fromInt(value, string, radix); }
WCHAR* IntToWStr(int value, WCHAR* string, int radix) { return fromInt(value, string, radix); }

int StrToInt(const char* string) { return toInt(string); }
int WStrToInt(const WCHAR* string) { return toInt(string); }

// Width conversion

namespace {

template <typename To, typename From>
[[gnu::always_inline]] inline void copyCount(To*& des, const From*& src, int count) {
  const auto copyOne = [](To& to, From from) {
    to = from;
    return false;
  };
  walk(Count{count}, copyOne, des, src);
}

// Two units in one word. Word by word is also unit by unit, forward, where the arrays overlap: both
// being aligned, they are an even number of units apart.
using Pair [[gnu::may_alias]] = uint32_t;

bool isAligned(const void* pair) { return reinterpret_cast<uintptr_t>(pair) % sizeof(Pair) == 0; }

// The library's only constant data.
constexpr char emptyText[] = "";
constexpr char escapeStart[] = "&(0x";

}  // namespace

void BytesToWords(const char* src, WORD* des, int len) {
  if (src && des) copyCount(des, src, len);
}

WCHAR* StrToWStr(const char* src, WCHAR* des, int bufsize) {
  if (!des) return nullptr;
  *des = 0;
  if (src) *copyUnits(des, src, Count{bufsize < 1 ? 0 : bufsize - 1}) = 0;
  return des;
}

char* WStrToStr(const WCHAR* src, char* des, int bufsize) {
  if (!des) return const_cast<char*>(emptyText);
  const auto copyPrintable = [](char& to, WCHAR from) {
    if (from < ' ' || from > '~') return true;
    to = static_cast<char>(from);
    return false;
  };
  char* at = des;
  while (src) {
    const int room = bufsize - static_cast<int>(at - des);  // the terminator's unit included
    if (!walk(Count{room < 1 ? 0 : room - 1}, copyPrintable, at, src) || *src == 0) break;
    char strbuf[5];
    IntToStr(*src++, strbuf, 16);
    if (static_cast<int>(at - des) + StrLen(strbuf) + 5 >= bufsize) break;
    *at = 0;
    StrCat(at, escapeStart);
    StrCat(at, strbuf);
    at += StrLen(at);
    *at++ = ')';
  }
  *at = 0;
  return des;
}

void WStrToWords(const WCHAR* src, WORD* des, int len) {
  if (!src || !des || len < 1) return;
  if (isAligned(src) && isAligned(des)) {
    Pair* to = reinterpret_cast<Pair*>(des);
    const Pair* from = reinterpret_cast<const Pair*>(src);
    copyCount(to, from, len >> 1);
    des = reinterpret_cast<WORD*>(to);
    src = reinterpret_cast<const WCHAR*>(from);
    len &= 1;
  }
  copyCount(des, src, len);
}
