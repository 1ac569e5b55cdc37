#!/usr/bin/python3 -B
"""costs.py IMAGE: prints for each function of the library in a linked image an upper bound of its
cycles, its bytes and its stack. The image is any ELF file for a Cortex-M0 or Cortex-M0+."""
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
BUILDS = {"gcc-O2": "GCC -O2", "clang-O2": "Clang -O2", "gcc-Os": "GCC -Os",
          "clang-Os": "Clang -Os"}
WORST = 6  # calls of a function that are made again later

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
    """What a function costs in one build: its upper bound, as factors of its terms; its bytes with
    those of all that it calls, but for the division; and its bytes of stack. `worst` are the
    numbers of the calls that ./dev test makes again."""
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
    """Makes the calls of these numbers, with a function of each of these names. Every other call
    has arguments that are not word-aligned. Gives the cycles and the bytes of stack of each, by
    number, of the width that takes more; and for each name what Core.parts() says."""
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
    """The factors of the upper bound of these calls, none of them negative. A linear program finds
    them:
        minimise    the sum of bound / cycles over all lengths, each with its worst call
        subject to  bound >= cycles for each."""
    from scipy.optimize import linprog
    worst = {}
    for number, found in cycles.items():
        lengths = tuple(function.calls[number][1].items())
        worst[lengths] = max(worst.get(lengths, 0), found)
    rows = [[TERMS[term](dict(lengths)) for term in function.terms] for lengths in worst]
    objective = [sum(value / found for value, found in zip(column, worst.values()))
                 for column in zip(*rows)]
    solved = linprog(objective, [[-value for value in row] for row in rows],
                     [-found for found in worst.values()])
    if solved.status:
        sys.exit(f"{function.title}: no bound with the terms {function.terms}: {solved.message}")
    quarters = [math.ceil(factor * 4 - 1e-6) / 4 for factor in solved.x]
    factors = {**dict(zip(function.terms, quarters)), "1": 0}
    rest = Cost(factors)
    above = max(found - rest.of(dict(lengths)) for lengths, found in worst.items())
    factors["1"] = max(0, math.ceil(above))
    return factors


def fit_function(core, function):
    """The cost of a function in a build. The calls that are made again later are those nearest to
    the bound, each of another length, and the one with the deepest stack."""
    numbers = range(len(function.calls))
    cycles, stack, parts = search(core, function, function.names(), numbers)
    bytes = max(sum(one.values()) for one in parts)
    cost = Cost(fit(function, cycles), bytes, max(stack.values()))
    lengths = [lengths for _, lengths in function.calls]
    nearest = {}
    for number in sorted(numbers, key=lambda one: cost.of(lengths[one]) - cycles[one]):
        nearest.setdefault(tuple(lengths[number].values()), number)
    cost.worst = {*list(nearest.values())[:WORST], max(numbers, key=stack.get)}
    return cost


def write(costs, versions):
    """To costs.csv: a line with the versions that the images were made with, then a line for each
    function, narrow and wide."""
    with open(FILE, "w", newline="") as file:
        writer = csv.writer(file, lineterminator="\n")
        writer.writerow(["made with", *versions])
        columns = [f"{build} {what}" for build in BUILDS for what in ("bound", "bytes", "stack")]
        writer.writerow(["function", *columns, "worst calls"])
        for function in FUNCTIONS:
            line, worst = [function.title], set()
            for build in BUILDS:
                cost = costs[build, function.title]
                factors = " ".join(f"{factor:g}" for factor in cost.factors.values())
                line += [factors, cost.bytes, cost.stack]
                worst |= cost.worst
            writer.writerow([*line, " ".join(map(str, sorted(worst)))])


def load():
    """The costs of costs.csv, by build and function, narrow or wide."""
    costs = {}
    with open(FILE, newline="") as file:
        next(file)
        lines = {line["function"]: line for line in csv.DictReader(file)}
    for function in FUNCTIONS:
        line = lines.get(function.title, {"worst calls": ""})
        worst = [int(number) for number in line["worst calls"].split()]
        if not worst or max(worst) >= len(function.calls):
            sys.exit(f"{FILE} does not fit bench/calls.py: {function.title} has no worst calls. "
                     "Run ./dev bench.")
        for build in BUILDS:
            factors = dict(zip(function.terms, map(float, line[f"{build} bound"].split())))
            bytes, stack = int(line[f"{build} bytes"]), int(line[f"{build} stack"])
            for name in function.names():
                costs[build, function.title_of(name)] = Cost(factors, bytes, stack, worst)
    return costs


def made_with():
    """The versions that costs.csv is of."""
    with open(FILE, newline="") as file:
        return next(csv.reader(file))[1:]


LEGEND = """n: units of the string   d: units that dst holds   m: units of the pattern or set
w: units of the replacement   r: units of the result   k: digits
Cycles are simulated, with zero wait states. The bounds are found by search. Bytes are without the
division. docs/performance.md says more."""


def print_costs(path):
    image = Image(path)
    core = Core(image)
    print(f"{path}: {len(image.functions)} functions of strutil\n\n"
          f"{'function':28}{'cycles, at most':44}{'bytes':>6}{'stack':>6}")
    left_out = []
    for function in FUNCTIONS:
        for name in function.names():
            if name in image.functions:
                show_progress(name)
                try:
                    print_cost(core, function, name)
                except Stopped as error:
                    left_out.append(f"{function.title_of(name)} left out: {error}")
    show_progress("")
    print("", *left_out, LEGEND, sep="\n")


def print_cost(core, function, name):
    cycles, stack, (parts,) = search(core, function, [name], range(len(function.calls)))
    formula = Cost(fit(function, cycles)).formula()
    show_progress("")
    print(f"{function.title_of(name):28}{formula:44}{sum(parts.values()):6}{max(stack.values()):6}")


def show_progress(name):
    if sys.stderr.isatty():
        print(f"\r\033[K{name}", end="", file=sys.stderr, flush=True)


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
