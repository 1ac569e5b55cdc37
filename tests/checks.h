// One check for each function or family: makes the call on memory that ends where the argument
// ends, and compares what comes of it with the model. The suite sweeps over them, the fuzzer feeds
// them.
#pragma once

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
TWIN(Token)
TWIN(Split)
TWIN(Trim)
TWIN(Replace)
TWIN(ToInt)
NAMED_TWIN(FromInt, IntToStr, IntToWStr)

// Lengths and case mapping

template <typename Unit>
void checkLengthAndCase(const Units& text) {
  INFO(show(text));
  CHECK(twin::Len<Unit>(Text<Unit>(text).get()) == static_cast<int>(text.size()));
  Buffer<Unit> raised(text + u'\0', text.size() + 1);
  CHECK(twin::Upper<Unit>(raised.get()) == raised.get());
  raised.check(model::upper(text) + u'\0');
  Buffer<Unit> lowered(text + u'\0', text.size() + 1);
  CHECK(twin::Lower<Unit>(lowered.get()) == lowered.get());
  lowered.check(model::lower(text) + u'\0');
}

// Copying and concatenation

template <typename Unit>
void checkCopies(const Units& src, int n) {
  INFO(show(src), ", ", n);
  Buffer<Unit> whole(u"", src.size() + 1);
  twin::Copy<Unit>(whole.get(), Text<Unit>(src).get());
  whole.check(src + u'\0');
  // Of a source that the bound ends, only so much is there to be read.
  const size_t size = src.size() + 2;
  Buffer<Unit> fitted(u"", size);
  auto units = exact<Unit>(model::take(src + u'\0', n < 2 ? 1 : n - 1));
  twin::CopyBuf<Unit>(fitted.get(), n, units.data());
  fitted.check(model::copyBuf(n, src));
  Buffer<Unit> counted(u"", size);
  units = exact<Unit>(model::take(src + u'\0', n < 1 ? 1 : n));
  twin::NCopy<Unit>(counted.get(), units.data(), n);
  counted.check(model::nCopy(src, n));
}

template <typename Unit>
void checkAppends(const Units& dst, const Units& src, int n, int num) {
  INFO(show(dst), ", ", show(src), ", ", n, ", ", num);
  const size_t size = dst.size() + src.size() + 2;
  Buffer<Unit> whole(dst + u'\0', size);
  twin::Cat<Unit>(whole.get(), Text<Unit>(src).get());
  whole.check(dst + src + u'\0');
  Buffer<Unit> fitted(dst + u'\0', size);
  twin::CatBuf<Unit>(fitted.get(), n, Text<Unit>(src).get());
  fitted.check(model::nCatBuf(dst, n, src, model::noLimit) + u'\0');
  if constexpr (std::is_same_v<Unit, WCHAR>) {
    auto units = exact<Unit>(model::take(src + u'\0', num < 1 ? 1 : num));
    Buffer<Unit> counted(dst + u'\0', size);
    WStrNCat(counted.get(), units.data(), num);
    counted.check(dst + model::take(src, num) + u'\0');
    Buffer<Unit> both(dst + u'\0', size);
    WStrNCatBuf(both.get(), n, units.data(), num);
    both.check(model::nCatBuf(dst, n, src, num) + u'\0');
  }
}

// Searching and comparison

template <typename Unit>
void checkFindUnit(const Units& text, char16_t c) {
  INFO(show(text), ", ", c);
  Text<Unit> str(text);
  const size_t index = c == 0 ? Units::npos : text.find(c);
  Unit* const expected = index == Units::npos ? nullptr : str.get() + index;
  CHECK(twin::Chr<Unit>(str.get(), static_cast<Unit>(c)) == expected);
}

template <typename Unit>
void checkFind(const Units& text, const Units& substr) {
  Text<Unit> str(text);
  Text<Unit> sub(substr);
  const auto check = [&](const Unit* found, int expected) {
    const int index = found ? static_cast<int>(found - str.get()) : -1;
    CHECK_MESSAGE(index == expected, show(substr), " in ", show(text));
  };
  check(twin::Str<Unit>(str.get(), sub.get()), model::find(text, substr));
  check(twin::IStr<Unit>(str.get(), sub.get()),
        model::find(model::lower(text), model::lower(substr)));
}

template <typename Unit>
void checkCompare(const Units& one, const Units& two, int n) {
  const auto check = [&](int result, int expected) {
    CHECK_MESSAGE(result == expected, show(one), " and ", show(two), ", ", n);
  };
  const Units lowOne = model::lower(one);
  const Units lowTwo = model::lower(two);
  Text<Unit> str1(one);
  Text<Unit> str2(two);
  check(twin::Cmp<Unit>(str1.get(), str2.get()), model::compare(one, two, model::noLimit));
  check(twin::ICmp<Unit>(str1.get(), str2.get()), model::compare(lowOne, lowTwo, model::noLimit));
  auto units1 = exact<Unit>(model::take(one + u'\0', n < 1 ? 1 : n));
  auto units2 = exact<Unit>(model::take(two + u'\0', n < 1 ? 1 : n));
  const int folded = model::compare(lowOne, lowTwo, n);
  const bool irregular = std::is_same_v<Unit, char> && folded > 0;
  check(twin::NCmp<Unit>(units1.data(), units2.data(), n), model::compare(one, two, n));
  check(twin::NICmp<Unit>(units1.data(), units2.data(), n), irregular ? -folded : folded);
}

