"""Formulas of lengths that bound the cycles of all calls that the search makes."""
import math
import re
from typing import NamedTuple

from core import DATA
from search import FAR, INT, LONG, SEARCHED, Same, calls_of, narrow

CODECS = {1: "latin-1", 2: "utf-16-le"}  # by the bytes of a unit

# What the terms of a formula are of.
TERMS = {
    "1": lambda lengths: 1,
    "n": lambda lengths: lengths["n"],
    "d": lambda lengths: lengths["d"],
    "m": lambda lengths: lengths["m"],
    "w": lambda lengths: lengths["w"],
    "r": lambda lengths: lengths["r"],
    "k": lambda lengths: lengths["k"],
    "n m": lambda lengths: lengths["n"] * lengths["m"],
    "n / m": lambda lengths: lengths["n"] / max(lengths["m"], 1),
}

# How many times the cycles of a call that is judged a formula may be: of every one when it is found, of the
# dearest in a later check, which makes some of the calls only.
LOOSEST = 1.4


class Formula:
    """A sum of terms, each with a factor, as it is written on the page: "70 - 11.75 n + 21.25 n m"."""

    def __init__(self, factors):
        self.factors = {term: factor for term, factor in factors.items() if factor}

    @classmethod
    def parse(cls, text):
        factors = {}
        for sign, factor, term in re.findall(r"(^|[-+] )([\d.]+)((?: [a-z/]+)*)", text):
            term = term.strip() or "1"
            if term not in TERMS or term in factors:
                raise SystemExit(f"docs/performance.md: {term}, in {text}, is no term of a formula; run ./dev bench")
            factors[term] = -float(factor) if sign == "- " else float(factor)
        return cls(factors)

    def __str__(self):
        text = ""
        for term, factor in self.factors.items():
            sign = "-" if factor < 0 else "+"
            text += f" {sign} {abs(factor):g}" + (f" {term}" if term != "1" else "")
        return text.removeprefix(" + ") or "0"

    def of(self, lengths):
        return sum(factor * TERMS[term](lengths) for term, factor in self.factors.items())


class Dearest(NamedTuple):
    """The calls of most cycles of all lengths that were searched, and the most stack in bytes."""
    calls: list  # pairs of lengths and cycles
    stack: int


def unit_of(name, index):
    """The bytes of a unit of an argument."""
    name = name.split(",")[0]
    if name in ("BytesToWords", "StrToWStr"):
        return 1 if index == 0 else 2
    if name == "WStrToStr":
        return 2 if index == 0 else 1
    return 1 if name == narrow(name) else 2


def run(core, symbol, name, arguments, skew=False, order=()):
    """Puts the buffers into memory, misaligned if `skew`, and calls with all or, by `order`, some."""
    core.places = []
    for index, one in enumerate(arguments):
        if isinstance(one, Same):
            one = core.places[one.index]
        elif not isinstance(one, int):
            unit = unit_of(name, index)
            data = (one + "\0").encode(CODECS[unit]) if isinstance(one, str) else bytes(4 * len(one))
            place = DATA + index * 0x4000
            if skew and one != INT:
                place += unit * (3 if index else 1)
            core.give(place, data)
            one = place
        core.places.append(one)
    core.registers = [core.places[index] for index in order] if order else core.places
    core.call(symbol, core.registers)


def search(core, build, symbol, name, limit=None):
    """Makes the calls of a function; fails where one takes more cycles than `limit`, if that is given.
    A change of the code shows in a fifth of the long ones, and in fewer of the longest, so only these are
    made then."""
    most, stack = {}, 0
    for index, (arguments, lengths, skew) in enumerate(calls_of(name)):
        n = lengths.get("n", 0)
        every = 1 if n <= 8 else 5 if n <= 40 else 25 if n <= 140 else 125
        if limit and index % every > 0:
            continue
        run(core, symbol, name, arguments, skew)
        if limit and core.cycles > limit.of(lengths):
            raise SystemExit(f"{build}: {name} takes {core.cycles} cycles with {shown(arguments)}, of lengths "
                             f"{lengths}: more than {limit}. Is that right? Then run ./dev bench")
        stack = max(stack, core.stack)
        key = tuple(lengths.items())
        most[key] = max(most.get(key, 0), core.cycles)
    if not most:
        raise SystemExit(f"{build}: {name}: no call is searched")
    return Dearest([(dict(key), cycles) for key, cycles in most.items()], stack)


def shown(arguments):
    """The arguments, of long texts the beginning."""
    parts = [repr(one) for one in arguments]
    return ", ".join(part if len(part) < 40 else part[:30] + "...'" for part in parts)


def judged(calls):
    """The calls for which a formula is to be tight: of a length that all shapes have, 16 units or more, with
    a pattern or set of two units to an eighth of them; of those that differ in the length of the result
    alone, the dearest."""
    found = {}
    for lengths, cycles in calls:
        n, m, k = lengths.get("n", 16), lengths.get("m", 2), lengths.get("k", 16)
        if n >= 16 and n in (*LONG, *FAR) and k >= 16 and 2 <= m <= n / 8:
            key = tuple(pair for pair in lengths.items() if pair[0] != "r")
            if key not in found or cycles > found[key][1]:
                found[key] = lengths, cycles
    return list(found.values()) or calls[:1]


def looseness(formula, calls):
    """How many times the cycles of a call a formula is, for each that is judged, and its lengths."""
    return [(formula.of(lengths) / cycles, lengths) for lengths, cycles in judged(calls)]


def fit(build, name, calls):
    """The least formula above the cycles of all calls. A linear program finds it, whose unknowns are the
    factors of the terms and the looseness l:
        least:  100 l + the mean of formula / cycles of the judged calls
        so that formula >= cycles            for all calls
        and     formula <= l cycles          for the judged calls."""
    from scipy.optimize import linprog
    terms = SEARCHED[narrow(name)].terms
    rows = [([TERMS[term](lengths) for term in terms], cycles) for lengths, cycles in calls]
    tight = [([TERMS[term](lengths) for term in terms], cycles) for lengths, cycles in judged(calls)]
    mean = [sum(row[i] / cycles for row, cycles in tight) / len(tight) for i in range(len(terms))]
    above = [[-value for value in row] + [0] for row, _ in rows]
    below = [[*row, -cycles] for row, cycles in tight]
    # A cost that begins with the second unit of a pattern makes the factor of n negative.
    ranges = [(None if term == "n" and "n m" in terms else 0, None) for term in terms]
    found = linprog([*mean, 100], above + below, [-cycles for _, cycles in rows] + [0] * len(tight),
                    bounds=[*ranges, (0, None)])
    if found.status:
        raise SystemExit(f"{build}: {name}: no formula of {terms} bounds all calls: {found.message}")
    factors = {term: math.ceil(factor * 4 - 1e-6) / 4 for term, factor in zip(terms, found.x)}
    factors["1"] = 0
    rest = Formula(factors)
    factors["1"] = math.ceil(max(cycles - rest.of(lengths) for lengths, cycles in calls))
    return Formula(factors)
