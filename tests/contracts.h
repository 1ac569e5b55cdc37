// What each function is to do: a reference model, written from the header's contracts in the
// plainest way and independently of the implementation.
#pragma once

#include <cstdlib>

#include "memory.h"

// The arguments of a call. The string or buffer that the function writes to or points into comes
// first, wherever the function has it; the others are in the function's order.
struct Args {
  std::vector<Units> strings;
  std::vector<int> numbers;
};

// The outcome of a call.
struct Outcome {
  std::vector<int> results;  // a pointer is an index into the first string, or -1 if it is null
  Units written;             // the units from the start of the first string on
  int reads = INT_MAX;       // how many units of each string that is not written may be read

  Outcome writes(const Units& units) const { return {results, units, reads}; }
  Outcome writesString(const Units& string) const { return writes(string + u'\0'); }
  Outcome readsAtMost(int count) const { return {results, written, count}; }
};
inline Outcome gives(int result) { return {{result}, u""}; }
inline Outcome gives(std::vector<int> results) { return {std::move(results), u""}; }
inline Outcome writesNothing() { return {}; }
inline Outcome writes(const Units& units) { return Outcome().writes(units); }
inline Outcome writesString(const Units& string) { return Outcome().writesString(string); }

namespace contract {

inline int length(const Units& string) {
  return string == null ? 0 : static_cast<int>(string.size());
}

inline bool anyNull(const Args& args) {
  return std::find(args.strings.begin(), args.strings.end(), null) != args.strings.end();
}

inline Units firstOf(const Units& string, int count) {
  return string.substr(0, static_cast<size_t>(std::max(count, 0)));
}

inline Units translate(Units string, const Units& from, const Units& to) {
  if (string == null) return null;
  for (char16_t& unit : string) {
    const size_t letter = from.find(unit);
    if (letter != Units::npos) unit = to[letter];
  }
  return string;
}
inline const Units uppercase = u"ABCDEFGHIJKLMNOPQRSTUVWXYZ";
inline const Units lowercase = u"abcdefghijklmnopqrstuvwxyz";
inline Units toLower(const Units& string) { return translate(string, uppercase, lowercase); }
inline Units toUpper(const Units& string) { return translate(string, lowercase, uppercase); }

inline Outcome charToLower(const Args& args) {
  const int c = args.numbers[0];
  return gives(c >= 'A' && c <= 'Z' ? c + 32 : c);
}
inline Outcome charToUpper(const Args& args) {
  const int c = args.numbers[0];
  return gives(c >= 'a' && c <= 'z' ? c - 32 : c);
}

// With the strings in lowercase.
inline Args lowered(Args args) {
  for (Units& string : args.strings) string = toLower(string);
  return args;
}

// The first string becomes `string`, and a pointer to it is returned.
inline Outcome makes(const Args& args, const Units& string) {
  return args.strings[0] == null ? gives(-1) : gives(0).writesString(string);
}

inline Outcome copyBuf(const Args& args, int n) {
  if (args.strings[0] == null || n < 1) return writesNothing().readsAtMost(0);
  if (args.strings[1] == null) return writesString(u"");
  return writesString(firstOf(args.strings[1], n - 1)).readsAtMost(n - 1);
}

inline Outcome nCopy(const Args& args) {
  const int n = args.numbers[0];
  if (args.strings[0] == null) return writesNothing();
  if (args.strings[1] == null || n < 1) return writesString(u"").readsAtMost(0);
  return writes(firstOf(args.strings[1] + u'\0', n)).readsAtMost(n);
}

inline Outcome append(const Args& args, int n, int num) {
  if (anyNull(args)) return writesNothing();
  const int room = std::max(n, 0) - length(args.strings[0]) - 1;
  const int count = std::min(room, num);
  return writesString(args.strings[0] + firstOf(args.strings[1], count)).readsAtMost(count);
}

inline Outcome find(const Args& args) {
  if (anyNull(args) || args.strings[0].empty()) return gives(-1);
  return gives(static_cast<int>(args.strings[0].find(args.strings[1])));  // npos becomes -1
}

// The unit to look for is the first of the second string, which may be its terminator.
inline Outcome findUnit(const Args& args) {
  if (anyNull(args) || args.strings[1].empty()) return gives(-1);
  return find({{args.strings[0], firstOf(args.strings[1], 1)}, {}});
}

enum class Order { regular, irregular };  // irregular: every difference is negative

inline Outcome compare(const Args& args, int n, Order order = Order::regular) {
  const Units& str1 = args.strings[0];
  const Units& str2 = args.strings[1];
  if (str1 == null || str2 == null) return gives((str2 == null) - (str1 == null));
  const Units a = firstOf(str1 + u'\0', n);
  const Units b = firstOf(str2 + u'\0', n);
  for (size_t i = 0; i < a.size() && i < b.size(); ++i) {
    if (a[i] == b[i]) continue;
    const int position = static_cast<int>(i) + 1;
    const bool isNegative = a[i] < b[i] || order == Order::irregular;
    return gives(isNegative ? -position : position).readsAtMost(n);
  }
  return gives(0).readsAtMost(n);
}

// All calls from an offset on to the second null. Each gives a token and the offset after it.
inline Outcome tokens(const Args& args, int off) {
  if (anyNull(args)) return gives({-1, off, -1, off});
  Outcome outcome = writesString(args.strings[0]);
  Units& string = outcome.written;
  const Units ends = args.strings[1] + u'\0';
  for (int nulls = 0; nulls < 2;) {
    const size_t start = string.find_first_not_of(ends, static_cast<size_t>(off));
    const size_t end = string.find_first_of(ends, start);
    off = length(args.strings[0]);
    if (start == Units::npos) {
      ++nulls;
    } else if (end < args.strings[0].size()) {
      string[end] = u'\0';
      off = static_cast<int>(end) + 1;
    }
    outcome.results.insert(outcome.results.end(), {static_cast<int>(start), off});
  }
  return outcome;
}

// The number of tokens, then their positions.
inline Outcome split(const Args& args) {
  if (anyNull(args)) return gives(0);
  const Outcome all = tokens(args, 0);
  Outcome outcome = gives(0).writes(all.written);
  for (size_t i = 0; all.results[i] >= 0; i += 2) {
    outcome.results.push_back(all.results[i]);
    ++outcome.results[0];
  }
  return outcome;
}

// First a terminator is written after what is kept; then this is copied to the start, unless it is
// there already.
inline Outcome trim(const Args& args) {
  const Units& string = args.strings[0];
  if (string == null) return gives(0);
  const Units set = args.strings[1] == null ? u"" : args.strings[1];
  const size_t first = std::min(string.find_first_not_of(set), string.size());
  const Units kept = string.substr(first, string.find_last_not_of(set) + 1 - first);
  Units written = string + u'\0';
  written[first + kept.size()] = u'\0';
  if (first > 0) written.replace(0, kept.size() + 1, kept + u'\0');
  return gives(length(kept)).writes(written);
}

inline Outcome replace(const Args& args) {
  Units string = args.strings[1];
  const Units& rep = args.strings[2];
  const Units& with = args.strings[3];
  if (string == null || rep == null || rep.empty() || with == null) return gives(0);
  for (size_t at = string.find(rep); at != Units::npos; at = string.find(rep, at + with.size())) {
    string.replace(at, rep.size(), with);
  }
  const Outcome sized = gives(length(string));
  return args.strings[0] == null ? sized : sized.writesString(string);
}

inline Units digits(int value, int radix) {
  if (radix < 1) return u"";
  if (radix == 1) return value == 0 ? u"0" : u"";
  Units string;
  for (long long rest = std::abs(static_cast<long long>(value)); rest > 0 || string.empty();) {
    const auto digit = static_cast<int>(rest % radix);
    string.insert(string.begin(), static_cast<char16_t>(digit < 10 ? 48 + digit : 87 + digit));
    rest /= radix;
  }
  return value < 0 ? u'-' + string : string;
}

inline Outcome intToStr(const Args& args) {
  return makes(args, digits(args.numbers[0], args.numbers[1]));
}

inline Outcome strToInt(const Args& args) {
  const Units& string = args.strings[0];
  size_t at = string == null ? Units::npos : string.find_first_not_of(u" \t");
  if (at == Units::npos) return gives(0);
  const bool isNegative = string[at] == u'-';
  unsigned long long value = 0;
  for (at += isNegative ? 1 : 0; at < string.size(); ++at) {
    if (string[at] < u'0' || string[at] > u'9') break;
    value = (value * 10 + (string[at] - u'0')) % (1ULL << 32);
  }
  return gives(static_cast<int>(static_cast<unsigned>(isNegative ? -value : value)));
}

inline Outcome copyElements(const Args& args) {
  const int len = args.numbers[0];
  return anyNull(args) ? writesNothing() : writes(firstOf(args.strings[1], len)).readsAtMost(len);
}

inline Outcome widen(const Args& args) {
  Outcome outcome = copyBuf(args, std::max(args.numbers[0], 1));
  outcome.results = {args.strings[0] == null ? -1 : 0};
  return outcome;
}

inline Outcome escape(const Args& args) {
  Units string;
  for (const char16_t unit : args.strings[1] == null ? u"" : args.strings[1]) {
    const bool isPrintable = unit >= u' ' && unit <= u'~';
    const Units piece = isPrintable ? Units(1, unit) : u"&(0x" + digits(unit, 16) + u")";
    if (length(string) + length(piece) >= args.numbers[0]) break;
    string += piece;
  }
  return makes(args, string);
}

}  // namespace contract
