// bench IMAGES MADE_WITH OUT: counts the cycles of every function beside the C libraries, the
// obvious loops and the hand-written limit, checks all results, and writes to the folder OUT the
// page, README.md's part of it and what the chart shows.
#include <algorithm>
#include <cmath>
#include <cstdio>
#include <fstream>
#include <iostream>
#include <map>
#include <memory>
#include <optional>
#include <sstream>

#include "core.h"
#include "rows.h"

namespace {

constexpr uint32_t mostStack = 64;  // bytes, as README.md promises for the first build

// The images, and how the page calls them.
struct Image {
  std::string file;
  std::string title;
};
const std::vector<Image> builds = {
    {"gcc-O2", "GCC -O2"}, {"clang-O2", "Clang -O2"}, {"gcc-Os", "GCC -Os"}};
const std::vector<Image> libraries = {
    {"newlib", "newlib"}, {"picolibc-small", "picolibc, small"}, {"picolibc", "picolibc, fast"}};
const std::vector<Image> loops = {{"loops-Os", ""}, {"loops-O2", ""}, {"loops-O3", ""}};
const std::string ours = builds.front().file;
const std::string loop = "loop";  // the best of the loops
const std::string limit = "limit";

[[noreturn]] void fail(const std::string& who, const std::string& what) {
  std::cerr << who << ": " << what << "\n";
  std::exit(1);
}

std::string format(const char* pattern, double value) {
  char shown[40];
  std::snprintf(shown, sizeof shown, pattern, value);
  return shown;
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

// Makes the call, checks what came of it, and returns what it did. Misaligned, all texts start a
// unit or three after a word's start.
Run measure(Core& core, const std::string& who, const Symbol& function, const Call& call,
            bool isPeer, bool aligned) {
  std::vector<uint32_t> starts;
  core.forgetGiven();
  for (const Buffer& one : call.memory) {
    const auto index = static_cast<uint32_t>(starts.size());
    const uint32_t offset = aligned || one.unitSize == 4 ? 0 : one.unitSize * (index == 0 ? 1 : 3);
    starts.push_back(Core::data + (index * 0x1000) + offset);
    core.give(starts.back(), bytesOf(one.units, one.unitSize));
  }
  const auto values = [&](const std::vector<Argument>& arguments) {
    std::vector<uint32_t> registers;
    registers.reserve(arguments.size());
    for (const auto& [value, isBuffer] : arguments) {
      registers.push_back(isBuffer ? starts.at(static_cast<size_t>(value))
                                   : static_cast<uint32_t>(value));
    }
    return registers;
  };

  Run all;
  Run run;
  do {
    const bool isFirst = all.cycles == 0;
    run = core.call(function, values(!isPeer   ? call.arguments
                                     : isFirst ? call.peerArguments
                                               : call.peerNext));
    if (!run.ended) fail(who, "does not return");
    all.cycles += run.cycles;
    all.readsPast |= run.readsPast;
    all.stack = std::max(all.stack, run.stack);
    all.functions.merge(run.functions);
  } while (call.untilNull && run.result != 0);

  auto result = static_cast<int>(run.result);
  int expected = call.result;
  if (call.kind == Call::sign && isPeer) {
    result = (result > 0) - (result < 0);
    expected = (expected > 0) - (expected < 0);
  } else if (call.kind == Call::index && run.result != 0) {
    result = static_cast<int>(run.result - starts[0]) / static_cast<int>(call.memory[0].unitSize);
  } else if (call.kind == Call::index) {
    result = -1;
  }
  if (call.kind != Call::ignored && result != expected) {
    fail(who, "gives " + std::to_string(result) + ", not " + std::to_string(expected));
  }
  if (!call.after.empty()) {
    const auto bytes = bytesOf(call.after, call.memory[call.written].unitSize);
    if (core.read(starts[call.written], bytes.size()) != bytes) fail(who, "writes something else");
  }
  return all;
}

// The limit holds functions whose names end in the cycles that they take.
void checkCounter(Core& core) {
  core.forgetGiven();
  core.give(Core::data, std::vector<uint8_t>(32, 1));
  int checked = 0;
  for (const auto& [name, function] : core.all()) {
    const std::string cycles = name.substr(name.find_last_of('_') + 1);
    if (cycles.find_first_not_of("0123456789") != std::string::npos || cycles.empty()) continue;
    const Run run = core.call(function, {Core::data});
    if (!run.ended || run.cycles != std::stoul(cycles)) {
      fail(name, "counted " + std::to_string(run.cycles));
    }
    ++checked;
  }
  if (checked != 3) fail("the counter", "is not checked");
}

// The geometric mean of some ratios, and which of them say that ours is slower.
class Ratios {
 public:
  void add(double ratio, const Row& row, int size) {
    sum += std::log(ratio);
    ++count;
    if (ratio <= 1.02) return;
    ++behind;
    slower[row.title()].insert(size);
  }
  std::string mean() const { return format("%.2f", std::exp(sum / count)); }
  std::string text() const {
    return mean() + " of " + std::to_string(count) + " cells, " + std::to_string(behind) +
           " behind";
  }
  // Where ours is slower, with the sizes; a wide twin only where its narrow one is not.
  std::string list() const {
    std::string text;
    for (const auto& [title, sizes] : slower) {
      if (slower.count("`" + title.substr(2)) > 0) continue;
      text += (text.empty() ? "" : "; ") + title + " (";
      for (const int size : sizes) {
        text += (size == *sizes.begin() ? "" : ", ") + std::to_string(size);
      }
      text += ")";
    }
    return text;
  }

 private:
  double sum = 0;
  int count = 0;
  int behind = 0;
  std::map<std::string, std::set<int>> slower;
};

// What a build's function was seen to take at most, all its rows together.
struct Seen {
  std::map<int, uint64_t> cycles;  // by the units
  double each = 0;                 // more of them a unit, of the row that grows fastest
  uint32_t stack = 0;
  std::set<std::string> parts;  // the functions that ran

  // What remains for all that was seen to stay within a formula of the units.
  double fixed() const {
    double most = 0;
    for (const auto& [size, count] : cycles) {
      most = std::max(most, std::ceil(static_cast<double>(count) - (each * size)));
    }
    return most;
  }
};

class Report {
 public:
  explicit Report(const std::string& images) {
    for (const auto* const group : {&builds, &libraries, &loops}) {
      for (const Image& image : *group) open(images, image.file);
    }
    open(images, limit);
    checkCounter(*cores[limit]);
    for (const uint32_t unit : {1U, 2U}) {
      for (const Row& row : rowsFor(unit)) {
        rows.push_back(row);
        for (const auto& [who, core] : cores) measureAll(row, who, *core);
      }
    }
  }

  void writePage(std::ostream& out, const std::string& madeWith) const {
    out << "# Performance\n\nMade by `./dev bench` with " << madeWith
        << ".\n\nCycles on a Cortex-M0+ with zero wait states, by the timing table of its "
           "Technical Reference Manual,\ncounted from a function's first instruction through its "
           "return.\n\n![Cycles a unit, beside the C libraries](performance.svg)\n\n"
           "## In short\n\nOur cycles divided by theirs, the geometric mean of all cells from 4 "
           "units on: below 1 ours is faster. Behind\nis a cell more than 2 % slower. An honest C "
           "library was not seen to read past an argument of the function;\nthe fastest one "
           "counts.\n\n| Build | bytes | honest C library | obvious loop | limit, from 16 units "
           "on |\n|---|--:|---|---|---|\n";
    for (const Image& build : builds) {
      out << "| " << build.title << " | " << codeSize(build.file) << " | "
          << honest(build.file).text() << " | " << against(build.file, loop, 4).text() << " | "
          << against(build.file, limit, 16).text() << " |\n";
    }
    for (const int size : {16, 256}) writeRatios(out, size);
    for (const Image& build : builds) writeCosts(out, build);
  }

  void writeSummary(std::ostream& out) const {
    out << "| At 256 units | cycles | newlib | picolibc, small | picolibc, fast | obvious loop |\n"
           "|---|--:|--:|--:|--:|--:|\n";
    for (const Row* const row : chosen()) {
      out << "| " << row->title() << " | " << cycles(*row, ours, 256);
      for (const Image& library : libraries) out << " | " << ratio(*row, library.file, 256);
      out << " | " << ratio(*row, loop, 256) << " |\n";
    }
    const Ratios besideLibraries = honest(ours);
    const Ratios besideLoop = against(ours, loop, 4);
    out << "\nOur cycles divided by theirs, so that below 1 ours is faster; \"past\": theirs reads "
           "past its argument. Over all\ncells from 4 units on, in the geometric mean: "
        << besideLibraries.mean()
        << " of the fastest C library that reads nothing past\nthe end, where a C library has the "
           "function, and "
        << besideLoop.mean() << " of the obvious loop. Ours is slower (by the number of units)\n\n"
        << "- than such a library: " << besideLibraries.list()
        << ";\n- than the loop: " << besideLoop.list()
        << ".\n\nBytes of code, and of stack at most: ";
    for (const Image& build : builds) {
      uint32_t stack = 0;
      for (const auto& [key, function] : functions) {
        if (key.first == build.file) stack = std::max(stack, function.stack);
      }
      out << (build.file == ours ? "" : "; ") << build.title << " " << codeSize(build.file)
          << " and " << stack;
    }
    out << ".\n";
  }

  // A line for each function: its name, then cycles a unit of ours and of the others, each of which
  // stands in one column if it reads past its argument and in the next if it does not.
  void writeChart(std::ostream& out) const {
    for (const Row* const row : chosen()) {
      out << row->name << "\t" << static_cast<double>(cycles(*row, ours, 256)) / 256;
      for (const std::string& who : {libraries[0].file, libraries[2].file, loop}) {
        const std::string each = std::to_string(static_cast<double>(cycles(*row, who, 256)) / 256);
        out << "\t" << (readsPast(*row, who) ? each + "\t0" : "0\t" + each);
      }
      out << "\n";
    }
  }

 private:
  using Key = std::tuple<std::string, std::string, int, bool>;  // row, who, size, aligned

  void open(const std::string& images, const std::string& name) {
    cores[name] = std::make_unique<Core>(images + "/" + name);
  }

  void measureAll(const Row& row, const std::string& who, Core& core) {
    const auto isOne = [&](const Image& image) { return image.file == who; };
    const bool isPeer = std::any_of(libraries.begin(), libraries.end(), isOne);
    const bool isOurs = std::any_of(builds.begin(), builds.end(), isOne);
    if (isPeer ? row.peer.empty() : who == limit && !row.isLimited) return;
    const Symbol* const function = core.find(isPeer         ? row.peer
                                             : who == limit ? row.name
                                                            : row.symbol);
    if (!function) fail(who, "has no " + row.name);
    std::vector<int> sizes = row.sizes;
    // Ours also at every length of a turn, so that the formula holds for all.
    if (isOurs && sizes.back() == 256) sizes.insert(sizes.end(), {5, 6, 7, 8, 65, 253, 254, 255});
    for (const int size : sizes) {
      for (const bool aligned : {true, false}) {
        const std::string where = who + " " + row.title() + " " + std::to_string(size);
        const Run run = measure(core, where, *function, row.call(size), isPeer, aligned);
        outcomes[{row.title(), who, size, aligned}] = run.cycles;
        if (run.readsPast) dishonest.insert({row.name, who});
        if (who.rfind("loops", 0) == 0) {
          uint64_t& best = outcomes[{row.title(), loop, size, aligned}];
          if (best == 0 || run.cycles < best) best = run.cycles;
        }
        if (!isOurs) continue;
        if (run.readsPast) fail(where, "reads past its argument");
        Seen& most = functions[{who, row.name}];
        most.stack = std::max(most.stack, run.stack);
        most.parts.insert(run.functions.begin(), run.functions.end());
        if (who == ours && most.stack > mostStack) fail(where, "uses more stack than promised");
        most.cycles[size] = std::max(most.cycles[size], run.cycles);
      }
    }
    if (!isOurs || row.sizes.size() < 2) return;
    const int from = row.sizes[row.sizes.size() - 2];
    const int to = row.sizes.back();
    double& each = functions[{who, row.name}].each;
    for (const bool aligned : {true, false}) {
      const uint64_t more = cycles(row, who, to, aligned) - cycles(row, who, from, aligned);
      each = std::max(each, std::ceil(static_cast<double>(more) * 100 / (to - from)) / 100);
    }
  }

  uint64_t cycles(const Row& row, const std::string& who, int size, bool aligned = true) const {
    const auto found = outcomes.find({row.title(), who, size, aligned});
    return found == outcomes.end() ? 0 : found->second;
  }

  // Whoever reads past in one call does not keep the promise.
  bool readsPast(const Row& row, const std::string& who) const {
    return dishonest.count({row.name, who}) > 0;
  }

  std::string ratio(const Row& row, const std::string& who, int size) const {
    std::string text;
    std::string before;
    for (const bool aligned : {true, false}) {
      const uint64_t theirs = cycles(row, who, size, aligned);
      if (theirs == 0) return "";
      const std::string one = format("%.2f", static_cast<double>(cycles(row, ours, size, aligned)) /
                                                 static_cast<double>(theirs));
      if (one != before) text += (text.empty() ? "" : " / ") + one;
      before = one;
    }
    return text + (readsPast(row, who) ? " past" : "");
  }

  // Of each row's cells from a size on, aligned, and misaligned where that makes a difference: what
  // the build takes, divided by `theirs`, which is 0 where there is nothing to compare with.
  Ratios compare(const std::string& build, int from,
                 const std::function<uint64_t(const Row&, int, bool)>& theirs) const {
    Ratios ratios;
    for (const Row& row : rows) {
      for (const int size : row.sizes) {
        std::pair<uint64_t, uint64_t> before;
        for (const bool aligned : {true, false}) {
          const std::pair cell(cycles(row, build, size, aligned), theirs(row, size, aligned));
          if (size < from || cell.second == 0 || cell == before) continue;
          before = cell;
          ratios.add(static_cast<double>(cell.first) / static_cast<double>(cell.second), row, size);
        }
      }
    }
    return ratios;
  }

  Ratios against(const std::string& build, const std::string& who, int from) const {
    return compare(build, from, [&](const Row& row, int size, bool aligned) {
      return cycles(row, who, size, aligned);
    });
  }

  // Against the fastest C library that reads nothing past the arguments of the function.
  Ratios honest(const std::string& build) const {
    return compare(build, 4, [&](const Row& row, int size, bool aligned) {
      uint64_t fastest = 0;
      for (const Image& library : libraries) {
        const uint64_t one = cycles(row, library.file, size, aligned);
        if (one == 0 || readsPast(row, library.file)) continue;
        if (fastest == 0 || one < fastest) fastest = one;
      }
      return fastest;
    });
  }

  uint64_t bytesOfFunctions(const std::string& build, const std::set<std::string>& names) const {
    uint64_t bytes = 0;
    for (const std::string& name : names) {
      if (name.rfind("__", 0) != 0) bytes += cores.at(build)->find(name)->size;
    }
    return bytes;
  }

  uint64_t codeSize(const std::string& build) const {
    std::set<std::string> all;
    for (const auto& [key, function] : functions) {
      if (key.first == build) all.insert(function.parts.begin(), function.parts.end());
    }
    return bytesOfFunctions(build, all);
  }

  // The rows that README.md and the chart show.
  std::vector<const Row*> chosen() const {
    std::vector<const Row*> some;
    for (const char* const title :
         {"`StrLen`", "`StrCopy`", "`StrCopyBuf`", "`StrCat`", "`StrChr`, not found",
          "`StrCmp`, equal", "`StrICmp`, same text", "`StrUpper`, mixed text",
          "`StrStr`, found late", "`StrIStr`, found late", "`StrToken`, to the end",
          "`StrReplace`, one unit by two"}) {
      const auto found = std::find_if(rows.begin(), rows.end(),
                                      [&](const Row& row) { return row.title() == title; });
      if (found == rows.end()) fail(title, "is no row");
      some.push_back(&*found);
    }
    return some;
  }

  void writeRatios(std::ostream& out, int size) const {
    out << "\n## Beside others, at " << size << " units\n\n"
        << "The cycles of " << builds[0].title
        << " divided by theirs, where it differs aligned / misaligned; \"past\": theirs reads "
           "past its\nargument. The loop is the obvious one at the best of -Os, -O2 and -O3, the "
           "limit is hand-written assembly.\n\n"
           "| Function | newlib | picolibc, small | picolibc, fast | loop | limit |\n"
           "|---|--:|--:|--:|--:|--:|\n";
    for (const Row& row : rows) {
      if (cycles(row, ours, size) == 0) continue;
      out << "| " << row.title();
      for (const Image& library : libraries) out << " | " << ratio(row, library.file, size);
      out << " | " << ratio(row, loop, size) << " | " << ratio(row, limit, size) << " |\n";
    }
  }

  void writeCosts(std::ostream& out, const Image& build) const {
    out << "\n## What each function costs, " << build.title
        << "\n\nCycles by the number of units, or of digits; the dearest seen as a formula of them "
           "(n); the bytes of a\nfunction and of those that it calls, and the bytes of stack, both "
           "without the runtime's division.\n\n"
           "| Function | 0 | 1 | 4 | 10 | 16 | 64 | 256 | at most | bytes | stack |\n"
           "|---|--:|--:|--:|--:|--:|--:|--:|--:|--:|--:|\n";
    std::set<std::string> shown;
    for (const Row& row : rows) {
      out << "| " << row.title() << " |";
      for (const int size : {0, 1, 4, 10, 16, 64, 256}) {
        const uint64_t count = cycles(row, build.file, size);
        out << " " << (count == 0 ? "" : std::to_string(count)) << " |";
      }
      const Seen& function = functions.at({build.file, row.name});
      if (shown.insert(row.name).second) {
        out << " " << format("%.0f", function.fixed());
        if (function.each > 0) out << " + " << format("%.2f", function.each) << " n";
        out << " | " << bytesOfFunctions(build.file, function.parts) << " | " << function.stack;
      } else {
        out << " | |";
      }
      out << " |\n";
    }
    out << "\nCode of all functions: " << codeSize(build.file) << " bytes.\n";
  }

  std::map<std::string, std::unique_ptr<Core>> cores;
  std::vector<Row> rows;
  std::map<Key, uint64_t> outcomes;                               // cycles
  std::set<std::pair<std::string, std::string>> dishonest;        // functions, and whose
  std::map<std::pair<std::string, std::string>, Seen> functions;  // by build and name
};

}  // namespace

int main(int argc, char** argv) {
  if (argc != 4) fail("usage", "bench IMAGES MADE_WITH OUT");
  const std::string out = argv[3];
  const Report report(argv[1]);
  std::ofstream page(out + "/performance.md");
  std::ofstream summary(out + "/summary.md");
  std::ofstream chart(out + "/chart.tsv");
  report.writePage(page, argv[2]);
  report.writeSummary(summary);
  report.writeChart(chart);
}
