// bench IMAGES CALLGRAPH MARKDOWN: counts the cycles of every function beside the C libraries, the
// obvious loops and the hand-written limit, checks all results, and writes the tables.
#include <unistd.h>

#include <algorithm>
#include <cmath>
#include <cstdio>
#include <fstream>
#include <functional>
#include <iostream>
#include <memory>
#include <optional>
#include <regex>
#include <set>
#include <sstream>

#include "core.h"
#include "strutil.h"

namespace {

using Units = std::u16string;

// A buffer that a call gets, and what of it may be read before it is written.
struct Buffer {
  uint32_t unitSize;
  Units units;
};

// An argument: a number, or the address of one of the call's buffers.
struct Argument {
  int value;
  bool isBuffer = true;
};
constexpr Argument number(int value) { return {value, false}; }
constexpr Argument b0 = {0};
constexpr Argument b1 = {1};
constexpr Argument b2 = {2};
constexpr Argument b3 = {3};

// What a result is: a number, or a pointer to the unit of buffer 0 that has an index, -1 for null.
enum class Result { ignored, number, index };

// A call to measure, the same for all who can do it.
struct Call {
  std::vector<Buffer> memory;
  std::vector<Argument> arguments;
  Result kind;
  int result = 0;
  size_t written = 0;                        // the buffer that is written,
  Units after = {};                          // and what it starts with then
  std::vector<Argument> peerArguments = {};  // if a C library takes others
  std::vector<Argument> peerNext = {};       // what it takes from the second call on
  bool untilNull = false;                    // called again until the result is null
};

struct Row {
  std::string name;
  std::string symbol;  // under which the library and the loops have it
  std::string limit;   // under which the hand-written limit has it
  std::string peer;    // under which the C libraries have it, if they do
  std::vector<int> sizes;
  std::function<Call(int size)> call;
};

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

// n units of words with commas between them.
Units commaSeparated(int n) {
  Units line = prose(n);
  for (size_t i = 0; i < line.size(); ++i) {
    if (line[i] == u' ') line[i] = u',';
  }
  return line;
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
int lower(int c) { return c >= 'A' && c <= 'Z' ? c + 32 : c; }
int upper(int c) { return c >= 'a' && c <= 'z' ? c - 32 : c; }
int otherCase(int c) { return lower(c) != c ? lower(c) : upper(c); }

const Units end = Units(1, 0);

// The link symbol of a function by its name.
#define TEXT_OF(symbol) #symbol
#define SYMBOL(name) TEXT_OF(name)

// All rows, narrow or wide by the size of a unit.
std::vector<Row> rowsFor(uint32_t unit) {
  const bool wide = unit == 2;
  std::vector<Row> rows;
  const auto text = [unit](const Units& units) { return Buffer{unit, units + end}; };
  const Buffer room{unit, {}};
  const auto add = [&](const char* name, const char* symbol, const char* about, const char* peer,
                       const std::function<Call(int)>& call,
                       const std::vector<int>& sizes = {0, 4, 16, 64, 256}) {
    rows.push_back({std::string(name) + about, symbol, name, wide ? "" : peer, sizes, call});
  };
#define TWIN(name) wide ? "W" #name : #name, wide ? SYMBOL(W##name) : SYMBOL(name)

  add(TWIN(StrLen), "", "strlen",
      [=](int n) { return Call{{text(prose(n))}, {b0}, Result::number, n}; });
  add(TWIN(StrUpper), "", "strupr", [=](int n) {
    return Call{{text(prose(n))}, {b0}, Result::index, 0, 0, mapped(prose(n), upper)};
  });
  add(TWIN(StrLower), "", "strlwr", [=](int n) {
    return Call{{text(prose(n))}, {b0}, Result::index, 0, 0, mapped(prose(n), lower)};
  });

  add(TWIN(StrCopy), "", "strcpy", [=](int n) {
    return Call{{room, text(prose(n))}, {b0, b1}, Result::ignored, 0, 0, prose(n) + end};
  });
  add(TWIN(StrCopyBuf), "", "strlcpy", [=](int n) {
    return Call{{room, text(prose(n))}, {b0, number(n + 1), b1}, Result::ignored, 0, 0,
                prose(n) + end,         {b0, b1, number(n + 1)}};
  });
  add(TWIN(StrNCopy), "", "strncpy", [=](int n) {
    return Call{{room, text(prose(n))}, {b0, b1, number(n + 4)}, Result::ignored, 0, 0,
                prose(n) + end};
  });

  // Half of the text is there, the other half is appended.
  const auto append = [=](int n, std::vector<Argument> arguments, std::vector<Argument> peer = {}) {
    const Units whole = prose(n);
    const size_t half = whole.size() / 2;
    return Call{{text(whole.substr(0, half)), text(whole.substr(half))},
                std::move(arguments),
                Result::ignored,
                0,
                0,
                whole + end,
                std::move(peer)};
  };
  add(TWIN(StrCat), "", "strcat", [=](int n) { return append(n, {b0, b1}); });
  add(TWIN(StrCatBuf), "", "strlcat",
      [=](int n) { return append(n, {b0, number(n + 1), b1}, {b0, b1, number(n + 1)}); });
  if (wide) {
    add("WStrNCat", SYMBOL(WStrNCat), "", "",
        [=](int n) { return append(n, {b0, b1, number(n)}); });
    add("WStrNCatBuf", SYMBOL(WStrNCatBuf), "", "",
        [=](int n) { return append(n, {b0, number(n + 1), b1, number(n)}); });
  }

  add(TWIN(StrChr), ", not found", "strchr",
      [=](int n) { return Call{{text(prose(n))}, {b0, number('~')}, Result::index, -1}; });
  const auto find = [=](int n, const Units& word) {
    const Units before = prose(std::max(n - 4, 0));
    return Call{{text(n < 4 ? u"" : before + u"dawn"), text(word)},
                {b0, b1},
                Result::index,
                n < 4 ? -1 : n - 4};
  };
  add(TWIN(StrStr), ", found late", "strstr", [=](int n) { return find(n, u"dawn"); });
  add(TWIN(StrIStr), ", found late", "strcasestr", [=](int n) { return find(n, u"DaWn"); });

  const auto compare = [=](int n, int map(int), bool bounded) {
    Call call{{text(prose(n)), text(mapped(prose(n), map))}, {b0, b1}, Result::number, 0};
    if (bounded) call.arguments.push_back(number(n + 4));
    return call;
  };
  const auto same = [](int c) { return c; };
  add(TWIN(StrNCmp), "", "strncmp", [=](int n) { return compare(n, same, true); });
  add(TWIN(StrNICmp), ", other case", "strncasecmp",
      [=](int n) { return compare(n, otherCase, true); });
  add(TWIN(StrCmp), "", "strcmp", [=](int n) { return compare(n, same, false); });
  add(TWIN(StrICmp), ", same text", "strcasecmp", [=](int n) { return compare(n, same, false); });
  add(TWIN(StrICmp), ", other case", "strcasecmp",
      [=](int n) { return compare(n, otherCase, false); });

  add(TWIN(StrToken), ", to the end", "strtok_r", [=](int n) {
    const Units line = commaSeparated(n);
    return Call{{text(line), text(u","), {4, end}}, {b0, b2, b1}, Result::ignored,     0,   0,
                replaced(line, u',', end),          {b0, b1, b2}, {number(0), b1, b2}, true};
  });
  add(TWIN(StrSplit), "", "peer_split", [=](int n) {
    const Units line = commaSeparated(n);
    int words = 0;
    for (size_t i = 0; i < line.size(); ++i) {
      if (line[i] != u',' && (i == 0 || line[i - 1] == u',')) ++words;
    }
    return Call{{text(line), text(u","), {4, {}}}, {b0, b1, b2}, Result::number, words, 0,
                replaced(line, u',', end)};
  });
  add(TWIN(StrTrim), ", a quarter at each end", "peer_trim", [=](int n) {
    const Units blanks(length(n / 4), u' ');
    const Units kept = replaced(prose(n - n / 4 * 2), u' ', u"_");
    return Call{{text(blanks + kept + blanks), text(u" \t")},
                {b0, b1},
                Result::number,
                n - n / 4 * 2,
                0,
                kept + end};
  });
  add(TWIN(StrReplace), ", one unit by two", "peer_replace", [=](int n) {
    const Units after = replaced(prose(n), u' ', u"__");
    return Call{{text(prose(n)), text(u" "), text(u"__"), room},
                {b0, b1, b2, b3},
                Result::number,
                static_cast<int>(after.size()),
                3,
                after + end};
  });

  const auto digits = [](int n) { return Units(u"1234567890").substr(0, length(n)); };
  const auto value = [=](int n) {
    int number = 0;
    for (const char16_t digit : digits(n)) number = number * 10 + (digit - '0');
    return number;
  };
  add(wide ? "IntToWStr" : "IntToStr", wide ? SYMBOL(IntToWStr) : SYMBOL(IntToStr), ", radix 10",
      "itoa",
      [=](int n) {
        return Call{{room},         {number(value(n)), b0, number(10)}, Result::index, 0, 0,
                    digits(n) + end};
      },
      {1, 4, 10});
  add(TWIN(StrToInt), "", "atoi",
      [=](int n) { return Call{{text(digits(n))}, {b0}, Result::number, value(n)}; }, {1, 4, 10});

  if (wide) {
    const auto copyWords = [=](int n, uint32_t from) {
      return Call{{{from, prose(n)}, room}, {b0, b1, number(n)}, Result::ignored, 0, 1, prose(n)};
    };
    add("BytesToWords", SYMBOL(BytesToWords), "", "", [=](int n) { return copyWords(n, 1); });
    add("StrToWStr", SYMBOL(StrToWStr), "", "", [=](int n) {
      return Call{{{1, prose(n) + end}, room},
                  {b0, b1, number(n + 1)},
                  Result::ignored,
                  0,
                  1,
                  prose(n) + end};
    });
    const auto escape = [=](const Units& src, const Units& after) {
      return Call{{text(src), {1, {}}},
                  {b0, b1, number(static_cast<int>(after.size()) + 1)},
                  Result::ignored,
                  0,
                  1,
                  after + end};
    };
    add("WStrToStr", SYMBOL(WStrToStr), ", printable", "",
        [=](int n) { return escape(prose(n), prose(n)); });
    add("WStrToStr", SYMBOL(WStrToStr), ", escaped", "", [=](int n) {
      const Units units(length(n), u'\u4e2d');
      return escape(units, replaced(units, u'\u4e2d', u"&(0x4e2d)"));
    });
    add("WStrToWords", SYMBOL(WStrToWords), "", "", [=](int n) { return copyWords(n, 2); });
  } else {
    add("CharToLower", SYMBOL(CharToLower), "", "",
        [](int) { return Call{{}, {number('A')}, Result::number, 'a'}; }, {1});
    add("CharToUpper", SYMBOL(CharToUpper), "", "",
        [](int) { return Call{{}, {number('a')}, Result::number, 'A'}; }, {1});
  }
  return rows;
}

struct Outcome {
  uint64_t cycles = 0;
  bool readsPast = false;
};

[[noreturn]] void fail(const std::string& who, const std::string& what) {
  std::cerr << who << ": " << what << "\n";
  std::exit(1);
}

std::vector<uint8_t> bytesOf(const Units& units, uint32_t unitSize) {
  std::vector<uint8_t> bytes;
  for (const char16_t unit : units) {
    for (uint32_t i = 0; i < unitSize; ++i) {
      bytes.push_back(i < 2 ? static_cast<uint8_t>(unit >> (8 * i)) : 0);
    }
  }
  return bytes;
}

// Makes the call, checks what came of it, and returns its cost. Misaligned, all texts start a unit
// or three after a word's start.
Outcome measure(Core& core, const std::string& who, const Function& function, const Call& call,
                bool peer, bool aligned) {
  std::vector<uint32_t> starts;
  core.forgetGiven();
  for (const Buffer& one : call.memory) {
    const auto index = static_cast<uint32_t>(starts.size());
    const uint32_t offset = aligned || one.unitSize == 4 ? 0 : one.unitSize * (index == 0 ? 1 : 3);
    starts.push_back(Core::data + index * 0x1000 + offset);
    core.give(starts.back(), bytesOf(one.units, one.unitSize));
  }

  const auto values = [&](const std::vector<Argument>& arguments) {
    std::vector<uint32_t> registers;
    registers.reserve(arguments.size());
    for (const Argument& argument : arguments) {
      registers.push_back(argument.isBuffer ? starts[length(argument.value)]
                                            : static_cast<uint32_t>(argument.value));
    }
    return registers;
  };
  const bool own = peer && !call.peerArguments.empty();
  std::vector<Argument> arguments = own ? call.peerArguments : call.arguments;
  Outcome outcome;
  Run run;
  do {
    run = core.call(function, values(arguments));
    if (!run.ended) fail(who, "does not return");
    outcome.cycles += run.cycles;
    outcome.readsPast = outcome.readsPast || run.readsPast;
    if (own && !call.peerNext.empty()) arguments = call.peerNext;
  } while (call.untilNull && run.result != 0);

  const auto result = static_cast<int>(run.result);
  if (call.kind == Result::number && result != call.result) {
    fail(who, "gives " + std::to_string(result) + ", not " + std::to_string(call.result));
  }
  if (call.kind == Result::index) {
    const uint32_t at = starts[0] + static_cast<uint32_t>(call.result) * call.memory[0].unitSize;
    if (run.result != (call.result < 0 ? 0 : at)) fail(who, "points elsewhere");
  }
  const std::vector<uint8_t> after = call.memory.empty()
                                         ? std::vector<uint8_t>()
                                         : bytesOf(call.after, call.memory[call.written].unitSize);
  if (!after.empty() && core.read(starts[call.written], after.size()) != after) {
    fail(who, "leaves another text");
  }
  return outcome;
}

// The cycles of these loops are worked out beside them, in limit.S.
void checkCounts(Core& core) {
  core.forgetGiven();
  core.give(Core::data, std::vector<uint8_t>(32, 1));
  const std::pair<const char*, uint64_t> known[] = {
      {"selfcheck_branches", 13}, {"selfcheck_memory", 22}, {"selfcheck_calls", 22}};
  for (const auto& [name, cycles] : known) {
    const Run run = core.call(*core.find(name), {Core::data});
    if (!run.ended || run.cycles != cycles) {
      fail(name, "counted " + std::to_string(run.cycles) + ", not " + std::to_string(cycles));
    }
  }
}

// The worst stack use of each function, its callees included, from the compiler's call graph.
class Stack {
 public:
  explicit Stack(const std::string& file) {
    std::ifstream graph(file);
    if (!graph) fail(file, "cannot be read");
    const std::regex node(R"re(node: \{ title: "([^"]*)" label: "[^"]*\\n(\d+) bytes \()re");
    const std::regex edge(R"re(edge: \{ sourcename: "([^"]*)" targetname: "([^"]*)")re");
    std::smatch match;
    for (std::string line; std::getline(graph, line);) {
      if (std::regex_search(line, match, node)) own[match[1]] = std::stoi(match[2]);
      if (std::regex_search(line, match, edge)) callees[match[1]].insert(match[2]);
    }
  }

  // NOLINTNEXTLINE(misc-no-recursion): a cycle in the library's calls ends at the first test.
  int of(const std::string& function, int depth = 0) const {
    if (depth > 10) fail(function, "is recursive");
    int deepest = 0;
    const auto called = callees.find(function);
    if (called != callees.end()) {
      for (const std::string& callee : called->second)
        deepest = std::max(deepest, of(callee, depth + 1));
    }
    if (function == "__aeabi_idivmod") return 0;  // the runtime's, not the library's
    const auto found = own.find(function);
    if (found == own.end()) fail(function, "is not in the call graph");
    return deepest + found->second;
  }

 private:
  std::map<std::string, int> own;
  std::map<std::string, std::set<std::string>> callees;
};

// The geometric mean and the largest of some ratios.
class Ratios {
 public:
  void add(double ratio, const std::string& where) {
    sum += std::log(ratio);
    ++count;
    if (ratio > worst) {
      worst = ratio;
      worstAt = where;
    }
  }
  std::string text() const {
    char shown[200];
    std::snprintf(shown, sizeof shown, "%.2f in the geometric mean of %d cells; at most %.2f (%s)",
                  std::exp(sum / count), count, worst, worstAt.c_str());
    return shown;
  }

 private:
  double sum = 0;
  int count = 0;
  double worst = 0;
  std::string worstAt;
};

std::string format(const char* pattern, double value) {
  char shown[40];
  std::snprintf(shown, sizeof shown, pattern, value);
  return shown;
}

// All outcomes of a row: by who, size and alignment.
using Outcomes = std::map<std::tuple<std::string, int, bool>, Outcome>;

constexpr int mostStack = 64;  // as README.md promises

const char* const libraries[] = {"newlib", "newlib-nano", "picolibc"};
const char* const loops[] = {"loops-Os", "loops-O2", "loops-O3"};

class Report {
 public:
  Report(const std::string& images, const std::string& callGraph) : stack(callGraph) {
    for (const char* name : {"strutil", "limit", "newlib", "newlib-nano", "picolibc", "loops-Os",
                             "loops-O2", "loops-O3"}) {
      cores[name] = std::make_unique<Core>(images + "/" + name);
    }
    checkCounts(*cores["limit"]);
  }

  void measureAll() {
    for (const uint32_t unit : {1U, 2U}) {
      for (const Row& row : rowsFor(unit)) {
        if (isatty(STDERR_FILENO) != 0) std::cerr << "\r\033[K" << row.name << std::flush;
        rows.emplace_back(row, measureRow(row));
      }
    }
    if (isatty(STDERR_FILENO) != 0) std::cerr << "\r\033[K";
  }

  void write(std::ostream& out) {
    out << "# Performance\n\n"
           "Cycles on a Cortex-M0+ with zero wait states, counted by `./dev bench` from the "
           "function's first\ninstruction through its return.\n\n"
           "## What each function costs\n\n"
           "By the number of units; by the number of digits for the number conversions. Stack is "
           "the worst use, callees\nincluded, without the runtime's division.\n\n"
           "| Function | 0 | 1 | 4 | 10 | 16 | 64 | 256 | a unit at the end | code bytes | stack "
           "bytes |\n|---|--:|--:|--:|--:|--:|--:|--:|--:|--:|--:|\n";
    std::set<std::string> seen;
    uint64_t code = 0;
    for (const auto& [row, outcomes] : rows) {
      out << "| `" << row.limit << "`" << row.name.substr(row.limit.size()) << " |";
      for (const int size : {0, 1, 4, 10, 16, 64, 256}) {
        const auto found = outcomes.find({"strutil", size, true});
        out << " " << (found == outcomes.end() ? "" : std::to_string(found->second.cycles)) << " |";
      }
      const int last = row.sizes.back();
      const double cycles = static_cast<double>(outcomes.at({"strutil", last, true}).cycles);
      const uint32_t size = cores["strutil"]->find(row.symbol)->size;
      if (seen.insert(row.symbol).second) code += size;
      if (stack.of(row.symbol) > mostStack) fail(row.name, "uses more stack than promised");
      out << " " << format("%.1f", cycles / last) << " | " << size << " | " << stack.of(row.symbol)
          << " |\n";
    }
    out << "\nCode of all functions: " << code << " bytes.\n";
    for (const int size : {4, 10, 16, 64, 256}) writeRatios(out, size);
    writeGoals(out);
  }

 private:
  Outcomes measureRow(const Row& row) {
    Outcomes outcomes;
    for (const auto& [who, core] : cores) {
      const bool peer =
          std::find(std::begin(libraries), std::end(libraries), who) != std::end(libraries);
      const Function* const function = core->find(peer             ? row.peer
                                                  : who == "limit" ? row.limit
                                                                   : row.symbol);
      if (!function && who != "limit" && !(peer && row.peer.empty()))
        fail(who, "has no " + row.name);
      if (!function) continue;
      for (const int size : row.sizes) {
        for (const bool aligned : {true, false}) {
          const std::string where = who + " " + row.name + " " + std::to_string(size);
          outcomes[{who, size, aligned}] =
              measure(*core, where, *function, row.call(size), peer, aligned);
          if (who == "strutil" && outcomes[{who, size, aligned}].readsPast) {
            fail(where, "reads past its argument");
          }
        }
      }
    }
    for (const int size : row.sizes) {
      for (const bool aligned : {true, false}) {
        Outcome best = outcomes[{loops[0], size, aligned}];
        for (const char* const loop : loops) {
          best.cycles = std::min(best.cycles, outcomes[{loop, size, aligned}].cycles);
        }
        outcomes[{"loop", size, aligned}] = best;
      }
    }
    return outcomes;
  }

  static std::optional<double> ratio(const Outcomes& outcomes, const std::string& who, int size,
                                     bool aligned) {
    const auto other = outcomes.find({who, size, aligned});
    if (other == outcomes.end()) return std::nullopt;
    return static_cast<double>(outcomes.at({"strutil", size, aligned}).cycles) /
           static_cast<double>(other->second.cycles);
  }

  // Whoever reads past at one size or alignment does not keep the promise.
  static bool readsPast(const Outcomes& outcomes, const std::string& who) {
    return std::any_of(outcomes.begin(), outcomes.end(), [&](const auto& one) {
      return std::get<0>(one.first) == who && one.second.readsPast;
    });
  }

  void writeRatios(std::ostream& out, int size) {
    const char* const others[] = {"newlib", "newlib-nano", "picolibc", "loop", "limit"};
    out << "\n## Beside others, at " << size << " units or digits\n\n"
        << "Our cycles divided by theirs, aligned / misaligned: below 1 ours is faster. \"past\": "
           "theirs reads past its\nargument. The loop is the obvious one at the best of -Os, -O2 "
           "and -O3, the limit is hand-written assembly.\n\n"
        << "| Function | newlib | newlib-nano | picolibc | loop | limit |\n"
           "|---|--:|--:|--:|--:|--:|\n";
    for (const auto& [row, outcomes] : rows) {
      if (outcomes.count({"strutil", size, true}) == 0) continue;
      out << "| `" << row.limit << "`" << row.name.substr(row.limit.size()) << " |";
      for (const char* const who : others) {
        const auto aligned = ratio(outcomes, who, size, true);
        if (aligned) {
          out << " " << format("%.2f", *aligned) << " / "
              << format("%.2f", *ratio(outcomes, who, size, false))
              << (readsPast(outcomes, who) ? " past" : "");
        }
        out << " |";
      }
      out << "\n";
    }
  }

  void writeGoals(std::ostream& out) {
    Ratios safe;
    Ratios loop;
    Ratios limit;
    for (const auto& [row, outcomes] : rows) {
      for (const int size : row.sizes) {
        if (size < 4) continue;
        for (const bool aligned : {true, false}) {
          const std::string where =
              row.name + " at " + std::to_string(size) + (aligned ? "" : ", misaligned");
          double fastest = 0;
          for (const char* const library : libraries) {
            const auto of = ratio(outcomes, library, size, aligned);
            if (of && !readsPast(outcomes, library)) fastest = std::max(fastest, *of);
          }
          if (fastest > 0) safe.add(fastest, where);
          loop.add(*ratio(outcomes, "loop", size, aligned), where);
          const auto limited = ratio(outcomes, "limit", size, aligned);
          if (limited && size >= 16) limit.add(*limited, where);
        }
      }
    }
    out << "\n## In short\n\n"
        << "- Beside the fastest C library that reads nothing past its argument: " << safe.text()
        << ".\n- Beside the obvious loop: " << loop.text()
        << ".\n- Beside the hand-written limit, from 16 units on: " << limit.text() << ".\n";
  }

  Stack stack;
  std::map<std::string, std::unique_ptr<Core>> cores;
  std::vector<std::pair<Row, Outcomes>> rows;
};

}  // namespace

int main(int argc, char** argv) {
  if (argc != 4) fail("usage", "bench IMAGES CALLGRAPH MARKDOWN");
  Report report(argv[1], argv[2]);
  report.measureAll();
  std::ostringstream text;
  report.write(text);
  std::ofstream(argv[3]) << text.str();
  std::cout << text.str();
}
