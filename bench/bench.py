#!/usr/bin/python3 -B
"""bench.py IMAGES SOURCE [--fit]: counts the cycles of the library, of the C libraries and of naive
loops, compares their results, and checks the library's upper bounds, bytes and stack. Fails where
costs.csv, the performance page, its chart or README.md differ; --fit searches for new bounds and
writes all of these."""
import difflib
import math
import re
import reprlib
import subprocess
import sys
from dataclasses import dataclass, field
from itertools import product
from pathlib import Path
from typing import NamedTuple

import costs
import page
from calls import FUNCTIONS, PROSE
from core import DATA, FILL, Buffer, Core, Stopped
from image import SOURCE, BadImage, Image

sys.path.append(str(SOURCE / "proof"))

from contracts import Array, expected  # noqa: E402

# The most bytes of stack of any function. README.md promises them, whatever the compiler's version.
PROMISED_STACK = {"gcc-O2": 56, "gcc-O3": 56, "gcc-Os": 56, "gcc-O0": 88, "clang-O2": 68,
                  "clang-Os": 64, "clang-O0": 512}
BUILDS = PROMISED_STACK
LIBRARIES = "newlib", "picolibc-small", "picolibc"
LOOPS = *page.LOOPS, "loops-O0"
WHAT_TO_DO = "If that is intended, run ./dev bench and review the diff."
OURS = "gcc-O2"  # whose results the others' are compared with


def loops_of(build):
    """The naive loops of a firmware that is built so; beside a fast build the fastest counts."""
    return page.LOOPS if build.endswith(("O2", "O3")) else ("loops-" + build[-2:],)


class Ratio(NamedTuple):
    """Our cycles / those of the fastest of others: the geometric mean over so many cases, and in
    how many of them ours takes more than 2 % more."""
    mean: float
    cases: int
    slower: int


@dataclass
class Measured:
    """Cycles by image, function, about, units and misalignment; the pairs of an image and a
    function that reads outside its arguments; and what each build takes."""
    cycles: dict = field(default_factory=dict)
    over_reads: set = field(default_factory=set)
    builds: dict = field(default_factory=dict)
    libraries: list = field(default_factory=list)

    def fastest(self, images, *case):
        return min((self.cycles[image, *case] for image in images if (image, *case) in self.cycles),
                   default=None)

    def compare(self, build, others):
        """With others(function), which gives images. Where alignment makes no difference, a case
        counts once."""
        pairs = set()
        for (image, name, about, n, misaligned), ours in self.cycles.items():
            theirs = self.fastest(others(name), name, about, n, misaligned)
            if image == build and theirs and n >= 4:
                pairs.add((name, about, n, ours, theirs))
        ratios = [ours / theirs for *_, ours, theirs in pairs]
        return Ratio(mean(ratios), len(ratios), sum(ratio > 1.02 for ratio in ratios))

    def beside_libraries(self, build):
        return self.compare(build, lambda _: self.libraries)

    def beside_exact_libraries(self, build):
        """Those that read nothing outside their arguments."""
        return self.compare(build, lambda name: [library for library in self.libraries
                                                 if (library, name) not in self.over_reads])

    def beside_loops(self, build):
        return self.compare(build, lambda _: loops_of(build))


@dataclass
class Build:
    """The bytes of all functions, and the geometric mean of one with all that it calls; without the
    division. The most bytes of stack."""
    bytes: int
    alone: float
    stack: int


def mean(numbers):
    """The geometric mean."""
    return math.exp(sum(map(math.log, numbers)) / len(numbers))


def check_counter(images):
    core = Core(Image(images / "counter", needs_library=False))
    name, = core.code
    core.run(name, [DATA], (1, 1))
    if name != f"counted_{core.cycles}_{core.stack}":
        sys.exit(f"the counter is wrong: it counts {core.cycles} cycles and {core.stack} bytes of "
                 f"stack for {name}")


def demangled(core):
    """The link symbols, by the C++ name without its parameters."""
    shown = subprocess.run(["arm-none-eabi-c++filt"], input="\n".join(core.code),
                           capture_output=True, text=True, check=True).stdout
    return {line.split("(")[0]: symbol for line, symbol in zip(shown.splitlines(), core.code)}


