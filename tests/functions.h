// Each function: what it is to do, written from its contract in the plainest way and by other means
// than its own, and how it is called. The suite and the fuzzer check calls of these.
#pragma once

#include <cstdlib>
#include <optional>

#include "support.h"

// The arguments of a call: texts, of which the first is what the function writes to or points into,
// and numbers, both in the order of the declaration.
struct Args {
  std::vector<Units> texts;
  std::vector<int> numbers;
};

// What comes of it: results, a pointer being an index in the first text or -1 for null; what is
// written from the start of the first text on; and how many units of the texts may be read.
struct Outcome {
  std::vector<int> results;
  Units written;
  int readsFirst = INT_MAX;
  int readsOthers = INT_MAX;

  Outcome() = default;
  Outcome(int result) : results{result} {}
  Outcome(std::vector<int> given, Units units = {}, int first = INT_MAX, int others = INT_MAX)
      : results(std::move(given)),
        written(std::move(units)),
        readsFirst(first),
        readsOthers(others) {}
};

template <typename To, typename From = To>
struct Call {
  To* to;
  const From* from[4];  // from 1 on
  const std::vector<int>& numbers;
  std::vector<int> results;

  void gives(int result) { results.push_back(result); }
  void gives(const To* place) { gives(place ? static_cast<int>(place - to) : -1); }
  // An empty text is given for null.
  void givesText(const To* text) { gives(to || *text != 0 ? text : nullptr); }
};

// Of the arguments, "T" stands for a text, "B" for a buffer to write to, "n" for a number.
template <typename To, typename From = To>
struct Function {
  std::string name;
  std::string arguments;
  Outcome (*expected)(const Args&);
  void (*call)(Call<To, From>&);
  mutable int failures = 0;  // of which the first three say enough

  bool readsFirst() const { return arguments[0] == 'T'; }
};

// Makes a call and compares what comes of it with what is expected, by the contract if nothing is.
template <typename To, typename From>
void check(const Function<To, From>& function, Args args, const Outcome* given = nullptr,
           const char* file = __builtin_FILE(), int line = __builtin_LINE()) {
  std::vector<Units>& texts = args.texts;
  if (std::is_same_v<To, From>) {
    for (Units& text : texts) text = lift<To>(text);
  }
  Outcome expected = given ? *given : function.expected(args);
  if (given && std::is_same_v<To, From>) expected.written = lift<To>(expected.written);
  const auto count = [](const Units& text, int reads) {
    return text == null ? 0 : std::min(text.size() + 1, static_cast<size_t>(std::max(reads, 0)));
  };
  const size_t first = function.readsFirst() ? count(texts[0], expected.readsFirst) : 0;
  Memory<To> to(texts[0], first, std::max(first, expected.written.size()));
  std::optional<Memory<From>> from[4];
  Call<To, From> call = {texts[0] == null ? nullptr : to.get(), {}, args.numbers, {}};
  for (size_t i = 1; i < texts.size(); ++i) {
    const size_t units = count(texts[i], expected.readsOthers);
    Memory<From>& memory = from[i].emplace(texts[i], units, units);
    call.from[i] = texts[i] == null ? nullptr : memory.get();
  }
  // Equal texts are now and then one.
  if constexpr (std::is_same_v<To, From>) {
    if (function.readsFirst() && expected.written.empty() && texts[0] == texts.back() &&
        nextNumber(2) == 0) {
      call.from[1] = call.to;
    }
  }
  for (size_t i = 2; i < texts.size(); ++i) {
    const size_t other = nextNumber(static_cast<unsigned>(i));
    if (other > 0 && texts[i] == texts[other]) call.from[i] = call.from[other];
  }
  function.call(call);
  std::string failure;
  if (call.results != expected.results) {
    failure = " gives" + show(call.results) + " and not" + show(expected.results);
  }
  if (!to.holds(expected.written)) failure += " makes " + to.shown() + " and not " + to.wanted();
  for (auto& one : from) {
    if (one && !one->holds(u"")) failure += " writes to an argument: " + one->shown();
  }
  if (failure.empty() || ++function.failures > 3) return;
  std::string told = (isWide<From> && function.name[0] == 'S' ? "W" : "") + function.name + '(';
  for (const Units& text : texts) told += show(text) + ' ';
  tell(file, line, told + "with" + show(args.numbers) + ')' + failure);
}

