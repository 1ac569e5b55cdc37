#include "rows.h"

#include <algorithm>

#include "strutil.h"

namespace {

constexpr Argument number(int value) { return {value, false}; }
constexpr Argument b0 = {0};
constexpr Argument b1 = {1};
constexpr Argument b2 = {2};
constexpr Argument b3 = {3};

size_t length(int n) { return static_cast<size_t>(n); }

// n units of English in mixed case.
Units prose(int n) {
  const Units text =
      u"Set the Alarm to 7 and dim Every lamp in the Hall; if Nobody is at home: Close the blinds "
      u"by 9. ";
  Units units;
  while (units.size() < length(n)) units += text;
  return units.substr(0, length(n));
}

Units replaced(Units text, char16_t unit, const Units& with) {
  for (size_t at = text.find(unit); at != Units::npos; at = text.find(unit, at + with.size())) {
    text.replace(at, 1, with);
  }
  return text;
}

Units mapped(Units text, int map(int)) {
  for (char16_t& unit : text) unit = static_cast<char16_t>(map(unit));
  return text;
}
int same(int c) { return c; }
int lower(int c) { return c >= 'A' && c <= 'Z' ? c + 32 : c; }
int upper(int c) { return c >= 'a' && c <= 'z' ? c - 32 : c; }
int otherCase(int c) { return lower(c) != c ? lower(c) : upper(c); }
int letter(int c) { return 'a' + c % 26; }

const Units end = Units(1, 0);
const std::vector<int> digitCounts = {1, 4, 10};

// The link symbol of a function by its name.
#define TEXT_OF(symbol) #symbol
#define SYMBOL(name) TEXT_OF(name)
#define NAMED(name) #name, SYMBOL(name)
#define TWIN(name) wide ? "W" #name : #name, wide ? SYMBOL(W##name) : SYMBOL(name)

}  // namespace

