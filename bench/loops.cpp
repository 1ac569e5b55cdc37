// The obvious loop for each function: what a firmware engineer writes in a minute, without tests
// for null and with no bounds but its own. Built at -Os, -O2 and -O3.
#include "strutil.h"

namespace {

template <typename Unit>
int length(const Unit* str) {
  int n = 0;
  while (str[n] != 0) n++;
  return n;
}

template <typename Unit>
Unit* change(Unit* str, Unit from, Unit to, int delta) {
  for (Unit* p = str; *p != 0; p++) {
    if (*p >= from && *p <= to) *p = static_cast<Unit>(*p + delta);
  }
  return str;
}

template <typename To, typename From>
void copy(To* dst, const From* src) {
  while ((*dst++ = *src++) != 0) {
  }
}

template <typename To, typename From>
void copyBuf(To* dst, int n, const From* src) {
  int i = 0;
  for (; i < n - 1 && src[i] != 0; i++) dst[i] = src[i];
  dst[i] = 0;
}

template <typename Unit>
void nCopy(Unit* dst, const Unit* src, int n) {
  for (int i = 0; i < n; i++) {
    dst[i] = src[i];
    if (src[i] == 0) break;
  }
}

template <typename Unit>
Unit* end(Unit* str) {
  while (*str != 0) str++;
  return str;
}

template <typename Unit>
Unit* chr(const Unit* str, Unit c) {
  for (; *str != 0; str++) {
    if (*str == c) return const_cast<Unit*>(str);
  }
  return nullptr;
}

int same(int c) { return c; }
int lower(int c) { return c >= 'A' && c <= 'Z' ? c + 32 : c; }

template <int fold(int), typename Unit>
Unit* find(const Unit* str, const Unit* substr) {
  for (; *str != 0; str++) {
    int j = 0;
    while (substr[j] != 0 && fold(str[j]) == fold(substr[j])) j++;
    if (substr[j] == 0) return const_cast<Unit*>(str);
  }
  return nullptr;
}

template <int fold(int), typename Unit>
int compare(const Unit* a, const Unit* b) {
  for (int i = 0;; i++) {
    if (fold(a[i]) != fold(b[i])) return fold(a[i]) < fold(b[i]) ? -(i + 1) : i + 1;
    if (a[i] == 0) return 0;
  }
}

template <int fold(int), typename Unit>
int nCompare(const Unit* a, const Unit* b, int n) {
  for (int i = 0; i < n; i++) {
    if (fold(a[i]) != fold(b[i])) return fold(a[i]) < fold(b[i]) ? -(i + 1) : i + 1;
    if (a[i] == 0) break;
  }
  return 0;
}

template <typename Unit>
Unit* token(Unit* str, int* off, const Unit* dlmt) {
  int i = *off;
  while (str[i] != 0 && chr(dlmt, str[i])) i++;
  const int start = i;
  while (str[i] != 0 && !chr(dlmt, str[i])) i++;
  *off = i;
  if (str[i] != 0) {
    str[i] = 0;
    *off = i + 1;
  }
  return i == start ? nullptr : str + start;
}

template <typename Unit>
int split(Unit* str, const Unit* dlmt, Unit** wrd) {
  int off = 0;
  int num = 0;
  while (Unit* tk = token(str, &off, dlmt)) wrd[num++] = tk;
  return num;
}

template <typename Unit>
int trim(Unit* str, const Unit* set) {
  int from = 0;
  while (str[from] != 0 && chr(set, str[from])) from++;
  int to = length(str);
  while (to > from && chr(set, str[to - 1])) to--;
  int n = 0;
  while (from < to) str[n++] = str[from++];
  str[n] = 0;
  return n;
}

template <typename Unit>
int replace(const Unit* orig, const Unit* rep, const Unit* with, Unit* result) {
  const int skip = length(rep);
  Unit* out = result;
  while (*orig != 0) {
    int j = 0;
    while (rep[j] != 0 && orig[j] == rep[j]) j++;
    if (rep[j] == 0) {
      for (j = 0; with[j] != 0; j++) *out++ = with[j];
      orig += skip;
    } else {
      *out++ = *orig++;
    }
  }
  *out = 0;
  return static_cast<int>(out - result);
}

template <typename Unit>
Unit* fromInt(int value, Unit* string, int radix) {
  int n = 0;
  unsigned rest = value < 0 ? 0U - static_cast<unsigned>(value) : static_cast<unsigned>(value);
  do {
    const unsigned digit = rest % static_cast<unsigned>(radix);
    rest /= static_cast<unsigned>(radix);
    string[n++] = static_cast<Unit>(digit < 10 ? '0' + digit : 'a' + digit - 10);
  } while (rest != 0);
  if (value < 0) string[n++] = '-';
  string[n] = 0;
  for (int i = 0; i < n / 2; i++) {
    const Unit unit = string[i];
    string[i] = string[n - 1 - i];
    string[n - 1 - i] = unit;
  }
  return string;
}

template <typename Unit>
int toInt(const Unit* string) {
  while (*string == ' ' || *string == '\t') string++;
  const bool negative = *string == '-';
  if (negative) string++;
  int value = 0;
  while (*string >= '0' && *string <= '9') value = value * 10 + (*string++ - '0');
  return negative ? -value : value;
}

template <typename Unit>
void toWords(const Unit* src, WORD* des, int len) {
  for (int i = 0; i < len; i++) des[i] = src[i];
}

}  // namespace