def symbol_of(names, image, function, name):
    """None if the image has nothing like it."""
    if image in LIBRARIES:
        return function.peer if name == function.name else None
    if image in LOOPS:
        unit = {1: "char", 2: "unsigned short"}[function.widths_of(name)[0]]
        shown = f"Loops<{unit}>::{name[1:] if name.startswith('W') else function.name}"
        return names.get(shown, shown)
    return costs.SYMBOLS[name]


def outcome_of(function, results, contents):
    """Results as numbers, or what is promised of them, and the contents of all buffers."""
    if function.returns == "nothing":
        return [], contents
    results = [result & 0xFFFFFFFF for result in results]
    if function.returns == "sign":
        results = [(result > 0) - (result >> 31) * 2 for result in results]
    return results, contents


def call(core, image, symbol, function, name, case, n, misaligned):
    """Makes the call of a case. Gives its cycles and its outcome."""
    is_peer = image in LIBRARIES
    arguments, widths = case.arguments(n, PROSE[:n]), function.widths_of(name)
    core.run(symbol, arguments, widths, misaligned, function.order if is_peer else ())
    cycles, results = core.cycles, [core.result]
    while case.repeats and core.result:  # a C library is given the string once
        core.call(symbol, [0, *core.registers[1:]] if is_peer else core.registers)
        cycles += core.cycles
        results.append(core.result)
    return cycles, outcome_of(function, results, core.contents())


def expected_outcome(core, function, name, case, n):
    """What the contract says of the call that the core has made."""
    values, buffers, results = [], [], []
    for index, argument in enumerate(case.arguments(n, PROSE[:n])):
        value = argument
        if not isinstance(argument, int):
            is_numbers = isinstance(argument, bytes)
            size = 4 if is_numbers else function.widths_of(name)[index > 0]
            value = Array("", core.places[index], size, units_of(argument, size))
            if not is_numbers:
                buffers.append(value)
        values.append(value)
    while not results or case.repeats and results[-1]:
        results.append(expected(name, values))
    contents = [b"".join(unit.to_bytes(one.size, "little") for unit in one.units)
                for one in buffers]
    return outcome_of(function, results, contents)


