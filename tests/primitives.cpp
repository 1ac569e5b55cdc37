#include "checks.h"

namespace {

// Both cases of a letter, a unit between the cases and one that differs from a letter in a bit.
const Units alphabet = u"aA_\u00e1";

// Bounds at which a loop of four or eight steps, or a count of 8 or 16 bits, could go wrong.
std::vector<int> boundsAround(int length) {
  std::vector<int> bounds = {INT_MIN, -65536, -1, 0, 1, 65536, 65537, 65539, INT_MAX};
  for (int more = -5; more <= 3; ++more) bounds.push_back(length + more);
  return bounds;
}

// Lengths at which the same could happen.
std::vector<size_t> lengthsOf() {
  std::vector<size_t> lengths;
  for (size_t length = 0; length <= (isBoard ? 20 : 40); ++length) lengths.push_back(length);
  for (const size_t length : Sizes{63, 64, 127, 255, 256, 257, 511, 512, 513, 1023, 1024, 1025}) {
    if (!isBoard || length <= 257) lengths.push_back(length);
  }
  return lengths;
}

// Lengths and case mapping

TEST_CASE_TEMPLATE("StrLen, StrUpper and StrLower walk the whole text", Unit, char, WCHAR) {
  CHECK(twin::Len<Unit>(nullptr) == 0);
  CHECK(twin::Upper<Unit>(nullptr) == nullptr);
  CHECK(twin::Lower<Unit>(nullptr) == nullptr);
  for (const size_t length : lengthsOf()) {
    for (int alignment = 0; alignment < 4; ++alignment) checkLengthAndCase<Unit>(longText(length));
  }
  for (const Units& text : allTexts(u"\1aZ{\u00c1", 4)) checkLengthAndCase<Unit>(text);
  checkLengthAndCase<Unit>(allUnits());
  if (!isBoard) checkLengthAndCase<Unit>(longText(70000));
}

TEST_CASE("CharToLower and CharToUpper map the 26 letters and nothing else") {
  for (int c = -70000; c <= 70000; ++c) {
    const int lower = c >= 'A' && c <= 'Z' ? c + 32 : c;
    const int upper = c >= 'a' && c <= 'z' ? c - 32 : c;
    if (CharToLower(c) != lower || CharToUpper(c) != upper) FAIL_CHECK("wrong for ", c);
  }
  for (const int c : {INT_MIN, INT_MIN + 'a', 0x20041, 0x20061, INT_MAX}) {
    CHECK(CharToLower(c) == c);
    CHECK(CharToUpper(c) == c);
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

// Copying

TEST_CASE_TEMPLATE("StrCopy, StrCopyBuf and StrNCopy write what fits", Unit, char, WCHAR) {
  for (const size_t length : lengthsOf()) {
    for (const int n : boundsAround(static_cast<int>(length))) {
      checkCopies<Unit>(longText(length), n);
    }
  }
  for (int n = 1; n < 45; ++n) {
    for (int alignment = 0; alignment < 4; ++alignment) checkCopies<Unit>(longText(45), n);
  }
  checkCopies<Unit>(allUnits(), 300);
  checkAppends<Unit>(allUnits(), allUnits(), 600);
  if (isBoard) return;
  const Units text = longText(70000);
  for (const int n : boundsAround(70000)) checkCopies<Unit>(text, n);
}

template <typename Unit>
void copyBy(int form, Unit* dst, int n, const Unit* src) {
  if (form == 0) twin::Copy<Unit>(dst, src);
  if (form == 1) twin::CopyBuf<Unit>(dst, n, src);
  if (form == 2) twin::NCopy<Unit>(dst, src, n);
}

TEST_CASE_TEMPLATE("StrCopy, StrCopyBuf and StrNCopy answer null", Unit, char, WCHAR) {
  Text<Unit> text(u"xy");
  for (int form = 0; form < 3; ++form) {
    for (const int n : {INT_MIN, -1, 0, 1, 5}) {
      copyBy<Unit>(form, nullptr, n, text.get());
      copyBy<Unit>(form, nullptr, n, nullptr);
      Buffer<Unit> buffer(u"ab");
      copyBy<Unit>(form, buffer.get(), n, nullptr);
      buffer.check(callOf<Unit>("a copy of null, form", form, "n", n),
                   form == 1 && n < 1 ? u""s : u"\0"s);
    }
  }
}

TEST_CASE_TEMPLATE("StrCopy, StrCopyBuf and StrNCopy move text left", Unit, char, WCHAR) {
  const Units text = lift<Unit>(longText(21)) + u'\0';
  for (int distance = 1; distance < 12; ++distance) {
    for (int form = 0; form < 3; ++form) {
      Buffer<Unit> buffer(Units(static_cast<size_t>(distance), u'-') + text);
      copyBy<Unit>(form, buffer.get(), 30, buffer.get() + distance);
      buffer.check(callOf<Unit>("a copy to the left by", distance, "of form", form), text);
    }
  }
}

// Concatenation

TEST_CASE_TEMPLATE("StrCat, StrCatBuf and the wide appends add what fits", Unit, char, WCHAR) {
  for (size_t held = 0; held < (isBoard ? 4 : 6); ++held) {
    for (size_t length = 0; length <= (isBoard ? 18 : 40); length += length < 10 ? 1 : 3) {
      const Units dst = longText(held);
      const Units src = longText(held + length).substr(held);
      for (const int n : boundsAround(static_cast<int>(held + length))) {
        checkAppends<Unit>(dst, src, n);
        if (isWide<Unit>) checkCountedAppends(dst, src, n, INT_MAX);
      }
      if (!isWide<Unit>) continue;
      for (const int num : boundsAround(static_cast<int>(length))) {
        for (const int n : {0, 3, 9, 65541, INT_MAX}) checkCountedAppends(dst, src, n, num);
      }
    }
  }
  for (const size_t length : Sizes{256, 1023, 1024, 70000}) {
    if (isBoard && length > 1024) continue;
    const Units text = longText(length);
    const Units more = longText(21);
    for (const int bound : boundsAround(static_cast<int>(length + 21))) {
      checkAppends<Unit>(text, more, bound);
      checkAppends<Unit>(more, text, bound);
      if (!isWide<Unit>) continue;
      checkCountedAppends(text, more, bound, bound);
      checkCountedAppends(more, text, bound, bound < 0 ? bound : bound - 21);
    }
  }
}

TEST_CASE_TEMPLATE("StrCat and StrCatBuf write nothing for a null pointer", Unit, char, WCHAR) {
  Text<Unit> text(u"ab");
  Unit* const null = nullptr;
  for (const auto& [dst, src] : {std::pair(text.get(), null), {null, text.get()}, {null, null}}) {
    twin::Cat<Unit>(dst, src);
    for (const int n : {-1, 0, 9}) {
      twin::CatBuf<Unit>(dst, n, src);
      if constexpr (isWide<Unit>) {
        WStrNCat(dst, src, n);
        WStrNCatBuf(dst, n, src, 9);
      }
    }
  }
}

// Searching

TEST_CASE_TEMPLATE("StrChr finds the first such unit but never the terminator", Unit, char, WCHAR) {
  CHECK(twin::Chr<Unit>(nullptr, 'a') == nullptr);
  CHECK(twin::Chr<Unit>(nullptr, 0) == nullptr);
  for (const Units& text : allTexts(u"\1a\u00e1\u00e9", isBoard ? 4 : 6)) {
    for (const char16_t c : u"\0\1a\u00e1\u00e9!"s) checkFindUnit<Unit>(text, c);
  }
  for (char16_t c = 1; c < 256; c = static_cast<char16_t>(c + (isBoard ? 9 : 1))) {
    checkFindUnit<Unit>(allUnits(c) + c, c);
  }
  for (const size_t length : lengthsOf()) checkFindUnit<Unit>(longText(length) + u"##", u'#');
  if (!isBoard) checkFindUnit<Unit>(longText(70000) + u"#", u'#');
}

TEST_CASE("Wide searches and comparisons compare all 16 bits") {
  const Units text = u"\u0141A\u8000\u0041\U00010000a";
  for (const char16_t unit : u"A\u0141\u0161a\u8000\u4141\u0100\xdc00"s) {
    for (const Units& before : {u""s, u"A"s, u"\u0141A"s, u"\u0141A\u8000\u0041"s}) {
      checkFindUnit<WCHAR>(text, unit);
      checkFind<WCHAR>(text, before + unit);
      checkCompare<WCHAR>(text, before + unit, 9);
    }
  }
}

TEST_CASE_TEMPLATE("StrStr and StrIStr answer null, then empty texts", Unit, char, WCHAR) {
  Text<Unit> empty(u"");
  Text<Unit> text(u"abc");
  Unit* const none = empty.get();
  Unit* const abc = text.get();
  Unit* const null = nullptr;
  for (const auto search : {twin::Str<Unit>, twin::IStr<Unit>}) {
    for (Unit* const substr : {null, none, abc}) {
      CHECK(search(null, substr) == null);
      CHECK(search(none, substr) == null);
      CHECK(search(abc, substr) == (substr ? abc : null));
    }
  }
}

TEST_CASE_TEMPLATE("StrStr and StrIStr find the first place", Unit, char, WCHAR) {
  const std::vector<Units> wanted = allTexts(alphabet, isBoard ? 2 : 3);
  for (const Units& text : allTexts(alphabet, isBoard ? 3 : 4)) {
    for (const Units& substr : wanted) checkFind<Unit>(text, substr);
  }
  // All ways in which a text and a pattern repeat themselves.
  const size_t longest = isBoard ? 9 : 11;
  const std::vector<Units> patterns = allTexts(u"a\u00e1", isBoard ? 5 : 7, 4);
  for (const Units& text : allTexts(u"a\u00e1", longest, longest)) {
    if (text[0] != u'a') continue;
    for (const Units& substr : patterns) {
      if (substr[0] == u'a') checkFind<Unit>(text, substr);
    }
  }
}

TEST_CASE_TEMPLATE("StrStr and StrIStr go on after a long partial match", Unit, char, WCHAR) {
  for (const Units& substr : {u"ababacu"s, u"ABABACU"s}) {
    checkFind<Unit>(u"@[ababac-abababacus", substr);
  }
  const Units text = longText(300);
  for (size_t length = 1; length < 300; length += length < 70 ? 1 : 37) {
    for (const Units& ending : {u""s, u"#"s, text.substr(0, 1)}) {
      checkFind<Unit>(text + u"#" + text, text.substr(300 - length) + ending);
    }
  }
  const size_t far = isBoard ? 2000 : 70000;
  checkFind<Unit>(longText(far) + u"#-" + text, u"#-" + text);
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

// Comparison

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
  const Unit nothing[1] = {'a'};
  const Unit* const same = nothing + 1;  // where no unit is
  CHECK(twin::Cmp<Unit>(same, same) == 0);
  CHECK(twin::ICmp<Unit>(same, same) == 0);
  CHECK(twin::NCmp<Unit>(same, same, 3) == 0);
  CHECK(twin::NICmp<Unit>(same, same, 3) == 0);
}

TEST_CASE_TEMPLATE("All comparisons tell the first difference", Unit, char, WCHAR) {
  const std::vector<Units> texts = allTexts(alphabet, isBoard ? 2 : 3);
  for (const Units& a : texts) {
    for (const Units& b : texts) {
      // Differences on both sides of a turn's end.
      for (const int n : {INT_MIN, 0, 1, 2, 3, INT_MAX}) checkCompare<Unit>(a, b, n);
      for (const int n : {4, 5, 65538}) checkCompare<Unit>(u"xYz" + a, u"xYz" + b, n);
    }
  }
  std::vector<size_t> lengths = lengthsOf();
  if (!isBoard) lengths.push_back(70000);
  for (const size_t length : lengths) {
    const Units text = longText(length);
    const Units raised = model::upper(text);
    for (const auto& [a, b] : {std::pair(u"a", u"b"), {u"B", u"a"}, {u"", u"z"}, {u"z", u"Z"}}) {
      if (length > 1024 && *b != u'Z') continue;
      for (const int n : boundsAround(static_cast<int>(length))) {
        checkCompare<Unit>(text + a, text + b, n);
        checkCompare<Unit>(raised + b + u"x", text + a + u"y", n);
      }
    }
  }
}

}  // namespace