namespace model {

using Texts = std::vector<Units>;

inline int size(const Units& text) { return text == null ? 0 : static_cast<int>(text.size()); }

inline bool hasNull(const Texts& texts) {
  return std::find(texts.begin(), texts.end(), null) != texts.end();
}

inline Units take(const Units& text, int count) {
  return text.substr(0, static_cast<size_t>(std::max(count, 0)));
}

inline Units exchange(Units text, const Units& from, const Units& to) {
  for (char16_t& unit : text) {
    const size_t letter = unit < 128 ? from.find(unit) : Units::npos;
    if (letter != Units::npos) unit = to[letter];
  }
  return text;
}
inline const Units capitals = u"ABCDEFGHIJKLMNOPQRSTUVWXYZ";
inline const Units smallLetters = u"abcdefghijklmnopqrstuvwxyz";
inline Units lower(const Units& text) { return exchange(text, capitals, smallLetters); }
inline Units upper(const Units& text) { return exchange(text, smallLetters, capitals); }

// The first text becomes another, and is given.
inline Outcome changed(const Units& before, const Units& text) {
  if (before == null) return -1;
  return {{0}, text + u'\0'};
}

// Of a source that the capacity ends, only so much may be read.
inline Outcome copyBuf(const Texts& texts, int n) {
  if (texts[0] == null || n < 1) return {};
  if (texts[1] == null) return {{}, u"\0"s};
  return {{}, take(texts[1], n - 1) + u'\0', INT_MAX, n - 1};
}

inline Outcome nCopy(const Texts& texts, int n) {
  if (texts[0] == null) return {};
  if (texts[1] == null || n < 1) return {{}, u"\0"s, INT_MAX, 0};
  return {{}, take(texts[1] + u'\0', n), INT_MAX, n};
}

inline Outcome append(const Texts& texts, int n, int num) {
  if (hasNull(texts)) return {};
  const int room = std::min(std::max(n, 0) - size(texts[0]) - 1, num);
  return {{}, texts[0] + take(texts[1], room) + u'\0', INT_MAX, room};
}

inline Outcome find(const Units& str, const Units& substr) {
  if (str == null || str.empty() || substr == null) return -1;
  return static_cast<int>(str.find(substr));
}

inline Outcome compare(const Units& str1, const Units& str2, int n, bool isIrregular = false) {
  if (str1 == null || str2 == null) return (str2 == null) - (str1 == null);
  const Units a = take(str1 + u'\0', n);
  const Units b = take(str2 + u'\0', n);
  for (size_t i = 0; i < a.size() && i < b.size(); ++i) {
    const int position = static_cast<int>(i) + 1;
    if (a[i] != b[i]) return {{a[i] < b[i] || isIrregular ? -position : position}, u"", n, n};
  }
  return {{0}, u"", n, n};
}

// All calls from an offset on to the second null: each gives a token, and the offset behind it.
inline Outcome walk(const Texts& texts, int off) {
  if (hasNull(texts)) return {{-1, off, -1, off}};
  Outcome outcome = {{}, texts[0] + u'\0'};
  Units& text = outcome.written;
  for (int nulls = 0; nulls < 2;) {
    const size_t start = text.find_first_not_of(texts[1] + u'\0', static_cast<size_t>(off));
    const size_t end = text.find_first_of(texts[1] + u'\0', start);
    off = size(texts[0]);
    if (start == Units::npos) ++nulls;
    if (start != Units::npos && end < texts[0].size()) {
      text[end] = u'\0';
      off = static_cast<int>(end) + 1;
    }
    outcome.results.insert(outcome.results.end(), {static_cast<int>(start), off});
  }
  return outcome;
}

// The number of tokens, and then their places.
inline Outcome split(const Texts& texts) {
  if (hasNull(texts)) return 0;
  const Outcome walked = walk(texts, 0);
  Outcome outcome = {{0}, walked.written};
  for (size_t i = 0; walked.results[i] >= 0; i += 2) {
    outcome.results.push_back(walked.results[i]);
    ++outcome.results[0];
  }
  return outcome;
}

// First a terminator behind what is kept; then this is copied to the start, unless it is there.
inline Outcome trim(const Units& text, const Units& trimSet) {
  if (text == null) return 0;
  const Units set = trimSet == null ? u"" : trimSet;
  const size_t first = std::min(text.find_first_not_of(set), text.size());
  const Units kept = text.substr(first, text.find_last_not_of(set) + 1 - first) + u'\0';
  Units written = text + u'\0';
  written[first + kept.size() - 1] = u'\0';
  if (first > 0) written.replace(0, kept.size(), kept);
  return {{static_cast<int>(kept.size()) - 1}, written};
}

inline Outcome replace(const Units& result, Units text, const Units& rep, const Units& with) {
  if (text == null || rep == null || rep.empty() || with == null) return 0;
  for (size_t at = text.find(rep); at != Units::npos; at = text.find(rep, at + with.size())) {
    text.replace(at, rep.size(), with);
  }
  return {{size(text)}, result == null ? u"" : text + u'\0'};
}

inline Units intToText(int value, int radix) {
  if (radix < 1) return u"";
  if (radix == 1) return value == 0 ? u"0" : u"";
  Units text;
  for (long long rest = std::abs(static_cast<long long>(value)); rest > 0 || text.empty();) {
    const auto digit = static_cast<int>(rest % radix);
    text.insert(text.begin(), static_cast<char16_t>(digit < 10 ? 48 + digit : 87 + digit));
    rest /= radix;
  }
  return value < 0 ? u'-' + text : text;
}

inline int textToInt(const Units& text) {
  size_t at = text == null ? Units::npos : text.find_first_not_of(u" \t");
  if (at == Units::npos) return 0;
  const bool negative = text[at] == u'-';
  unsigned long long value = 0;
  for (at += negative ? 1 : 0; at < text.size() && text[at] >= u'0' && text[at] <= u'9'; ++at) {
    value = (value * 10 + (text[at] - u'0')) % (1ULL << 32);
  }
  return static_cast<int>(static_cast<unsigned>(negative ? -value : value));
}

inline Outcome words(const Texts& texts, int len) {
  if (hasNull(texts)) return {};
  return {{}, take(texts[1], len), INT_MAX, len};
}

inline Outcome widen(const Texts& texts, int bufsize) {
  Outcome outcome = copyBuf(texts, std::max(bufsize, 1));
  outcome.results = {texts[0] == null ? -1 : 0};
  return outcome;
}

inline Units escape(const Units& src, int bufsize) {
  Units text;
  for (const char16_t unit : src == null ? u"" : src) {
    const bool printable = unit >= u' ' && unit <= u'~';
    const Units piece = printable ? Units(1, unit) : u"&(0x" + intToText(unit, 16) + u")";
    if (size(text) + size(piece) >= bufsize) break;
    text += piece;
  }
  return text;
}

}  // namespace model

