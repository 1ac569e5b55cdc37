#!/usr/bin/python3 -B
"""bench.py IMAGES SOURCE [--fit]: counts cycles beside the C libraries and the obvious loops, checks all
results, and tries to break the formulas of SOURCE/docs/performance.md. Fails where this page, its chart
or README.md says something else than is counted; --fit finds new formulas and writes the three."""
import difflib
import math
import re
import sys
import textwrap
from dataclasses import dataclass
from pathlib import Path

import branches
import formulas
from chart import chart
from core import DATA, Core
from rows import PROSE, ROWS, SHOWN_SIZES
from search import SEARCHED, SIZING, narrow

BUILDS = {"gcc-O2": "GCC -O2", "clang-O2": "Clang -O2", "gcc-Os": "GCC -Os"}
LIBRARIES = {"newlib": "newlib", "picolibc-small": "picolibc, small", "picolibc": "picolibc, fast"}
LOOPS = "loops-Os", "loops-O2", "loops-O3"
OURS = "gcc-O2"
PAGE, CHART, README = "docs/performance.md", "docs/performance.svg", "README.md"


@dataclass
class Cost:
    """What a function costs in one build; bytes with all that it calls."""
    formula: formulas.Formula
    bytes: int
    stack: int


@dataclass
class Build:
    title: str
    costs: dict  # of Cost, by function
    bytes: int
    stack: int
    ways_taken: int
    ways: int


@dataclass
class Comparison:
    """Ours beside the fastest of others: the geometric mean of ours / theirs, of so many cells, in some of
    which ours is more than 2 % slower."""
    ratio: float
    cells: int
    behind: int


@dataclass
class Counted:
    """Cycles by who, row, units and alignment; and the functions of whom that read past an argument."""
    cells: dict
    past: set

    def compare(self, who, others_of):
        """Where misalignment makes no difference, it counts once; below 4 units nothing does."""
        pairs = set()
        for (one, row, n, skew), cycles in self.cells.items():
            theirs = [self.cells[other, row, n, skew] for other in others_of(row)
                      if (other, row, n, skew) in self.cells]
            if one == who and theirs and n >= 4:
                pairs.add((row, n, cycles, min(theirs)))
        ratios = [ours / theirs for _, _, ours, theirs in pairs]
        mean = math.exp(sum(math.log(ratio) for ratio in ratios) / len(ratios))
        return Comparison(mean, len(ratios), sum(ratio > 1.02 for ratio in ratios))

    def honest(self, who):
        return self.compare(who, lambda row: [one for one in LIBRARIES if (one, row[0]) not in self.past])

    def loops(self, who):
        return self.compare(who, lambda _: ["loop"])


def find(name, text, pattern):
    found = re.search(pattern, text, re.M)
    if not found:
        sys.exit(f"{name}: nothing is like {pattern}; ./dev bench makes it")
    return found[1]


def check_counter(images):
    core = Core(images / "counter")
    name, = core.functions
    core.call(name, [DATA])
    if name != f"counted_{core.cycles}_{core.stack}":
        sys.exit(f"the counter: {name} takes {core.cycles} cycles, {core.stack} bytes of stack")


def symbol_of(core, symbols, who, row):
    if who in LIBRARIES:
        return row.peer
    if who in BUILDS:
        return symbols[row.name]
    name = narrow(row.name)
    start = f"_ZN5LoopsI{'c' if name == row.name else 't'}E{len(name)}{name}E"
    return next((one for one in core.functions if one.startswith(start)), start)


def sign(number):
    """-1, 0 or 1, of a number of 32 bits."""
    if number == 0:
        return 0
    return -1 if number >> 31 else 1


def measure(core, symbol, who, row, n, skew):
    """The cycles of a row's call of so many units; fails where something else comes of it."""
    arguments, result, written = row.make(n, PROSE[:n])
    where = f"{who}: {row.name}, {row.about or 'it'} at {n} units"
    if result is None and written is None:
        sys.exit(f"{where}: nothing is expected")
    if symbol not in core.functions:
        sys.exit(f"{where}: there is no {symbol}")
    is_peer = who in LIBRARIES
    core.forget_given()
    formulas.run(core, symbol, row.name, arguments, skew, row.order if is_peer else ())
    cycles, found = core.cycles, core.result
    if result == "walk":  # until it gives null; a C library takes the text at the first call only
        while core.result:
            core.call(symbol, [0, *core.registers[1:]] if is_peer else core.registers)
            cycles += core.cycles
    elif isinstance(result, tuple):
        argument, unit = result
        wanted = 0
        if argument is not None:
            wanted = core.places[argument] + unit * formulas.unit_of(row.name, argument)
        if found != wanted:
            sys.exit(f"{where}: gives {found:#x}, not {wanted:#x}")
    elif isinstance(result, int):
        wanted = result & 0xFFFFFFFF
        if is_peer and "Cmp" in row.name:  # of which the sign alone is given
            found, wanted = sign(found), sign(wanted)
        if found != wanted:
            sys.exit(f"{where}: gives {found}, not {wanted}")
    if written:
        index, units = written
        data = units.encode(formulas.CODECS[formulas.unit_of(row.name, index)])
        if core.uc.mem_read(core.places[index], len(data)) != data:
            sys.exit(f"{where}: writes something else")
    return cycles


