#!/usr/bin/python3 -B
"""costs.py IMAGE: prints for each function of the library in a linked image an upper bound of its cycles,
its bytes and its stack. The image is any ELF file for a Cortex-M0 or Cortex-M0+, such as a firmware."""
import csv
import math
import sys
from dataclasses import dataclass
from pathlib import Path

import api
from calls import FUNCTIONS
from core import Core, Stopped
from image import SOURCE, BadImage, Image

SYMBOLS = api.functions(SOURCE)
FILE = Path(__file__).with_name("costs.csv")
BUILDS = {"gcc-O2": "GCC -O2", "clang-O2": "Clang -O2", "gcc-Os": "GCC -Os", "clang-Os": "Clang -Os"}
WORST = 3  # calls of each kind that are made again later

# What a bound is a sum of.
TERMS = {
    "1": lambda lengths: 1,
    "n": lambda lengths: lengths["n"],
    "d": lambda lengths: lengths["d"],
    "m": lambda lengths: lengths["m"],
    "w": lambda lengths: lengths["w"],
    "r": lambda lengths: lengths["r"],
    "k": lambda lengths: lengths["k"],
    "n m": lambda lengths: lengths["n"] * lengths["m"],
}


@dataclass
class Cost:
    """What a function costs in one build: its upper bound, as factors of its terms; its bytes with those of
    all that it calls, but for the division; and its bytes of stack. `worst` are the numbers of the calls
    that ./dev test makes again."""
    factors: dict
    bytes: int = 0
    stack: int = 0
    worst: list = ()

    def of(self, lengths):
        """The bound in cycles."""
        return sum(factor * TERMS[term](lengths) for term, factor in self.factors.items())

    def formula(self):
        return " + ".join(f"{factor:g}" + (f" {term}" if term != "1" else "")
                          for term, factor in self.factors.items() if factor) or "0"


def search(core, function, names, numbers):
    """Makes the calls of these numbers, with a function of each of these names. Every other call has
    arguments that are not word-aligned. Gives the cycles and the bytes of stack of each, by number, of the
    width that takes more; and for each name the functions that ran, as Core.parts() does."""
    cycles, stack, parts = {}, {}, []
    for name in names:
        core.blocks.clear()
        for number in numbers:
            arguments, _ = function.calls[number]
            core.run(SYMBOLS[name], arguments, function.widths_of(name), number % 2 == 1)
            if core.outside:
                raise Stopped(f"{name}{arguments}: {core.outside}")
            cycles[number] = max(core.cycles, cycles.get(number, 0))
            stack[number] = max(core.stack, stack.get(number, 0))
        parts.append(core.parts())
    return cycles, stack, parts


def fit(function, cycles):
    """The factors of the upper bound of these calls, which a linear program finds; none is negative:
        minimise    the sum of bound / cycles over all lengths, each with its worst call
        subject to  bound >= cycles for each."""
    from scipy.optimize import linprog
    worst = {}
    for number, found in cycles.items():
        lengths = tuple(function.calls[number][1].items())
        worst[lengths] = max(worst.get(lengths, 0), found)
    rows = [[TERMS[term](dict(lengths)) for term in function.terms] for lengths in worst]
    mean = [sum(row[i] / found for row, found in zip(rows, worst.values())) for i in range(len(function.terms))]
    solved = linprog(mean, [[-value for value in row] for row in rows], [-found for found in worst.values()])
    if solved.status:
        sys.exit(f"{function.name}: no bound with the terms {function.terms}: {solved.message}")
    factors = {term: math.ceil(factor * 4 - 1e-6) / 4 for term, factor in zip(function.terms, solved.x)}
    factors["1"] = 0
    rest = Cost(factors)
    factors["1"] = max(0, math.ceil(max(found - rest.of(dict(lengths)) for lengths, found in worst.items())))
    return factors


