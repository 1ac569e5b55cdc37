#!/usr/bin/python3 -B
"""bench.py IMAGES SOURCE [--fit]: counts cycles beside the C libraries and the obvious loops, checks all
results, and tries to break the formulas of SOURCE/docs/performance.md. Fails where this page, its chart
or README.md says something else than is counted; --fit finds new formulas and writes the three."""
import difflib
import math
import re
import sys
from pathlib import Path

from chart import chart
from core import DATA, Core
from formulas import CODECS, dearest, fit, run, unit_of
from rows import PROSE, ROWS
from search import narrow

BUILDS = {"gcc-O2": "GCC -O2", "clang-O2": "Clang -O2", "gcc-Os": "GCC -Os"}
LIBRARIES = {"newlib": "newlib", "picolibc-small": "picolibc, small", "picolibc": "picolibc, fast"}
LOOPS = "loops-Os", "loops-O2", "loops-O3"
OURS = "gcc-O2"

images, source, fits = Path(sys.argv[1]), Path(sys.argv[2]), sys.argv[3:] == ["--fit"]
PAGE, CHART, README = "docs/performance.md", "docs/performance.svg", "README.md"
texts = {name: Path(source, name).read_text() for name in (PAGE, CHART, README)}
TABLE = r"(?:^\|.*\n)+"
symbols = dict(re.findall(r"^#define (\w+) (\w+)$", Path(source, "include/SubName.h").read_text(), re.M))


def find(name, pattern):
    found = re.search(pattern, texts[name], re.M)
    if not found:
        sys.exit(f"{name}: nothing is like {pattern}; ./dev bench makes it")
    return found[1]


def check_counter():
    core = Core(images / "counter")
    name, = core.functions
    core.call(name, [DATA])
    if name != f"counted_{core.cycles}_{core.stack}":
        sys.exit(f"the counter: {name} takes {core.cycles} cycles, {core.stack} bytes of stack")


def symbol_of(core, who, row):
    if who in LIBRARIES:
        return row.peer
    if who in BUILDS:
        return symbols[row.name]
    name = narrow(row.name)
    start = f"_ZN5LoopsI{'c' if name == row.name else 't'}E{len(name)}{name}E"
    return next((one for one in core.functions if one.startswith(start)), start)


def measure(core, who, row, n, skew):
    """The cycles of a row's call of so many units; fails where something else comes of it."""
    arguments, result, written = row.make(n, PROSE[:n])
    where = f"{who}: {row.name}, {row.about or 'it'} at {n} units"
    symbol = symbol_of(core, who, row)
    if result is None and written is None:
        sys.exit(f"{where}: nothing is expected")
    if symbol not in core.functions:
        sys.exit(f"{where}: there is no {symbol}")
    is_peer = who in LIBRARIES
    core.forget_given()
    run(core, symbol, row.name, arguments, skew, row.order if is_peer else ())
    cycles, found = core.cycles, core.result
    while result == "walk" and core.result:
        core.call(symbol, [0, *core.registers[1:]] if is_peer else core.registers)
        cycles += core.cycles
    if isinstance(result, tuple):
        argument, unit = result
        result = 0 if argument is None else core.places[argument] + unit * unit_of(row.name, argument)
    elif isinstance(result, int):
        result &= 0xFFFFFFFF
        if is_peer and "Cmp" in row.name:  # of which the sign alone is given
            found, result = ((one > 0) - 2 * (one >> 31) for one in (found, result))
    if result not in (None, "walk") and found != result:
        sys.exit(f"{where}: gives {found}, not {result}")
    if written:
        index, units = written
        data = units.encode(CODECS[unit_of(row.name, index)])
        if core.uc.mem_read(core.places[index], len(data)) != data:
            sys.exit(f"{where}: writes something else")
    return cycles


def compare_all():
    """Cycles by who, row, size and alignment; and which functions of whom read past an argument."""
    cells, past = {}, set()
    for who in [*BUILDS, *LIBRARIES, *LOOPS]:
        core = Core(images / who, watches_reads=True)
        for row in ROWS:
            for n in row.sizes if row.peer or who not in LIBRARIES else ():
                for skew in (False, True):
                    cycles = measure(core, who, row, n, skew)
                    cell = "loop" if who in LOOPS else who, row[:2], n, skew
                    cells[cell] = min(cycles, cells.get(cell, cycles))
                    if core.reads_past:
                        past.add((who, row.name))
    if any(who in BUILDS for who, _ in past):
        sys.exit(f"a build reads past an argument: {past}")
    return cells, past


def costs_of(who):
    """Formula, bytes and stack of each of a build's functions, and bytes and stack of all."""
    core, title = Core(images / who), BUILDS[who]
    costs, parts, before = {}, set(), "[^|]*\\|" * 3 * list(BUILDS).index(who)
    for name, symbol in symbols.items():
        core.blocks.clear()
        formula = None if fits else find(PAGE, rf"^\| `{name}` \|{before} ([^|]*) \|(?=[^#]*\n## Who)")
        most, stack = dearest(core, title, symbol, name, formula)
        costs[name] = formula or fit(title, name, most), sum(dict(core.parts()).values()), stack
        parts |= core.parts()
        if who == OURS and stack > promise:
            sys.exit(f"{name} takes {stack} bytes of stack: README.md promises {promise}")
    return costs, (sum(dict(parts).values()), max(stack for _, _, stack in costs.values()))


