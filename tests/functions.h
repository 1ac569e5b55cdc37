// How each function is called, and the check that a call does what its contract says. The test
// suite and the fuzzer use both.
#pragma once

#include <optional>

#include "contracts.h"
#include "doctest.h"

// What an argument is. Strings come before numbers, and among them what the function writes to or
// points into comes first, wherever the function has it.
enum Role {
  buffer,  // written from its start; what it held does not matter
  string,
  array,    // units without a terminator, of which 0 is none
  number,   // a count, a capacity, a value or a radix
  offset,   // an index in the first string
  elements  // a count that must not exceed the array
};

// A call while it is made.
template <typename To, typename From = To>
struct Call {
  To* to;               // the first string or buffer
  const From* from[4];  // the other strings, from 1 on
  const std::vector<int>& numbers;
  std::vector<int> results;

  void returns(int result) { results.push_back(result); }
  void returns(const To* pointer) { returns(pointer ? static_cast<int>(pointer - to) : -1); }
};

template <typename To, typename From = To>
struct Function {
  std::string name;  // the narrow one's, if it has a wide twin
  std::vector<Role> roles;
  Outcome (*contract)(const Args&);
  void (*call)(Call<To, From>&);
  mutable int failures = 0;

  std::string fullName() const {
    std::string full = name;
    if (isWide<To> && isWide<From> && name[0] != 'W') full.insert(name.find("Str"), 1, 'W');
    return full;
  }
};

// What a call's result must not depend on.
struct Layout {
  unsigned offsets[4];  // of the strings from aligned addresses, in units
  unsigned filler;      // what the guard units are
  bool sharesEqual;     // equal strings that are only read are at one address
  bool endsAtBound;     // a string ends after the units that may be read, without its terminator

  explicit Layout(unsigned seed) {
    Random random(~seed);
    for (unsigned& one : offsets) one = 1 + random(4);
    filler = random(12);
    sharesEqual = random(2) > 0;
    endsAtBound = random(2) > 0;
  }
  std::string shown(size_t strings) const {
    std::string shown = " (offsets";
    for (size_t i = 0; i < strings; ++i) shown += ' ' + std::to_string(offsets[i]);
    shown += sharesEqual ? ", equal strings shared" : ", equal strings apart";
    return shown + (endsAtBound ? ", ending at the bound)" : ", terminated)");
  }
};

inline std::string show(const std::vector<int>& results) {
  std::string shown;
  for (const int result : results) shown += (shown.empty() ? "" : " ") + std::to_string(result);
  return shown.empty() ? "nothing" : shown;
}

// The fuzzer reports a failure in another way.
inline void (*report)(const char* file, int line, const std::string& failure) =
    [](const char* file, int line, const std::string& failure) {
      ADD_FAIL_CHECK_AT(file, line, failure);
    };

// The units of a string that are in memory: all and the terminator, or only those that may be read.
inline Units unitsInMemory(const Units& string, int reads, const Layout& layout) {
  if (string == null) return u"";
  return layout.endsAtBound ? contract::firstOf(string + u'\0', reads) : string + u'\0';
}

