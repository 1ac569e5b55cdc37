// One check for each function or family: makes the call and compares what comes of it with the
// model. The suite sweeps over them, the fuzzer feeds them.
#pragma once

#include <climits>

#include "model.h"
#include "support.h"

#define TWINS(a, b, c, d, e) TWIN(a) TWIN(b) TWIN(c) TWIN(d) TWIN(e)
TWINS(Len, Upper, Lower, Copy, CopyBuf)
TWINS(NCopy, Cat, CatBuf, Chr, Str)
TWINS(IStr, NCmp, NICmp, Cmp, ICmp)
TWINS(Token, Split, Trim, Replace, ToInt)
NAMED_TWIN(FromInt, IntToStr, IntToWStr)

// The name of a function and its arguments, for what is told of a failure.
template <typename Unit, typename... Part>
auto callOf(const std::string& name, const Part&... parts) {
  return [&, name] { return told((isWide<Unit> ? "W" : "") + name, parts...); };
}

// Lengths and case mapping

template <typename Unit>
void checkLengthAndCase(const Units& given) {
  const Units text = lift<Unit>(given);
  expect(callOf<Unit>("StrLen", text), twin::Len<Unit>(Text<Unit>(text).get()),
         static_cast<int>(text.size()));
  Buffer<Unit> raised(text + u'\0', 0);
  expect(callOf<Unit>("StrUpper", text), twin::Upper<Unit>(raised.get()) == raised.get(), true);
  raised.check(callOf<Unit>("StrUpper", text), model::upper(text) + u'\0');
  Buffer<Unit> lowered(text + u'\0', 0);
  expect(callOf<Unit>("StrLower", text), twin::Lower<Unit>(lowered.get()) == lowered.get(), true);
  lowered.check(callOf<Unit>("StrLower", text), model::lower(text) + u'\0');
}

// Copying and concatenation

template <typename Unit>
void checkCopies(const Units& given, int n) {
  const Units src = lift<Unit>(given);
  Buffer<Unit> whole(u"", src.size() + 1);
  twin::Copy<Unit>(whole.get(), Text<Unit>(src).get());
  whole.check(callOf<Unit>("StrCopy", src), src + u'\0');
  // Of a source that the bound ends, only so much may be read.
  Buffer<Unit> fitted(u"", model::copyBuf(n, src).size());
  twin::CopyBuf<Unit>(fitted.get(), n, Counted<Unit>(src, n < 1 ? 1 : n - 1).get());
  fitted.check(callOf<Unit>("StrCopyBuf n", n, "src", src), model::copyBuf(n, src));
  Buffer<Unit> counted(u"", model::nCopy(src, n).size());
  twin::NCopy<Unit>(counted.get(), Counted<Unit>(src, n).get(), n);
  counted.check(callOf<Unit>("StrNCopy", src, "n", n), model::nCopy(src, n));
}

template <typename Unit>
void checkAppends(const Units& before, const Units& given, int n) {
  const Units dst = lift<Unit>(before);
  const Units src = lift<Unit>(given);
  Buffer<Unit> whole(dst + u'\0', dst.size() + src.size() + 1);
  twin::Cat<Unit>(whole.get(), Text<Unit>(src).get());
  whole.check(callOf<Unit>("StrCat", dst, src), dst + src + u'\0');
  const Units expected = model::nCatBuf(dst, n, src, model::noLimit) + u'\0';
  const int room = n < 1 ? 0 : n - 1 - static_cast<int>(dst.size());
  Buffer<Unit> fitted(dst + u'\0', expected.size());
  twin::CatBuf<Unit>(fitted.get(), n, Counted<Unit>(src, room).get());
  fitted.check(callOf<Unit>("StrCatBuf", dst, "n", n, "src", src), expected);
}

