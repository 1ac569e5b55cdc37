#include <climits>

#include "model.h"
#include "support.h"

TWIN(Len)
TWIN(Upper)
TWIN(Lower)
TWIN(Copy)
TWIN(CopyBuf)
TWIN(NCopy)
TWIN(Cat)
TWIN(CatBuf)
TWIN(Chr)
TWIN(Str)
TWIN(IStr)
TWIN(NCmp)
TWIN(NICmp)
TWIN(Cmp)
TWIN(ICmp)

namespace {

// Both cases of a letter, a unit between the cases and one above 127.
const Units alphabet = u"aA_\u00e1";

TEST_SUITE_BEGIN("Lengths and case mapping");

TEST_CASE_TEMPLATE("StrLen counts units", Unit, char, WCHAR) {
  CHECK(twin::Len<Unit>(nullptr) == 0);
  // Every place at which the unrolled loop can end, more than once around.
  for (size_t length = 0; length < 10; ++length) {
    CHECK(twin::Len<Unit>(Text<Unit>(Units(length, 0x80)).get()) == static_cast<int>(length));
  }
}

TEST_CASE("WStrLen counts units whose low byte is 0") {
  CHECK(WStrLen(Text<WCHAR>(u"\u0100\u4e00\uff00").get()) == 3);
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

TEST_CASE_TEMPLATE("StrUpper and StrLower change letters in place", Unit, char, WCHAR) {
  CHECK(twin::Upper<Unit>(nullptr) == nullptr);
  CHECK(twin::Lower<Unit>(nullptr) == nullptr);
  const Units edges = u"a1z{@\u00e1`AZ[\u00c1";
  for (const Units& text : {u""s, edges, edges + edges.substr(1), edges + edges.substr(3)}) {
    Units upper;
    for (const char16_t unit : text) upper += static_cast<char16_t>(CharToUpper(unit));
    Buffer<Unit> raised(text + u'\0');
    CHECK(twin::Upper<Unit>(raised.get()) == raised.get());
    raised.check(upper + u'\0');
    Buffer<Unit> lowered(text + u'\0');
    CHECK(twin::Lower<Unit>(lowered.get()) == lowered.get());
    lowered.check(model::lower(text) + u'\0');
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

TEST_CASE("WStrUpper and WStrLower know no letters beyond ASCII") {
  const Units text = u"\u00e9\uff41\u0161\u0261\u00c9\uff21\u0141\u0241"s + u'\0';
  Buffer<WCHAR> buffer(text);
  WStrLower(WStrUpper(buffer.get()));
  buffer.check(text);
}

TEST_SUITE_END();
TEST_SUITE_BEGIN("Copying");

TEST_CASE_TEMPLATE("StrCopy, StrCopyBuf and StrNCopy write what fits and no unit more", Unit, char,
                   WCHAR) {
  for (size_t length = 0; length < 8; ++length) {
    const Units src = u"a\u00ffbcdef"s.substr(0, length);
    Buffer<Unit> whole;
    twin::Copy<Unit>(whole.get(), Text<Unit>(src).get());
    whole.check(src + u'\0');
    for (const int n : {INT_MIN, -1, 0, 1, 2, 3, 4, 5, 6, 7, 8, 9, 10, INT_MAX}) {
      CAPTURE(n);
      // Of a source that the bound ends, only so much is there to be read.
      Buffer<Unit> fitted;
      auto units = exact<Unit>(model::take(src + u'\0', n < 2 ? 1 : n - 1));
      twin::CopyBuf<Unit>(fitted.get(), n, units.data());
      fitted.check(model::copyBuf(n, src));
      Buffer<Unit> counted;
      units = exact<Unit>(model::take(src + u'\0', n < 1 ? 1 : n));
      twin::NCopy<Unit>(counted.get(), units.data(), n);
      counted.check(model::nCopy(src, n));
    }
  }
}

TEST_CASE("WStrCopy, WStrCopyBuf and WStrNCopy keep all 16 bits") {
  const Units src = u"\u4e2d\uffff\u0100";
  for (int form = 0; form < 3; ++form) {
    Buffer<WCHAR> buffer;
    Text<WCHAR> text(src);
    if (form == 0) WStrCopy(buffer.get(), text.get());
    if (form == 1) WStrCopyBuf(buffer.get(), 9, text.get());
    if (form == 2) WStrNCopy(buffer.get(), text.get(), 9);
    buffer.check(src + u'\0');
  }
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

TEST_CASE_TEMPLATE("StrCat and StrCatBuf append what fits and no unit more", Unit, char, WCHAR) {
  for (const Units& dst : {u""s, u"x"s, u"xyz"s, u"xyz\u00ffxyz"s}) {
    for (size_t length = 0; length < 7; ++length) {
      const Units src = u"a\u00ffbcde"s.substr(0, length);
      Buffer<Unit> whole(dst + u'\0');
      twin::Cat<Unit>(whole.get(), Text<Unit>(src).get());
      whole.check(dst + src + u'\0');
      for (const int n : {INT_MIN, -1, 0, 1, 2, 3, 4, 5, 6, 8, 9, 14, 15, INT_MAX}) {
        CAPTURE(n);
        Buffer<Unit> fitted(dst + u'\0');
        twin::CatBuf<Unit>(fitted.get(), n, Text<Unit>(src).get());
        fitted.check(model::nCatBuf(dst, n, src, model::noLimit) + u'\0');
      }
    }
  }
}

TEST_CASE("WStrNCat and WStrNCatBuf append what both bounds allow") {
  const int bounds[] = {INT_MIN, -1, 0, 1, 2, 3, 4, 5, 6, 7, 8, 9, INT_MAX};
  for (const Units& dst : {u""s, u"x\u4e2d"s, u"xyzxyz"s}) {
    for (const Units& src : {u""s, u"\u4e2d"s, u"ab\u0100de"s, u"abcdefgh\uffff"s}) {
      for (const int num : bounds) {
        CAPTURE(num);
        auto units = exact<WCHAR>(model::take(src + u'\0', num < 1 ? 1 : num));
        Buffer<WCHAR> counted(dst + u'\0');
        WStrNCat(counted.get(), units.data(), num);
        counted.check(dst + model::take(src, num) + u'\0');
        for (const int n : bounds) {
          CAPTURE(n);
          Buffer<WCHAR> fitted(dst + u'\0');
          WStrNCatBuf(fitted.get(), n, units.data(), num);
          fitted.check(model::nCatBuf(dst, n, src, num) + u'\0');
        }
      }
    }
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
    CAPTURE(show(text));
    Text<Unit> str(text);
    for (const char16_t c : u"\0ab\u00e9"s) {
      const size_t index = c == 0 ? Units::npos : text.find(c);
      Unit* const expected = index == Units::npos ? nullptr : str.get() + index;
      CHECK(twin::Chr<Unit>(str.get(), static_cast<Unit>(c)) == expected);
    }
  }
}

TEST_CASE("Wide searches and comparisons compare all 16 bits") {
  Text<WCHAR> text(u"\u0141A\u8000");
  CHECK(WStrChr(text.get(), 'A') == text.get() + 1);
  CHECK(WStrChr(text.get(), 0x8000) == text.get() + 2);
  CHECK(WStrStr(text.get(), Text<WCHAR>(u"A").get()) == text.get() + 1);
  CHECK(WStrIStr(text.get(), Text<WCHAR>(u"a").get()) == text.get() + 1);
  CHECK(WStrIStr(text.get(), Text<WCHAR>(u"\u0161").get()) == nullptr);
  CHECK(WStrCmp(text.get() + 2, text.get() + 1) == 1);
  CHECK(WStrICmp(text.get(), Text<WCHAR>(u"\u0161").get()) == -1);
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
    Text<Unit> str(text);
    const auto check = [&](const Unit* found, int expected, const Units& substr) {
      const int index = found ? static_cast<int>(found - str.get()) : -1;
      CHECK_MESSAGE(index == expected, show(substr), " in ", show(text));
    };
    for (const Units& substr : wanted) {
      Text<Unit> sub(substr);
      check(twin::Str<Unit>(str.get(), sub.get()), model::find(text, substr), substr);
      check(twin::IStr<Unit>(str.get(), sub.get()),
            model::find(model::lower(text), model::lower(substr)), substr);
    }
  }
}

TEST_CASE_TEMPLATE("StrStr and StrIStr go on after a long partial match", Unit, char, WCHAR) {
  Text<Unit> text(u"@[ababac-abababacus");
  CHECK(twin::Str<Unit>(text.get(), Text<Unit>(u"ababacu").get()) == text.get() + 11);
  CHECK(twin::IStr<Unit>(text.get(), Text<Unit>(u"ABABACU").get()) == text.get() + 11);
  CHECK(twin::IStr<Unit>(text.get(), Text<Unit>(u"`").get()) == nullptr);
  CHECK(twin::IStr<Unit>(text.get(), Text<Unit>(u"{").get()) == nullptr);
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
      for (const Units& head : {u""s, u"xYz"s}) {  // differences on both sides of a turn's end
        const Units one = head + a;
        const Units two = head + b;
        const Units lowOne = model::lower(one);
        const Units lowTwo = model::lower(two);
        const auto check = [&](int result, int expected) {
          CHECK_MESSAGE(result == expected, show(one), " and ", show(two));
        };
        Text<Unit> str1(one);
        Text<Unit> str2(two);
        check(twin::Cmp<Unit>(str1.get(), str2.get()), model::compare(one, two, model::noLimit));
        check(twin::ICmp<Unit>(str1.get(), str2.get()),
              model::compare(lowOne, lowTwo, model::noLimit));
        for (const int n : {INT_MIN, 0, 2, 3, 4, INT_MAX}) {
          const int folded = model::compare(lowOne, lowTwo, n);
          const bool irregular = std::is_same_v<Unit, char> && folded > 0;
          check(twin::NCmp<Unit>(str1.get(), str2.get(), n), model::compare(one, two, n));
          check(twin::NICmp<Unit>(str1.get(), str2.get(), n), irregular ? -folded : folded);
        }
      }
    }
  }
}

TEST_CASE_TEMPLATE("StrNCmp and StrNICmp read no unit past the count", Unit, char, WCHAR) {
  for (size_t length = 1; length < 10; ++length) {
    auto a = exact<Unit>(u"abcdefghi"s.substr(0, length));
    auto b = exact<Unit>(u"aBcdefghi"s.substr(0, length));
    const int n = static_cast<int>(length);
    CHECK(twin::NCmp<Unit>(a.data(), b.data(), n) == (n > 1 ? 2 : 0));
    CHECK(twin::NICmp<Unit>(a.data(), b.data(), n) == 0);
    b = a;
    CHECK(twin::NCmp<Unit>(a.data(), b.data(), n) == 0);
  }
}

TEST_SUITE_END();

}  // namespace