// Makes a call in the memory layout of the seed, and compares its outcome with the one given, or
// else with the contract's. Of each function the first three failures are reported.
template <typename To, typename From>
void check(const Function<To, From>& function, const Args& args, unsigned seed,
           const Outcome* given = nullptr, const char* file = __builtin_FILE(),
           int line = __builtin_LINE()) {
  constexpr bool isOneWidth = std::is_same_v<To, From>;
  const std::vector<Units>& strings = args.strings;
  const Outcome expected = given ? *given : function.contract(args);
  const Layout layout(seed);
  const bool readsFirst = function.roles[0] != buffer;
  const bool onlyReads = readsFirst && expected.written.empty();
  const Units first =
      readsFirst ? unitsInMemory(strings[0], onlyReads ? expected.reads : INT_MAX, layout) : u"";
  Memory<To> to(first, std::max(first.size(), expected.written.size()), layout.offsets[0],
                layout.filler);
  std::optional<Memory<From>> from[4];
  Call<To, From> call = {strings[0] == null ? nullptr : to.get(), {}, args.numbers, {}};
  if constexpr (isOneWidth) call.from[0] = call.to;
  for (size_t i = 1; i < strings.size(); ++i) {
    const Units units = unitsInMemory(strings[i], expected.reads, layout);
    Memory<From>& memory = from[i].emplace(units, units.size(), layout.offsets[i], layout.filler);
    call.from[i] = strings[i] == null ? nullptr : memory.get();
    for (size_t other = isOneWidth && onlyReads ? 0 : 1; other < i; ++other) {
      if (layout.sharesEqual && strings[i] == strings[other]) call.from[i] = call.from[other];
    }
  }
  function.call(call);

  std::string failure;
  if (call.results != expected.results) {
    failure = " returned " + show(call.results) + ", expected " + show(expected.results) + ';';
  }
  if (!to.holds(expected.written)) {
    failure += " wrote " + to.shown() + ", expected " + to.expectedShown() + ';';
  }
  for (auto& one : from) {
    if (one && !one->holds(u"")) failure += " wrote to an input: " + one->shown() + ';';
  }
  if (failure.empty() || ++function.failures > 3) return;
  std::string arguments;
  for (size_t i = 0; i < strings.size(); ++i) {
    const bool isBuffer = function.roles[i] == buffer && strings[i] != null;
    arguments += (i > 0 ? ", " : "") + (isBuffer ? "buffer" : show(strings[i]));
  }
  for (const int one : args.numbers) arguments += ", " + std::to_string(one);
  report(file, line,
         function.fullName() + '(' + arguments + "):" + failure + " seed " + std::to_string(seed) +
             layout.shown(strings.size()));
}

// Calls from an offset on to the second null.
template <typename Unit>
void callToken(Call<Unit>& call, Unit* (*function)(Unit*, int*, const Unit*)) {
  int off = call.numbers[0];
  for (int nulls = 0; nulls < 2;) {
    Unit* const token = function(call.to, &off, call.from[1]);
    call.returns(token);
    call.returns(off);
    if (!token) ++nulls;
  }
}

// With as many entries as always suffice, and one more.
template <typename Unit>
void callSplit(Call<Unit>& call, int (*function)(Unit*, const Unit*, Unit**)) {
  static Unit untouched{};
  size_t length = 0;
  while (call.to && call.to[length] != 0) ++length;
  std::vector<Unit*> wrd((length + 1) / 2 + 1, &untouched);
  call.returns(function(call.to, call.from[1], wrd.data()));
  for (Unit* const token : wrd) {
    if (token != &untouched) call.returns(token);
  }
}

// The one of two functions that is for a unit.
template <typename Unit, typename Narrow, typename Wide>
constexpr auto twin(Narrow narrow, [[maybe_unused]] Wide wide) {
  if constexpr (isWide<Unit>) {
    return wide;
  } else {
    return narrow;
  }
}

