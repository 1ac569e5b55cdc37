// What the functions are to do, written from their contracts in the plainest way and by other means
// than theirs. Texts are without terminators, -1 is the index of nothing.
#pragma once

#include <algorithm>
#include <cstdlib>
#include <string>

namespace model {

using Units = std::u16string;

inline constexpr int noLimit = 0x7fffffff;

inline const Units capitals = u"ABCDEFGHIJKLMNOPQRSTUVWXYZ";
inline const Units smallLetters = u"abcdefghijklmnopqrstuvwxyz";

inline Units exchange(Units text, const Units& from, const Units& to) {
  for (char16_t& unit : text) {
    if (unit < from.front() || unit > from.back()) continue;
    const size_t letter = from.find(unit);
    if (letter != Units::npos) unit = to[letter];
  }
  return text;
}
inline Units lower(const Units& text) { return exchange(text, capitals, smallLetters); }
inline Units upper(const Units& text) { return exchange(text, smallLetters, capitals); }

inline Units take(const Units& text, int count) {
  return text.substr(0, static_cast<size_t>(std::max(count, 0)));
}

// The units that a copy writes.
inline Units copyBuf(int n, const Units& src) { return n < 1 ? u"" : take(src, n - 1) + u'\0'; }
inline Units nCopy(const Units& src, int n) {
  return n < 1 ? Units(1, u'\0') : take(src + u'\0', n);
}

// The text in the destination after an append.
inline Units nCatBuf(const Units& dst, int n, const Units& src, int num) {
  const int room = std::max(n, 0) - static_cast<int>(dst.size()) - 1;
  return dst + take(src, std::min(room, num));
}

inline int find(const Units& str, const Units& substr) {
  return str.empty() ? -1 : static_cast<int>(str.find(substr));
}

inline int compare(const Units& str1, const Units& str2, int n) {
  const Units a = take(str1 + u'\0', n);
  const Units b = take(str2 + u'\0', n);
  for (size_t i = 0; i < a.size() && i < b.size(); ++i) {
    const int position = static_cast<int>(i) + 1;
    if (a[i] != b[i]) return a[i] < b[i] ? -position : position;
  }
  return 0;
}

// Cuts the next token off `text` as a walk does, moves `off`, and returns the token's index.
inline int token(Units& text, int& off, const Units& dlmt) {
  const size_t start = text.find_first_not_of(dlmt, static_cast<size_t>(off));
  const size_t end = start == Units::npos ? start : text.find_first_of(dlmt, start);
  off = static_cast<int>(std::min(end, text.size()));
  if (end != Units::npos) text[static_cast<size_t>(off++)] = u'\0';
  return static_cast<int>(start);
}

// Trims the text and returns its length; what follows its terminator in the buffer stays.
inline int trim(Units& text, const Units& trimSet) {
  const size_t first = std::min(text.find_first_not_of(trimSet), text.size());
  const Units kept = text.substr(first, text.find_last_not_of(trimSet) + 1 - first);
  text += u'\0';
  text[first + kept.size()] = u'\0';
  if (first > 0) text.replace(0, kept.size() + 1, kept + u'\0');
  return static_cast<int>(kept.size());
}

inline Units replace(Units text, const Units& rep, const Units& with) {
  for (size_t at = text.find(rep); at != Units::npos; at = text.find(rep, at + with.size())) {
    text.replace(at, rep.size(), with);
  }
  return text;
}

inline Units intToText(int value, int radix) {
  if (radix < 1 || (radix == 1 && value != 0)) return u"";
  long long rest = std::abs(static_cast<long long>(value));
  Units text;
  do {
    const auto digit = static_cast<int>(rest % radix);
    text.insert(text.begin(), static_cast<char16_t>(digit < 10 ? 48 + digit : 87 + digit));
  } while (radix > 1 && (rest /= radix) != 0);
  return value < 0 ? u'-' + text : text;
}

inline int textToInt(const Units& text) {
  const Units number = text.substr(std::min(text.find_first_not_of(u" \t"), text.size()));
  const bool negative = number.substr(0, 1) == u"-";
  const Units digits = number.substr(negative ? 1 : 0);
  unsigned long long value = 0;
  for (const char16_t digit : digits.substr(0, digits.find_first_not_of(u"0123456789"))) {
    value = (value * 10 + (digit - u'0')) % (1ULL << 32);
  }
  return static_cast<int>(static_cast<unsigned>(negative ? -value : value));
}

inline Units escape(const Units& src, int bufsize) {
  Units text;
  for (const char16_t unit : src) {
    const bool printable = unit >= u' ' && unit <= u'~';
    const Units piece = printable ? Units(1, unit) : u"&(0x" + intToText(unit, 16) + u")";
    if (static_cast<int>(text.size() + piece.size()) >= bufsize) break;
    text += piece;
  }
  return text;
}

}  // namespace model
