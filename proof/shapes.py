"""The calls that are proved of each function: its arguments with any contents up to a size, in each
variant: which pointers are null, are the same, overlap or are not aligned to words."""
from itertools import combinations

import z3

from contracts import FUNCTIONS, Array, Call, narrow
from machine import Division, Memory

BASE, DISTANCE = 0x20000000, 0x400  # where the arguments' arrays are

# The most units of each argument, in all calls and in the quick ones; in `OTHER` where a function
# has its own.
ANY = {"str": (9, 5), "src": (9, 5), "dst": (9, 4), "str1": (9, 5), "str2": (9, 5), "orig": (4, 3),
       "substr": (5, 5), "dlmt": (5, 2), "trimSet": (5, 2), "rep": (3, 2), "with": (3, 1),
       "string": (9, 4), "des": (9, 5)}
OTHER = {"StrLen": {"str": (64, 9)}, "StrUpper": {"str": (16, 5)}, "StrLower": {"str": (16, 5)},
         "StrCopy": {"src": (16, 5)}, "StrCopyBuf": {"src": (16, 5)}, "StrNCopy": {"src": (16, 5)},
         "StrChr": {"str": (32, 9)}, "StrCmp": {"str1": (16, 5), "str2": (16, 5)},
         "StrNCmp": {"str1": (16, 5), "str2": (16, 5)},
         "StrStr": {"str": (9, 5), "substr": (6, 5)}, "StrIStr": {"str": (9, 5), "substr": (2, 3)},
         "StrSplit": {"str": (6, 4), "dlmt": (3, 2)},
         "WStrToStr": {"src": (2, 1)}, "BytesToWords": {"src": (16, 6), "des": (16, 6)},
         "WStrToWords": {"src": (18, 18), "des": (18, 18)}, "StrToWStr": {"src": (16, 5)}}
# Also a long replacement and a long pattern, since the loops that walk them take four units in an
# iteration.
LONG_REPLACEMENT = {"orig": 2, "rep": 1, "with": 6}
LONG_PATTERN = {"str": 5, "substr": 5}
# The solver takes too long for the upper bound of these at other sizes than the quick ones.
SLOW_BOUNDS = "StrIStr", "StrSplit", "StrToken", "StrTrim"
RADICES = 10, 16, 2, 3, 36, 37, 200, 65536, 1, 0, -1


def units_of(name, argument):
    """The bytes of a unit of an argument."""
    if name in ("BytesToWords", "StrToWStr"):
        return 1 if argument == "src" else 2
    if name == "WStrToStr":
        return 2 if argument == "src" else 1
    return 2 if name.startswith("W") or name == "IntToWStr" else 1


def sizes(name, is_quick):
    own = OTHER.get(narrow(name), {})
    kinds = dict(one.split(":") for one in FUNCTIONS[narrow(name)][1].split())
    if "radix" in kinds:
        return {}
    return {one: own.get(one, ANY[one])[is_quick] for one, kind in kinds.items()
            if one in ANY and kind != "out"}


def variants(name):
    """What is special about the arguments of a call, by argument."""
    kinds = dict(one.split(":") for one in FUNCTIONS[narrow(name)][1].split())
    pointers = [one for one, kind in kinds.items() if kind not in ("int", "unit")]
    yield {}
    for count in range(1, len(pointers) + 1):
        for some in combinations(pointers, count):
            yield dict.fromkeys(some, "null")
    if "str2" in kinds:
        yield {"str2": ("same", "str1")}
    if narrow(name) in ("StrCopy", "StrCopyBuf", "StrNCopy"):
        yield {"dst": ("same", "src")}
        yield {"dst": ("before", "src", 1)}
        yield {"dst": ("before", "src", 3)}
    if name in ("BytesToWords", "WStrToWords"):
        yield {"src": "skewed"}
        yield {"des": "skewed"}
        yield {"src": "skewed", "des": "skewed"}
    if name == "WStrToWords":
        for distance in (1, 2, 3):
            yield {"des": ("before", "src", distance)}
            yield {"src": ("before", "des", distance)}
        yield {"des": ("same", "src")}
    if name == "StrChr":
        yield {"c": "sign"}
    if "off" in kinds:
        yield {"off": 1}
        yield {"off": 4}
    if "result" in kinds:
        yield {"result": ("same", "orig")}


def int_variants(is_quick):
    for radix in (10, 16, 1, 0) if is_quick else RADICES:
        for value in ("zero", "positive", "negative", "least"):
            yield {"value": value, "radix": radix}
    yield {"value": "positive", "radix": 10, "string": "null"}


