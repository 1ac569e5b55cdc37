#include <cstring>

#include "checks.h"

namespace {

TEST_SUITE_BEGIN("Integer text conversion");

TEST_CASE_TEMPLATE("IntToStr writes every value in every radix", Unit, char, WCHAR) {
  CHECK(twin::FromInt<Unit>(5, nullptr, 10) == nullptr);
  std::vector<int> values = {0, INT_MIN, INT_MIN + 1, INT_MAX, -123, 35, 36, 83, 255, -255};
  for (int power = 1; power < 1000000000; power *= 10) {
    values.insert(values.end(), {power, power - 1, -power, 1 - power});
  }
  std::vector<int> radices = {INT_MIN, -3, 170, 1000, 70000, INT_MAX - 1, INT_MAX};
  for (int radix = 0; radix < 42; ++radix) radices.push_back(radix);
  for (const int value : values) {
    for (const int radix : radices) {
      checkFromInt<Unit>(value, radix);
    }
  }
}

TEST_CASE_TEMPLATE("IntToStr texts take the sizes that the header states", Unit, char, WCHAR) {
  const int sizes[][2] = {{2, 34}, {8, 13}, {10, 12}, {16, 10}, {36, 8}};
  for (const auto& [radix, size] : sizes) {
    std::vector<Unit> string(static_cast<size_t>(size), 'x');
    CHECK(twin::FromInt<Unit>(INT_MIN, string.data(), radix)[size - 1] == 0);
    CHECK(string[static_cast<size_t>(size) - 2] != 0);
  }
}

TEST_CASE_TEMPLATE("StrToInt reads spaces, a sign and digits", Unit, char, WCHAR) {
  CHECK(twin::ToInt<Unit>(nullptr) == 0);
  std::vector<Units> texts = allTexts(u" \t-19x", 4);
  for (const char16_t* const text : {u"  42",        u"\t\t-42x",
                                     u"12a34",       u"007",
                                     u"\n5",         u"\r7",
                                     u"+5",          u"/1",
                                     u":1",          u"5:",
                                     u"6/",          u"2147483647",
                                     u"2147483648",  u"-2147483648",
                                     u"42949672945", u"4294967297",
                                     u"-4294967297", u"123456789012345678901234567890",
                                     u"\u00b11",     u"\u00a01",
                                     u"1\u00b2",     u"         \t \t        -8765432109x"}) {
    texts.emplace_back(text);
  }
  for (const Units& text : texts) checkToInt<Unit>(text);
}

TEST_CASE("WStrToInt reads no digit, sign or space beyond ASCII") {
  for (const Units& text : {u" 1\u01323"s, u"\uff15"s, u"\u01205"s, u"\u012d5"s, u"\u30005"s}) {
    checkToInt<WCHAR>(text);
  }
}

TEST_SUITE_END();
TEST_SUITE_BEGIN("Width conversion");

TEST_CASE("BytesToWords and WStrToWords copy the count for every alignment") {
  const Units units = u"a\0\u00ff\u0080z\0bcd"s;
  for (const int from : {0, 1}) {
    for (const int to : {0, 1}) {
      for (int len = -1; len < 9; ++len) checkWords(units, len, from, to);
      for (int len = 10; len < 300; len += len < 26 ? 1 : 91) {
        checkWords(longText(300), len, from, to);
      }
    }
  }
  for (const int len : {INT_MIN, 3}) {
    Buffer<WORD> words;
    const char byte = 'a';
    const WCHAR unit = 0x4E2D;
    BytesToWords(len < 0 ? &byte : nullptr, words.get(), len);
    WStrToWords(len < 0 ? &unit : nullptr, words.get(), len);
    BytesToWords(&byte, nullptr, len);
    WStrToWords(&unit, nullptr, len);
    words.check(u"");
  }
}

TEST_CASE("BytesToWords and WStrToWords run forward where the arrays overlap") {
  Buffer<WORD> words(u"\u4e2dbcdef");
  WStrToWords(words.get(), words.get() + 1, 5);
  words.check(Units(6, u'\u4e2d'));
  alignas(4) WORD pairs[8] = {1, 2, 3, 4, 5, 6, 7, 8};
  WStrToWords(pairs, pairs + 2, 5);
  CHECK(show(Units(pairs, pairs + 8)) == show(u"\1\2\1\2\1\2\1\b"));

  WORD area[8] = {0x0102, 0x0304, 0x0506, 0x0708, 0x090A, 0x0B0C, 0x0D0E, 0x0F10};
  unsigned char expected[sizeof area];
  std::memcpy(expected, area, sizeof area);
  for (size_t k = 0; k < 7; ++k) {
    const WORD word = expected[k + 3];
    std::memcpy(&expected[2 * k], &word, sizeof word);
  }
  BytesToWords(reinterpret_cast<const char*>(area) + 3, area, 7);
  CHECK(std::memcmp(area, expected, sizeof area) == 0);
}

TEST_CASE("StrToWStr widens what fits") {
  for (const int bufsize : {12, 13, 16, 17, 20, 21, 255, 256, 257, 300, 301, INT_MAX}) {
    checkWiden(longText(300), bufsize);
  }
  for (const int bufsize : {INT_MIN, -1, 0, 1, 2, 3, 4, 5, 6, 7, 8, 9, INT_MAX}) {
    for (const Units& src : {u""s, u"\u00e9\u00ff"s, u"abcdefg"s}) checkWiden(src, bufsize);
    Buffer<WCHAR> emptied;
    CHECK(StrToWStr(nullptr, emptied.get(), bufsize) == emptied.get());
    emptied.check(u"\0"s);
    CHECK(StrToWStr(Text<char>(u"a").get(), nullptr, bufsize) == nullptr);
  }
}

TEST_CASE("WStrToStr escapes what is not printable and cuts between units") {
  const Units sources[] = {
      u"",          u"Hi",      u"\u4e2d", u"\n",         u"a\nb",
      u"a\u4e2db",  u"\u4e2db", u"&(",     u"\x1f ~\x7f", u"\u0080\u0100\u0fff\u1000\uffff",
      u"abcdefghij"};
  for (const Units& src : sources) {
    checkEscape(src, INT_MIN);
    checkEscape(src, INT_MAX);
    for (int bufsize = -1; bufsize < 50; ++bufsize) checkEscape(src, bufsize);
  }
  for (const int bufsize : {255, 256, 257, 700, INT_MAX}) checkEscape(longText(300), bufsize);
  for (int unit = 1; unit < 0x10000; unit += unit < 300 ? 1 : 251) {
    checkEscape(Units(1, static_cast<char16_t>(unit)), 10);
  }
}

TEST_CASE("WStrToStr answers null with an empty text") {
  Buffer<char> des;
  CHECK(WStrToStr(nullptr, des.get(), 9) == des.get());
  des.check(u"\0"s);
  for (const int bufsize : {-1, 0, 9}) {
    const char* const constant = WStrToStr(Text<WCHAR>(u"a").get(), nullptr, bufsize);
    REQUIRE(constant != nullptr);
    CHECK(*constant == 0);
    CHECK(WStrToStr(nullptr, nullptr, bufsize) == constant);
  }
}

TEST_SUITE_END();

}  // namespace