// Calls from an offset on to the second null.
template <typename Unit>
void walk(Call<Unit>& call, Unit* (*function)(Unit*, int*, const Unit*)) {
  int off = call.numbers[0];
  for (int nulls = 0; nulls < 2;) {
    Unit* const token = function(call.to, &off, call.from[1]);
    call.gives(token);
    call.gives(off);
    if (!token) ++nulls;
  }
}

// With as many entries as are always enough, and one more.
template <typename Unit>
void split(Call<Unit>& call, int (*function)(Unit*, const Unit*, Unit**)) {
  static Unit untouched{};
  size_t size = 0;
  while (call.to && call.to[size] != 0) ++size;
  std::vector<Unit*> wrd((size + 1) / 2 + 1, &untouched);
  call.gives(function(call.to, call.from[1], wrd.data()));
  for (Unit* const token : wrd) {
    if (token != &untouched) call.gives(token);
  }
}

// twin::Len<char> is StrLen, twin::Len<WCHAR> is WStrLen. strLen<Unit> is the function of these:
// its arguments, and with t the texts and n the numbers, what is expected and how it is called.
// NOLINTBEGIN(bugprone-macro-parentheses): these are names and code.
#define CODE(To, From, expected, result)                   \
  [](const Args& args) -> Outcome {                        \
    [[maybe_unused]] const auto& [t, n] = args;            \
    return expected;                                       \
  },                                                       \
      [](Call<To, From>& call) {                           \
        [[maybe_unused]] const auto& n = call.numbers;     \
        [[maybe_unused]] const From* const* t = call.from; \
        result;                                            \
      }
#define NAMED_FUNCTION(title, name, narrow, wide, arguments, expected, result) \
  namespace twin {                                                             \
  template <typename Unit>                                                     \
  constexpr auto name = [] {                                                   \
    if constexpr (isWide<Unit>) {                                              \
      return &wide;                                                            \
    } else {                                                                   \
      return &narrow;                                                          \
    }                                                                          \
  }();                                                                         \
  }                                                                            \
  template <typename Unit>                                                     \
  inline const Function<Unit> str##name = {title, arguments, CODE(Unit, Unit, expected, result)};
#define FUNCTION(name, ...) NAMED_FUNCTION("Str" #name, name, Str##name, WStr##name, __VA_ARGS__)
#define ALONE(name, To, From, arguments, expected, result) \
  inline const Function<To, From> of##name = {#name, arguments, CODE(To, From, expected, result)};
