// All functions with arguments of all kinds, compared with what their contracts say.
#include "functions.h"

namespace {

// The arguments of a call that takes its strings from these, in their order, and n for each number.
template <typename To, typename From>
Args argsFor(const Function<To, From>& function, const std::vector<Units>& strings, int n) {
  Args args;
  size_t next = 0;
  for (const Role role : function.roles) {
    if (role == buffer) args.strings.emplace_back();
    if (role == string || role == array) args.strings.push_back(strings[next++]);
    if (role == number) args.numbers.push_back(n);
    if (role == offset) args.numbers.push_back(0);
    if (role == elements) args.numbers.push_back(std::min(n, contract::length(args.strings[1])));
  }
  return args;
}

TEST_CASE("Every function: every choice of null pointers") {
  forEachFunction([](const auto& function) {
    unsigned seed = 0;
    for (const int n : {INT_MIN, -1, 0, 1, 2, 5}) {
      const Args args = argsFor(function, {u"ab", u"ab", u"ab"}, n);
      for (unsigned nulls = 1; nulls < 1U << args.strings.size(); ++nulls) {
        Args some = args;
        for (size_t i = 0; i < args.strings.size(); ++i) {
          if ((nulls >> i & 1) != 0) some.strings[i] = null;
        }
        check(function, some, ++seed);
      }
    }
  });
}

TEST_CASE("Every function: random arguments") {
  forEachFunction([](const auto& function) {
    for (unsigned seed = 0; seed < (isFast ? 15000 : isBoard ? 150 : 6000); ++seed) {
      Random random(seed);
      checkRandomCall(function, random, seed);
    }
  });
}

// Bounds at and around a length, and those at which a count of 16 bits goes wrong.
std::vector<int> boundsAround(size_t length) {
  std::vector<int> bounds = {INT_MIN, -65536, -1, 0, 1, 65536, 65537, 65539, INT_MAX};
  for (int more = -5; more <= 3; ++more) bounds.push_back(static_cast<int>(length) + more);
  return bounds;
}

template <typename To, typename From>
void checkLength(const Function<To, From>& function, size_t length) {
  const Role last = function.roles.back();
  const bool isBounded = last == number || last == elements;
  const Units text = longString<From>(length);
  auto seed = static_cast<unsigned>(length) * 64;
  for (const int bound : isBounded ? boundsAround(length) : std::vector<int>{0}) {
    check(function, argsFor(function, {text + u"%", text + u"#", text}, bound), ++seed);
    check(function, argsFor(function, {text + u"#", u"#", text}, bound), ++seed);
    check(function, argsFor(function, {text, text, u"bc"}, bound), ++seed);
  }
}

// Finds unrolled loops and counts of 8 or 16 bits that go wrong.
TEST_CASE("Every function: strings and bounds of many lengths") {
  std::vector<size_t> lengths = {63, 64, 255, 256, 257};
  if (!isBoard) lengths.insert(lengths.end(), {511, 512, 513, 1023, 1024});
  if (isFast) lengths.push_back(70000);
  for (size_t length = 0; length < (isBoard ? 13 : 40); ++length) lengths.push_back(length);
  forEachFunction([&](const auto& function) {
    for (const size_t length : lengths) checkLength(function, length);
  });
}

// All strings of up to so many units of an alphabet.
std::vector<Units> allStrings(const Units& alphabet, size_t longest) {
  std::vector<Units> strings = {u""};
  for (size_t i = 0; strings[i].size() < longest; ++i) {
    for (const char16_t unit : alphabet) strings.push_back(strings[i] + unit);
  }
  return strings;
}

TEST_CASE("Every function: all pairs of short strings, with small bounds") {
  forEachFunction([](const auto& function) {
    unsigned seed = 0;
    const auto checkPairs = [&](const Units& alphabet, size_t longest1, size_t longest2) {
      for (const Units& one : allStrings(alphabet, longest1)) {
        for (const Units& other : allStrings(alphabet, longest2)) {
          const int n = static_cast<int>(Random(++seed)(9)) - 1;
          check(function, argsFor(function, {one, other, seed % 3 > 0 ? one : u""}, n), seed);
        }
      }
    };
    checkPairs(u"ab", isBoard ? 3 : 6, isBoard ? 2 : 4);
    if (!isBoard) checkPairs(u"aA,\u00e1", isFast ? 3 : 2, isFast ? 3 : 2);
  });
}

// All narrow units; for wide functions also each with several high bytes, and as a high byte.
template <typename From>
Units unitsToTry() {
  const Units boundaries = u" &+-/09:@AZ[`az{~\t\x1f\x7f\u0080\u00e1";
  Units units;
  for (char16_t unit = 1; unit < 256; ++unit) {
    if (isBoard && boundaries.find(unit) == Units::npos) continue;
    units += unit;
    for (const int wide : {unit | 0x100, unit | 0x2100, unit | 0x8000, unit | 0xff00, unit << 8}) {
      if (isWide<From>) units += static_cast<char16_t>(wide);
    }
  }
  return units;
}

template <typename To, typename From>
void checkUnits(const Function<To, From>& function) {
  constexpr int greatest = isWide<From> ? 0xffff : 0xff;
  unsigned seed = 0;
  for (const char16_t unit : unitsToTry<From>()) {
    // Each beside units that code might take for it.
    std::vector<int> others = {unit ^ 0x20, '7'};
    if (isFast) {
      others.insert(others.end(), {unit, unit + 1, unit - 1, unit + 0x20, unit - 0x20, unit ^ 0x80,
                                   unit ^ 0x100});
    }
    for (const int other : others) {
      if (other < 1 || other > greatest) continue;
      const Units one(1, unit);
      const Units two(1, static_cast<char16_t>(other));
      check(function, argsFor(function, {one + two + one, two, one}, 40), ++seed);
      check(function, argsFor(function, {one, two, u"7"}, 40), ++seed);
      check(function, argsFor(function, {two + one + two + u"7", two + u"7", one}, 40), ++seed);
    }
  }
  Units all;
  for (int unit = 1; unit <= (isBoard ? 0xff : greatest); ++unit) {
    all += static_cast<char16_t>(unit);
  }
  check(function, argsFor(function, {all, all.substr(all.size() - 1), u"7"}, INT_MAX), ++seed);
}

TEST_CASE("Every function: short strings with each unit") {
  forEachFunction([](const auto& function) { checkUnits(function); });
}

// n times the same.
Units repeated(const Units& units, size_t n) {
  Units string;
  while (string.size() < n * units.size()) string += units;
  return string;
}

TEST_CASE_TEMPLATE("StrToken, StrSplit, StrTrim, StrReplace: many tokens and long sets", Unit, char,
                   WCHAR) {
  const auto& table = functions<Unit>;
  for (const unsigned n : {15U, 16U, 63U, 255U, 256U, 257U, isFast ? 65537U : 300U}) {
    const Units word = longString<Unit>(n);
    const Units set = repeated(u"#$%&'()*+", n / 9) + u"!";
    for (const auto& [text, units] : {std::pair(repeated(u"a,", n), u","s),
                                      {u"!a!b!!", set},
                                      {repeated(u" ", n) + word + repeated(u" ", n), u"- "s}}) {
      check(find(table, "StrToken"), {{text, units}, {0}}, n);
      check(find(table, "StrSplit"), {{text, units}, {}}, n);
      check(find(table, "StrTrim"), {{text, units}, {}}, n);
    }
    for (const Units& result : {u""s, null}) {
      const auto& replace = find(table, "StrReplace");
      check(replace, {{result, repeated(u"a,", n), u",", u";-"}, {}}, n);
      check(replace, {{result, u"-" + word + u"-", word, word + u"+"}, {}}, n);
    }
  }
}

TEST_CASE_TEMPLATE("IntToStr: boundary and random values in many radices", Unit, char, WCHAR) {
  unsigned seed = 0;
  const auto checkCall = [&seed](int value, int radix) {
    check(find(functions<Unit>, "IntToStr"), {{u""}, {value, radix}}, ++seed);
  };
  std::vector<int> values = {0, INT_MIN, INT_MIN + 1, INT_MAX, -123, 4095, -4096, 65449, 65536};
  for (int power = 1; power < 1000000000; power *= 10) {
    values.insert(values.end(), {power, power - 1, -power, 1 - power});
  }
  std::vector<int> radices = {INT_MIN, 65449, 65450, 70000, INT_MAX - 1, INT_MAX};
  for (int radix = -1; radix < 42; ++radix) radices.push_back(radix);
  for (const int value : values) {
    for (const int radix : radices) checkCall(value, radix);
  }
  // Also where a reciprocal instead of a division would be wrong first.
  Random random(1);
  for (int i = 0; i < (isBoard ? 500 : 20000); ++i) {
    const auto any = static_cast<int>(random(1U << 15) << 16 | random(1U << 16));
    for (const int value : {i, any, any & 0x3ffff, INT_MAX - i}) {
      checkCall(value, i % 4 > 0 ? 10 : i / 4 % 301);
    }
  }
}

TEST_CASE_TEMPLATE("StrToInt: short strings and long ones", Unit, char, WCHAR) {
  std::vector<Units> strings = allStrings(toUnitsOf<Unit>(u" \t-+0\u00b19x"), isBoard ? 3 : 4);
  strings.insert(strings.end(),
                 {u"007", u"0x1f", u"1.2", u"-000000000000000000012", u"2147483647", u"-2147483648",
                  u"42949672945", u"-4294967297", u"655360000", u"123456789012345678901234567890",
                  u"    \t \t     -8765432109x",
                  Units(300, u' ') + u"-" + Units(isBoard ? 1100 : 66000, u'0') + u"7"});
  unsigned seed = 0;
  for (const Units& one : strings) check(find(functions<Unit>, "StrToInt"), {{one}, {}}, ++seed);
}

TEST_CASE("WStrToStr: short strings with every capacity") {
  const std::vector<Units> strings = allStrings(u"a\n\x7f\u0123\u4e2d", isBoard ? 2 : 3);
  unsigned seed = 0;
  for (const Units& one : strings) {
    for (int bufsize = -1; bufsize < 30; ++bufsize) {
      check(find(narrowing, "WStrToStr"), {{u"", one}, {bufsize}}, ++seed);
    }
  }
}

}  // namespace