// Text editing

template <typename Unit>
void checkWalk(const Units& text, const Units& set, int start) {
  INFO(show(text), ", ", show(set), ", ", start);
  Text<Unit> dlmt(set);
  Buffer<Unit> str(text + u'\0', text.size() + 1);
  Units cut = text;
  int off = start;
  int expectedOff = start;
  for (int ends = 0; ends < 2;) {
    const int expected = model::token(cut, expectedOff, set);
    CHECK(str.indexOf(twin::Token<Unit>(str.get(), &off, dlmt.get())) == expected);
    CHECK(off == expectedOff);
    if (expected < 0) ++ends;
  }
  str.check(cut + u'\0');
}

template <typename Unit>
void checkSplit(const Units& text, const Units& set) {
  INFO(show(text), ", ", show(set));
  Units cut = text;
  std::vector<int> expected;
  int off = 0;
  for (int token = model::token(cut, off, set); token >= 0; token = model::token(cut, off, set)) {
    expected.push_back(token);
  }
  Buffer<Unit> str(text + u'\0', text.size() + 1);
  Unit untouched{};
  std::vector<Unit*> wrd(expected.size() + 1, &untouched);
  CHECK(twin::Split<Unit>(str.get(), Text<Unit>(set).get(), wrd.data()) ==
        static_cast<int>(expected.size()));
  for (size_t i = 0; i < expected.size(); ++i) CHECK(str.indexOf(wrd[i]) == expected[i]);
  CHECK(wrd.back() == &untouched);
  str.check(cut + u'\0');
}

template <typename Unit>
void checkTrim(const Units& text, const Units& set) {
  INFO(show(text), ", ", show(set));
  Buffer<Unit> str(text + u'\0', text.size() + 1);
  Units expected = text;
  const int kept = model::trim(expected, set);
  CHECK(twin::Trim<Unit>(str.get(), Text<Unit>(set).get()) == kept);
  str.check(expected);
}

template <typename Unit>
void checkReplace(const Units& text, const Units& pattern, const Units& replacement) {
  INFO(show(text), ", ", show(pattern), ", ", show(replacement));
  Text<Unit> orig(text);
  Text<Unit> rep(pattern);
  Text<Unit> with(replacement);
  const Units expected = model::replace(text, pattern, replacement);
  const int length = static_cast<int>(expected.size());
  CHECK(twin::Replace<Unit>(orig.get(), rep.get(), with.get(), nullptr) == length);
  Buffer<Unit> result(u"", expected.size() + 1);
  CHECK(twin::Replace<Unit>(orig.get(), rep.get(), with.get(), result.get()) == length);
  result.check(expected + u'\0');
}

// Conversion

template <typename Unit>
void checkFromInt(int value, int radix) {
  INFO(value, ", ", radix);
  Buffer<Unit> string(u"", 34);
  CHECK(twin::FromInt<Unit>(value, string.get(), radix) == string.get());
  string.check(model::intToText(value, radix) + u'\0');
}

template <typename Unit>
void checkToInt(const Units& text) {
  CHECK_MESSAGE(twin::ToInt<Unit>(Text<Unit>(text).get()) == model::textToInt(text), show(text));
}

// The arrays start some units into their memory, to be aligned or not.
inline void checkWords(const Units& units, int len, int from, int to) {
  INFO(show(units), ", ", len);
  const Units written = model::take(units, len);
  const Units src = Units(static_cast<size_t>(from), u'-') + model::take(units, std::max(len, 1));
  auto bytes = exact<char>(src);
  auto wide = exact<WCHAR>(src);
  const Units head(static_cast<size_t>(to), 0xB5);
  Buffer<WORD> copied(u"", head.size() + written.size());
  WStrToWords(wide.data() + from, copied.get() + to, len);
  copied.check(head + written);
  Buffer<WORD> widened(u"", head.size() + written.size());
  BytesToWords(bytes.data() + from, widened.get() + to, len);
  widened.check(head + valuesOf(exact<char>(written)));
}

inline void checkWiden(const Units& src, int bufsize) {
  INFO(show(src), ", ", bufsize);
  Buffer<WCHAR> des(u"", src.size() + 2);
  CHECK(StrToWStr(Text<char>(src).get(), des.get(), bufsize) == des.get());
  des.check(model::copyBuf(std::max(bufsize, 1), src));
}

inline void checkEscape(const Units& src, int bufsize) {
  INFO(show(src), ", ", bufsize);
  Buffer<char> des(u"", 9 * src.size() + 1);
  CHECK(WStrToStr(Text<WCHAR>(src).get(), des.get(), bufsize) == des.get());
  des.check(model::escape(src, bufsize) + u'\0');
}
