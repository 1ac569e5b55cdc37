// Each operation is written once, as a template on the unit, and the functions of both widths are
// entries of one line. The templates stand in unnamed namespaces: elsewhere each would leave a
// symbol of its own in the object.
#include "strutil.h"

static_assert(static_cast<char>(-1) > 0, "narrow units are 0 to 255: compile with -funsigned-char");

namespace {

// The loop that all others are expressed through: passes the units that the pointers point at to
// `stop`, one of each, and moves all pointers on by one unit until `stop` returns true. They are
// left at the units that stopped it. Four steps a turn: the address arithmetic and the jump back
// cost half as much as the rest of a simple step.
template <typename Stop, typename... Unit>
void walk(Stop stop, Unit*&... at) {
  for (;; (..., (at += 4))) {
    if (stop(at[0]...)) return;
    if (stop(at[1]...)) return (..., void(at += 1));
    if (stop(at[2]...)) return (..., void(at += 2));
    if (stop(at[3]...)) return (..., void(at += 3));
  }
}

// How many units may still be taken from a source.
struct Count {
  int left;

  bool spent() {
    if (left <= 0) return true;
    --left;
    return false;
  }
};

constexpr int noLimit = 0x7fffffff;

}  // namespace

// Lengths and case mapping

namespace {

// What separates the two cases of a letter.
constexpr unsigned caseBit = 'a' - 'A';

// Whether c is one of the 26 letters from `first` on.
template <unsigned first>
bool isLetterFrom(unsigned c) {
  return c - first < 26;
}

template <typename Unit>
int length(const Unit* str) {
  if (!str) return 0;
  const Unit* end = str;
  walk([](unsigned unit) { return unit == 0; }, end);
  return static_cast<int>(end - str);
}

// Gives the letters from `first` on their other case.
template <unsigned first, typename Unit>
Unit* switchCase(Unit* str) {
  if (!str) return nullptr;
  Unit* at = str;
  walk(
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
  return isLetterFrom<'A'>(static_cast<unsigned>(c)) ? c + static_cast<int>(caseBit) : c;
}

int CharToUpper(const int c) {
  return isLetterFrom<'a'>(static_cast<unsigned>(c)) ? c - static_cast<int>(caseBit) : c;
}

char* StrUpper(char* str) { return switchCase<'a'>(str); }
WCHAR* WStrUpper(WCHAR* str) { return switchCase<'a'>(str); }

char* StrLower(char* str) { return switchCase<'A'>(str); }
WCHAR* WStrLower(WCHAR* str) { return switchCase<'A'>(str); }

// Copying

namespace {

// Copies up to the terminator, or `count` units without one, and returns where it ended.
template <typename To, typename From>
To* copyUnits(To* dst, const From* src, Count count) {
  walk([&count](To& to, const From& from) { return count.spent() || (to = from) == 0; }, dst, src);
  return dst;
}

template <typename Unit>
void copy(Unit* dst, const Unit* src) {
  if (!dst || dst == src) return;
  *dst = 0;
  if (!src) return;
  walk([](Unit& to, Unit from) { return (to = from) == 0; }, dst, src);
}

template <typename Unit>
void copyBuf(Unit* dst, int n, const Unit* src) {
  if (!dst || dst == src || n < 1) return;
  *dst = 0;
  if (!src) return;
  *copyUnits(dst, src, Count{n - 1}) = 0;
}

template <typename Unit>
void nCopy(Unit* dst, const Unit* src, int n) {
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

// Pairs such as this one let a template call the twin of its own width.
int len(const char* str) { return StrLen(str); }
int len(const WCHAR* str) { return WStrLen(str); }

template <typename Unit>
void cat(Unit* dst, const Unit* src) {
  if (!dst || !src) return;
  dst += len(dst);
  walk([](Unit& to, Unit from) { return (to = from) == 0; }, dst, src);
}

template <typename Unit>
void nCatBuf(Unit* dst, int n, const Unit* src, int num) {
  if (!dst || !src) return;
  const int off = len(dst);
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

// How searches and comparisons take units: as they are, or letters without their case. `other` is
// the second unit that `map` maps to the same value, or that value where there is none.
struct Exact {
  static int map(int unit) { return unit; }
  static int other(int mapped) { return mapped; }
};

struct IgnoreCase {
  static int map(int unit) { return CharToLower(unit); }
  static int other(int mapped) {
    return isLetterFrom<'a'>(static_cast<unsigned>(mapped)) ? mapped - static_cast<int>(caseBit)
                                                            : mapped;
  }
};

template <typename Unit>
Unit* findUnit(const Unit* str, Unit c) {
  if (!str) return nullptr;
  walk([c](Unit unit) { return unit == c || unit == 0; }, str);
  return *str == 0 ? nullptr : const_cast<Unit*>(str);
}

// Looks for the first unit of substr before it compares the rest. Where the rest fails at the
// terminator of str, no later place has room for substr.
template <typename Case, typename Unit>
Unit* find(const Unit* str, const Unit* substr) {
  if (!str || !substr || *str == 0) return nullptr;
  if (*substr == 0) return const_cast<Unit*>(str);
  const int first = Case::map(*substr);
  const int other = Case::other(first);
  for (;; ++str) {
    walk([=](int unit) { return unit == first || unit == other || unit == 0; }, str);
    if (*str == 0) return nullptr;
    const Unit* at = str + 1;
    const Unit* rest = substr + 1;
    walk([](int a, int b) { return b == 0 || (a != b && Case::map(a) != Case::map(b)); }, at, rest);
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

struct Unbounded {
  static bool spent() { return false; }
};

// Returns 0, or the position i + 1 of the first difference: negative where str1 has the smaller
// unit. Equal units map to equal values, so only unequal ones are mapped.
template <typename Case, typename Unit, typename Bound>
int compare(const Unit* str1, const Unit* str2, Bound bound) {
  if (!str1 || !str2) return (str1 ? 1 : 0) - (str2 ? 1 : 0);
  if (str1 == str2) return 0;
  int difference = 0;
  const Unit* at = str1;
  walk(
      [&](const Unit& a, const Unit& b) {
        if (bound.spent()) return true;
        if (a == b) return a == 0;
        difference = Case::map(a) - Case::map(b);
        return difference != 0;
      },
      at, str2);
  const int position = static_cast<int>(at - str1) + 1;
  return difference == 0 ? 0 : difference < 0 ? -position : position;
}

// StrNICmp alone reports every difference as negative. Its callers rely on it.
int alwaysNegative(int result) { return result > 0 ? -result : result; }

}  // namespace

int StrNCmp(const char* str1, const char* str2, int n) {
  return compare<Exact>(str1, str2, Count{n});
}
int WStrNCmp(const WCHAR* str1, const WCHAR* str2, int n) {
  return compare<Exact>(str1, str2, Count{n});
}

int StrNICmp(const char* str1, const char* str2, int n) {
  const int result = compare<IgnoreCase>(str1, str2, Count{n});
  return str1 && str2 ? alwaysNegative(result) : result;
}
int WStrNICmp(const WCHAR* str1, const WCHAR* str2, int n) {
  return compare<IgnoreCase>(str1, str2, Count{n});
}

int StrCmp(const char* str1, const char* str2) { return compare<Exact>(str1, str2, Unbounded{}); }
int WStrCmp(const WCHAR* str1, const WCHAR* str2) {
  return compare<Exact>(str1, str2, Unbounded{});
}

int StrICmp(const char* str1, const char* str2) {
  return compare<IgnoreCase>(str1, str2, Unbounded{});
}
int WStrICmp(const WCHAR* str1, const WCHAR* str2) {
  return compare<IgnoreCase>(str1, str2, Unbounded{});
}
