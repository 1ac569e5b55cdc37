#!/usr/bin/python3
"""bench.py IMAGES SOURCE OUT MADE_WITH [--fit]: counts cycles beside the C libraries and the obvious
loops, checks all results, and tries to break the formulas that SOURCE/docs/performance.md states,
or finds new ones. Writes that page, its chart and README.md with its part of it to the folder OUT."""
import math
import re
import sys
from collections import defaultdict
from pathlib import Path

from chart import chart
from core import DATA, Core
from formulas import Formula, dearest, fit, looseness, run, unit_of
from rows import ROWS

BUILDS = {"gcc-O2": "GCC -O2", "clang-O2": "Clang -O2", "gcc-Os": "GCC -Os"}
LIBRARIES = {"newlib": "newlib", "picolibc-small": "picolibc, small", "picolibc": "picolibc, fast"}
LOOPS = "loops-Os", "loops-O2", "loops-O3"
OURS = "gcc-O2"

images, source, out, made_with = Path(sys.argv[1]), Path(sys.argv[2]), Path(sys.argv[3]), sys.argv[4]
fits = sys.argv[5:] == ["--fit"]
page_now = Path(source, "docs/performance.md").read_text()
promise = re.search(r"no function takes more than (\d+) bytes of stack",
                    Path(source, "README.md").read_text())
symbols = dict(re.findall(r"^#define (\w+) (\w+)$", Path(source, "include/SubName.h").read_text(), re.M))


def check_counter():
    core = Core(images / "counter")
    checked = 0
    for name in core.functions:
        wanted = re.fullmatch(r"\w+?_(\d+)_(\d+)", name)
        if wanted:
            core.give(DATA, bytes([1]) * 32)
            core.call(name, [DATA])
            if (core.cycles, core.stack) != (int(wanted[1]), int(wanted[2])):
                sys.exit(f"the counter: {name} takes {core.cycles} cycles, {core.stack} bytes of stack")
            checked += 1
    if checked != 3:
        sys.exit("the counter is not checked")


def measure(core, who, this, n, skew):
    """The cycles of a row's call of so many units; fails where something else comes of it."""
    name, about, make, peer, order, _ = this
    arguments, result, written = make(n)
    where = f"{who}: {name}, {about or 'it'} at {n} units"
    if result is None and written is None:
        sys.exit(f"{where}: nothing is expected")
    is_peer = who in LIBRARIES
    symbol = peer if is_peer else symbols[name]
    if symbol not in core.functions:
        sys.exit(f"{where}: there is no {symbol}")
    core.forget_given()
    run(core, symbol, name, arguments, skew, order if is_peer else None)
    cycles, found = core.cycles, core.result
    while result == "walk" and core.result:
        registers = core.registers[:]
        core.call(symbol, [0, *registers[1:]] if is_peer else registers)
        cycles += core.cycles
    if isinstance(result, tuple):
        places = [core.places[i] for i, one in enumerate(arguments) if isinstance(one, tuple)]
        unit = unit_of(name, 0)
        result = {-1: 0, None: (places[-1:] or [0])[0]}.get(result[1],
                                                           places[0] + (result[1] or 0) * unit)
    elif isinstance(result, int):
        result &= 0xFFFFFFFF
        if is_peer and "Cmp" in name:  # of which the sign alone is given
            found, result = ((one > 0) - 2 * (one >> 31) for one in (found, result))
    if result not in (None, "walk") and found != result:
        sys.exit(f"{where}: gives {found}, not {result}")
    if written:
        index, units = written
        unit = unit_of(name, index)
        data = b"".join(ord(one).to_bytes(unit, "little") for one in units)
        if bytes(core.uc.mem_read(core.places[index], len(data))) != data:
            sys.exit(f"{where}: writes something else")
    return cycles