def count_rows(images, symbols):
    missing = set(symbols) - {row.name for row in ROWS} - {"CharToLower", "CharToUpper"}
    if missing:
        sys.exit(f"bench/rows.py has no row for {', '.join(sorted(missing))}")
    cells, past = {}, set()
    for who in [*BUILDS, *LIBRARIES, *LOOPS]:
        core = Core(images / who, watches_reads=True)
        for row in ROWS:
            if who in LIBRARIES and not row.peer:
                continue
            symbol = symbol_of(core, symbols, who, row)
            for n in row.sizes:
                for skew in (False, True):
                    cycles = measure(core, symbol, who, row, n, skew)
                    cell = "loop" if who in LOOPS else who, row[:2], n, skew
                    cells[cell] = min(cycles, cells.get(cell, cycles))
                    if core.reads_past:
                        past.add((who, row.name))
    if any(who in BUILDS for who, _ in past):
        sys.exit(f"a build reads past an argument: {past}")
    return Counted(cells, past)


def stated_formulas(page, fits):
    """The formulas of the page's first table, by build and function; none if new ones are to be found."""
    if fits:
        return {}
    stated = {}
    lines = find(PAGE, page, r"((?:^\| .*\n)+)").splitlines()
    heads = [head.strip() for head in lines[0].strip("|").split("|")]
    for line in lines[2:]:
        cells = [cell.strip() for cell in line.strip("|").split("|")]
        for who, title in BUILDS.items():
            name = cells[0].replace("`", "")
            stated[who, name] = formulas.Formula.parse(cells[heads.index(f"{title}, at most")])
    return stated


def cost_of(core, title, symbol, name, stated):
    """With a formula that is stated, this is checked; else one is found."""
    core.blocks.clear()
    dearest = formulas.search(core, title, symbol, name, stated)
    if stated:
        formula = stated
        loose, lengths = min(formulas.looseness(formula, dearest.calls), key=lambda one: one[0])
    else:
        formula = formulas.fit(title, name, dearest.calls)
        loose, lengths = max(formulas.looseness(formula, dearest.calls), key=lambda one: one[0])
    if loose > formulas.LOOSEST:
        sys.exit(f"{title}: {name}: {formula} is {loose:.2f} times what a call of {lengths} takes: run ./dev "
                 "bench; if that says so, find better terms or calls (see CONTRIBUTING.md)")
    return Cost(formula, sum(dict(core.parts()).values()), dearest.stack)


def search_build(images, symbols, who, stated, promise):
    core = Core(images / who)
    title = BUILDS[who]
    costs, parts = {}, set()
    for name, symbol in symbols.items():
        for title_of in (name, name + SIZING):
            if narrow(title_of) not in SEARCHED:
                if title_of == name:
                    sys.exit(f"bench/search.py has no calls of {name}")
                continue
            if stated and (who, title_of) not in stated:
                sys.exit(f"{PAGE}: no formula of {title_of}; ./dev bench makes it")
            costs[title_of] = cost_of(core, title, symbol, title_of, stated.get((who, title_of)))
            parts |= core.parts()
            if who == OURS and costs[title_of].stack > promise:
                sys.exit(f"{name} takes {costs[title_of].stack} bytes of stack: README.md promises {promise}")
    names = {symbol: name for name, symbol in symbols.items()}
    taken, ways = branches.check(who, title, core, names)
    return Build(title, costs, sum(dict(parts).values()), max(cost.stack for cost in costs.values()), taken, ways)


def versions(images):
    """Of what made the images."""
    found = []
    for image in ("gcc-O2", "clang-O2", "newlib", "picolibc"):
        text = Path(images, image).read_bytes()
        found.append(re.search(rb"(?:GCC: \(.*?\)|clang version|newlib|picolibc) ([\d.]+)", text)[1].decode())
    return found


def table(heads, lines):
    rule = ["---"] + ["--:"] * (len(heads) - 1)
    return "".join(f"| {' | '.join(map(str, line))} |\n" for line in [heads, rule, *lines])


def cost_table(builds):
    heads = ["Function"]
    for build in builds.values():
        heads += [f"{build.title}, {what}" for what in ("at most", "bytes", "stack")]
    lines = []
    for name in builds[OURS].costs:
        function, *rest = name.split(", ")
        line = [", ".join([f"`{function}`", *rest])]
        for build in builds.values():
            cost = build.costs[name]
            line += [cost.formula, cost.bytes, cost.stack]
        lines.append(line)
    return table(heads, lines)


