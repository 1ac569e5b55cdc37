"""Formulas of lengths that bound the cycles of all calls that the search makes."""
import math
import re
from itertools import product

from core import DATA
from search import CALLS, INT, LONG, LONGEST, narrow

CODECS = {1: "latin-1", 2: "utf-16-le"}  # by the bytes of a unit


def unit_of(name, index):
    """The bytes of a unit of an argument."""
    if name in ("BytesToWords", "StrToWStr", "WStrToStr"):
        return 1 if (index == 0) != (name == "WStrToStr") else 2
    return 1 if name == narrow(name) else 2


def run(core, symbol, name, arguments, skew=False, order=()):
    """Puts the buffers into memory, misaligned if `skew`, and calls with all or, by `order`, some."""
    core.places = []
    for index, one in enumerate(arguments):
        if not isinstance(one, int):
            unit = unit_of(name, index)
            data = (one + "\0").encode(CODECS[unit]) if isinstance(one, str) else bytes(4 * len(one))
            one = DATA + index * 0x4000 + (unit * (3 if index else 1) if skew and one != INT else 0)
            core.give(one, data)
        core.places.append(one)
    core.registers = [core.places[index] for index in order] if order else core.places
    core.call(symbol, core.registers)


def searched(name):
    """All calls of a function, aligned or not by turns; both ways where that makes a difference."""
    for index, (arguments, lengths) in enumerate(CALLS[narrow(name)][0]):
        for skew in (False, True) if "Words" in name else (bool(index % 2),):
            yield arguments, lengths, skew
        if index == 0:  # the same with each choice of its pointers null
            choices = [(one,) if isinstance(one, int) else (one, 0) for one in arguments]
            nothing = {length: int(length == "m") for length in lengths}
            yield from ((some, nothing, False) for some in list(product(*choices))[1:])


def bound(formula):
    """What a formula, written as on the page, gives for lengths."""
    code = compile(re.sub(r"(?<=\w) (?=[a-z])", "*", formula), formula, "eval")
    return lambda lengths: eval(code, None, lengths)


def dearest(core, build, symbol, name, formula=None):
    """The calls of most cycles of all lengths, and the most stack; with a formula, fails where one
    exceeds it."""
    most, stack = {}, 0
    limit = bound(formula or "0")
    for index, (arguments, lengths, skew) in enumerate(searched(name)):
        if formula and index > 20 and index % (25 if lengths.get("n", 0) > 40 else 5):
            continue  # what a change could break shows in a fifth of the calls, and less of the long ones
        run(core, symbol, name, arguments, skew)
        if formula and core.cycles > limit(lengths):
            raise SystemExit(f"{build}: {name} takes {core.cycles} cycles with {arguments}, of lengths "
                             f"{lengths}: more than {formula}")
        stack = max(stack, core.stack)
        key = tuple(lengths.items())
        most[key] = max(most.get(key, 0), core.cycles)
    if not most:
        raise SystemExit(f"{build}: {name}: no call is searched")
    return [(dict(key), cycles) for key, cycles in most.items()], stack


def judged(most):
    """Where a formula is to be tight: at 16 units or more, with a pattern or set of two units to an
    eighth of them; of calls that differ in the length of the result alone, at the dearest."""
    found = {}
    for lengths, cycles in most:
        n, m = lengths.get("n", 16), lengths.get("m", 2)
        if n in (*LONG, LONGEST) and lengths.get("k", n) >= 16 and 2 <= m <= n / 8:
            key = tuple(pair for pair in lengths.items() if pair[0] != "r")
            found[key] = max(found.get(key, (0, {})), (cycles, lengths), key=lambda one: one[0])
    return [(lengths, cycles) for cycles, lengths in found.values()]


def growth(most):
    """By how much lengths and cycles differ from turn to turn of the loops: pairs of calls of which one
    length differs, or that of the result with it."""
    for grown in "dnmw":
        before = {}
        for lengths, cycles in sorted(most, key=lambda call: call[0].get(grown, 0)):
            length, others = lengths.get(grown, 0), {**lengths, grown: 0, "r": 0}
            if length not in (*LONG, LONGEST) if grown in "dn" else length == 0:
                continue
            key = length % 4, lengths.get("r", 0) * 10 // length, *others.items()
            start, start_cycles = before.get(key, ({}, 0))
            if start.get(grown, 0) >= (8 if grown in "mw" else max(8, 2 * lengths.get("m", 0))):
                yield start, lengths, cycles - start_cycles
            before[key] = lengths, cycles


def fit(build, name, most):
    """The formula above all of these that is the least where it is the loosest, and grows as they do."""
    from scipy.optimize import linprog
    terms = CALLS[narrow(name)][1]
    bounds = [bound(term) for term in terms]

    def row(lengths):
        return [term(lengths) for term in bounds]

    above = [(row(lengths), cycles) for lengths, cycles in most]
    grown = [([a - b for a, b in zip(row(end), row(start))], cycles) for start, end, cycles in growth(most)]
    above += [one for one in grown if min(one[0]) >= 0]
    tight = [(row(lengths), cycles) for lengths, cycles in judged(most) or most[:1]]
    weights = [sum(one[i] / cycles for one, cycles in tight) / len(tight) for i in range(len(terms))]
    found = linprog(
        [*weights, 100],
        [[-one for one in some] + [0] for some, _ in above] + [some + [-cycles] for some, cycles in tight],
        [-cycles for _, cycles in above] + [0] * len(tight),
        bounds=[(None if term == "n" and "n m" in terms else 0, None) for term in terms] + [(0, None)])
    if found.status:
        raise SystemExit(f"{build}: {name}: no formula bounds all calls: {found.message}")
    if found.x[-1] > 1.3:
        print(f"{build}: {name}: the formula is up to {found.x[-1]:.2f} of the dearest call")
    rest = ""
    for term, factor in zip(terms[1:], found.x[1:]):
        factor = math.ceil(factor * 4 - 1e-6) / 4
        rest += f" {'-' if factor < 0 else '+'} {abs(factor):g} {term}" if factor else ""
    return f"{math.ceil(max(cycles - bound('0' + rest)(lengths) for lengths, cycles in most))}{rest}"
