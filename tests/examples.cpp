// What the functions do, written out, and what is particular to some of them.
#include <cstring>

#include "functions.h"

namespace {

static_assert(std::is_same_v<INT8, int8_t> && std::is_same_v<WCHAR, uint16_t> &&
              std::is_same_v<WORD, uint16_t>);

// A call and its outcome. The first string of a function that writes to a buffer is u"". In
// functions of one width, units from 128 on stand for those of toUnitsOf().
struct Example {
  const char* name;
  std::vector<Units> strings;
  std::vector<int> numbers;
  Outcome outcome;
};

template <typename To, typename From>
void checkExamples(const std::vector<Function<To, From>>& table,
                   const std::vector<Example>& examples) {
  for (Example one : examples) {
    if (std::is_same_v<To, From>) {
      for (Units& units : one.strings) units = toUnitsOf<To>(units);
      one.outcome.written = toUnitsOf<To>(one.outcome.written);
    }
    for (unsigned seed = 0; seed < 16; ++seed) {
      check(find(table, one.name), {one.strings, one.numbers}, seed, &one.outcome);
    }
  }
}

TEST_CASE_TEMPLATE("StrLen, StrUpper, StrLower: examples", Unit, char, WCHAR) {
  checkExamples(functions<Unit>,
                {{"StrLen", {u"temperature"}, {}, gives(11)},
                 {"StrUpper", {u"a1Z{\u00e9"}, {}, gives(0).writesString(u"A1Z{\u00e9")},
                 {"StrLower", {u"aA[@\u00c9"}, {}, gives(0).writesString(u"aa[@\u00c9")}});
}

TEST_CASE("CharToLower, CharToUpper: the 26 letters and nothing else") {
  for (int c = -200; c < (isFast ? 70000 : 400); ++c) {
    for (const unsigned high : {0U, 1U << 8, 1U << 24, 1U << 31}) {
      const int value = c ^ static_cast<int>(high);
      for (const auto& function : ofInts) check(function, {{u""}, {value}}, 0);
    }
  }
}

TEST_CASE_TEMPLATE("StrCopy, StrCopyBuf, StrNCopy: examples", Unit, char, WCHAR) {
  checkExamples(functions<Unit>, {{"StrCopy", {u"", u"abc"}, {}, writesString(u"abc")},
                                  {"StrCopyBuf", {u"", u"abcdef"}, {4}, writesString(u"abc")},
                                  {"StrCopyBuf", {u"", u"abc"}, {0}, writesNothing()},
                                  {"StrCopyBuf", {u"", null}, {0}, writesNothing()},
                                  {"StrNCopy", {u"", u"abcde"}, {3}, writes(u"abc")},
                                  {"StrNCopy", {u"", u"ab"}, {5}, writesString(u"ab")},
                                  {"StrNCopy", {u"", u"ab"}, {0}, writesString(u"")}});
}

TEST_CASE_TEMPLATE("StrCopy, StrCopyBuf, StrNCopy: dst begins before src and overlaps it", Unit,
                   char, WCHAR) {
  const Units string = longString<Unit>(21) + u'\0';
  for (size_t distance = 1; distance < 12; ++distance) {
    const auto checkCopy = [&](auto copy, const Units& expected) {
      Memory<Unit> memory(Units(distance, u'-') + string, string.size() + distance, 1, 0);
      copy(memory.get(), memory.get() + distance);
      CHECK_MESSAGE(memory.holds(expected), "from ", distance, " units on: ", memory.shown());
    };
    checkCopy([](Unit* dst, Unit* src) { twin<Unit>(StrCopy, WStrCopy)(dst, src); }, string);
    for (const int n : {1, 15, 22, 30}) {
      const Units units = contract::firstOf(string, n);
      checkCopy([n](Unit* dst, Unit* src) { twin<Unit>(StrNCopy, WStrNCopy)(dst, src, n); }, units);
      checkCopy([n](Unit* dst, Unit* src) { twin<Unit>(StrCopyBuf, WStrCopyBuf)(dst, n, src); },
                contract::firstOf(string, std::min(n, 22) - 1) + u'\0');
    }
  }
}

TEST_CASE_TEMPLATE("StrCat, StrCatBuf, WStrNCat, WStrNCatBuf: examples", Unit, char, WCHAR) {
  checkExamples(functions<Unit>, {{"StrCat", {u"ab", u"cd"}, {}, writesString(u"abcd")},
                                  {"StrCatBuf", {u"ab", u"cdef"}, {4}, writesString(u"abc")},
                                  {"StrCatBuf", {u"abc", u"def"}, {4}, writesNothing()},
                                  {"StrCatBuf", {u"", u"g"}, {1}, writesNothing()}});
  checkExamples(wideOnly, {{"WStrNCat", {u"ab", u"cdef"}, {2}, writesString(u"abcd")},
                           {"WStrNCatBuf", {u"ab", u"cdef"}, {10, 3}, writesString(u"abcde")},
                           {"WStrNCatBuf", {u"ab", u"cdef"}, {5, 3}, writesString(u"abcd")},
                           {"WStrNCatBuf", {u"", u"cdef"}, {1, 3}, writesNothing()}});
}

TEST_CASE_TEMPLATE("StrChr, StrStr, StrIStr: examples", Unit, char, WCHAR) {
  checkExamples(functions<Unit>, {{"StrChr", {u"abca", u"a"}, {}, gives(0)},
                                  {"StrChr", {u"abc", u""}, {}, gives(-1)},
                                  {"StrStr", {u"aaab", u"aab"}, {}, gives(1)},
                                  {"StrStr", {u"", u""}, {}, gives(-1)},
                                  {"StrIStr", {u"xxHeLLo", u"hEllO"}, {}, gives(2)}});
}

TEST_CASE_TEMPLATE("StrCmp, StrICmp, StrNCmp, StrNICmp: examples", Unit, char, WCHAR) {
  checkExamples(functions<Unit>, {{"StrCmp", {u"abc", u"abd"}, {}, gives(-3)},
                                  {"StrCmp", {u"\u00e9", u"a"}, {}, gives(1)},
                                  {"StrICmp", {u"abC", u"ABd"}, {}, gives(-3)},
                                  {"StrNCmp", {u"abcX", u"abcY"}, {3}, gives(0).readsAtMost(3)},
                                  {"StrNCmp", {u"abcX", u"abcY"}, {4}, gives(-4).readsAtMost(4)},
                                  {"StrNICmp", {u"b", u"A"}, {5}, gives(isWide<Unit> ? 1 : -1)}});
  checkExamples(functions<WCHAR>, {{"StrCmp", {u"\ue000", u"\xd800"}, {}, gives(1)}});
  const auto compare = twin<Unit>(StrCmp, WStrCmp);
  const Unit text[] = {'a', 'a', 'b', 0};
  CHECK(compare(text, text + 1) == -2);
  Memory<Unit> nothing(u"", 0, 1, 0);
  const Unit* const same = nothing.get();  // a pointer that must not be read from
  CHECK(compare(same, same) == 0);
  CHECK(twin<Unit>(StrICmp, WStrICmp)(same, same) == 0);
  CHECK(twin<Unit>(StrNCmp, WStrNCmp)(same, same, 3) == 0);
  CHECK(twin<Unit>(StrNICmp, WStrNICmp)(same, same, 3) == 0);
}

TEST_CASE_TEMPLATE("StrToken, StrSplit, StrTrim: examples", Unit, char, WCHAR) {
  checkExamples(
      functions<Unit>,
      {{"StrToken",
        {u",,ab,,c,", u","},
        {0},
        gives({2, 5, 6, 8, -1, 8, -1, 8}).writes(u",,ab\0,c\0\0"s)},
       {"StrToken", {u"a b;c", u" ;"}, {2}, gives({2, 4, 4, 5, -1, 5, -1, 5}).writes(u"a b\0c\0"s)},
       {"StrSplit", {u",,ab,,c,", u","}, {}, gives({2, 2, 6}).writes(u",,ab\0,c\0\0"s)},
       {"StrSplit", {u",,", u","}, {}, gives(0).writesString(u",,")},
       {"StrTrim", {u"--ab-.", u"-."}, {}, gives(2).writes(u"ab\0b\0.\0"s)},
       {"StrTrim", {u"--", u"-"}, {}, gives(0).writes(u"\0-\0"s)},
       {"StrTrim", {u"a-b", null}, {}, gives(3).writesString(u"a-b")}});
  Memory<Unit> memory(u"a,b\0,"s, 6, 1, 0);
  Unit* const text = memory.get();
  CHECK(twin<Unit>(StrToken, WStrToken)(text, nullptr, text + 4) == nullptr);
  CHECK(twin<Unit>(StrSplit, WStrSplit)(text, text + 4, nullptr) == 0);
  CHECK_MESSAGE(memory.holds(u""), memory.shown());
}

TEST_CASE_TEMPLATE("StrReplace: examples", Unit, char, WCHAR) {
  checkExamples(
      functions<Unit>,
      {{"StrReplace", {u"", u"a-b-c", u"-", u"=="}, {}, gives(7).writesString(u"a==b==c")},
       {"StrReplace", {null, u"abcabc", u"abc", u"x"}, {}, gives(2)},
       {"StrReplace", {u"", u"aXbX", u"X", u"XX"}, {}, gives(6).writesString(u"aXXbXX")},
       {"StrReplace", {u"", u"a", u"", u"b"}, {}, gives(0)},
       {"StrReplace", {u"", u"", u"a", u"b"}, {}, gives(0).writesString(u"")}});
}

TEST_CASE_TEMPLATE("IntToStr, StrToInt: examples", Unit, char, WCHAR) {
  const Units zeros(31, u'0');
  checkExamples(functions<Unit>,
                {{"IntToStr", {u""}, {-123, 10}, gives(0).writesString(u"-123")},
                 {"IntToStr", {u""}, {255, 16}, gives(0).writesString(u"ff")},
                 {"IntToStr", {u""}, {INT_MIN, 2}, gives(0).writesString(u"-1" + zeros)},
                 {"IntToStr", {u""}, {7, 0}, gives(0).writesString(u"")},
                 {"StrToInt", {u" \t -42x"}, {}, gives(-42)},
                 {"StrToInt", {u"2147483648"}, {}, gives(INT_MIN)},
                 {"StrToInt", {u"4294967297"}, {}, gives(1)}});
}

TEST_CASE("BytesToWords, StrToWStr, WStrToStr, WStrToWords: examples") {
  checkExamples(widening,
                {{"BytesToWords", {u"", u"a\0\u00ff\0"s}, {4}, writes(u"a\0\u00ff\0"s)},
                 {"StrToWStr", {u"", u"\u00e9\u00ff"}, {5}, gives(0).writesString(u"\u00e9\u00ff")},
                 {"StrToWStr", {u"", u"abc"}, {0}, gives(0).writesString(u"")}});
  checkExamples(narrowing,
                {{"WStrToStr", {u"", u"a\nb"}, {20}, gives(0).writesString(u"a&(0xa)b")},
                 {"WStrToStr", {u"", u"\n"}, {6}, gives(0).writesString(u"")},
                 {"WStrToStr", {u"", u"a\u4e2db"}, {10}, gives(0).writesString(u"a")},
                 {"WStrToStr", {u"", u"\u4e2d"}, {10}, gives(0).writesString(u"&(0x4e2d)")}});
  checkExamples(wideOnly, {{"WStrToWords", {u"", u"a\0\u4e2d\0b"s}, {4}, writes(u"a\0\u4e2d\0"s)}});
}

TEST_CASE("BytesToWords, WStrToWords: overlapping arrays are copied forward") {
  for (int from = 0; from < 20; ++from) {
    for (int to = 0; to < 20; ++to) {
      CAPTURE(from);
      CAPTURE(to);
      alignas(4) WORD area[40];
      WORD expected[40];
      for (WORD i = 0; i < 40; ++i) expected[i] = area[i] = static_cast<WORD>(0x8100 + i * 0x301);
      for (int k = 0; k < 19; ++k) expected[to + k] = expected[from + k];
      WStrToWords(area + from, area + to, 19);
      CHECK(std::memcmp(area, expected, sizeof area) == 0);
      // Bytes at any distance from the words, even the bytes of these words.
      unsigned char bytes[sizeof area];
      std::memcpy(bytes, area, sizeof bytes);
      for (int k = 0; k < 19; ++k) {
        const WORD word = bytes[from + k];
        std::memcpy(bytes + 2 * (to + k), &word, sizeof word);
      }
      BytesToWords(reinterpret_cast<const char*>(area) + from, area + to, 19);
      CHECK(std::memcmp(area, bytes, sizeof area) == 0);
    }
  }
}

TEST_CASE_TEMPLATE("Nothing is written where nothing changes", Unit, char, WCHAR) {
  // Where constant data is protected, a write to it is a fault.
  static const Unit uppercase[] = {'A', '1', 'Z', '{', '_', static_cast<Unit>(0xe1), 0};
  static const Unit lowercase[] = {'a', '1', 'z', '@', '[', static_cast<Unit>(0xc1), 0};
  Unit* const text = const_cast<Unit*>(lowercase);
  CHECK(twin<Unit>(StrUpper, WStrUpper)(const_cast<Unit*>(uppercase)) == uppercase);
  CHECK(twin<Unit>(StrLower, WStrLower)(text) == lowercase);
  twin<Unit>(StrCopy, WStrCopy)(text, text);
  twin<Unit>(StrCopyBuf, WStrCopyBuf)(text, 0, uppercase);
  for (const int n : {INT_MIN, 0, 1, 3, 6, 7}) {
    twin<Unit>(StrCopyBuf, WStrCopyBuf)(text, n, text);
    twin<Unit>(StrNCopy, WStrNCopy)(text, text, n);
    twin<Unit>(StrCatBuf, WStrCatBuf)(text, n, uppercase);
    if constexpr (isWide<Unit>) WStrNCatBuf(text, n, uppercase, 9);
  }
  CHECK(twin<Unit>(StrReplace, WStrReplace)(text, uppercase, uppercase, text) == 6);
}

}  // namespace