class Shape:
    """The arguments of a call of a variant: for the machine `registers` and `memory`, for the
    contract `arguments`; what the contract says of them is `call` and `expected`."""

    def __init__(self, name, variant, most, segments):
        self.name, self.variant, self.most = name, variant, most
        contract, signature = FUNCTIONS[narrow(name)]
        self.kinds = dict(one.split(":") for one in signature.split())
        self.arrays, self.conditions, self.values = [], [], {}
        # Last those that depend on another argument.
        for argument in sorted(self.kinds, key=lambda one: isinstance(variant.get(one), tuple)):
            self.values[argument] = self.make(argument, list(self.kinds).index(argument))
        self.arguments = [self.values[argument] for argument in self.kinds]
        self.divide = Division()
        self.call = Call(self.arrays, self.divide)
        self.call.needs += self.conditions
        self.expected = contract(self.call, *self.arguments)
        if isinstance(self.expected, z3.ExprRef):
            self.expected = z3.simplify(self.expected)
        self.call.cells = {cell: z3.simplify(unit) if isinstance(unit, z3.ExprRef) else unit
                           for cell, unit in self.call.cells.items()}
        self.memory = Memory(segments)
        for array in self.arrays:
            paces = self.kinds[array.name] not in ("pattern", "with", "offset", "pointers")
            self.memory.give(array.address, array.size, array.units, paces)
        self.registers = [self.register(argument) for argument in self.kinds]

    def make(self, argument, index):
        kind, special = self.kinds[argument], self.variant.get(argument)
        if special == "null":
            return None
        if kind == "unit":
            return unknown(argument, units_of(self.name, argument))
        if argument == "value":
            return self.value(special)
        if kind == "int":
            return special if isinstance(special, int) else z3.BitVec(argument, 32)
        if isinstance(special, tuple):
            return self.beside(argument, *special)
        size = 4 if kind in ("offset", "pointers") else units_of(self.name, argument)
        address = BASE + index * DISTANCE
        if kind not in ("offset", "pointers", "words") or special == "skewed":
            address += size
        array = Array(argument, address, size, self.units(argument, kind, size))
        self.arrays.append(array)
        return array

    def units(self, argument, kind, size):
        if kind == "offset":
            return [offset_of(self.variant)]
        count = self.most.get(argument, 0)
        if kind == "counted":
            count += 1  # the last unit can be the terminator as well
        if kind == "pointers":
            count = (self.most["str"] + 1) // 2
        if kind == "out":
            count = self.room()
        units = [unknown(f"{argument}[{number}]", size) for number in range(count)]
        if kind in ("text", "pattern", "with", "room"):
            units.append(0)
        if kind == "room":
            units += [unknown(f"{argument}[{number}]", size)
                      for number in range(count + 1, count + 2 + self.most["src"])]
        if kind in ("out", "pointers", "words"):
            units.append(unknown(f"{argument}[{count}]", size))  # which is not to change
        if argument == "str" and offset_of(self.variant):
            units[offset_of(self.variant) - 1] = 0  # cut by an earlier call
        return units

    def room(self):
        """The units that an output takes at most."""
        if self.name == "WStrToStr":
            return 9 * self.most["src"] + 1
        if "with" in self.most:
            return self.most["orig"] * max(1, self.most["with"]) + 1
        if "radix" in self.kinds:
            return 34
        return self.most["src"] + 2

    def beside(self, argument, relation, other, distance=0):
        """An array that is another one, or begins so many units before it and overlaps it."""
        there = self.values[other]
        if relation == "before":
            size = there.size
            there.units[:0] = [unknown(f"{argument}[{number}]", size) for number in range(distance)]
            there.address -= distance * size
            array = Array(argument, there.address, size, there.units)
            self.arrays.append(array)
            self.arrays.remove(there)
            self.values[other] = there.after(distance)
            return array
        return Array(argument, there.address, there.size, there.units)

    def value(self, kind):
        """An int of which it is known whether it is negative."""
        if kind in ("zero", "least"):
            return 0 if kind == "zero" else -0x80000000
        some = z3.ZeroExt(1, z3.BitVec("value", 31))
        self.conditions.append(some != 0)
        return some if kind == "positive" else -some

    def register(self, argument):
        value = self.values[argument]
        if value is None:
            return 0
        if isinstance(value, Array):
            return value.address
        if self.variant.get(argument) == "sign":
            return z3.simplify(z3.SignExt(24, z3.Extract(7, 0, value)))
        return value & 0xFFFFFFFF if isinstance(value, int) else z3.simplify(value)


def offset_of(variant):
    """From where a token is looked for."""
    return variant["off"] if isinstance(variant.get("off"), int) else 0


def unknown(name, size):
    """Any unit of so many bytes."""
    some = z3.BitVec(name, 8 * size)
    return some if size == 4 else z3.ZeroExt(32 - 8 * size, some)
