// What every test file uses: the twins by width, texts that end where their memory ends, and
// destinations between canaries.
#pragma once

#include <string>
#include <type_traits>
#include <vector>

#include "doctest.h"
#include "strutil.h"

using namespace std::string_literals;

// twin::Len<char> is StrLen, twin::Len<WCHAR> is WStrLen.
// NOLINTBEGIN(bugprone-macro-parentheses): these are names.
#define NAMED_TWIN(name, narrow, wide)          \
  namespace twin {                              \
  template <typename Unit>                      \
  constexpr auto name = [] {                    \
    if constexpr (std::is_same_v<Unit, char>) { \
      return &narrow;                           \
    } else {                                    \
      return &wide;                             \
    }                                           \
  }();                                          \
  }
#define TWIN(name) NAMED_TWIN(name, Str##name, WStr##name)
// NOLINTEND(bugprone-macro-parentheses)

// The units of a text of either width, by value.
using Units = std::u16string;

template <typename Unit>
Units valuesOf(const std::vector<Unit>& units) {
  Units values;
  for (const Unit unit : units) values += static_cast<std::make_unsigned_t<Unit>>(unit);
  return values;
}

// As a message shows them: printable units themselves, the others as numbers.
inline std::string show(const Units& units) {
  std::string shown;
  for (const char16_t unit : units) {
    if (unit >= ' ' && unit <= '~') {
      shown += static_cast<char>(unit);
    } else {
      shown += '<' + std::to_string(unit) + '>';
    }
  }
  return shown;
}

// Memory that ends where the units end: the sanitizers catch one read or written too far.
template <typename Unit>
std::vector<Unit> exact(const Units& units) {
  return {units.begin(), units.end()};
}

// A text argument, in memory that ends after the terminator, or a null pointer.
template <typename Unit>
class Text {
 public:
  explicit Text(const Units& text) : units(exact<Unit>(text + u'\0')) {}
  explicit Text(const char16_t* text) {
    if (text) *this = Text(Units(text));
  }

  Unit* get() { return units.empty() ? nullptr : units.data(); }

 private:
  std::vector<Unit> units;
};

// A buffer to write to, between canaries.
template <typename Unit>
class Buffer {
 public:
  explicit Buffer(const Units& start = {}, size_t size = 24)
      : before(Units(margin, 0xB5) + start + Units(size - start.size() + margin, 0xB5)),
        now(exact<Unit>(before)) {}

  Unit* get() { return now.data() + margin; }
  int indexOf(const Unit* unit) { return unit ? static_cast<int>(unit - get()) : -1; }

  // Checks that the buffer starts with `written` and that no other unit has changed.
  void check(const Units& written) {
    Units expected = before;
    expected.replace(margin, written.size(), written);
    CHECK(show(valuesOf(now)) == show(valuesOf(exact<Unit>(expected))));
  }

 private:
  static constexpr size_t margin = 3;

  Units before;
  std::vector<Unit> now;
};

// n units of all kinds, without a separator, in an order that does not repeat.
inline Units longText(size_t n) {
  Units text;
  for (unsigned state = 1; text.size() < n; state = state * 75 % 65537) {
    text += u"aZ_\u00e1mA{zM@1"[state % 11];
  }
  return text;
}

// All texts of up to `longest` units of an alphabet.
inline std::vector<Units> allTexts(const Units& alphabet, size_t longest) {
  std::vector<Units> texts = {u""};
  for (size_t i = 0; texts[i].size() < longest; ++i) {
    for (const char16_t unit : alphabet) texts.push_back(texts[i] + unit);
  }
  return texts;
}
