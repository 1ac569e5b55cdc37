#include "checks.h"

namespace {

// Both cases of a letter, a unit between the cases and one above 127.
const Units alphabet = u"aA_\u00e1";

TEST_SUITE_BEGIN("Lengths and case mapping");

TEST_CASE_TEMPLATE("StrLen, StrUpper and StrLower walk the whole text", Unit, char, WCHAR) {
  CHECK(twin::Len<Unit>(nullptr) == 0);
  CHECK(twin::Upper<Unit>(nullptr) == nullptr);
  CHECK(twin::Lower<Unit>(nullptr) == nullptr);
  // Every place at which the unrolled loop can end, more than once around.
  const Units text = u"a1z{@\u00e1`AZ[\u00c1\u0080";
  for (size_t start = 0; start <= text.size(); ++start) {
    checkLengthAndCase<Unit>(text.substr(start));
  }
  for (size_t length = 12; length < 40; ++length) checkLengthAndCase<Unit>(longText(length));
  Units every;
  for (char16_t unit = 255; unit > 0; --unit) every += unit;
  checkLengthAndCase<Unit>(every + every);
}

TEST_CASE("CharToLower and CharToUpper map the 26 letters and nothing else") {
  for (int c = -70000; c <= 70000; ++c) {
    const int lower = c >= 'A' && c <= 'Z' ? c + 32 : c;
    const int upper = c >= 'a' && c <= 'z' ? c - 32 : c;
    if (CharToLower(c) != lower || CharToUpper(c) != upper) FAIL_CHECK("wrong for ", c);
  }
  for (const int c : {INT_MIN, INT_MIN + 'a', INT_MAX}) {
    CHECK(CharToLower(c) == c);
    CHECK(CharToUpper(c) == c);
  }
}

TEST_CASE_TEMPLATE("StrUpper, StrLower and StrCatBuf write only what changes", Unit, char, WCHAR) {
  // Where constant data is protected, a write to it is a fault.
  static const Unit capitals[] = {'A', '1', 'Z', '{', '_', 0};
  static const Unit small[] = {'a', '1', 'z', '{', '_', 0};
  CHECK(twin::Upper<Unit>(const_cast<Unit*>(capitals)) == capitals);
  CHECK(twin::Lower<Unit>(const_cast<Unit*>(small)) == small);
  twin::CatBuf<Unit>(const_cast<Unit*>(small), 6, capitals);
}

TEST_CASE("WStrLen, WStrUpper and WStrLower take all 16 bits") {
  checkLengthAndCase<WCHAR>(u"\u0100\u4e00\uff00\u00e9\uff41\u0161\u0261\u00c9\uff21\u0141\u0241");
}

TEST_SUITE_END();
TEST_SUITE_BEGIN("Copying");

TEST_CASE_TEMPLATE("StrCopy, StrCopyBuf and StrNCopy write what fits and no unit more", Unit, char,
                   WCHAR) {
  for (size_t length = 0; length < 8; ++length) {
    for (const int n : {INT_MIN, -1, 0, 1, 2, 3, 4, 5, 6, 7, 8, 9, 10, INT_MAX}) {
      checkCopies<Unit>(u"a\u00ffbcdef"s.substr(0, length), n);
    }
  }
  for (const int n : {12, 13, 16, 17, 20, 21, 255, 256, 257, 299, 300, 301, 302}) {
    checkCopies<Unit>(longText(300), n);
  }
}

TEST_CASE("Wide copies and appends keep all 16 bits") {
  checkCopies<WCHAR>(u"\u4e2d\uffff\u0100", 9);
  checkAppends<WCHAR>(u"\u4e2d\u0100", u"\u4e2d\uffff\u0100", 9, 9);
}

TEST_CASE_TEMPLATE("StrCopy, StrCopyBuf and StrNCopy answer null and the same pointer", Unit, char,
                   WCHAR) {
  Text<Unit> text(u"xy");
  twin::Copy<Unit>(nullptr, text.get());
  twin::CopyBuf<Unit>(nullptr, 5, text.get());
  twin::NCopy<Unit>(nullptr, text.get(), 5);

  Buffer<Unit> same(u"ab");
  twin::Copy<Unit>(same.get(), same.get());
  for (const int n : {0, 1, 5}) {
    twin::CopyBuf<Unit>(same.get(), n, same.get());
    twin::NCopy<Unit>(same.get(), same.get(), n);
  }
  same.check(u"ab");

  for (const int n : {-1, 0, 1, 5}) {
    Buffer<Unit> whole(u"ab");
    twin::Copy<Unit>(whole.get(), nullptr);
    whole.check(u"\0"s);
    Buffer<Unit> fitted(u"ab");
    twin::CopyBuf<Unit>(fitted.get(), n, nullptr);
    fitted.check(n < 1 ? u""s : u"\0"s);
    Buffer<Unit> counted(u"ab");
    twin::NCopy<Unit>(counted.get(), nullptr, n);
    counted.check(u"\0"s);
  }
}

TEST_CASE_TEMPLATE("StrCopy, StrCopyBuf and StrNCopy move text toward the start", Unit, char,
                   WCHAR) {
  for (int distance = 1; distance < 6; ++distance) {
    const Units head(static_cast<size_t>(distance), u'-');
    for (int form = 0; form < 3; ++form) {
      Buffer<Unit> buffer(head + u"abcdefg\0"s);
      if (form == 0) twin::Copy<Unit>(buffer.get(), buffer.get() + distance);
      if (form == 1) twin::CopyBuf<Unit>(buffer.get(), 9, buffer.get() + distance);
      if (form == 2) twin::NCopy<Unit>(buffer.get(), buffer.get() + distance, 9);
      buffer.check(u"abcdefg\0"s);
    }
  }
}

TEST_SUITE_END();
TEST_SUITE_BEGIN("Concatenation");

TEST_CASE_TEMPLATE("StrCat, StrCatBuf and the wide appends add what the bounds allow", Unit, char,
                   WCHAR) {
  const int bounds[] = {INT_MIN, -1, 0, 1, 2, 3, 4, 5, 6, 7, 8, 9, 14, 15, INT_MAX};
  for (const Units& dst : {u""s, u"x"s, u"xyz"s, u"xyz\u00ffxyz"s}) {
    for (const Units& src : {u""s, u"\u00ff"s, u"ab\u0080de"s, u"abcdefgh"s}) {
      for (const int n : bounds) {
        for (const int num : bounds) checkAppends<Unit>(dst, src, n, num);
      }
    }
  }
  for (const int bound : {12, 13, 16, 20, 21, 22, 255, 256, 257, 258, 277, 278, 279, 280}) {
    checkAppends<Unit>(longText(21), longText(257), bound, INT_MAX);
    checkAppends<Unit>(longText(21), longText(257), INT_MAX, bound);
    checkAppends<Unit>(longText(257), longText(21), INT_MAX, bound);
  }
}

TEST_CASE_TEMPLATE("StrCat and StrCatBuf write nothing for a null pointer", Unit, char, WCHAR) {
  Buffer<Unit> buffer(u"ab\0"s);
  for (const bool noSource : {true, false}) {
    Unit* const dst = noSource ? buffer.get() : nullptr;
    Unit* const src = noSource ? nullptr : buffer.get();
    twin::Cat<Unit>(dst, src);
    twin::CatBuf<Unit>(dst, 9, src);
    if constexpr (std::is_same_v<Unit, WCHAR>) {
      WStrNCat(dst, src, 9);
      WStrNCatBuf(dst, 9, src, 9);
    }
  }
  buffer.check(u"ab\0"s);
}

TEST_SUITE_END();
TEST_SUITE_BEGIN("Searching");

TEST_CASE_TEMPLATE("StrChr finds the first such unit but never the terminator", Unit, char, WCHAR) {
  CHECK(twin::Chr<Unit>(nullptr, 'a') == nullptr);
  for (const Units& text : allTexts(u"ab\u00e9", 6)) {
    for (const char16_t c : u"\0ab\u00e9"s) checkFindUnit<Unit>(text, c);
  }
  const Units text = longText(300) + u"#";
  for (size_t start = 0; start <= 300; ++start) checkFindUnit<Unit>(text.substr(start), u'#');
}

TEST_CASE("Wide searches and comparisons compare all 16 bits") {
  const Units text = u"\u0141A\u8000";
  for (const char16_t unit : u"A\u0141\u0161a\u8000\u0041\u4141"s) {
    checkFindUnit<WCHAR>(text, unit);
    checkFind<WCHAR>(text, Units(1, unit));
    checkCompare<WCHAR>(text, Units(1, unit), 5);
  }
}

TEST_CASE_TEMPLATE("StrStr and StrIStr answer null and empty texts in this order", Unit, char,
                   WCHAR) {
  Text<Unit> empty(u"");
  Text<Unit> text(u"abc");
  for (const auto search : {twin::Str<Unit>, twin::IStr<Unit>}) {
    CHECK(search(nullptr, text.get()) == nullptr);
    CHECK(search(text.get(), nullptr) == nullptr);
    CHECK(search(nullptr, empty.get()) == nullptr);
    CHECK(search(empty.get(), empty.get()) == nullptr);
    CHECK(search(empty.get(), text.get()) == nullptr);
    CHECK(search(text.get(), empty.get()) == text.get());
  }
}

TEST_CASE_TEMPLATE("StrStr and StrIStr find the first place", Unit, char, WCHAR) {
  const std::vector<Units> wanted = allTexts(alphabet, 3);
  for (const Units& text : allTexts(alphabet, 4)) {
    for (const Units& substr : wanted) checkFind<Unit>(text, substr);
  }
}

TEST_CASE_TEMPLATE("StrStr and StrIStr go on after a long partial match", Unit, char, WCHAR) {
  for (const Units& substr : {u"ababacu"s, u"ABABACU"s}) {
    checkFind<Unit>(u"@[ababac-abababacus", substr);
  }
  const Units text = longText(300);
  for (size_t length = 1; length < 30; ++length) {
    for (const Units& ending : {u""s, u"#"s, text.substr(0, 1)}) {
      checkFind<Unit>(text + u"#" + text, text.substr(300 - length) + ending);
    }
  }
}

TEST_CASE_TEMPLATE("StrIStr, StrICmp and StrNICmp fold the 26 letters and nothing else", Unit, char,
                   WCHAR) {
  for (char16_t unit = 1; unit < 256; ++unit) {
    for (const int other : {unit ^ 32, unit + 32, unit - 32, unit ^ 64, unit ^ 128, unit + 1}) {
      if (other < 1 || other > 255) continue;
      const Units one(1, unit);
      const Units two(1, static_cast<char16_t>(other));
      checkCompare<Unit>(one + u"x", two + u"y", 2);
      checkFind<Unit>(u"-" + one, two);
      checkFind<Unit>(u"--" + one + u"-", u"-" + two);
    }
  }
}

TEST_SUITE_END();
TEST_SUITE_BEGIN("Comparison");

TEST_CASE_TEMPLATE("All comparisons order null before any text", Unit, char, WCHAR) {
  Text<Unit> a(u"");
  for (const auto compare : {twin::Cmp<Unit>, twin::ICmp<Unit>}) {
    CHECK(compare(nullptr, nullptr) == 0);
    CHECK(compare(nullptr, a.get()) == -1);
    CHECK(compare(a.get(), nullptr) == 1);
  }
  for (const auto compare : {twin::NCmp<Unit>, twin::NICmp<Unit>}) {
    for (const int n : {INT_MIN, 0, 1}) {
      CHECK(compare(nullptr, nullptr, n) == 0);
      CHECK(compare(nullptr, a.get(), n) == -1);
      CHECK(compare(a.get(), nullptr, n) == 1);
    }
  }
}

TEST_CASE_TEMPLATE("All comparisons take a text as equal to itself unread", Unit, char, WCHAR) {
  auto unterminated = exact<Unit>(u"ab");
  const Unit* const same = unterminated.data();
  CHECK(twin::Cmp<Unit>(same, same) == 0);
  CHECK(twin::ICmp<Unit>(same, same) == 0);
  CHECK(twin::NCmp<Unit>(same, same, 3) == 0);
  CHECK(twin::NICmp<Unit>(same, same, 3) == 0);
}

TEST_CASE_TEMPLATE("All comparisons tell place and order of the first difference", Unit, char,
                   WCHAR) {
  const std::vector<Units> texts = allTexts(alphabet, 3);
  for (const Units& a : texts) {
    for (const Units& b : texts) {
      // Differences on both sides of a turn's end.
      for (const int n : {INT_MIN, 0, 1, 2, 3, INT_MAX}) checkCompare<Unit>(a, b, n);
      for (const int n : {4, 5, 6}) checkCompare<Unit>(u"xYz" + a, u"xYz" + b, n);
    }
  }
  const Units text = longText(300);
  for (size_t length = 5; length < 300; length += length < 25 ? 1 : 91) {
    for (const auto& [a, b] : {std::pair(u"a", u"b"), {u"B", u"a"}, {u"", u"z"}, {u"z", u"Z"}}) {
      for (const int more : {-1, 0, 1, 2}) {
        const int n = static_cast<int>(length) + more;
        checkCompare<Unit>(text.substr(0, length) + a, text.substr(0, length) + b, n);
      }
    }
  }
}

TEST_SUITE_END();

}  // namespace
