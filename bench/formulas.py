"""Formulas of lengths that bound the cycles of all calls that the search makes."""
import math
import re
import subprocess
import tempfile
from pathlib import Path

from core import DATA
from search import LONG, Raw, calls, nulls, terms_of


def unit_of(name, index):
    """The bytes of a unit of an argument."""
    if name in ("BytesToWords", "StrToWStr"):
        return 1 if index == 0 else 2
    if name == "WStrToStr":
        return 2 if index == 0 else 1
    return 2 if name.startswith("W") or name == "IntToWStr" else 1


def run(core, symbol, name, arguments, skew=False, order=None):
    """Puts the texts into memory, misaligned if `skew`, and calls with all or, by `order`, some."""
    core.places = []
    for index, one in enumerate(arguments):
        if isinstance(one, tuple):
            unit = 4 if "Token" in name and index == 1 else unit_of(name, index)
            address = DATA + index * 0x4000 + (unit * (3 if index else 1) if skew and unit < 4 else 0)
            units = one if isinstance(one, Raw) else one + (0,)
            core.give(address, b"".join(value.to_bytes(unit, "little") for value in units))
            one = address
        core.places.append(one)
    core.registers = [core.places[index] for index in order] if order else core.places
    core.call(symbol, core.registers)


def searched(name):
    """All calls of a function, aligned or not by turns; both ways where that makes a difference."""
    for index, (arguments, lengths) in enumerate(calls(name)):
        for skew in (False, True) if "Words" in name else (bool(index % 2),):
            yield arguments, lengths, skew
        if index == 0:
            yield from ((some, dict.fromkeys(lengths, 0), False) for some in nulls(arguments))


def value(term, lengths):
    if "/" in term:
        return lengths.get(term[0], 0) / max(lengths.get(term[2], 0), 1)
    return math.prod(lengths.get(one, 0) for one in term.split("*")) if term else 1


class Formula:
    def __init__(self, terms, factors):
        self.parts = list(zip(terms, factors))

    def __call__(self, lengths):
        return sum(factor * value(term, lengths) for term, factor in self.parts)

    def __str__(self):
        words = {"*": " ", "/": " / "}
        return " + ".join(f"{factor:g}" + (" " + "".join(words.get(c, c) for c in term) if term else "")
                          for term, factor in self.parts if factor or not term)

    @classmethod
    def parse(cls, written):
        parts = [re.fullmatch(r"([\d.]+)(.*)", part) for part in written.split(" + ")]
        return cls([part[2].strip().replace(" / ", "/").replace(" ", "*") for part in parts],
                   [float(part[1]) for part in parts])


def dearest(core, build, symbol, name, formula=None):
    """The most cycles by lengths, and the most stack; with a formula, fails where one exceeds it."""
    most, stack = {}, 0
    for index, (arguments, lengths, skew) in enumerate(searched(name)):
        if formula and index > 20 and index % 3:
            continue  # what a change could break shows in a third of the calls
        run(core, symbol, name, arguments, skew)
        cycles = core.cycles
        stack = max(stack, core.stack)
        if formula and cycles > formula(lengths):
            raise SystemExit(f"{build}: {name} takes {cycles} cycles with {arguments}, of lengths {lengths}: "
                             f"more than {formula}")
        key = tuple(sorted(lengths.items()))
        most[key] = max(most.get(key, 0), cycles)
    if not most:
        raise SystemExit(f"{build}: {name}: no call is searched")
    return most, stack


def judged(most):
    """Where a formula is to be tight: at 16 units or more, with a pattern or set of two units to an
    eighth of them; of calls that differ in the length of the result alone, at the dearest."""
    calls_of = {}
    for lengths, cycles in most.items():
        known = tuple(pair for pair in lengths if pair[0] != "r")
        calls_of.setdefault(known, []).append((cycles, dict(lengths)))
    return [(lengths, cycles) for cycles, lengths in
            (max(some, key=lambda call: call[0]) for some in calls_of.values())
            if lengths.get("n", 16) in LONG and lengths.get("n", lengths.get("k", 0)) >= 16
            and 2 <= lengths.get("m", 2) <= lengths.get("n", 16) / 8]


def fit(name, most):
    """The formula above all of these that is the least where it is the loosest."""
    terms = terms_of(name)
    points = [(dict(lengths), cycles) for lengths, cycles in most.items()]
    rows = [([value(term, lengths) for term in terms], cycles) for lengths, cycles in points]
    # It also grows as fast as they do, by each length alone, from turn to turn of the loops.
    for grown in sorted({one for lengths, _ in points for one in lengths} & set("dnmw")):
        before = {}
        for lengths, cycles in sorted(points, key=lambda point: point[0].get(grown, 0)):
            length = lengths.get(grown, 0)
            others = tuple(sorted((k, v) for k, v in lengths.items() if k not in (grown, "r")))
            key = others, length % 4, round(lengths.get("r", 0) / max(length, 1), 1)
            start, start_cycles = before.get(key, ({}, 0))
            is_long = grown in "mw" or {length, start.get(grown)} <= set(LONG)
            if is_long and start.get(grown, 0) >= (
                    8 if grown in "mw" else max(8, 2 * lengths.get("m", 0))):
                row = [value(term, lengths) - value(term, start) for term in terms]
                if min(row) >= 0:
                    rows.append((row, cycles - start_cycles))
            before[key] = lengths, cycles
    tight = [([value(term, lengths) for term in terms], cycles)
             for lengths, cycles in judged(most) or points[:1]]
    weights = [sum(row[i] / cycles for row, cycles in tight) / len(tight)
               for i in range(len(terms))]
    lines = [(row + [0], ">=", cycles) for row, cycles in rows]
    lines += [(row + [-cycles], "<=", 0) for row, cycles in tight]
    program = "\n".join(
        ["Minimize", " + ".join(f"{w:.9f} x{i}" for i, w in enumerate(weights + [100])), "Subject To"] +
        [" + ".join(f"{factor:.9f} x{i}" for i, factor in enumerate(row)) + f" {sign} {bound}"
         for row, sign, bound in lines] + ["End\n"]).replace("+ -", "- ")
    with tempfile.TemporaryDirectory() as work:
        Path(work, "lp").write_text(program)
        subprocess.run(["glpsol", "--lp", "lp", "-w", "out"], cwd=work, check=True,
                       stdout=subprocess.DEVNULL)
        solution = Path(work, "out").read_text()
    if not re.search(r"^s bas \d+ \d+ f f ", solution, re.M):
        raise SystemExit(f"{name}: no formula bounds all calls")
    solved = re.findall(r"^j \d+ \w+ (\S+)", solution, re.M)
    factors = [math.ceil(float(one) * 4 - 1e-6) / 4 for one in solved[:len(terms)]]
    rest = max(cycles - Formula(terms[1:], factors[1:])(lengths) for lengths, cycles in points)
    return Formula(terms, [max(math.ceil(rest), 0), *factors[1:]])


def looseness(formula, most):
    """How much more than the dearest call the formula says, at most."""
    return max((formula(lengths) / cycles for lengths, cycles in judged(most)), default=1)
