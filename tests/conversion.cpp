#include <cstring>

#include "checks.h"

namespace {

static_assert(std::is_same_v<INT8, int8_t> && std::is_same_v<WCHAR, uint16_t> &&
              std::is_same_v<WORD, uint16_t>);

// Integer text conversion

TEST_CASE_TEMPLATE("IntToStr writes values in every radix", Unit, char, WCHAR) {
  std::vector<int> values = {0,     INT_MIN, INT_MIN + 1, INT_MAX, -123,  35,
                             36,    83,      255,         -255,    65535, 65536,
                             65537, -65536,  655350,      4095,    4096,  -4096};
  for (int power = 1; power < 1000000000; power *= 10) {
    values.insert(values.end(), {power, power - 1, -power, 1 - power});
  }
  std::vector<int> radices = {INT_MIN, -3, 64, 128, 170, 1000, 70000, INT_MAX - 1, INT_MAX};
  for (int radix = 0; radix < 42; ++radix) radices.push_back(radix);
  for (const int value : values) {
    for (const int radix : radices) checkFromInt<Unit>(value, radix);
  }
  for (int value = isBoard ? -99 : -1000; value < (isBoard ? 1000 : 100000); ++value)
    checkFromInt<Unit>(value, 10);
  for (const int radix : {INT_MIN, 0, 1, 10})
    CHECK(twin::FromInt<Unit>(5, nullptr, radix) == nullptr);
}

TEST_CASE_TEMPLATE("StrToInt reads spaces, a sign and digits", Unit, char, WCHAR) {
  CHECK(twin::ToInt<Unit>(nullptr) == 0);
  std::vector<Units> texts = allTexts(u" \t-0\u00b19x", 4);
  const char16_t* const more[] = {u"  42",
                                  u"12a34",
                                  u"007",
                                  u"0x1f",
                                  u"010",
                                  u"-000000000000000000012",
                                  u"\n5",
                                  u"\r7",
                                  u"\v5",
                                  u"\f5",
                                  u"\u00855",
                                  u"\u00a05",
                                  u"+5",
                                  u"/1",
                                  u":1",
                                  u"5:",
                                  u"6/",
                                  u"1,2",
                                  u"2147483647",
                                  u"2147483648",
                                  u"-2147483648",
                                  u"42949672945",
                                  u"4294967297",
                                  u"-4294967297",
                                  u"65536",
                                  u"655360000",
                                  u"1\u00b2",
                                  u"1e5",
                                  u"-\t4",
                                  u"0000000000000000000000",
                                  u"123456789012345678901234567890",
                                  u"         \t \t        -8765432109x"};
  texts.insert(texts.end(), std::begin(more), std::end(more));
  for (const Units& text : texts) checkToInt<Unit>(text);
  checkToInt<Unit>(Units(300, u' ') + u"-" + Units(1100, u'0') + u"7");
}

TEST_CASE("WStrToInt reads no digit, sign or space beyond ASCII") {
  for (const Units& text : {u" 1\u01323"s, u"\uff15"s, u"\u01205"s, u"\u012d5"s, u"\u30005"s}) {
    checkToInt<WCHAR>(text);
    checkToInt<WCHAR>(u"1" + text);
  }
}

// Width conversion

TEST_CASE("BytesToWords and WStrToWords copy the count for every alignment") {
  const Units units = u"a\0\u00ff\u0080z\0\u4e2db\u8061\u0100cd"s;
  for (int alignment = 0; alignment < 32; ++alignment) {
    for (int len = -1; len < 13; ++len) checkWords(units, len);
  }
  for (int len = 10; len < 1030; len += len < 45 ? 1 : 13) checkWords(longText(1030), len);
  if (!isBoard) checkWords(lift<WCHAR>(longText(70000)), 65539);
  for (const int len : {INT_MIN, 0, 3}) {
    Buffer<WORD> words;
    const char byte = 'a';
    const WCHAR unit = 0x4E2D;
    BytesToWords(len < 1 ? &byte : nullptr, words.get(), len);
    WStrToWords(len < 1 ? &unit : nullptr, words.get(), len);
    BytesToWords(&byte, nullptr, len);
    WStrToWords(&unit, nullptr, len);
    BytesToWords(nullptr, nullptr, len);
    WStrToWords(nullptr, nullptr, len);
    words.check([] { return "a copy of nothing"; }, u"");
  }
}

TEST_CASE("BytesToWords and WStrToWords run forward where the arrays overlap") {
  for (int from = 0; from < 20; ++from) {
    for (int to = 0; to < 20; ++to) {
      alignas(4) WORD area[40];
      WORD expected[40];
      for (WORD i = 0; i < 40; ++i) expected[i] = area[i] = static_cast<WORD>(0x8100 + i * 3);
      for (int k = 0; k < 19; ++k) expected[to + k] = expected[from + k];
      WStrToWords(area + from, area + to, 19);
      expect([&] { return told("WStrToWords from", from, "to", to); }, Units(area, area + 40),
             Units(expected, expected + 40));
      // Bytes: at any distance from the words, also where they are these words themselves.
      for (WORD i = 0; i < 40; ++i) expected[i] = area[i] = static_cast<WORD>(0x8100 + i * 0x301);
      unsigned char bytes[sizeof area];
      std::memcpy(bytes, expected, sizeof bytes);
      for (int k = 0; k < 19; ++k) {
        const WORD word = bytes[from + k];
        std::memcpy(bytes + 2 * (to + k), &word, sizeof word);
      }
      std::memcpy(expected, bytes, sizeof bytes);
      BytesToWords(reinterpret_cast<const char*>(area) + from, area + to, 19);
      expect([&] { return told("BytesToWords from", from, "to", 2 * to); }, Units(area, area + 40),
             Units(expected, expected + 40));
    }
  }
}

TEST_CASE("StrToWStr widens what fits") {
  for (const size_t length :
       Sizes{0, 1, 2, 3, 4, 7, 8, 9, 12, 17, 40, 255, 256, 1023, 1024, 70000}) {
    if (isBoard && length > 1024) continue;
    const int size = static_cast<int>(length);
    for (const int more : {-5, -4, -3, -2, -1, 0, 1, 2}) checkWiden(longText(length), size + more);
    for (const int bufsize : {INT_MIN, -1, 0, 1, 2, 65538, INT_MAX}) {
      checkWiden(longText(length), bufsize);
    }
  }
  for (const int bufsize : {INT_MIN, 0, 1, 5}) {
    Buffer<WCHAR> emptied;
    CHECK(StrToWStr(nullptr, emptied.get(), bufsize) == emptied.get());
    emptied.check([] { return "StrToWStr of null"; }, u"\0"s);
    CHECK(StrToWStr(Text<char>(u"a").get(), nullptr, bufsize) == nullptr);
    CHECK(StrToWStr(nullptr, nullptr, bufsize) == nullptr);
  }
}

TEST_CASE("WStrToStr escapes what is not printable and cuts between units") {
  const Units sources[] = {
      u"",           u"Hi",        u"\u4e2d", u"\n",         u"a\nb",
      u"a\u4e2db",   u"\u4e2db",   u"&(",     u"\x1f ~\x7f", u"\u0080\u0100\u0fff\u1000\uffff",
      u"abcdefghij", u"\U0001f600"};
  for (const Units& src : sources) {
    for (const int bufsize : {INT_MIN, -65530, 65540, INT_MAX}) checkEscape(src, bufsize);
    for (int bufsize = -1; bufsize < 50; ++bufsize) checkEscape(src, bufsize);
  }
  const Units text = lift<WCHAR>(longText(isBoard ? 1100 : 70000));
  for (const int bufsize : {255, 256, 257, 700, 1024, 66000, INT_MAX}) checkEscape(text, bufsize);
  for (int unit = 1; unit < 0x10000; unit += unit < 300 ? 1 : 251) {
    for (const int bufsize : {8, 9, 10}) {
      checkEscape(Units(1, static_cast<char16_t>(unit)) + u"b", bufsize);
    }
  }
}

TEST_CASE("WStrToStr answers null with an empty text") {
  for (const int bufsize : {INT_MIN, 0, 9}) {
    Buffer<char> des;
    CHECK(WStrToStr(nullptr, des.get(), bufsize) == des.get());
    des.check([] { return "WStrToStr of null"; }, u"\0"s);
    const char* const constant = WStrToStr(Text<WCHAR>(u"a").get(), nullptr, bufsize);
    REQUIRE(constant != nullptr);
    CHECK(*constant == 0);
    CHECK(WStrToStr(nullptr, nullptr, bufsize) == constant);
  }
}

}  // namespace