def mean(who, others):
    """The geometric mean of ours by the fastest of the others, the cells, and those 2 % behind; from 4
    units on, and misaligned only where that makes a difference."""
    pairs = set()
    for (one, row, n, skew), cycles in cells.items():
        theirs = [cells[other, row, n, skew] for other in others(row) if (other, row, n, skew) in cells]
        if one == who and theirs and n >= 4:
            pairs.add((row, n, cycles, min(theirs)))
    found = sorted(ours / theirs for _, _, ours, theirs in pairs)
    return math.exp(sum(map(math.log, found)) / len(found)), len(found), sum(one > 1.02 for one in found)


def ratio(row, n, other):
    pair = [f"{cells[OURS, row, n, skew] / cells[other, row, n, skew]:.2f}"
            for skew in (False, True) if (other, row, n, skew) in cells]
    return " / ".join(dict.fromkeys(pair)) + (" past" if pair and (other, row[0]) in past else "")


def table(columns, rows):
    lines = [columns, ["---"] + ["--:"] * (len(columns) - 1), *rows]
    return "".join(f"| {' | '.join(map(str, line))} |\n" for line in lines)


def replace(name, *parts):
    """Puts these in the places of what a pattern is found for, once each, and in their order."""
    text, end = texts[name], 0
    for pattern, part in parts:
        found = re.compile(pattern, re.M).search(text, end)
        if not found:
            sys.exit(f"{name}: nothing is like {pattern}")
        text = text[:found.start()] + part + text[found.end():]
        end = found.start() + len(part)
    return text


promise = int(find(README, r"no function takes more than (\d+) bytes of stack"))
check_counter()
cells, past = compare_all()
found = {who: costs_of(who) for who in BUILDS}
costs, sizes = ({who: one[i] for who, one in found.items()} for i in (0, 1))
honest = {who: mean(who, lambda row: [one for one in LIBRARIES if (one, row[0]) not in past]) for who in BUILDS}
loops = {who: mean(who, lambda _: ["loop"]) for who in BUILDS}
versions = [re.search(rb"(?:GCC: \(.*?\)|clang version|newlib|picolibc) ([\d.]+)",
                      Path(images, image).read_bytes())[1].decode()
            for image in ("gcc-O2", "clang-O2", "newlib", "picolibc")]
made = {
    CHART: chart(cells, past, OURS),
    PAGE: replace(
        PAGE, (r"^Made .*$", "Made by `./dev bench` with GCC {}, Clang {}, newlib {} and picolibc {}."
               .format(*versions)),
        (TABLE, table(["Function"] + [f"{title}, {what}" for title in BUILDS.values()
                                      for what in ("at most", "bytes", "stack")],
                      [[f"`{name}`", *(cell for build in costs.values() for cell in build[name])]
                       for name in symbols])),
        (TABLE, table(["Build", "bytes", "stack", "honest C library", "obvious loop"],
                      [[title, *sizes[who], *("{:.2f} of {} cells, {} behind".format(*one[who])
                                              for one in (honest, loops))]
                       for who, title in BUILDS.items()])),
        (TABLE, table(["Function"] + [head for title in [*LIBRARIES.values(), "loop"]
                                      for head in (f"{title}: 16", 256)],
                      [[f"`{row.name}`{row.about and ', '}{row.about}",
                        *(ratio(row[:2], n, other) for other in [*LIBRARIES, "loop"]
                          for n in ((4, 10) if row.sizes == (1, 4, 10) else (16, 256)))]
                       for row in ROWS if row.peer or not row.name.startswith("W")]))),
    README: replace(README, (r"(?<=^<!-- bench -->\n)[^<]*(?=<!-- end of bench -->$)", """\
GCC at `-O2` makes {:.2f} of the cycles of the fastest C library that reads nothing past the end (hollow
bars do), and {:.2f} of those of the obvious loop: geometric means of {} and {} calls of 4 to 256 units, {}
and {} of which are slower than theirs. All code is {} bytes, the runtime's division included; by Clang {},
by GCC at `-Os` {}, whose most stack is {} and {} bytes.
""".format(*(one[OURS][i] for i in range(3) for one in (honest, loops)),
           *(sizes[who][0] for who in BUILDS), *(sizes[who][1] for who in list(BUILDS)[1:]))))}
for name, new in made.items():
    if fits:
        Path(source, name).write_text(new)
    sys.stdout.writelines(difflib.unified_diff(texts[name].splitlines(True), new.splitlines(True),
                                               name, f"{name}, as counted"))
if not fits and made != texts:
    sys.exit("The code costs something else than is said, or it was made with other compilers or libraries: "
             "run ./dev bench, look at the diff")