// clang-format off: it would give each row a line more.
// The functions that both widths have.
template <typename Unit>
const std::vector<Function<Unit>> functions = {
    {"StrLen", {string}, [](const Args& a) { return gives(contract::length(a.strings[0])); },
     [](Call<Unit>& c) { c.returns(twin<Unit>(StrLen, WStrLen)(c.to)); }},
    {"StrUpper", {string},
     [](const Args& a) { return contract::makes(a, contract::toUpper(a.strings[0])); },
     [](Call<Unit>& c) { c.returns(twin<Unit>(StrUpper, WStrUpper)(c.to)); }},
    {"StrLower", {string},
     [](const Args& a) { return contract::makes(a, contract::toLower(a.strings[0])); },
     [](Call<Unit>& c) { c.returns(twin<Unit>(StrLower, WStrLower)(c.to)); }},

    {"StrCopy", {buffer, string}, [](const Args& a) { return contract::copyBuf(a, INT_MAX); },
     [](Call<Unit>& c) { twin<Unit>(StrCopy, WStrCopy)(c.to, c.from[1]); }},
    {"StrCopyBuf", {buffer, string, number},
     [](const Args& a) { return contract::copyBuf(a, a.numbers[0]); },
     [](Call<Unit>& c) { twin<Unit>(StrCopyBuf, WStrCopyBuf)(c.to, c.numbers[0], c.from[1]); }},
    {"StrNCopy", {buffer, string, number}, contract::nCopy,
     [](Call<Unit>& c) { twin<Unit>(StrNCopy, WStrNCopy)(c.to, c.from[1], c.numbers[0]); }},

    {"StrCat", {string, string},
     [](const Args& a) { return contract::append(a, INT_MAX, INT_MAX); },
     [](Call<Unit>& c) { twin<Unit>(StrCat, WStrCat)(c.to, c.from[1]); }},
    {"StrCatBuf", {string, string, number},
     [](const Args& a) { return contract::append(a, a.numbers[0], INT_MAX); },
     [](Call<Unit>& c) { twin<Unit>(StrCatBuf, WStrCatBuf)(c.to, c.numbers[0], c.from[1]); }},

    {"StrChr", {string, string}, contract::findUnit,
     [](Call<Unit>& c) {
       c.returns(twin<Unit>(StrChr, WStrChr)(c.to, c.from[1] ? *c.from[1] : Unit{}));
     }},
    {"StrStr", {string, string}, contract::find,
     [](Call<Unit>& c) { c.returns(twin<Unit>(StrStr, WStrStr)(c.to, c.from[1])); }},
    {"StrIStr", {string, string},
     [](const Args& a) { return contract::find(contract::lowered(a)); },
     [](Call<Unit>& c) { c.returns(twin<Unit>(StrIStr, WStrIStr)(c.to, c.from[1])); }},

    {"StrNCmp", {string, string, number},
     [](const Args& a) { return contract::compare(a, a.numbers[0]); },
     [](Call<Unit>& c) {
       c.returns(twin<Unit>(StrNCmp, WStrNCmp)(c.to, c.from[1], c.numbers[0]));
     }},
    {"StrNICmp", {string, string, number},
     [](const Args& a) {
       const auto order = isWide<Unit> ? contract::Order::regular : contract::Order::irregular;
       return contract::compare(contract::lowered(a), a.numbers[0], order);
     },
     [](Call<Unit>& c) {
       c.returns(twin<Unit>(StrNICmp, WStrNICmp)(c.to, c.from[1], c.numbers[0]));
     }},
    {"StrCmp", {string, string}, [](const Args& a) { return contract::compare(a, INT_MAX); },
     [](Call<Unit>& c) { c.returns(twin<Unit>(StrCmp, WStrCmp)(c.to, c.from[1])); }},
    {"StrICmp", {string, string},
     [](const Args& a) { return contract::compare(contract::lowered(a), INT_MAX); },
     [](Call<Unit>& c) { c.returns(twin<Unit>(StrICmp, WStrICmp)(c.to, c.from[1])); }},

    {"StrToken", {string, string, offset},
     [](const Args& a) { return contract::tokens(a, a.numbers[0]); },
     [](Call<Unit>& c) { callToken(c, twin<Unit>(StrToken, WStrToken)); }},
    {"StrSplit", {string, string}, contract::split,
     [](Call<Unit>& c) { callSplit(c, twin<Unit>(StrSplit, WStrSplit)); }},
    {"StrTrim", {string, string}, contract::trim,
     [](Call<Unit>& c) { c.returns(twin<Unit>(StrTrim, WStrTrim)(c.to, c.from[1])); }},
    {"StrReplace", {buffer, string, string, string}, contract::replace,
     [](Call<Unit>& c) {
       c.returns(twin<Unit>(StrReplace, WStrReplace)(c.from[1], c.from[2], c.from[3], c.to));
     }},

    {"IntToStr", {buffer, number, number}, contract::intToStr,
     [](Call<Unit>& c) {
       c.returns(twin<Unit>(IntToStr, IntToWStr)(c.numbers[0], c.to, c.numbers[1]));
     }},
    {"StrToInt", {string}, contract::strToInt,
     [](Call<Unit>& c) { c.returns(twin<Unit>(StrToInt, WStrToInt)(c.to)); }}};

// The others, by the units that they write and read.
inline const std::vector<Function<char>> ofInts = {
    {"CharToLower", {buffer, number}, contract::charToLower,
     [](Call<char>& c) { c.returns(CharToLower(c.numbers[0])); }},
    {"CharToUpper", {buffer, number}, contract::charToUpper,
     [](Call<char>& c) { c.returns(CharToUpper(c.numbers[0])); }}};
inline const std::vector<Function<WCHAR>> wideOnly = {
    {"WStrNCat", {string, string, number},
     [](const Args& a) { return contract::append(a, INT_MAX, a.numbers[0]); },
     [](Call<WCHAR>& c) { WStrNCat(c.to, c.from[1], c.numbers[0]); }},
    {"WStrNCatBuf", {string, string, number, number},
     [](const Args& a) { return contract::append(a, a.numbers[0], a.numbers[1]); },
     [](Call<WCHAR>& c) { WStrNCatBuf(c.to, c.numbers[0], c.from[1], c.numbers[1]); }},
    {"WStrToWords", {buffer, array, elements}, contract::copyElements,
     [](Call<WCHAR>& c) { WStrToWords(c.from[1], c.to, c.numbers[0]); }}};
