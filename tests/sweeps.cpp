// All functions with arguments of all kinds, compared with what their contracts say.
#include "functions.h"

namespace {

// Each choice of pointers that are null, with counts around 0.
template <typename To, typename From>
void checkNulls(const Function<To, From>& function) {
  const std::string& arguments = function.arguments;
  const auto numbers = static_cast<size_t>(std::count(arguments.begin(), arguments.end(), 'n'));
  const size_t texts = arguments.size() - numbers;
  for (unsigned nulls = 1; nulls < 1U << texts; ++nulls) {
    for (const int n : {INT_MIN, -1, 0, 1, 2, 5}) {
      Args args = {std::vector<Units>(texts, u"ab"), std::vector<int>(numbers, n)};
      for (size_t i = 0; i < texts; ++i) {
        if ((nulls >> i & 1) != 0) args.texts[i] = null;
      }
      check(function, args);
    }
  }
}

TEST_CASE_TEMPLATE("Every function, with every choice of null pointers", Unit, char, WCHAR) {
  withEach<Unit>([](const auto& function) { checkNulls(function); });
}

TEST_CASE_TEMPLATE("Every function, with arguments by chance", Unit, char, WCHAR) {
  const auto choose = [](size_t n) { return nextNumber(static_cast<unsigned>(n)); };
  withEach<Unit>([&](const auto& function) {
    for (int i = 0; i < (isFast ? 15000 : isBoard ? 150 : 6000); ++i)
      checkByChance(function, choose);
  });
}

// All texts of up to so many units of an alphabet.
std::vector<Units> allTexts(const Units& alphabet, size_t longest) {
  std::vector<Units> texts = {u""};
  for (size_t i = 0; texts[i].size() < longest; ++i) {
    for (const char16_t unit : alphabet) texts.push_back(texts[i] + unit);
  }
  return texts;
}

// Bounds at and around a length, and those at which a count of 16 bits goes wrong.
std::vector<int> boundsAround(size_t length) {
  std::vector<int> bounds = {INT_MIN, -65536, -1, 0, 1, 65536, 65537, 65539, INT_MAX};
  for (int more = -5; more <= 3; ++more) bounds.push_back(static_cast<int>(length) + more);
  return bounds;
}

// Where a loop of four steps or a count of 8 or 16 bits goes wrong. The longest comes first: what
// is left of it is there for the others.
TEST_CASE_TEMPLATE("Every function, with texts and bounds of many lengths", Unit, char, WCHAR) {
  std::vector<size_t> lengths = {257, 256, 255, 64, 63};
  if (!isBoard) lengths.insert(lengths.begin(), {1024, 1023, 513, 512, 511});
  if (isFast) lengths.insert(lengths.begin(), 70000);
  for (size_t length = isBoard ? 20 : 40; length-- > 0;) lengths.push_back(length);
  withEach<Unit>([&](const auto& function) {
    const std::string& arguments = function.arguments;
    const bool isBounded = arguments.back() == 'n' && function.name != "StrToken";
    for (const size_t length : lengths) {
      const Units text = longText(length);
      for (const int bound : isBounded ? boundsAround(length) : std::vector<int>{0}) {
        const bool hasUnits = function.name.find("ToWords") != std::string::npos;
        if (hasUnits && bound > static_cast<int>(length)) continue;
        for (Args args : {Args{{text, text + u"#", u"#", text}, {bound, bound}},
                          Args{{text + u"#", u"#", u"a", u"bc"}, {bound, bound}}}) {
          const size_t texts = std::min(arguments.find('n'), arguments.size());
          args.texts.resize(texts);
          args.numbers.resize(arguments.size() - texts);
          if (!function.readsFirst()) args.texts[0] = u"";
          if (!function.readsFirst() && args.texts.size() > 1) args.texts[1] = text;
          check(function, args);
        }
      }
    }
  });
}

// n times the same.
Units repeated(const Units& units, size_t n) {
  Units text;
  while (text.size() < n * units.size()) text += units;
  return text;
}

TEST_CASE_TEMPLATE("StrToken, StrSplit, StrTrim and StrReplace, with many tokens and long sets",
                   Unit, char, WCHAR) {
  for (const size_t n : {15U, 16U, 63U, 255U, 256U, 257U, isFast ? 65537U : 300U}) {
    const Units set = repeated(u"#$%&'()*+", n / 9) + u"!";
    for (const auto& [text, units] :
         {std::pair(repeated(u"a,", n), u","s),
          {u"!a!b!!", set},
          {repeated(u" ", n) + longText(n) + repeated(u" ", n), u"- "s}}) {
      check(strToken<Unit>, {{text, units}, {0}});
      check(strSplit<Unit>, {{text, units}, {}});
      check(strTrim<Unit>, {{text, units}, {}});
    }
    for (const Units& result : {u""s, null}) {
      check(strReplace<Unit>, {{result, repeated(u"a,", n), u",", u";-"}, {}});
      check(strReplace<Unit>,
            {{result, u"-" + longText(n) + u"-", longText(n), longText(n) + u"+"}, {}});
    }
  }
}

TEST_CASE_TEMPLATE("IntToStr, with values all over the range and every radix", Unit, char, WCHAR) {
  std::vector<int> values = {0, INT_MIN, INT_MIN + 1, INT_MAX, -123, 4095, -4096, 65536};
  for (int power = 1; power < 1000000000; power *= 10) {
    values.insert(values.end(), {power, power - 1, -power, 1 - power});
  }
  for (const int value : values) {
    for (int radix = -1; radix < 42; ++radix) check(strFromInt<Unit>, {{u""}, {value, radix}});
    for (const int radix : {INT_MIN, 64, 170, 1000, 70000, INT_MAX - 1, INT_MAX}) {
      check(strFromInt<Unit>, {{u""}, {value, radix}});
    }
  }
  // Also where a reciprocal instead of a division would be wrong first.
  for (int i = 0; i < (isBoard ? 500 : 20000); ++i) {
    const auto some = static_cast<int>(nextNumber(1U << 15) << 16 | nextNumber(1U << 16));
    for (const int value : {i, some, some & 0x3ffff, INT_MAX - i}) {
      check(strFromInt<Unit>, {{u""}, {value, i % 4 > 0 ? 10 : i / 4 % 101}});
    }
  }
}

TEST_CASE_TEMPLATE("StrToInt, with all short texts and long ones", Unit, char, WCHAR) {
  std::vector<Units> texts = allTexts(u" \t-0\u00b19x", isBoard ? 3 : 4);
  for (Units rest =
           u"12a34,007,0x1f,-000000000000000000012,\n5,\r7,\v5,\f5,\u00855,\u00a05,/1,:1,5:,6/,"
           u"1.2,2147483647,-2147483648,42949672945,-4294967297,655360000,1\u00b2,-\t4,"
           u"123456789012345678901234567890,         \t \t     -8765432109x,";
       !rest.empty(); rest.erase(0, rest.find(u',') + 1)) {
    texts.push_back(rest.substr(0, rest.find(u',')));
  }
  texts.push_back(Units(300, u' ') + u"-" + Units(isBoard ? 1100 : 66000, u'0') + u"7");
  for (const Units& text : texts) check(strToInt<Unit>, {{text}, {}});
  for (const char16_t unit :
       {u'\u0132', u'\uff15', u'\u0120', u'\u012d', u'\u3000', u'\u8020', u'\u8035'}) {
    if (isWide<Unit>) check(strToInt<Unit>, {{{unit, u'1', unit, u'5'}}, {}});
  }
}

}  // namespace