inline void checkCountedAppends(const Units& before, const Units& given, int n, int num) {
  const Units dst = lift<WCHAR>(before);
  const Units src = lift<WCHAR>(given);
  Units expected = dst + model::take(src, num) + u'\0';
  Buffer<WCHAR> counted(dst + u'\0', expected.size());
  WStrNCat(counted.get(), Counted<WCHAR>(src, num).get(), num);
  counted.check(callOf<WCHAR>("StrNCat", dst, src, "num", num), expected);
  expected = model::nCatBuf(dst, n, src, num) + u'\0';
  const int room = n < 1 ? 0 : n - 1 - static_cast<int>(dst.size());
  Buffer<WCHAR> both(dst + u'\0', expected.size());
  WStrNCatBuf(both.get(), n, Counted<WCHAR>(src, std::min(num, room)).get(), num);
  both.check(callOf<WCHAR>("StrNCatBuf", dst, "n", n, "src", src, "num", num), expected);
}

// Searching and comparison

template <typename Unit>
void checkFindUnit(const Units& given, char16_t unit) {
  const Units text = lift<Unit>(given);
  const char16_t c = lift<Unit>({unit})[0];
  Text<Unit> str(text);
  const int index = c == 0 ? -1 : static_cast<int>(text.find(c));
  expect(callOf<Unit>("StrChr", text, "c", c),
         str.indexOf(twin::Chr<Unit>(str.get(), static_cast<Unit>(c))), index);
}

template <typename Unit>
void checkFind(const Units& given, const Units& pattern) {
  const Units text = lift<Unit>(given);
  const Units substr = lift<Unit>(pattern);
  Text<Unit> str(text);
  Text<Unit> sub(substr);
  expect(callOf<Unit>("StrStr", text, "substr", substr),
         str.indexOf(twin::Str<Unit>(str.get(), sub.get())), model::find(text, substr));
  expect(callOf<Unit>("StrIStr", text, "substr", substr),
         str.indexOf(twin::IStr<Unit>(str.get(), sub.get())),
         model::find(model::lower(text), model::lower(substr)));
}

template <typename Unit>
void checkCompare(const Units& first, const Units& second, int n) {
  const Units one = lift<Unit>(first);
  const Units two = lift<Unit>(second);
  const Units lowOne = model::lower(one);
  const Units lowTwo = model::lower(two);
  Counted<Unit> counted1(one, n);
  Counted<Unit> counted2(two, n);
  const int folded = model::compare(lowOne, lowTwo, n);
  const bool irregular = !isWide<Unit> && folded > 0;
  expect(callOf<Unit>("StrNCmp", one, two, "n", n),
         twin::NCmp<Unit>(counted1.get(), counted2.get(), n), model::compare(one, two, n));
  expect(callOf<Unit>("StrNICmp", one, two, "n", n),
         twin::NICmp<Unit>(counted1.get(), counted2.get(), n), irregular ? -folded : folded);
  if (n < static_cast<int>(std::max(one.size(), two.size()))) return;
  Text<Unit> str1(one);
  Text<Unit> str2(two);
  expect(callOf<Unit>("StrCmp", one, two), twin::Cmp<Unit>(str1.get(), str2.get()),
         model::compare(one, two, model::noLimit));
  expect(callOf<Unit>("StrICmp", one, two), twin::ICmp<Unit>(str1.get(), str2.get()),
         model::compare(lowOne, lowTwo, model::noLimit));
}

// Text editing

template <typename Unit>
void checkWalk(const Units& given, const Units& delimiters, int start) {
  const Units text = lift<Unit>(given);
  const Units set = lift<Unit>(delimiters);
  const auto call = callOf<Unit>("StrToken", text, "dlmt", set, "off", start);
  Text<Unit> dlmt(set);
  Buffer<Unit> str(text + u'\0', 0);
  Units cut = text;
  int off = start;
  int expectedOff = start;
  for (int ends = 0; ends < 2;) {
    const int expected = model::token(cut, expectedOff, set);
    expect(call, str.indexOf(twin::Token<Unit>(str.get(), &off, dlmt.get())), expected);
    expect(call, off, expectedOff);
    if (expected < 0) ++ends;
  }
  str.check(call, cut + u'\0');
}