std::vector<Row> rowsFor(uint32_t unit) {
  const bool wide = unit == 2;
  std::vector<Row> rows;
  const auto text = [unit](const Units& units) { return Buffer{unit, units + end}; };
  const Buffer room{unit, {}};
  const auto add = [&](const char* name, const char* symbol, const char* about, const char* peer,
                       const std::function<Call(int)>& call,
                       const std::vector<int>& sizes = {0, 4, 16, 64, 256}) {
    rows.push_back({name, about, symbol, wide ? "" : peer, false, sizes, call});
  };
  const auto limited = [&] { rows.back().isLimited = true; };

  add(TWIN(StrLen), "", "strlen", [=](int n) { return Call{{text(prose(n))}, {b0}}.returns(n); });
  limited();
  const auto mapCase = [=](int n, int from(int), int map(int)) {
    const Units before = mapped(prose(n), from);
    return Call{{text(before)}, {b0}}.finds(0).writes(0, mapped(before, map));
  };
  add(TWIN(StrUpper), ", mixed text", "strupr", [=](int n) { return mapCase(n, same, upper); });
  add(TWIN(StrUpper), ", nothing to change", "strupr",
      [=](int n) { return mapCase(n, upper, upper); });
  add(TWIN(StrUpper), ", all to change", "strupr",
      [=](int n) { return mapCase(n, letter, upper); });
  add(TWIN(StrLower), ", mixed text", "strlwr", [=](int n) { return mapCase(n, same, lower); });

  const auto copy = [=](int n, const std::vector<Argument>& arguments) {
    return Call{{room, text(prose(n))}, arguments}.writes(0, prose(n) + end);
  };
  add(TWIN(StrCopy), "", "strcpy", [=](int n) { return copy(n, {b0, b1}); });
  limited();
  add(TWIN(StrCopyBuf), "", "strlcpy",
      [=](int n) { return copy(n, {b0, number(n + 1), b1}).peerTakes({b0, b1, number(n + 1)}); });
  add(TWIN(StrNCopy), ", ended by the text", "strncpy",
      [=](int n) { return copy(n, {b0, b1, number(n + 4)}); });
  add(TWIN(StrNCopy), ", ended by its count", "strncpy",
      [=](int n) {
        return Call{{room, text(prose(n + 4))}, {b0, b1, number(n)}}.writes(0, prose(n));
      },
      {4, 16, 64, 256});

  // Half of the text is there, the other half is appended.
  const auto append = [=](int n, const std::vector<Argument>& arguments) {
    const Units whole = prose(n);
    const size_t half = whole.size() / 2;
    return Call{{text(whole.substr(0, half)), text(whole.substr(half))}, arguments}.writes(
        0, whole + end);
  };
  add(TWIN(StrCat), "", "strcat", [=](int n) { return append(n, {b0, b1}); });
  add(TWIN(StrCatBuf), "", "strlcat",
      [=](int n) { return append(n, {b0, number(n + 1), b1}).peerTakes({b0, b1, number(n + 1)}); });
  if (wide) {
    add(NAMED(WStrNCat), "", "", [=](int n) { return append(n, {b0, b1, number(n)}); });
    add(NAMED(WStrNCatBuf), "", "",
        [=](int n) { return append(n, {b0, number(n + 1), b1, number(n)}); });
  }

  add(TWIN(StrChr), ", not found", "strchr",
      [=](int n) { return Call{{text(prose(n))}, {b0, number('~')}}.finds(-1); });
  limited();
  const auto find = [=](int n, const Units& word) {
    const Units before = prose(std::max(n - 4, 0));
    return Call{{text(n < 4 ? u"" : before + u"dawn"), text(word)}, {b0, b1}}.finds(n < 4 ? -1
                                                                                          : n - 4);
  };
  const auto findRepeated = [=](int n, const Units& word) {
    return Call{{text(Units(length(n), u'a')), text(word)}, {b0, b1}}.finds(-1);
  };
  add(TWIN(StrStr), ", found late", "strstr", [=](int n) { return find(n, u"dawn"); });
  add(TWIN(StrStr), ", first unit repeated", "strstr",
      [=](int n) { return findRepeated(n, u"ab"); });
  add(TWIN(StrIStr), ", found late", "strcasestr", [=](int n) { return find(n, u"DaWn"); });
  add(TWIN(StrIStr), ", first unit repeated", "strcasestr",
      [=](int n) { return findRepeated(n, u"Ab"); });

  // The text beside itself with its units mapped, and its unit `differs` another one.
  const auto compare = [=](int n, int map(int), int count, int differs = -1) {
    Units other = mapped(prose(n), map);
    if (differs >= 0) other[length(differs)] = u'~';
    Call call{{text(prose(n)), text(other)}, {b0, b1}};
    if (count >= 0) {
      for (auto* const taken : {&call.arguments, &call.peerArguments, &call.peerNext}) {
        taken->push_back(number(count));
      }
    }
    return call.returns(-differs - 1, Call::sign);
  };
  add(TWIN(StrNCmp), ", ended by the text", "strncmp",
      [=](int n) { return compare(n, same, n + 4); });
  add(TWIN(StrNCmp), ", ended by its count", "strncmp", [=](int n) { return compare(n, same, n); });
  add(TWIN(StrNICmp), ", other case", "strncasecmp",
      [=](int n) { return compare(n, otherCase, n + 4); });
  add(TWIN(StrCmp), ", equal", "strcmp", [=](int n) { return compare(n, same, -1); });
  limited();
  const std::vector<int> someUnits = {4, 16, 64, 256};
  add(TWIN(StrCmp), ", first unit differs", "strcmp",
      [=](int n) { return compare(n, same, -1, 0); }, {16});
  add(
      TWIN(StrCmp), ", last unit differs", "strcmp",
      [=](int n) { return compare(n, same, -1, n - 1); }, someUnits);
  add(TWIN(StrICmp), ", same text", "strcasecmp", [=](int n) { return compare(n, same, -1); });
  add(TWIN(StrICmp), ", other case", "strcasecmp",
      [=](int n) { return compare(n, otherCase, -1); });

  const auto line = [](int n) { return replaced(prose(n), u' ', u","); };
  add(TWIN(StrToken), ", to the end", "strtok_r", [=](int n) {
    return Call{{text(line(n)), text(u","), {4, end}}, {b0, b2, b1}}
        .peerTakes({b0, b1, b2}, {number(0), b1, b2})
        .writes(0, replaced(line(n), u',', end))
        .isRepeatedUntilNull();
  });
  add(TWIN(StrSplit), "", "peer_split", [=](int n) {
    int words = 0;
    const Units units = u"," + line(n);
    for (size_t i = 1; i < units.size(); ++i) words += units[i] != u',' && units[i - 1] == u',';
    return Call{{text(line(n)), text(u","), {4, {}}}, {b0, b1, b2}}.returns(words).writes(
        0, replaced(line(n), u',', end));
  });
  add(TWIN(StrTrim), ", a quarter at each end", "peer_trim", [=](int n) {
    const Units blanks(length(n / 4), u' ');
    const Units kept = replaced(prose(n - n / 4 * 2), u' ', u"_");
    return Call{{text(blanks + kept + blanks), text(u" \t")}, {b0, b1}}
        .returns(n - n / 4 * 2)
        .writes(0, kept + end);
  });
  add(TWIN(StrReplace), ", one unit by two", "peer_replace", [=](int n) {
    const Units after = replaced(prose(n), u' ', u"__");
    return Call{{text(prose(n)), text(u" "), text(u"__"), room}, {b0, b1, b2, b3}}
        .returns(static_cast<int>(after.size()))
        .writes(3, after + end);
  });

  const auto digits = [](int n) { return Units(u"1234567890").substr(0, length(n)); };
  const auto value = [](int n) {
    return std::stoi(std::string("1234567890").substr(0, length(n)));
  };
  add(
      wide ? "IntToWStr" : "IntToStr", wide ? SYMBOL(IntToWStr) : SYMBOL(IntToStr), ", radix 10",
      "itoa",
      [=](int n) {
        return Call{{room}, {number(value(n)), b0, number(10)}}.finds(0).writes(0, digits(n) + end);
      },
      digitCounts);
  add(
      TWIN(StrToInt), "", "atoi",
      [=](int n) { return Call{{text(digits(n))}, {b0}}.returns(value(n)); }, digitCounts);

  if (wide) {
    const auto copyWords = [=](int n, uint32_t from) {
      return Call{{{from, prose(n)}, room}, {b0, b1, number(n)}}.writes(1, prose(n));
    };
    add(NAMED(BytesToWords), "", "", [=](int n) { return copyWords(n, 1); });
    add(NAMED(StrToWStr), "", "", [=](int n) {
      return Call{{{1, prose(n) + end}, room}, {b0, b1, number(n + 1)}}.writes(1, prose(n) + end);
    });
    const auto escape = [=](const Units& src, const Units& after) {
      const int capacity = static_cast<int>(after.size()) + 1;
      return Call{{text(src), {1, {}}}, {b0, b1, number(capacity)}}.writes(1, after + end);
    };
    add(NAMED(WStrToStr), ", printable", "", [=](int n) { return escape(prose(n), prose(n)); });
    add(NAMED(WStrToStr), ", escaped", "", [=](int n) {
      const Units units(length(n), u'\u4e2d');
      return escape(units, replaced(units, u'\u4e2d', u"&(0x4e2d)"));
    });
    add(NAMED(WStrToWords), "", "", [=](int n) { return copyWords(n, 2); });
  } else {
    add(NAMED(CharToLower), "", "", [](int) { return Call{{}, {number('A')}}.returns('a'); }, {1});
    add(NAMED(CharToUpper), "", "", [](int) { return Call{{}, {number('a')}}.returns('A'); }, {1});
  }
  return rows;
}
