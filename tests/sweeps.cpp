// All functions with arguments of all kinds, compared with what their contracts say.
#include "functions.h"

namespace {

TEST_CASE("Every function: every choice of null pointers") {
  forEachFunction([](const auto& function) {
    const size_t strings = function.stringCount();
    const size_t numbers = function.roles.size() - strings;
    unsigned seed = 0;
    for (unsigned nulls = 1; nulls < 1U << strings; ++nulls) {
      for (const int n : {INT_MIN, -1, 0, 1, 2, 5}) {
        Args args = {std::vector<Units>(strings, u"ab"), std::vector<int>(numbers, n)};
        for (size_t i = 0; i < strings; ++i) {
          if ((nulls >> i & 1) != 0) args.strings[i] = null;
        }
        check(function, args, ++seed);
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

// All strings of up to so many units of an alphabet.
std::vector<Units> allStrings(const Units& alphabet, size_t longest) {
  std::vector<Units> strings = {u""};
  for (size_t i = 0; strings[i].size() < longest; ++i) {
    for (const char16_t unit : alphabet) strings.push_back(strings[i] + unit);
  }
  return strings;
}

// Bounds at and around a length, and those at which a count of 16 bits goes wrong.
std::vector<int> boundsAround(size_t length) {
  std::vector<int> bounds = {INT_MIN, -65536, -1, 0, 1, 65536, 65537, 65539, INT_MAX};
  for (int more = -5; more <= 3; ++more) bounds.push_back(static_cast<int>(length) + more);
  return bounds;
}

// Finds loops unrolled four times and counts of 8 or 16 bits that go wrong.
TEST_CASE("Every function: strings and bounds of many lengths") {
  std::vector<size_t> lengths = {257, 256, 255, 64, 63};
  if (!isBoard) lengths.insert(lengths.begin(), {1024, 1023, 513, 512, 511});
  if (isFast) lengths.insert(lengths.begin(), 70000);
  for (size_t length = isBoard ? 20 : 40; length-- > 0;) lengths.push_back(length);
  forEachFunction([&](const auto& function) {
    const size_t strings = function.stringCount();
    const Role last = function.roles.back();
    unsigned seed = 0;
    for (const size_t length : lengths) {
      const Units text = longString(length);
      const bool isBounded = last == number || last == elements;
      for (const int bound : isBounded ? boundsAround(length) : std::vector<int>{0}) {
        if (last == elements && bound > static_cast<int>(length)) continue;
        for (Args args : {Args{{text, text + u"#", u"#", text}, {bound, bound}},
                          Args{{text + u"#", u"#", u"a", u"bc"}, {bound, bound}}}) {
          args.strings.resize(strings);
          args.numbers.resize(function.roles.size() - strings);
          if (function.roles[0] == buffer) args.strings[0] = u"";
          if (function.roles[0] == buffer && strings > 1) args.strings[1] = text;
          check(function, args, ++seed);
        }
      }
    }
  });
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
  for (const size_t n : {15U, 16U, 63U, 255U, 256U, 257U, isFast ? 65537U : 300U}) {
    const Units set = repeated(u"#$%&'()*+", n / 9) + u"!";
    for (const auto& [text, units] :
         {std::pair(repeated(u"a,", n), u","s),
          {u"!a!b!!", set},
          {repeated(u" ", n) + longString(n) + repeated(u" ", n), u"- "s}}) {
      check(find(table, "StrToken"), {{text, units}, {0}}, 0);
      check(find(table, "StrSplit"), {{text, units}, {}}, 0);
      check(find(table, "StrTrim"), {{text, units}, {}}, 0);
    }
    const Units text = longString(n);
    for (const Units& result : {u""s, null}) {
      const auto& replace = find(table, "StrReplace");
      check(replace, {{result, repeated(u"a,", n), u",", u";-"}, {}}, 0);
      check(replace, {{result, u"-" + text + u"-", text, text + u"+"}, {}}, 0);
    }
  }
}

TEST_CASE_TEMPLATE("IntToStr: boundary and random values in many radices", Unit, char, WCHAR) {
  const auto& intToStr = find(functions<Unit>, "IntToStr");
  std::vector<int> values = {0, INT_MIN, INT_MIN + 1, INT_MAX, -123, 4095, -4096, 65536};
  for (int power = 1; power < 1000000000; power *= 10) {
    values.insert(values.end(), {power, power - 1, -power, 1 - power});
  }
  std::vector<int> radices = {INT_MIN, 64, 170, 1000, 70000, INT_MAX - 1, INT_MAX};
  for (int radix = -1; radix < 42; ++radix) radices.push_back(radix);
  for (const int value : values) {
    for (const int radix : radices) check(intToStr, {{u""}, {value, radix}}, 0);
  }
  // Also where a reciprocal instead of a division would be wrong first.
  Random random(1);
  for (int i = 0; i < (isBoard ? 500 : 20000); ++i) {
    const auto any = static_cast<int>(random(1U << 15) << 16 | random(1U << 16));
    for (const int value : {i, any, any & 0x3ffff, INT_MAX - i}) {
      check(intToStr, {{u""}, {value, i % 4 > 0 ? 10 : i / 4 % 101}}, 0);
    }
  }
}

TEST_CASE_TEMPLATE("StrToInt: all short strings and long ones", Unit, char, WCHAR) {
  std::vector<Units> strings = allStrings(u" \t-0\u00b19x", isBoard ? 3 : 4);
  for (Units rest =
           u"12a34,007,0x1f,-000000000000000000012,\n5,\r7,\v5,\f5,\u00855,\u00a05,/1,:1,5:,6/,"
           u"1.2,2147483647,-2147483648,42949672945,-4294967297,655360000,1\u00b2,-\t4,"
           u"123456789012345678901234567890,         \t \t     -8765432109x,";
       !rest.empty(); rest.erase(0, rest.find(u',') + 1)) {
    strings.push_back(rest.substr(0, rest.find(u',')));
  }
  strings.push_back(Units(300, u' ') + u"-" + Units(isBoard ? 1100 : 66000, u'0') + u"7");
  for (const char16_t unit :
       {u'\u0132', u'\uff15', u'\u0120', u'\u012d', u'\u3000', u'\u8020', u'\u8035'}) {
    if (isWide<Unit>) strings.push_back({unit, u'1', unit, u'5'});
  }
  unsigned seed = 0;
  for (const Units& one : strings) check(find(functions<Unit>, "StrToInt"), {{one}, {}}, ++seed);
}

}  // namespace