def build_table(builds, counted):
    lines = []
    for who, build in builds.items():
        line = [build.title, build.bytes, build.stack, f"{build.ways_taken} of {build.ways}"]
        for one in (counted.honest(who), counted.loops(who)):
            line.append(f"{one.ratio:.2f} of {one.cells} cells, {one.behind} behind")
        lines.append(line)
    return table(["Build", "bytes", "stack", "ways taken", "honest C library", "obvious loop"], lines)


def ratio(counted, row, n, other):
    """Ours / theirs, aligned and, if that differs, misaligned; empty where nothing is counted."""
    found = []
    for skew in (False, True):
        if (other, row, n, skew) in counted.cells:
            text = f"{counted.cells[OURS, row, n, skew] / counted.cells[other, row, n, skew]:.2f}"
            if text not in found:
                found.append(text)
    return " / ".join(found) + (" past" if found and (other, row[0]) in counted.past else "")


def ratio_table(counted):
    others = {**LIBRARIES, "loop": "loop"}
    heads = ["Function"]
    for title in others.values():
        heads += [f"{title}: 16", "256"]
    lines = []
    for row in ROWS:
        if narrow(row.name) != row.name and narrow(row.name) in {one.name for one in ROWS}:
            continue  # the narrow twin says it
        line = [f"`{row.name}`" + (f", {row.about}" if row.about else "")]
        for other in others:
            line += [ratio(counted, row[:2], n, other) for n in SHOWN_SIZES[row.sizes]]
        lines.append(line)
    return table(heads, lines)


def readme_figures(builds, counted):
    honest, loops = counted.honest(OURS), counted.loops(OURS)
    clang, small = builds["clang-O2"], builds["gcc-Os"]
    sentences = (
        f"Built by GCC at `-O2`, a call takes on average {honest.ratio:.2f} times the cycles of the fastest C "
        f"library function that reads nothing past the end, and {loops.ratio:.2f} times those of the obvious "
        f"loop (geometric means of {honest.cells} and {loops.cells} calls of 4 to 256 units; {honest.behind} "
        f"and {loops.behind} of them are more than 2 % slower). The library is then {builds[OURS].bytes} bytes, "
        f"the runtime's division included, and takes at most {builds[OURS].stack} bytes of stack; by Clang it is "
        f"{clang.bytes} and takes {clang.stack}, by GCC at `-Os` {small.bytes} and {small.stack}.")
    return textwrap.fill(sentences, 108, break_on_hyphens=False) + "\n"


def replace(name, text, *parts):
    """Puts these in the places of what a pattern is found for, once each, and in their order."""
    end = 0
    for pattern, part in parts:
        found = re.compile(pattern, re.M).search(text, end)
        if not found:
            sys.exit(f"{name}: nothing is like {pattern}")
        text = text[:found.start()] + part + text[found.end():]
        end = found.start() + len(part)
    return text


def main():
    images, source, fits = Path(sys.argv[1]), Path(sys.argv[2]), sys.argv[3:] == ["--fit"]
    from api import functions
    symbols = functions(source)
    texts = {name: Path(source, name).read_text() for name in (PAGE, CHART, README)}
    promise = int(find(README, texts[README], r"no function takes more than (\d+) bytes of stack"))
    check_counter(images)
    counted = count_rows(images, symbols)
    stated = stated_formulas(texts[PAGE], fits)
    builds = {who: search_build(images, symbols, who, stated, promise) for who in BUILDS}
    gcc, clang, newlib, picolibc = versions(images)
    a_table = r"(?:^\|.*\n)+"
    made = {
        CHART: chart(counted, OURS),
        PAGE: replace(
            PAGE, texts[PAGE],
            (r"^Made .*$",
             f"Made by `./dev bench` with GCC {gcc}, Clang {clang}, newlib {newlib} and picolibc {picolibc}."),
            (a_table, cost_table(builds)),
            (a_table, build_table(builds, counted)),
            (a_table, ratio_table(counted))),
        README: replace(
            README, texts[README],
            (r"(?<=^<!-- bench -->\n)[^<]*(?=<!-- end of bench -->$)", readme_figures(builds, counted))),
    }
    for name, new in made.items():
        if fits:
            Path(source, name).write_text(new)
        sys.stdout.writelines(difflib.unified_diff(texts[name].splitlines(True), new.splitlines(True),
                                                   name, f"{name}, as counted"))
    if not fits and made != texts:
        sys.exit("The code costs something else than is said, or it was made with other compilers or "
                 "libraries: run ./dev bench, look at the diff")


if __name__ == "__main__":
    main()
