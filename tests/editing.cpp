#include "checks.h"

namespace {

const std::vector<Units> texts = allTexts(u"a,;\u00e9", 4);
const std::vector<Units> sets = {u"", u",", u",;", u";,;,", u"\u00e9", u"\u00e9a;,"};

// Tokens of every length up to 24 and as many as that, between runs of all units of a set of 6.
const Units manySet = u",; .\u00fe\t";
Units manyTokens() {
  Units line;
  for (size_t i = 0; i < 25; ++i) {
    line += manySet.substr(i % 6) + manySet.substr(0, i % 4) + longText(i);
  }
  return line + manySet + manySet;
}

TEST_SUITE_BEGIN("Tokenizing and splitting");

TEST_CASE_TEMPLATE("StrToken and StrSplit walk to the end", Unit, char, WCHAR) {
  for (const Units& text : texts) {
    for (const Units& set : sets) {
      checkSplit<Unit>(text, set);
      for (int start = 0; start <= static_cast<int>(text.size()); ++start) {
        checkWalk<Unit>(text, set, start);
      }
    }
  }
  checkSplit<Unit>(manyTokens(), manySet);
  checkWalk<Unit>(manyTokens(), manySet, 0);
}

TEST_CASE_TEMPLATE("StrToken takes another set at each call", Unit, char, WCHAR) {
  Buffer<Unit> str(u"key = a=b;c\0"s);
  int off = 0;
  CHECK(str.indexOf(twin::Token<Unit>(str.get(), &off, Text<Unit>(u" =").get())) == 0);
  CHECK(str.indexOf(twin::Token<Unit>(str.get(), &off, Text<Unit>(u" ;").get())) == 4);
  CHECK(str.indexOf(twin::Token<Unit>(str.get(), &off, Text<Unit>(u"").get())) == 6);
  str.check(u"key\0=\0a=b;c\0"s);
}

TEST_CASE_TEMPLATE("StrToken and StrSplit answer null and write nothing", Unit, char, WCHAR) {
  Buffer<Unit> str(u"a,b\0"s);
  Text<Unit> dlmt(u",");
  int off = 1;
  CHECK(twin::Token<Unit>(nullptr, &off, dlmt.get()) == nullptr);
  CHECK(twin::Token<Unit>(str.get(), nullptr, dlmt.get()) == nullptr);
  CHECK(twin::Token<Unit>(str.get(), &off, nullptr) == nullptr);
  CHECK(off == 1);
  Unit* wrd = nullptr;
  CHECK(twin::Split<Unit>(nullptr, dlmt.get(), &wrd) == 0);
  CHECK(twin::Split<Unit>(str.get(), nullptr, &wrd) == 0);
  CHECK(twin::Split<Unit>(str.get(), dlmt.get(), nullptr) == 0);
  CHECK(wrd == nullptr);
  str.check(u"a,b\0"s);
}

TEST_SUITE_END();
TEST_SUITE_BEGIN("Trimming");

TEST_CASE_TEMPLATE("StrTrim keeps what lies between the set's units", Unit, char, WCHAR) {
  for (const Units& text : texts) {
    for (const Units& set : sets) checkTrim<Unit>(text, set);
  }
  checkTrim<Unit>(manyTokens(), manySet);
  checkTrim<Unit>(manySet + manySet + manySet, manySet);
  for (size_t length = 5; length < 300; length += length < 25 ? 1 : 91) {
    checkTrim<Unit>(manySet + longText(length) + manySet, manySet);
  }
}

TEST_CASE_TEMPLATE("StrTrim answers null", Unit, char, WCHAR) {
  Text<Unit> set(u" ");
  CHECK(twin::Trim<Unit>(nullptr, set.get()) == 0);
  for (char16_t unit = 1; unit < 256; ++unit) {
    const Units text = Units(1, unit) + u"a" + unit + u'\0';
    Buffer<Unit> str(text);
    CHECK(twin::Trim<Unit>(str.get(), nullptr) == 3);
    str.check(text);
  }
}

TEST_SUITE_END();
TEST_SUITE_BEGIN("Replacing");

TEST_CASE_TEMPLATE("StrReplace sizes and fills alike", Unit, char, WCHAR) {
  const std::vector<Units> patterns = allTexts(u"ab", 3);
  for (const Units& text : allTexts(u"ab", 5)) {
    for (const Units& pattern : patterns) {
      if (pattern.empty()) continue;
      for (const Units& replacement : {u""s, u"a"s, pattern, u"ab\u00e9"s, pattern + pattern}) {
        checkReplace<Unit>(text, pattern, replacement);
      }
    }
  }
  checkReplace<Unit>(u"Dear ${name}, ${name}: ${names}", u"${name}", u"Zo\u00eb Q.");
  const Units text = longText(300);
  for (const Units& pattern : {u"a"s, text.substr(100, 24), text.substr(276), text}) {
    for (const Units& replacement : {u""s, u"b"s, longText(25)}) {
      checkReplace<Unit>(text + u"-" + text, pattern, replacement);
    }
  }
}

TEST_CASE_TEMPLATE("StrReplace writes nothing for null and for an empty pattern", Unit, char,
                   WCHAR) {
  Text<Unit> null(nullptr);
  Text<Unit> empty(u"");
  Text<Unit> a(u"a");
  Text<Unit>* const rows[][3] = {
      {&null, &a, &a}, {&a, &null, &a}, {&a, &a, &null}, {&a, &empty, &a}, {&a, &empty, &null}};
  Buffer<Unit> result;
  for (const auto& [orig, rep, with] : rows) {
    CHECK(twin::Replace<Unit>(orig->get(), rep->get(), with->get(), nullptr) == 0);
    CHECK(twin::Replace<Unit>(orig->get(), rep->get(), with->get(), result.get()) == 0);
  }
  result.check(u"");
}

TEST_CASE_TEMPLATE("StrReplace may write to its own text if nothing occurs", Unit, char, WCHAR) {
  Buffer<Unit> text(u"hello\0"s);
  CHECK(twin::Replace<Unit>(text.get(), Text<Unit>(u"xyz").get(), Text<Unit>(u"q").get(),
                            text.get()) == 5);
  text.check(u"hello\0"s);
}

TEST_SUITE_END();

}  // namespace