template <typename Unit>
void checkSplit(const Units& given, const Units& delimiters) {
  const Units text = lift<Unit>(given);
  const Units set = lift<Unit>(delimiters);
  const auto call = callOf<Unit>("StrSplit", text, "dlmt", set);
  Units cut = text;
  std::vector<int> expected;
  int off = 0;
  for (int token = model::token(cut, off, set); token >= 0; token = model::token(cut, off, set)) {
    expected.push_back(token);
  }
  Buffer<Unit> str(text + u'\0', 0);
  Unit untouched{};
  std::vector<Unit*> wrd(expected.size() + 1, &untouched);
  expect(call, twin::Split<Unit>(str.get(), Text<Unit>(set).get(), wrd.data()),
         static_cast<int>(expected.size()));
  for (size_t i = 0; i < expected.size(); ++i) expect(call, str.indexOf(wrd[i]), expected[i]);
  expect(call, wrd.back() == &untouched, true);
  str.check(call, cut + u'\0');
}

template <typename Unit>
void checkTrim(const Units& given, const Units& set) {
  const Units text = lift<Unit>(given);
  const Units trimSet = lift<Unit>(set);
  const auto call = callOf<Unit>("StrTrim", text, "trimSet", trimSet);
  Buffer<Unit> str(text + u'\0', 0);
  Units expected = text;
  const int kept = model::trim(expected, trimSet);
  expect(call, twin::Trim<Unit>(str.get(), Text<Unit>(trimSet).get()), kept);
  str.check(call, expected);
}

template <typename Unit>
void checkReplace(const Units& given, const Units& pattern, const Units& replacement) {
  const Units text = lift<Unit>(given);
  const Units units = lift<Unit>(pattern);
  const Units others = lift<Unit>(replacement);
  const auto call = callOf<Unit>("StrReplace", text, "rep", units, "with", others);
  Text<Unit> orig(text);
  Text<Unit> rep(units);
  Text<Unit> with(others);
  const Units expected = model::replace(text, units, others);
  const int length = static_cast<int>(expected.size());
  expect(call, twin::Replace<Unit>(orig.get(), rep.get(), with.get(), nullptr), length);
  Buffer<Unit> result(u"", expected.size() + 1);
  expect(call, twin::Replace<Unit>(orig.get(), rep.get(), with.get(), result.get()), length);
  result.check(call, expected + u'\0');
}

// Conversion

template <typename Unit>
void checkFromInt(int value, int radix) {
  const auto call = callOf<char>(isWide<Unit> ? "IntToWStr" : "IntToStr", value, "radix", radix);
  const Units expected = model::intToText(value, radix) + u'\0';
  Buffer<Unit> string(u"", expected.size());
  expect(call, twin::FromInt<Unit>(value, string.get(), radix) == string.get(), true);
  string.check(call, expected);
}

template <typename Unit>
void checkToInt(const Units& given) {
  const Units text = lift<Unit>(given);
  expect(callOf<Unit>("StrToInt", text), twin::ToInt<Unit>(Text<Unit>(text).get()),
         model::textToInt(text));
}

inline void checkWords(const Units& units, int len) {
  const Units written = model::take(units, len);
  Buffer<WORD> copied(u"", written.size());
  WStrToWords(Counted<WCHAR>(units, len).get(), copied.get(), len);
  copied.check(callOf<WCHAR>("StrToWords", units, "len", len), written);
  Buffer<WORD> widened(u"", written.size());
  BytesToWords(Counted<char>(units, len).get(), widened.get(), len);
  Units bytes = written;
  for (char16_t& unit : bytes) unit = static_cast<unsigned char>(unit);
  widened.check(callOf<char>("BytesToWords", units, "len", len), bytes);
}

inline void checkWiden(const Units& src, int bufsize) {
  const auto call = callOf<char>("StrToWStr", src, "bufsize", bufsize);
  const Units expected = model::copyBuf(std::max(bufsize, 1), src);
  Buffer<WCHAR> des(u"", expected.size());
  const int count = bufsize < 1 ? 0 : bufsize - 1;
  expect(call, StrToWStr(Counted<char>(src, count).get(), des.get(), bufsize) == des.get(), true);
  des.check(call, expected);
}

inline void checkEscape(const Units& src, int bufsize) {
  const auto call = callOf<WCHAR>("StrToStr", src, "bufsize", bufsize);
  const Units expected = model::escape(src, bufsize) + u'\0';
  Buffer<char> des(u"", expected.size());
  expect(call, WStrToStr(Text<WCHAR>(src).get(), des.get(), bufsize) == des.get(), true);
  des.check(call, expected);
}