inline const std::vector<Function<WORD, char>> widening = {
    {"BytesToWords", {buffer, array, elements}, contract::copyElements,
     [](Call<WORD, char>& c) { BytesToWords(c.from[1], c.to, c.numbers[0]); }},
    {"StrToWStr", {buffer, string, number}, contract::widen,
     [](Call<WORD, char>& c) { c.returns(StrToWStr(c.from[1], c.to, c.numbers[0])); }}};
// A null buffer gives a constant empty string, which stands for null here.
inline const std::vector<Function<char, WCHAR>> narrowing = {
    {"WStrToStr", {buffer, string, number}, contract::escape,
     [](Call<char, WCHAR>& c) {
       const char* const result = WStrToStr(c.from[1], c.to, c.numbers[0]);
       c.returns(c.to || *result != 0 ? result : nullptr);
     }}};
// clang-format on

template <typename Action>
void forEachFunction(const Action& action) {
  for (const auto& function : functions<char>) action(function);
  for (const auto& function : functions<WCHAR>) action(function);
  for (const auto& function : ofInts) action(function);
  for (const auto& function : wideOnly) action(function);
  for (const auto& function : widening) action(function);
  for (const auto& function : narrowing) action(function);
}

// The row of a table with this name.
template <typename To, typename From>
const Function<To, From>& find(const std::vector<Function<To, From>>& table, const char* name) {
  for (const auto& function : table) {
    if (function.name == name) return function;
  }
  FAIL("no row for " << name);
  std::abort();
}

// A random string, often related to the other: equal, or one a prefix or part of the other.
// choose(n) gives a number below n.
template <typename Unit, typename Choose>
Units randomString(Choose& choose, const Units& other) {
  const size_t length = choose(9) > 0              ? choose(9)
                        : isBoard || choose(9) > 0 ? choose(isBoard ? 40 : 100)
                                                   : choose(1100);
  const Units alphabets[] = {u"a\u00e1", u"aA_\u00e1[{\u00c1\u00d1", u"a,;\u00ac -",
                             u" \t-0\u00b19x\u0080"};
  const Units alphabet = toUnitsOf<Unit>(alphabets[choose(4)]);
  Units string = length > 8 && choose(2) > 0 ? longString<Unit>(length) : u"";
  while (string.size() < length) string += alphabet[choose(alphabet.size())];
  switch (other == null ? 7 : choose(8)) {
    case 0: return other;
    case 1: return other + string;
    case 2: return other.substr(choose(other.size() + 1), length);
    case 3: string = other; break;
    case 4: return null;
    default: break;
  }
  if (string.empty() || choose(4) > 0) return string;
  char16_t& unit = string[choose(string.size())];
  constexpr unsigned bits = sizeof(Unit) * 8;
  unit = static_cast<char16_t>(choose(3) > 0 ? unit ^ 1U << choose(bits) : choose(1U << bits));
  if (unit == 0) unit = 1;
  return string;
}

template <typename To, typename From, typename Choose>
void checkRandomCall(const Function<To, From>& function, Choose& choose, unsigned seed) {
  Args args;
  int size = 0;
  for (const Role role : function.roles) {
    if (role == buffer) {
      args.strings.push_back(choose(9) > 0 ? u"" : null);
    } else if (role <= array) {
      Units one = randomString<From>(choose, args.strings.empty() ? u"," : args.strings.back());
      for (char16_t& unit : one) {
        if (role == array && one != null && choose(4) == 0) unit = 0;
      }
      size = contract::length(one) + (choose(3) > 0 ? 0 : size);
      args.strings.push_back(one);
    } else if (choose(2) > 0) {
      args.numbers.push_back(size + static_cast<int>(choose(9)) - 5);
    } else {
      const unsigned any = choose(65536) << 16 ^ choose(65536);
      args.numbers.push_back(static_cast<int>(any) >> choose(32));
    }
    if (role == offset) {
      args.numbers[0] = std::clamp(args.numbers[0], 0, contract::length(args.strings[0]));
    } else if (role == elements) {
      args.numbers[0] = std::min(args.numbers[0], contract::length(args.strings[1]));
    }
  }
  check(function, args, seed);
}
