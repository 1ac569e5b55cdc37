#include "checks.h"

namespace {

const std::vector<Units> texts = allTexts(u"a,;\u00ac", isBoard ? 3 : 4);
const std::vector<Units> sets = {u"", u",", u"\u00ac", u",;", u";,;,", u"\u00e9", u"\u00aca;,"};

// Sets of up to 300 units, and tokens of every length up to 40 between runs of their units.
const Units manySet = u",; .\u00fe\t-";
Units manyTokens(const Units& set) {
  Units line;
  for (size_t i = 0; i < 41; ++i) {
    line += set.substr(i % set.size()) + set.substr(0, i % 4) + longText(i);
  }
  return line + set + set;
}
Units longSet(size_t size) {
  Units set;
  while (set.size() < size) set += u"#$%&'()*+"[set.size() % 9];
  return set + u"!";
}

// Tokenizing and splitting

TEST_CASE_TEMPLATE("StrToken and StrSplit walk to the end", Unit, char, WCHAR) {
  for (const Units& text : texts) {
    for (const Units& set : sets) {
      checkSplit<Unit>(text, set);
      for (int start = 0; start <= static_cast<int>(text.size()); ++start) {
        checkWalk<Unit>(text, set, start);
      }
    }
  }
  for (size_t size = 1; size <= manySet.size(); ++size) {
    checkSplit<Unit>(manyTokens(manySet), manySet.substr(0, size));
    checkWalk<Unit>(manyTokens(manySet), manySet.substr(0, size), 0);
  }
  for (char16_t c = 1; c < 256; c = static_cast<char16_t>(c + (isBoard ? 9 : 1))) {
    checkSplit<Unit>(allUnits(), {c});
    checkSplit<Unit>(allUnits(), {'~', c});
  }
  for (const size_t size : Sizes{31, 63, 255, 256}) checkWalk<Unit>(u"a!b!", longSet(size), 0);
  for (const size_t length : Sizes{255, 256, 1023, 70000}) {
    if (isBoard && length > 1023) continue;
    checkSplit<Unit>(longText(length) + u",-" + longText(length), u",");
    checkWalk<Unit>(longText(length) + u"!" + Units(length, u'#'), longSet(9), 0);
  }
}

TEST_CASE("WStrToken, WStrSplit, WStrTrim and WStrReplace compare all 16 bits") {
  for (const Units& set : {u","s, u"\u012c"s, u"\u802c"s, u";\u012c"s, u"\u802ca"s}) {
    const Units text = u"\u012ca,\u012cb\u802c,\u8061,\U00010000,\u012c";
    checkSplit<WCHAR>(text, set);
    checkTrim<WCHAR>(text, set);
    checkReplace<WCHAR>(text, set, u"\u012c\uff41");
  }
}

TEST_CASE_TEMPLATE("StrToken and StrSplit answer null and write nothing", Unit, char, WCHAR) {
  Text<Unit> text(u"a,b");
  Unit* const a = text.get();
  Unit* const null = nullptr;
  int off = 1;
  Unit* wrd = nullptr;
  for (const auto& [str, dlmt] : {std::pair(null, a), {a, null}, {null, null}}) {
    CHECK(twin::Token<Unit>(str, &off, dlmt) == nullptr);
    CHECK(twin::Token<Unit>(str, nullptr, dlmt) == nullptr);
    CHECK(twin::Split<Unit>(str, dlmt, &wrd) == 0);
    CHECK(twin::Split<Unit>(str, dlmt, nullptr) == 0);
  }
  CHECK(twin::Token<Unit>(a, nullptr, a) == nullptr);
  CHECK(twin::Split<Unit>(a, a, nullptr) == 0);
  CHECK(off == 1);
  CHECK(wrd == nullptr);
}

// Trimming

TEST_CASE_TEMPLATE("StrTrim keeps what lies between the set's units", Unit, char, WCHAR) {
  for (const Units& text : texts) {
    for (const Units& set : sets) checkTrim<Unit>(text, set);
  }
  checkTrim<Unit>(manyTokens(manySet), manySet);
  for (const size_t length : Sizes{1, 2, 3, 5, 12, 24, 63, 64, 65, 255, 256, 257, 1023, 70000}) {
    if (isBoard && length > 1023) continue;
    const Units run = longSet(length);
    checkTrim<Unit>(run, longSet(9));
    checkTrim<Unit>(run + u"a" + manySet + longText(length) + manySet, longSet(9) + manySet);
    checkTrim<Unit>(u"-" + longText(length) + run, longSet(9) + u"-");
    checkTrim<Unit>(u"!a!", longSet(length % 1000));
  }
}

TEST_CASE_TEMPLATE("StrTrim answers null", Unit, char, WCHAR) {
  CHECK(twin::Trim<Unit>(nullptr, Text<Unit>(u" ").get()) == 0);
  CHECK(twin::Trim<Unit>(nullptr, nullptr) == 0);
  for (const Units& text : {u""s, u" "s, u" a "s, u"\1a\1"s, u"\u00ffa\u00ff"s}) {
    Buffer<Unit> str(text + u'\0', 0);
    CHECK(twin::Trim<Unit>(str.get(), nullptr) == static_cast<int>(text.size()));
    str.check([] { return "StrTrim by null"; }, text + u'\0');
  }
}

// Replacing

TEST_CASE_TEMPLATE("StrReplace sizes and fills alike", Unit, char, WCHAR) {
  const std::vector<Units> patterns = allTexts(u"a\u00e1", 3, 1);
  for (const Units& text : allTexts(u"a\u00e1", isBoard ? 5 : 6)) {
    for (const Units& pattern : patterns) {
      for (const Units& replacement : {u""s, u"a"s, pattern, u"ab\u00e9"s, pattern + pattern}) {
        checkReplace<Unit>(text, pattern, replacement);
      }
    }
  }
  checkReplace<Unit>(u"Dear ${name}, ${name}: ${names}", u"${name}", u"Zo\u00eb Q.");
  const Units text = longText(300);
  for (const Units& pattern : {u"a"s, text.substr(100, 24), text.substr(255), text}) {
    for (const size_t length : Sizes{0, 1, 4, 25, 31, 32, 33, 255, 256}) {
      if (isBoard && length > 33 && pattern.size() == 1) continue;
      checkReplace<Unit>(text + u"-" + text, pattern, longText(length));
    }
  }
  if (!isBoard) checkReplace<Unit>(longText(70000), text.substr(0, 2), u"");
}

TEST_CASE_TEMPLATE("StrReplace writes nothing for null or no pattern", Unit, char, WCHAR) {
  Text<Unit> empty(u"");
  Text<Unit> text(u"a");
  Unit* const none = empty.get();
  Unit* const a = text.get();
  Unit* const rows[][3] = {{nullptr, a, a},    {a, nullptr, a},       {a, a, nullptr},
                           {a, none, a},       {a, none, nullptr},    {nullptr, nullptr, nullptr},
                           {none, none, none}, {none, nullptr, none}, {nullptr, none, a}};
  Buffer<Unit> result;
  for (const auto& [orig, rep, with] : rows) {
    CHECK(twin::Replace<Unit>(orig, rep, with, nullptr) == 0);
    CHECK(twin::Replace<Unit>(orig, rep, with, result.get()) == 0);
  }
  result.check([] { return "StrReplace"; }, u"");
}

}  // namespace
