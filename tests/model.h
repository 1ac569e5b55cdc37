// What the functions are to do, written from their contracts in the plainest way and by other means
// than theirs. Texts are without terminators, -1 is the index of nothing.
#pragma once

#include <algorithm>
#include <string>

namespace model {

using Units = std::u16string;

inline constexpr int noLimit = 0x7fffffff;

inline Units lower(Units text) {
  const Units capitals = u"ABCDEFGHIJKLMNOPQRSTUVWXYZ";
  for (char16_t& unit : text) {
    const size_t letter = capitals.find(unit);
    if (letter != Units::npos) unit = u"abcdefghijklmnopqrstuvwxyz"[letter];
  }
  return text;
}

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

}  // namespace model