def fit_function(core, function):
    """The cost of a function in a build. The calls that are made again later are, each of another length,
    those nearest to the bound, by cycles and by the ratio; and the one with the deepest stack."""
    cycles, stack, parts = search(core, function, function.names(), range(len(function.calls)))
    cost = Cost(fit(function, cycles), max(sum(one.values()) for one in parts), max(stack.values()))
    bounds = {number: cost.of(function.calls[number][1]) for number in cycles}
    by_cycles = sorted(cycles, key=lambda number: bounds[number] - cycles[number])
    by_ratio = sorted(cycles, key=lambda number: bounds[number] / cycles[number])
    cost.worst = {*first_of_lengths(function, by_cycles), *first_of_lengths(function, by_ratio),
                  max(stack, key=stack.get)}
    return cost


def first_of_lengths(function, numbers):
    found = {}
    for number in numbers:
        found.setdefault(tuple(function.calls[number][1].values()), number)
    return list(found.values())[:WORST]


def write(costs, versions):
    """To costs.csv: in the first line the versions that the images were made with, then a line for each
    function, narrow and wide."""
    with open(FILE, "w", newline="") as file:
        writer = csv.writer(file, lineterminator="\n")
        writer.writerow(["made with", *versions])
        columns = [f"{build} {what}" for build in BUILDS for what in ("bound", "bytes", "stack")]
        writer.writerow(["function", *columns, "worst calls"])
        for function in FUNCTIONS:
            title = function.title(function.name)
            line, worst = [title], set()
            for build in BUILDS:
                cost = costs[build, title]
                line += [" ".join(f"{factor:g}" for factor in cost.factors.values()), cost.bytes, cost.stack]
                worst |= cost.worst
            writer.writerow([*line, " ".join(map(str, sorted(worst)))])


def load():
    """The costs of costs.csv, by build and function; those of a wide function are its narrow one's."""
    costs = {}
    with open(FILE, newline="") as file:
        next(file)
        lines = {line["function"]: line for line in csv.DictReader(file)}
    for function in FUNCTIONS:
        line = lines.get(function.title(function.name))
        if line is None:
            sys.exit(f"{FILE}: no line for {function.title(function.name)}: run ./dev bench")
        worst = [int(number) for number in line["worst calls"].split()]
        for build in BUILDS:
            factors = dict(zip(function.terms, map(float, line[f"{build} bound"].split())))
            cost = Cost(factors, int(line[f"{build} bytes"]), int(line[f"{build} stack"]), worst)
            for name in function.names():
                costs[build, function.title(name)] = cost
    return costs


def made_with():
    """The versions that costs.csv is of."""
    with open(FILE, newline="") as file:
        return next(csv.reader(file))[1:]


def print_costs(path):
    image = Image(path)
    core = Core(image)
    print(f"{path}: {len(image.functions)} functions of strutil\n\n"
          f"{'function':28}{'cycles, at most':44}{'bytes':>6}{'stack':>6}")
    left_out = []
    for function in FUNCTIONS:
        for name in function.names():
            if name not in image.functions:
                continue
            show_progress(name)
            try:
                cycles, stack, parts = search(core, function, [name], range(len(function.calls)))
            except Stopped as error:
                left_out.append(f"{function.title(name)} left out: {error}")
                continue
            formula = Cost(fit(function, cycles)).formula()
            print(f"{function.title(name):28}{formula:44}{sum(parts[0].values()):6}{max(stack.values()):6}")
    show_progress("")
    print(*left_out, sep="\n")
    print(LEGEND)


def show_progress(name):
    if sys.stderr.isatty():
        print(f"\r\033[K{name}", end="", file=sys.stderr, flush=True)


LEGEND = """n: units of the string   d: units that dst holds   m: units of the pattern or set   w: of the replacement
r: units of the result   k: digits   Table 3 of docs/performance.md says more. Cycles are simulated, with
zero wait states; the bounds are found by search. Bytes are without the division."""


def main():
    if len(sys.argv) != 2:
        print("usage: costs.py IMAGE", file=sys.stderr)
        return 2
    try:
        print_costs(sys.argv[1])
    except BadImage as error:
        print(error, file=sys.stderr)
        return 2
    return 0


if __name__ == "__main__":
    sys.exit(main())