// NOLINTEND(bugprone-macro-parentheses)

// clang-format off: one line each
FUNCTION(Len, "T", model::size(t[0]), call.gives(twin::Len<Unit>(call.to)))
FUNCTION(Upper, "T", model::changed(t[0], model::upper(t[0])), call.gives(twin::Upper<Unit>(call.to)))
FUNCTION(Lower, "T", model::changed(t[0], model::lower(t[0])), call.gives(twin::Lower<Unit>(call.to)))

ALONE(CharToLower, char, char, "Bn", n[0] >= 'A' && n[0] <= 'Z' ? n[0] + 32 : n[0], call.gives(CharToLower(n[0])))
ALONE(CharToUpper, char, char, "Bn", n[0] >= 'a' && n[0] <= 'z' ? n[0] - 32 : n[0], call.gives(CharToUpper(n[0])))

FUNCTION(Copy, "BT", model::copyBuf(t, INT_MAX), twin::Copy<Unit>(call.to, t[1]))
FUNCTION(CopyBuf, "BTn", model::copyBuf(t, n[0]), twin::CopyBuf<Unit>(call.to, n[0], t[1]))
FUNCTION(NCopy, "BTn", model::nCopy(t, n[0]), twin::NCopy<Unit>(call.to, t[1], n[0]))

FUNCTION(Cat, "TT", model::append(t, INT_MAX, INT_MAX), twin::Cat<Unit>(call.to, t[1]))
FUNCTION(CatBuf, "TTn", model::append(t, n[0], INT_MAX), twin::CatBuf<Unit>(call.to, n[0], t[1]))
ALONE(WStrNCat, WCHAR, WCHAR, "TTn", model::append(t, INT_MAX, n[0]), WStrNCat(call.to, t[1], n[0]))
ALONE(WStrNCatBuf, WCHAR, WCHAR, "TTnn", model::append(t, n[0], n[1]), WStrNCatBuf(call.to, n[0], t[1], n[1]))

// The unit is the first of the second text, which may be its terminator.
FUNCTION(Chr, "TT", t[1].empty() ? Outcome(-1) : model::find(t[0], model::take(t[1], 1)),
         call.gives(twin::Chr<Unit>(call.to, t[1] ? *t[1] : Unit{})))
FUNCTION(Str, "TT", model::find(t[0], t[1]), call.gives(twin::Str<Unit>(call.to, t[1])))
FUNCTION(IStr, "TT", model::find(model::lower(t[0]), model::lower(t[1])), call.gives(twin::IStr<Unit>(call.to, t[1])))

FUNCTION(NCmp, "TTn", model::compare(t[0], t[1], n[0]), call.gives(twin::NCmp<Unit>(call.to, t[1], n[0])))
FUNCTION(NICmp, "TTn", model::compare(model::lower(t[0]), model::lower(t[1]), n[0], !isWide<Unit>),
         call.gives(twin::NICmp<Unit>(call.to, t[1], n[0])))
FUNCTION(Cmp, "TT", model::compare(t[0], t[1], INT_MAX), call.gives(twin::Cmp<Unit>(call.to, t[1])))
FUNCTION(ICmp, "TT", model::compare(model::lower(t[0]), model::lower(t[1]), INT_MAX),
         call.gives(twin::ICmp<Unit>(call.to, t[1])))

FUNCTION(Token, "TTn", model::walk(t, n[0]), walk(call, twin::Token<Unit>))
FUNCTION(Split, "TT", model::split(t), split(call, twin::Split<Unit>))
FUNCTION(Trim, "TT", model::trim(t[0], t[1]), call.gives(twin::Trim<Unit>(call.to, t[1])))
FUNCTION(Replace, "BTTT", model::replace(t[0], t[1], t[2], t[3]),
         call.gives(twin::Replace<Unit>(t[1], t[2], t[3], call.to)))

NAMED_FUNCTION("IntToStr", FromInt, IntToStr, IntToWStr, "Bnn", model::changed(t[0], model::intToText(n[0], n[1])),
               call.gives(twin::FromInt<Unit>(n[0], call.to, n[1])))
FUNCTION(ToInt, "T", model::textToInt(t[0]), call.gives(twin::ToInt<Unit>(call.to)))
ALONE(BytesToWords, WORD, char, "BTn", model::words(t, n[0]), BytesToWords(t[1], call.to, n[0]))
ALONE(StrToWStr, WCHAR, char, "BTn", model::widen(t, n[0]), call.gives(StrToWStr(t[1], call.to, n[0])))
ALONE(WStrToStr, char, WCHAR, "BTn", model::changed(t[0], model::escape(t[1], n[0])),
      call.givesText(WStrToStr(t[1], call.to, n[0])))
