// The naive loop for each function: what a firmware engineer writes in a minute, without tests for
// null and with no bounds but its own. Built at -O0, -Os, -O2 and -O3.
#include "base_types.h"

template <typename Unit>
struct Loops {
  static int same(int c) { return c; }
  static int lower(int c) { return c >= 'A' && c <= 'Z' ? c + 32 : c; }

  static int StrLen(const Unit* str) {
    int n = 0;
    while (str[n] != 0) n++;
    return n;
  }

  static Unit* change(Unit* str, Unit from, Unit to, int delta) {
    for (Unit* p = str; *p != 0; p++) {
      if (*p >= from && *p <= to) *p = static_cast<Unit>(*p + delta);
    }
    return str;
  }
  static Unit* StrUpper(Unit* str) { return change(str, 'a', 'z', -32); }
  static Unit* StrLower(Unit* str) { return change(str, 'A', 'Z', 32); }

  static void StrCopy(Unit* dst, const Unit* src) {
    while ((*dst++ = *src++) != 0) {
    }
  }
  template <typename To>
  static void copyBuf(To* dst, int n, const Unit* src) {
    int i = 0;
    for (; i < n - 1 && src[i] != 0; i++) dst[i] = src[i];
    dst[i] = 0;
  }
  static void StrCopyBuf(Unit* dst, int n, const Unit* src) { copyBuf(dst, n, src); }
  static WCHAR* StrToWStr(const Unit* src, WCHAR* des, int bufsize) {
    copyBuf(des, bufsize, src);
    return des;
  }
  static void StrNCopy(Unit* dst, const Unit* src, int n) {
    for (int i = 0; i < n; i++) {
      dst[i] = src[i];
      if (src[i] == 0) break;
    }
  }

  static Unit* end(Unit* str) {
    while (*str != 0) str++;
    return str;
  }
  static void StrCat(Unit* dst, const Unit* src) { StrCopy(end(dst), src); }
  static void StrNCat(Unit* dst, const Unit* src, int num) { copyBuf(end(dst), num + 1, src); }
  static void StrNCatBuf(Unit* dst, int n, const Unit* src, int num) {
    const int off = StrLen(dst);
    copyBuf(dst + off, num + 1 < n - off ? num + 1 : n - off, src);
  }
  static void StrCatBuf(Unit* dst, int n, const Unit* src) { StrNCatBuf(dst, n, src, n); }

  static Unit* StrChr(const Unit* str, Unit c) {
    for (; *str != 0; str++) {
      if (*str == c) return const_cast<Unit*>(str);
    }
    return nullptr;
  }
  template <int fold(int)>
  static Unit* find(const Unit* str, const Unit* substr) {
    for (; *str != 0; str++) {
      int j = 0;
      while (substr[j] != 0 && fold(str[j]) == fold(substr[j])) j++;
      if (substr[j] == 0) return const_cast<Unit*>(str);
    }
    return nullptr;
  }
  static Unit* StrStr(const Unit* str, const Unit* substr) { return find<same>(str, substr); }
  static Unit* StrIStr(const Unit* str, const Unit* substr) { return find<lower>(str, substr); }

  template <int fold(int)>
  static int compare(const Unit* a, const Unit* b) {
    for (int i = 0;; i++) {
      if (fold(a[i]) != fold(b[i])) return fold(a[i]) < fold(b[i]) ? -(i + 1) : i + 1;
      if (a[i] == 0) return 0;
    }
  }
  static int StrCmp(const Unit* str1, const Unit* str2) { return compare<same>(str1, str2); }
  static int StrICmp(const Unit* str1, const Unit* str2) { return compare<lower>(str1, str2); }
  template <int fold(int)>
  static int nCompare(const Unit* a, const Unit* b, int n) {
    for (int i = 0; i < n; i++) {
      if (fold(a[i]) != fold(b[i])) return fold(a[i]) < fold(b[i]) ? -(i + 1) : i + 1;
      if (a[i] == 0) break;
    }
    return 0;
  }
  static int StrNCmp(const Unit* a, const Unit* b, int n) { return nCompare<same>(a, b, n); }
  static int StrNICmp(const Unit* a, const Unit* b, int n) { return nCompare<lower>(a, b, n); }

  static Unit* StrToken(Unit* str, int* off, const Unit* dlmt) {
    int i = *off;
    while (str[i] != 0 && StrChr(dlmt, str[i])) i++;
    const int start = i;
    while (str[i] != 0 && !StrChr(dlmt, str[i])) i++;
    *off = i;
    if (str[i] != 0) {
      str[i] = 0;
      *off = i + 1;
    }
    return i == start ? nullptr : str + start;
  }
  static int StrSplit(Unit* str, const Unit* dlmt, Unit** wrd) {
    int off = 0;
    int num = 0;
    while (Unit* tk = StrToken(str, &off, dlmt)) wrd[num++] = tk;
    return num;
  }

  static int StrTrim(Unit* str, const Unit* set) {
    int from = 0;
    while (str[from] != 0 && StrChr(set, str[from])) from++;
    int to = StrLen(str);
    while (to > from && StrChr(set, str[to - 1])) to--;
    str[to] = 0;
    int n = 0;
    while (from < to) str[n++] = str[from++];
    str[n] = 0;
    return n;
  }

  static int StrReplace(const Unit* orig, const Unit* rep, const Unit* with, Unit* result) {
    const int skip = StrLen(rep);
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

  static Unit* IntToStr(int value, Unit* string, int radix) {
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
  static int StrToInt(const Unit* string) {
    while (*string == ' ' || *string == '\t') string++;
    const bool negative = *string == '-';
    if (negative) string++;
    int value = 0;
    while (*string >= '0' && *string <= '9') value = value * 10 + (*string++ - '0');
    return negative ? -value : value;
  }

  static void BytesToWords(const Unit* src, WORD* des, int len) {
    for (int i = 0; i < len; i++) des[i] = src[i];
  }
  static void StrToWords(const Unit* src, WORD* des, int len) { BytesToWords(src, des, len); }
  static char* StrToStr(const Unit* src, char* des, int bufsize) {
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
};

template struct Loops<char>;
template struct Loops<WCHAR>;