def compare_all():
    """Cycles by who, row, size and alignment; and which functions of whom read past an argument."""
    cells, past = {}, set()
    for who in [*BUILDS, *LIBRARIES, *LOOPS]:
        core = Core(images / who, watches_reads=True)
        for this in ROWS:
            if who in LIBRARIES and not this[3]:
                continue
            for n in this[5]:
                for skew in (False, True):
                    cells[who, this[:2], n, skew] = measure(core, who, this, n, skew)
                    if core.reads_past:
                        past.add((who, this[0]))
    for who in BUILDS:
        if any(one == who for one, _ in past):
            sys.exit(f"{who} reads past an argument: {past}")
    for (who, this, n, skew), cycles in list(cells.items()):
        if who in LOOPS:
            best = cells.get(("loop", this, n, skew), math.inf)
            cells["loop", this, n, skew] = min(best, cycles)
    return cells, past


class Costs:
    """What a build's functions cost: formulas, bytes and stack."""

    def __init__(self, who):
        core = Core(images / who)
        self.formulas, self.sizes, self.stacks, self.parts = {}, {}, {}, set()
        for name, symbol in symbols.items():
            formula = None if fits else Formula.parse(stated(BUILDS[who] + ", at most", name))
            core.entered.clear()
            most, self.stacks[name] = dearest(core, BUILDS[who], symbol, name, formula)
            if not fits:
                self.stacks[name] = max(self.stacks[name], int(stated(BUILDS[who] + ", stack", name)))
            parts = core.parts()
            self.sizes[name] = sum(parts.values())
            self.parts |= set(parts.items())
            self.formulas[name] = formula or fit(name, most)
            if fits and looseness(self.formulas[name], most) > 1.3:
                print(f"{who}: {name}: {self.formulas[name]} is "
                      f"{looseness(self.formulas[name], most):.2f} of the dearest call")
            if who == OURS and (not promise or self.stacks[name] > int(promise[1])):
                sys.exit(f"{name} takes {self.stacks[name]} bytes of stack: README.md promises "
                         f"{promise and promise[1]}")
        self.bytes = sum(size for _, size in self.parts)


def stated(column, name):
    """What the page states of a function."""
    head = re.search(rf"^\| Function .*\| {column} \|.*$", page_now, re.M)
    line = re.search(rf"^\| `{name}` \|.*$", page_now, re.M)
    if not head or not line:
        sys.exit(f"docs/performance.md: nothing of {name}, {column}; ./dev bench makes it")
    cells = [cell.strip() for cell in head[0].split("|")]
    return line[0].split("|")[cells.index(column)].strip()


def mean(cells, who, others, sizes):
    """The geometric mean of ours by the fastest of the others, the cells, and those 2 % behind."""
    ratios, before = [], None
    for (one, this, n, skew), cycles in cells.items():
        theirs = [cells[other, this, n, skew] for other in others(this)
                  if (other, this, n, skew) in cells]
        if one == who and theirs and n in sizes and (this, n, cycles, min(theirs)) != before:
            ratios.append(cycles / min(theirs))
            before = this, n, cycles, min(theirs)
    return (math.exp(sum(map(math.log, ratios)) / len(ratios)), len(ratios),
            sum(ratio > 1.02 for ratio in ratios))


def shown_ratio(cells, past, this, n, other):
    pair = []
    for skew in (False, True):
        if (other, this, n, skew) not in cells:
            return ""
        pair.append(f"{cells[OURS, this, n, skew] / cells[other, this, n, skew]:.2f}")
    return " / ".join(dict.fromkeys(pair)) + (" past" if (other, this[0]) in past else "")