ALONE(WStrToWords, WORD, WCHAR, "BTn", model::words(t, n[0]), WStrToWords(t[1], call.to, n[0]))
// clang-format on

// Does it with every function of a width, and with those that convert.
template <typename Unit, typename Action>
void withEach(const Action& action) {
  action(strLen<Unit>), action(strUpper<Unit>), action(strLower<Unit>);
  action(ofCharToLower), action(ofCharToUpper);
  action(strCopy<Unit>), action(strCopyBuf<Unit>), action(strNCopy<Unit>);
  action(strCat<Unit>), action(strCatBuf<Unit>);
  if constexpr (isWide<Unit>) action(ofWStrNCat), action(ofWStrNCatBuf);
  action(strChr<Unit>), action(strStr<Unit>), action(strIStr<Unit>);
  action(strNCmp<Unit>), action(strNICmp<Unit>), action(strCmp<Unit>), action(strICmp<Unit>);
  action(strToken<Unit>), action(strSplit<Unit>), action(strTrim<Unit>), action(strReplace<Unit>);
  action(strFromInt<Unit>), action(strToInt<Unit>);
  action(ofBytesToWords), action(ofStrToWStr), action(ofWStrToStr), action(ofWStrToWords);
}

// A call, and what comes of it, written out.
template <typename To, typename From = To>
struct Example {
  const Function<To, From>& function;
  Args args;
  Outcome expected;
};
template <typename To, typename From = To>
void checkExamples(const std::vector<Example<To, From>>& examples) {
  for (const auto& one : examples) check(one.function, one.args, &one.expected);
}

// Arguments by chance, of which many have to do with each other. choose(n) gives a number below n.
template <typename Unit, typename Choose>
Units anyText(const Choose& choose, const Units& other) {
  const size_t length = choose(9) > 0              ? choose(9)
                        : isBoard || choose(9) > 0 ? choose(isBoard ? 40 : 100)
                                                   : choose(1100);
  const Units alphabets[] = {u"a\u00e1", u"aA_\u00e1[{\u00c1\u00d1", u"a,;\u00ac -",
                             u" \t-0\u00b19x\u0080"};
  const Units& alphabet = alphabets[choose(4)];
  Units text = length > 8 && choose(2) > 0 ? longText(length) : u"";
  while (text.size() < length) text += alphabet[choose(static_cast<unsigned>(alphabet.size()))];
  switch (other == null ? 7 : choose(8)) {
    case 0: return other;
    case 1: return other + text;
    case 2: return other.substr(choose(static_cast<unsigned>(other.size()) + 1), length);
    case 3: text = other; break;
    case 4: return null;
    default: break;
  }
  if (text.empty() || choose(4) > 0) return text;
  char16_t& unit = text[choose(static_cast<unsigned>(text.size()))];
  constexpr unsigned bits = sizeof(Unit) * 8;
  unit = static_cast<char16_t>(choose(3) > 0 ? unit ^ 1U << choose(bits) : choose(1U << bits));
  if (unit == 0) unit = 1;
  return text;
}

template <typename To, typename From, typename Choose>
void checkByChance(const Function<To, From>& function, const Choose& choose) {
  Args args;
  int size = 0;
  for (const char argument : function.arguments) {
    if (argument == 'T') {
      args.texts.push_back(anyText<From>(choose, args.texts.empty() ? u"," : args.texts.back()));
      size = choose(3) > 0 ? model::size(args.texts.back()) : size + model::size(args.texts.back());
    } else if (argument == 'B') {
      args.texts.push_back(choose(9) > 0 ? u"" : null);
    } else if (choose(2) > 0) {
      args.numbers.push_back(size + static_cast<int>(choose(9)) - 5);
    } else {
      const unsigned number = choose(65536) << 16 ^ choose(65536);
      args.numbers.push_back(static_cast<int>(number) >> choose(32));
    }
  }
  // An offset lies in the text; raw units are as many as are copied.
  if (function.name == "StrToken") {
    args.numbers[0] = std::clamp(args.numbers[0], 0, model::size(args.texts[0]));
  } else if (function.name.find("ToWords") != std::string::npos) {
    args.numbers[0] = std::min(args.numbers[0], model::size(args.texts[1]));
  }
  check(function, args);
}