int StrLen(const char* str) noexcept { return length(str); }
int WStrLen(const WCHAR* str) noexcept { return length(str); }
int CharToLower(const int c) noexcept { return c >= 'A' && c <= 'Z' ? c + 32 : c; }
int CharToUpper(const int c) noexcept { return c >= 'a' && c <= 'z' ? c - 32 : c; }
char* StrUpper(char* str) noexcept { return change<char>(str, 'a', 'z', -32); }
WCHAR* WStrUpper(WCHAR* str) noexcept { return change<WCHAR>(str, 'a', 'z', -32); }
char* StrLower(char* str) noexcept { return change<char>(str, 'A', 'Z', 32); }
WCHAR* WStrLower(WCHAR* str) noexcept { return change<WCHAR>(str, 'A', 'Z', 32); }

void StrCopy(char* dst, const char* src) noexcept { copy(dst, src); }
void WStrCopy(WCHAR* dst, const WCHAR* src) noexcept { copy(dst, src); }
void StrCopyBuf(char* dst, int n, const char* src) noexcept { copyBuf(dst, n, src); }
void WStrCopyBuf(WCHAR* dst, int n, const WCHAR* src) noexcept { copyBuf(dst, n, src); }
void StrNCopy(char* dst, const char* src, int n) noexcept { nCopy(dst, src, n); }
void WStrNCopy(WCHAR* dst, const WCHAR* src, int n) noexcept { nCopy(dst, src, n); }

void StrCat(char* dst, const char* src) noexcept { copy(end(dst), src); }
void WStrCat(WCHAR* dst, const WCHAR* src) noexcept { copy(end(dst), src); }
void StrCatBuf(char* dst, int n, const char* src) noexcept {
  const int off = length(dst);
  copyBuf(dst + off, n - off, src);
}
void WStrCatBuf(WCHAR* dst, int n, const WCHAR* src) noexcept {
  const int off = length(dst);
  copyBuf(dst + off, n - off, src);
}
void WStrNCat(WCHAR* dst, const WCHAR* src, int num) noexcept { copyBuf(end(dst), num + 1, src); }
void WStrNCatBuf(WCHAR* dst, int n, const WCHAR* src, int num) noexcept {
  const int room = n - length(dst);
  copyBuf(end(dst), num + 1 < room ? num + 1 : room, src);
}