def write_page(costs, cells, past, sums):
    lines = [f"""# Performance

Made by `./dev bench` with {made_with}. Cycles on a Cortex-M0+ with zero wait states, by the timing table
of its Technical Reference Manual, counted from a function's first instruction through its return.

## What a call costs at most

No call was found that costs more, null, misaligned and cut ones included; what is searched: all texts
of a few classes of unit up to 3 units, and repeated shapes up to 67, with every count and capacity
around their ends. The lengths, in units: n of the text that is walked, that is read, copied, appended,
compared, split, trimmed or converted, searched up to and with what is found, or from `*off` to where
`StrToken` leaves it; d of the text that an append's destination holds; m of the pattern or set, w of the
replacement, r of the result, or 0 if it is null; k digits. Bytes are those of a function and of all that
it calls, stack is the most below the caller's stack pointer; the runtime's division is in all three.

| Function | {" | ".join(f"{title}, at most | bytes | {title}, stack" for title in BUILDS.values())} |
|---|{"---|--:|--:|" * 3}"""]
    for name in symbols:
        lines.append(f"| `{name}` | " + " | ".join(
            f"{one.formulas[name]} | {one.sizes[name]} | {one.stacks[name]}"
            for one in costs.values()) + " |")
    lines.append("| all 50 | " + " | ".join(
        f" | {one.bytes} | {max(one.stacks.values())}" for one in costs.values()) + " |")
    lines.append("""
## Who is faster

The geometric mean of our cycles divided by theirs, from 4 to 256 units, aligned and misaligned where that
makes a difference: below 1 ours is faster. Behind is a cell more than 2 % slower. An honest C library was not
seen to read past an argument of the function; the fastest one counts. The loop is the obvious one, narrow
and wide, at the best of -Os, -O2 and -O3.

![Cycles a unit, beside the C libraries](performance.svg)

| Build | honest C library | obvious loop |
|---|---|---|""")
    for who, title in BUILDS.items():
        lines.append(f"| {title} | " + " | ".join(
            f"{ratio:.2f} of {count} cells, {behind} behind" for ratio, count, behind in sums[who]) + " |")
    lines.append(f"""
GCC -O2 at 16 and at 256 units (digits: 4 and 10), where it differs aligned / misaligned; "past": theirs
reads past its argument. What a library has no function for is put together from its others.

| Function | {" | ".join(f"{title}: 16 | 256" for title in [*LIBRARIES.values(), "loop"])} |
|---|{"--:|" * 8}""")
    for this in ROWS:
        if this[3] or not this[0].startswith("W"):
            sizes = (4, 10) if this[5] == (1, 4, 10) else (16, 256)
            lines.append(f"| `{this[0]}`{this[1] and ', '}{this[1]} | " + " | ".join(
                shown_ratio(cells, past, this[:2], n, other)
                for other in [*LIBRARIES, "loop"] for n in sizes) + " |")
    Path(out, "performance.md").write_text("\n".join(lines) + "\n")


def write_readme(costs, sums):
    (libraries, cells, behind), (loops, loop_cells, loop_behind) = sums[OURS]
    sizes = "; ".join(f"{BUILDS[who]} {one.bytes} and {max(one.stacks.values())}"
                      for who, one in costs.items())
    part = f"""Built by GCC at `-O2` it takes {libraries:.2f} of the cycles of the fastest C library that reads nothing past
the end, and {loops:.2f} of those of the obvious loop: the geometric means of {cells} and {loop_cells} calls of 4 to 256
units, of which {behind} and {loop_behind} are slower than theirs. Bytes of all code, the runtime's division included,
and of stack at most: {sizes}.
"""
    readme = Path(source, "README.md").read_text()
    pattern = r"(?<=<!-- bench -->\n).*?(?=<!-- end of bench -->)"
    if len(re.findall(pattern, readme, re.S)) != 1:
        sys.exit("README.md: the marks around the part of the benchmark are lost")
    readme = re.sub(pattern, lambda _: part, readme, flags=re.S)
    for words, ratio in ((r"\d\.\d\d(?= of those of the fastest C library)", libraries),
                         (r"\d\.\d\d(?= of those of\nthe obvious loop)", loops)):
        readme, found = re.subn(words, f"{ratio:.2f}", readme)
        if found != 1:
            sys.exit(f"README.md: the first paragraph lacks {words}")
    Path(out, "README.md").write_text(readme)


check_counter()
cells, past = compare_all()
costs = {who: Costs(who) for who in BUILDS}
honest = defaultdict(list)
for name in symbols:
    honest[name] = [who for who in LIBRARIES if (who, name) not in past]
sums = {who: (mean(cells, who, lambda this: honest[this[0]], (4, 10, 16, 64, 256)),
              mean(cells, who, lambda this: ["loop"], (4, 10, 16, 64, 256))) for who in BUILDS}
write_page(costs, cells, past, sums)
write_readme(costs, sums)
Path(out, "performance.svg").write_text(chart(cells, past, OURS))