def units_of(argument, size):
    """What an argument of the core holds before a call."""
    if isinstance(argument, bytes):
        return [0] * (len(argument) // size)
    held = argument.held if isinstance(argument, Buffer) else argument
    units = [*map(ord, held), 0] if held or isinstance(argument, str) else []
    room = argument.units if isinstance(argument, Buffer) else 0
    return units + [int.from_bytes([FILL] * size, "little")] * (room - len(units))


def measure_case(core, image, symbol, function, name, case, measured, outcomes):
    """Fails where a call gives something else than the contract of ours."""
    for n, misaligned in product(case.sizes, (False, True)):
        where = f"{image}: {name}{', ' * bool(case.about)}{case.about}, {n} units"
        try:
            cycles, outcome = call(core, image, symbol, function, name, case, n, misaligned)
        except Stopped as error:
            sys.exit(f"{where}: {error}")
        key = name, case.about, n, misaligned
        if key not in outcomes:
            outcomes[key] = expected_outcome(core, function, name, case, n)
        differs = difference(outcome, outcomes[key], image in BUILDS)
        if differs:
            sys.exit(f"{where}: {differs}")
        if core.outside and image not in LIBRARIES:
            sys.exit(f"{where}: {core.outside}")
        if core.outside:
            measured.over_reads.add((image, name))
        measured.cycles[image, name, case.about, n, misaligned] = cycles


def difference(found, wanted, is_ours):
    """In a few words, or None. Others may write where ours does not: strncpy fills the buffer."""
    (results, contents), (wanted_results, wanted_contents) = found, wanted
    if results != wanted_results:
        return f"returned {results}, expected {wanted_results}"
    for data, units in zip(contents, wanted_contents):
        if any(one != other for one, other in zip(data, units) if is_ours or other != FILL):
            return f"wrote {data}, expected {units}"
    return None


def measure_cases(images):
    measured, outcomes = Measured(), {}
    measured.libraries = [library for library in LIBRARIES
                          if library != "newlib" or (images / "newlib").exists()]
    for image in (*BUILDS, *measured.libraries, *LOOPS):
        core = Core(Image(images / image, needs_library=False), watches=True)
        names = demangled(core) if image in LOOPS else {}
        for function in FUNCTIONS:
            for name in function.names():
                symbol = symbol_of(names, image, function, name)
                for case in function.cases if symbol else ():
                    measure_case(core, image, symbol, function, name, case, measured, outcomes)
    return measured


def check_cost(build, function, cost, cycles, bytes, stack):
    """The bound is that of the same calls: none is above it, and one within a cycle."""
    title, slack = function.title, []
    for number, found in cycles.items():
        arguments, lengths = function.calls[number]
        slack.append(cost.of(lengths) - found)
        if slack[-1] < 0:
            sys.exit(f"{build}: {title} takes {found} cycles with {reprlib.repr(arguments)}, its "
                     f"bound is {cost.formula()} = {cost.of(lengths):g}. {WHAT_TO_DO}")
    if min(slack) >= 1:
        sys.exit(f"{build}: {title}: no call comes near its bound, {cost.formula()}. {WHAT_TO_DO}")
    if (bytes, stack) != (cost.bytes, cost.stack):
        sys.exit(f"{build}: {title} has {bytes} bytes and takes {stack} of stack, costs.csv has "
                 f"{cost.bytes} and {cost.stack}. {WHAT_TO_DO}")


def check_build(images, build, stated, is_compared):
    """Makes the worst calls of each function again, with their memory watched."""
    core = Core(Image(images / build), watches=True)
    everything, alone, deepest = {}, [], 0
    for function in FUNCTIONS:
        title, numbers = function.title, stated[OURS, function.title].worst
        try:
            cycles, stack, parts = costs.search(core, function, function.names(), numbers)
        except Stopped as error:
            sys.exit(f"{build}: {title}: {error}")
        sizes = [sum(one.values()) for one in parts]
        for one in parts:
            everything.update(one)
        if not function.about:
            alone += sizes
        deep = max(stack.values())
        deepest = max(deepest, deep)
        if deepest > PROMISED_STACK[build]:
            sys.exit(f"{build}: {title} takes {deepest} bytes of stack, README.md promises "
                     f"{PROMISED_STACK[build]}")
        if is_compared and build in costs.BUILDS:
            check_cost(build, function, stated[build, title], cycles, max(sizes), deep)
    return Build(sum(everything.values()), mean(alone), deepest)


def check_complete():
    missing = set(costs.SYMBOLS) - {name for function in FUNCTIONS for name in function.names()}
    if missing:
        sys.exit(f"bench/calls.py has no entry for {', '.join(sorted(missing))}")


def versions_of(images):
    """Of what made the images."""
    found = []
    for image, name, pattern in (("gcc-O2", "GCC", rb"GCC: \(.*?\) ([\d.]+)"),
                                 ("clang-O2", "Clang", rb"clang version ([\d.]+)"),
                                 ("newlib", "newlib", rb"newlib ([\d.]+)"),
                                 ("picolibc", "picolibc", rb"picolibc ([\d.]+)")):
        if (images / image).exists():
            version = re.search(pattern, (images / image).read_bytes())
            found.append(f"{name} {version[1].decode() if version else 'unknown'}")
    return found


def fit_all(images):
    fitted = {}
    for build in costs.BUILDS:
        core = Core(Image(images / build))
        for function in FUNCTIONS:
            fitted[build, function.title] = costs.fit_function(core, function)
    return fitted


def main():
    images, source, fits = Path(sys.argv[1]), Path(sys.argv[2]), sys.argv[3:] == ["--fit"]
    check_complete()
    check_counter(images)
    versions = versions_of(images)
    if fits:
        costs.write(fit_all(images), versions)
    stated, made_with = costs.load(), costs.made_with()
    measured = measure_cases(images)
    for build in BUILDS:
        measured.builds[build] = check_build(images, build, stated, versions == made_with)
    if versions != made_with:
        print("Not compared: the bounds, docs/performance.md and README.md's figures, because they "
              f"are of {', '.join(made_with)}, and here is {', '.join(versions)}.")
        return
    differ = False
    for name, text in page.make(source, stated, measured, versions, PROMISED_STACK).items():
        old = (source / name).read_text()
        differ = differ or text != old
        if fits:
            (source / name).write_text(text)
        sys.stdout.writelines(difflib.unified_diff(old.splitlines(True), text.splitlines(True),
                                                   name, f"{name}, as measured"))
    if differ and not fits:
        sys.exit(f"The figures above differ from those measured. {WHAT_TO_DO}")


if __name__ == "__main__":
    try:
        main()
    except (BadImage, OSError) as error:
        sys.exit(error)