char* StrChr(const char* str, const char c) noexcept { return chr(str, c); }
WCHAR* WStrChr(const WCHAR* str, const WCHAR c) noexcept { return chr(str, c); }
char* StrStr(const char* str, const char* substr) noexcept { return find<same>(str, substr); }
WCHAR* WStrStr(const WCHAR* str, const WCHAR* substr) noexcept { return find<same>(str, substr); }
char* StrIStr(const char* str, const char* substr) noexcept { return find<lower>(str, substr); }
WCHAR* WStrIStr(const WCHAR* str, const WCHAR* substr) noexcept { return find<lower>(str, substr); }

int StrNCmp(const char* str1, const char* str2, int n) noexcept {
  return nCompare<same>(str1, str2, n);
}
int WStrNCmp(const WCHAR* str1, const WCHAR* str2, int n) noexcept {
  return nCompare<same>(str1, str2, n);
}
int StrNICmp(const char* str1, const char* str2, int n) noexcept {
  return nCompare<lower>(str1, str2, n);
}
int WStrNICmp(const WCHAR* str1, const WCHAR* str2, int n) noexcept {
  return nCompare<lower>(str1, str2, n);
}
int StrCmp(const char* str1, const char* str2) noexcept { return compare<same>(str1, str2); }
int WStrCmp(const WCHAR* str1, const WCHAR* str2) noexcept { return compare<same>(str1, str2); }
int StrICmp(const char* str1, const char* str2) noexcept { return compare<lower>(str1, str2); }
int WStrICmp(const WCHAR* str1, const WCHAR* str2) noexcept { return compare<lower>(str1, str2); }

char* StrToken(char* str, int* off, const char* dlmt) noexcept { return token(str, off, dlmt); }
WCHAR* WStrToken(WCHAR* str, int* off, const WCHAR* dlmt) noexcept { return token(str, off, dlmt); }
int StrSplit(char* str, const char* dlmt, char** wrd) noexcept { return split(str, dlmt, wrd); }
int WStrSplit(WCHAR* str, const WCHAR* dlmt, WCHAR** wrd) noexcept { return split(str, dlmt, wrd); }
int StrTrim(char* str, const char* trimSet) noexcept { return trim(str, trimSet); }
int WStrTrim(WCHAR* str, const WCHAR* trimSet) noexcept { return trim(str, trimSet); }

int StrReplace(const char* orig, const char* rep, const char* with, char* result) noexcept {
  return replace(orig, rep, with, result);
}
int WStrReplace(const WCHAR* orig, const WCHAR* rep, const WCHAR* with, WCHAR* result) noexcept {
  return replace(orig, rep, with, result);
}

char* IntToStr(int value, char* string, int radix) noexcept {
  return fromInt(value, string, radix);
}
WCHAR* IntToWStr(int value, WCHAR* string, int radix) noexcept {
  return fromInt(value, string, radix);
}
int StrToInt(const char* string) noexcept { return toInt(string); }
int WStrToInt(const WCHAR* string) noexcept { return toInt(string); }

void BytesToWords(const char* src, WORD* des, int len) noexcept { toWords(src, des, len); }
void WStrToWords(const WCHAR* src, WORD* des, int len) noexcept { toWords(src, des, len); }
WCHAR* StrToWStr(const char* src, WCHAR* des, int bufsize) noexcept {
  copyBuf(des, bufsize, src);
  return des;
}
char* WStrToStr(const WCHAR* src, char* des, int bufsize) noexcept {
  int i = 0;
  for (; *src != 0; src++) {
    if (*src >= ' ' && *src <= '~') {
      if (i + 1 >= bufsize) break;
      des[i++] = static_cast<char>(*src);
    } else {
      int digits = 1;
      while (digits < 4 && *src >> (4 * digits) != 0) digits++;
      if (i + digits + 5 >= bufsize) break;
      for (const char* p = "&(0x"; *p != 0; p++) des[i++] = *p;
      while (digits-- > 0) des[i++] = "0123456789abcdef"[*src >> (4 * digits) & 0xF];
      des[i++] = ')';
    }
  }
  des[i] = 0;
  return des;
}
