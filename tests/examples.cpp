// What the functions do, written out, and what is particular to some.
#include <cstring>

#include "functions.h"

namespace {

static_assert(std::is_same_v<INT8, int8_t> && std::is_same_v<WCHAR, uint16_t> &&
              std::is_same_v<WORD, uint16_t>);

TEST_CASE_TEMPLATE("StrLen, StrUpper, StrLower: examples", Unit, char, WCHAR) {
  checkExamples<Unit>({{strLen<Unit>, {{u"temperature"}, {}}, 11},
                       {strUpper<Unit>, {{u"a1Z{\u00e9"}, {}}, {{0}, u"A1Z{\u00e9\0"s}},
                       {strLower<Unit>, {{u"aA[@\u00c9"}, {}}, {{0}, u"aa[@\u00c9\0"s}}});
}

TEST_CASE("CharToLower and CharToUpper map the 26 letters and nothing else") {
  for (int c = -300; c < (isBoard ? 300 : 70000); ++c) {
    check(ofCharToLower, {{u""}, {c}});
    check(ofCharToUpper, {{u""}, {c}});
  }
}

TEST_CASE_TEMPLATE("StrCopy, StrCopyBuf, StrNCopy: examples", Unit, char, WCHAR) {
  checkExamples<Unit>({{strCopy<Unit>, {{u"", u"abc"}, {}}, {{}, u"abc\0"s}},
                       {strCopyBuf<Unit>, {{u"", u"abcdef"}, {4}}, {{}, u"abc\0"s}},
                       {strCopyBuf<Unit>, {{u"", u"abc"}, {0}}, {}},
                       {strCopyBuf<Unit>, {{u"", null}, {0}}, {}},
                       {strNCopy<Unit>, {{u"", u"abcde"}, {3}}, {{}, u"abc"}},
                       {strNCopy<Unit>, {{u"", u"ab"}, {5}}, {{}, u"ab\0"s}},
                       {strNCopy<Unit>, {{u"", u"ab"}, {0}}, {{}, u"\0"s}}});
}

TEST_CASE_TEMPLATE("StrCopy, StrCopyBuf and StrNCopy move text left", Unit, char, WCHAR) {
  const Units text = lift<Unit>(longText(21)) + u'\0';
  for (size_t distance = 1; distance < 12; ++distance) {
    for (int form = 0; form < 3; ++form) {
      const size_t size = text.size() + distance;
      Memory<Unit> buffer(Units(distance, u'-') + text, size, size);
      Unit* const dst = buffer.get();
      if (form == 0) twin::Copy<Unit>(dst, dst + distance);
      if (form == 1) twin::CopyBuf<Unit>(dst, 30, dst + distance);
      if (form == 2) twin::NCopy<Unit>(dst, dst + distance, 30);
      CAPTURE(form);
      CHECK_MESSAGE(buffer.holds(text), "by ", distance, ": ", buffer.shown());
    }
  }
}

TEST_CASE_TEMPLATE("StrCat, StrCatBuf, WStrNCat, WStrNCatBuf: examples", Unit, char, WCHAR) {
  checkExamples<Unit>({{strCat<Unit>, {{u"ab", u"cd"}, {}}, {{}, u"abcd\0"s}},
                       {strCatBuf<Unit>, {{u"ab", u"cdef"}, {4}}, {{}, u"abc\0"s}},
                       {strCatBuf<Unit>, {{u"abc", u"def"}, {4}}, {}},
                       {strCatBuf<Unit>, {{u"", u"g"}, {1}}, {}}});
  checkExamples<WCHAR>({{ofWStrNCat, {{u"ab", u"cdef"}, {2}}, {{}, u"abcd\0"s}},
                        {ofWStrNCatBuf, {{u"ab", u"cdef"}, {10, 3}}, {{}, u"abcde\0"s}},
                        {ofWStrNCatBuf, {{u"ab", u"cdef"}, {5, 3}}, {{}, u"abcd\0"s}},
                        {ofWStrNCatBuf, {{u"", u"cdef"}, {1, 3}}, {}}});
}

TEST_CASE_TEMPLATE("StrChr, StrStr, StrIStr: examples", Unit, char, WCHAR) {
  checkExamples<Unit>({{strChr<Unit>, {{u"abca", u"a"}, {}}, 0},
                       {strChr<Unit>, {{u"abc", u""}, {}}, -1},
                       {strStr<Unit>, {{u"aaab", u"aab"}, {}}, 1},
                       {strStr<Unit>, {{u"", u""}, {}}, -1},
                       {strIStr<Unit>, {{u"xxHeLLo", u"hEllO"}, {}}, 2}});
}

TEST_CASE_TEMPLATE("All comparisons: examples", Unit, char, WCHAR) {
  checkExamples<Unit>({{strCmp<Unit>, {{u"abc", u"abd"}, {}}, -3},
                       {strCmp<Unit>, {{u"\u00e9", u"a"}, {}}, 1},
                       {strICmp<Unit>, {{u"abC", u"ABd"}, {}}, -3},
                       {strNCmp<Unit>, {{u"abcX", u"abcY"}, {3}}, {{0}, u"", 3, 3}},
                       {strNCmp<Unit>, {{u"abcX", u"abcY"}, {4}}, {{-4}, u"", 4, 4}},
                       {strNICmp<Unit>, {{u"b", u"A"}, {5}}, isWide<Unit> ? 1 : -1}});
  checkExamples<WCHAR>({{strCmp<WCHAR>, {{u"\ue000", u"\xd800"}, {}}, 1}});
  const Unit text[] = {'a', 'a', 'b', 0};
  CHECK(twin::Cmp<Unit>(text, text + 1) == -2);  // its own end
  Memory<Unit> nothing(u"", 0, 0);
  const Unit* const same = nothing.get();  // where no unit is
  CHECK(twin::Cmp<Unit>(same, same) == 0);
  CHECK(twin::ICmp<Unit>(same, same) == 0);
  CHECK(twin::NCmp<Unit>(same, same, 3) == 0);
  CHECK(twin::NICmp<Unit>(same, same, 3) == 0);
}

TEST_CASE_TEMPLATE("StrToken, StrSplit, StrTrim: examples", Unit, char, WCHAR) {
  checkExamples<Unit>(
      {{strToken<Unit>, {{u",,ab,,c,", u","}, {0}}, {{2, 5, 6, 8, -1, 8, -1, 8}, u",,ab\0,c\0\0"s}},
       {strToken<Unit>, {{u"a b;c", u" ;"}, {2}}, {{2, 4, 4, 5, -1, 5, -1, 5}, u"a b\0c\0"s}},
       {strSplit<Unit>, {{u",,ab,,c,", u","}, {}}, {{2, 2, 6}, u",,ab\0,c\0\0"s}},
       {strSplit<Unit>, {{u",,", u","}, {}}, {{0}, u",,\0"s}},
       {strTrim<Unit>, {{u"--ab-.", u"-."}, {}}, {{2}, u"ab\0b\0.\0"s}},
       {strTrim<Unit>, {{u"--", u"-"}, {}}, {{0}, u"\0-\0"s}},
       {strTrim<Unit>, {{u"a-b", null}, {}}, {{3}, u"a-b\0"s}}});
  Unit text[] = {'a', ',', 'b', 0};
  CHECK(twin::Token<Unit>(text, nullptr, text + 1) == nullptr);
  CHECK(twin::Split<Unit>(text, text + 2, nullptr) == 0);
}

TEST_CASE_TEMPLATE("StrReplace: examples", Unit, char, WCHAR) {
  checkExamples<Unit>({{strReplace<Unit>, {{u"", u"a-b-c", u"-", u"=="}, {}}, {{7}, u"a==b==c\0"s}},
                       {strReplace<Unit>, {{null, u"abcabc", u"abc", u"x"}, {}}, 2},
                       {strReplace<Unit>, {{u"", u"aXbX", u"X", u"XX"}, {}}, {{6}, u"aXXbXX\0"s}},
                       {strReplace<Unit>, {{u"", u"a", u"", u"b"}, {}}, 0},
                       {strReplace<Unit>, {{u"", u"", u"a", u"b"}, {}}, {{0}, u"\0"s}}});
}

TEST_CASE_TEMPLATE("IntToStr, StrToInt: examples", Unit, char, WCHAR) {
  checkExamples<Unit>(
      {{strFromInt<Unit>, {{u""}, {-123, 10}}, {{0}, u"-123\0"s}},
       {strFromInt<Unit>, {{u""}, {255, 16}}, {{0}, u"ff\0"s}},
       {strFromInt<Unit>, {{u""}, {INT_MIN, 2}}, {{0}, u"-1" + Units(31, u'0') + u'\0'}},
       {strFromInt<Unit>, {{u""}, {7, 0}}, {{0}, u"\0"s}},
       {strToInt<Unit>, {{u" \t -42x"}, {}}, -42},
       {strToInt<Unit>, {{u"2147483648"}, {}}, INT_MIN},
       {strToInt<Unit>, {{u"4294967297"}, {}}, 1}});
}

TEST_CASE("BytesToWords, StrToWStr, WStrToStr, WStrToWords: examples") {
  checkExamples<WORD, char>(
      {{ofBytesToWords, {{u"", u"a\0\u00ff"s}, {3}}, {{}, u"a\0\u00ff"s}},
       {ofStrToWStr, {{u"", u"\u00e9\u00ff"}, {5}}, {{0}, u"\u00e9\u00ff\0"s}},
       {ofStrToWStr, {{u"", u"abc"}, {0}}, {{0}, u"\0"s}}});
  checkExamples<char, WCHAR>({{ofWStrToStr, {{u"", u"a\nb"}, {20}}, {{0}, u"a&(0xa)b\0"s}},
                              {ofWStrToStr, {{u"", u"\n"}, {6}}, {{0}, u"\0"s}},
                              {ofWStrToStr, {{u"", u"a\u4e2db"}, {10}}, {{0}, u"a\0"s}},
                              {ofWStrToStr, {{u"", u"\u4e2d"}, {10}}, {{0}, u"&(0x4e2d)\0"s}}});
  checkExamples<WORD, WCHAR>({{ofWStrToWords, {{u"", u"a\u4e2db"}, {2}}, {{}, u"a\u4e2d"}}});
}

TEST_CASE("BytesToWords and WStrToWords run forward where the arrays overlap") {
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
      // Bytes: at any distance from the words, also where they are these words themselves.
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
  static const Unit capitals[] = {'A', '1', 'Z', '{', '_', 0};
  static const Unit small[] = {'a', '1', 'z', '{', '_', 0};
  Unit* const text = const_cast<Unit*>(small);
  CHECK(twin::Upper<Unit>(const_cast<Unit*>(capitals)) == capitals);
  CHECK(twin::Lower<Unit>(text) == small);
  twin::Copy<Unit>(text, text);
  twin::CopyBuf<Unit>(text, 0, capitals);
  for (const int n : {INT_MIN, 0, 1, 3, 6}) {
    twin::CopyBuf<Unit>(text, n, text);
    twin::NCopy<Unit>(text, text, n);
    twin::CatBuf<Unit>(text, n, capitals);
    if constexpr (isWide<Unit>) WStrNCatBuf(text, n, capitals, 9);
  }
  CHECK(twin::Replace<Unit>(text, capitals, capitals, text) == 5);
}

}  // namespace
