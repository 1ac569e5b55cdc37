"""Calls that may be the dearest of their size: for each function all texts of a few classes of unit up
to three units, then long ones of repeated shapes, with all that ends them. Each comes with the
lengths that a formula of its cycles is of."""
from itertools import product

LONG = 5, 8, 16, 17, 18, 19, 34, 35, 64, 65, 66, 67
# n units of the text that is walked, d that the destination holds, m of the pattern or set, w of the
# replacement, r of the result, k digits.
TERMS = {"StrCat": "d n", "StrCatBuf": "d n", "StrNCat": "d n", "StrNCatBuf": "d n",
         "StrStr": "n n*m", "StrIStr": "n n*m", "StrToken": "n n*m m", "StrSplit": "n n*m m",
         "StrTrim": "n n*m m", "StrReplace": "n n*m n/m m w r", "IntToStr": "k",
         "CharToLower": "", "CharToUpper": ""}


class Text(tuple):
    """The units of an argument, which a terminator follows."""


class Raw(tuple):
    """The units of an argument as they are; none: a buffer to write to."""


OUT = Raw()


def terms_of(name):
    twin = name.replace("IntToWStr", "IntToStr")
    twin = twin[1:] if twin.startswith("WStr") else twin
    return [""] + TERMS.get(twin, "n").split()


def text(units):
    return Text(ord(unit) if isinstance(unit, str) else unit for unit in units)


def shapes(*classes):
    for length in range(4):
        yield from product(classes, repeat=length)
    for length in LONG:
        for shape in [(one,) for one in classes] + list(product(classes, repeat=2)):
            units = (shape * length)[:length]
            yield units
            if len(shape) == 1:
                yield from (units[:-1] + (last,) for last in classes if last != shape[0])


def bounds(length):
    return sorted({-1, 0, 1, length - 1, length, length + 1, length + 2, 0x7FFFFFFF})


def taken(length, bound):
    return max(0, min(length, bound))


def append(name):
    for held, more in product((0, 1, 2, 3, 16, 17, 64, 67), (0, 1, 2, 3, 4, 5, 8, 16, 19, 64, 65, 67)):
        dst, src = text("a" * held), text("b" * more)
        for bound in bounds(more):
            room = held + bound + 1 if bound < 1000 else bound
            if name.endswith("NCatBuf"):
                yield (dst, room, src, 0x7FFFFFFF), {"d": held, "n": taken(more, bound)}
                yield (dst, 0x7FFFFFFF, src, bound), {"d": held, "n": taken(more, bound)}
            elif name.endswith("CatBuf"):
                yield (dst, room, src), {"d": held, "n": taken(more, bound)}
            elif name.endswith("NCat"):
                yield (dst, src, bound), {"d": held, "n": taken(more, bound)}
        if name.endswith("rCat"):
            yield (dst, src), {"d": held, "n": more}


def find(name):
    other = str.swapcase if "I" in name else str
    for m in (0, 1, 2, 3, 4, 5, 8, 9, 16):
        for end, case in product("ab", dict.fromkeys((str, other))):
            pattern = "a" * (m - 1) + end if m else ""
            for units in shapes("a", "x"):
                if m <= 2 or len(units) < 4 or set(units) <= {"a", units[-1]}:
                    place = "".join(units).find(pattern)
                    n = len(units) if place < 0 else place + m
                    yield (text(units), text(case(pattern))), {"n": n, "m": m}


def compare(name):
    fold = str.lower if "I" in name else str
    ends = ("", ""), ("1", "2"), ("@", "`"), ("x", ""), ("", "x"), ("A", "b"), ("b", "A")
    for pairs in shapes("xx", "xX", "Xx") if "I" in name else shapes("xx"):
        one, two = ("".join(pair[i] for pair in pairs) for i in (0, 1))
        for end1, end2 in ends:
            a, b = one + end1, two + end2
            same = next((i for i, (x, y) in enumerate(zip(a, b)) if fold(x) != fold(y)),
                        min(len(a), len(b)))
            if "N" not in name:
                yield (text(a), text(b)), {"n": same}
            else:
                for count in bounds(same):
                    yield (text(a), text(b), count), {"n": taken(same, count)}


def sets(name):
    for m in (0, 1, 2, 3, 4, 7, 8, 12):
        members = [chr(33 + i) for i in range(m)]
        classes = {"x", *(members[:1] + members[-1:])}
        edges = [(members[-1],) * first + ("x",) * kept + (members[-1],) * (n - first - kept)
                 for n in (4, *LONG) for first in (0, 1, n // 3) for kept in (1, 2, n // 2) if m]
        for units in [*shapes(*sorted(classes)), *edges]:
            line, dlmt = text(units), text(members)
            lengths = {"n": len(units), "m": m}
            if name.endswith("Token"):
                start = next((i for i, unit in enumerate(units) if unit not in members), len(units))
                end = next((i + 1 for i in range(start, len(units)) if units[i] in members),
                           len(units))
                yield (line, Raw([0]), dlmt), {"n": end, "m": m}
            elif name.endswith("Split"):
                yield (line, dlmt, OUT), lengths
            else:
                yield (line, dlmt), lengths


def replace():
    def both(orig, rep, w):
        texts = text(orig), text(rep), text("y" * w)
        lengths = {"n": len(orig), "m": len(rep), "w": w}
        yield (*texts, OUT), {**lengths, "r": len("".join(orig).replace(rep, "y" * w))}
        yield (*texts, 0), {**lengths, "r": 0}

    for m, w in product(range(1, 18), (*range(6), *range(16, 20), 34, 35)):
        for orig in ("", "a", "a" * 67 if m == 1 else "aab"):
            yield from both(orig, "a" * m, w)
    for rep, w in product(("a", "b", "aa", "ab", "aab", "aaab", "aaaaaaab", "abababab"), (0, 1, 9)):
        for units in shapes("a", "b"):
            yield from both("".join(units), rep, w)


def numbers():
    for radix in (*range(2, 11), 16, 36, 255, 1000, 46341, 0x7FFFFFFF):
        for power in range(32):
            for value in (radix ** power - 1, radix ** power, 2 ** power, 3 ** power, 2 ** 31 - 1):
                if value >= 2 ** 31:
                    continue
                for signed in (value, -value, -value - 1):
                    digits, rest = 1, abs(signed)
                    while rest >= radix:
                        digits, rest = digits + 1, rest // radix
                    yield (signed, OUT, radix), {"k": digits}
    for radix in (0, 1, -1):
        yield (7, OUT, radix), {"k": 0}


def calls(name):
    """Pairs of the arguments and the lengths."""
    kind = name.replace("WStr", "Str", 1) if name.startswith("W") else name
    if kind.startswith("CharTo"):
        return (((c,), {}) for c in (0, 64, 65, 90, 91, 97, 122, 123, 2 ** 31 - 1, -2 ** 31))
    if kind in ("StrLen", "StrUpper", "StrLower"):
        return (((text(units),), {"n": len(units)})
                for units in (shapes("1", "A", "a", "{") if kind != "StrLen" else shapes("x")))
    if kind in ("StrCopy", "StrCopyBuf", "StrNCopy", "StrToWStr"):
        order = {"StrCopy": lambda src, _: (OUT, src), "StrCopyBuf": lambda src, n: (OUT, n, src),
                 "StrNCopy": lambda src, n: (OUT, src, n),
                 "StrToWStr": lambda src, n: (src, OUT, n)}[kind]
        more = 0 if kind == "StrNCopy" else 1
        return ((order(text(units), n + more if n < 1000 else n), {"n": taken(len(units), n)})
                for units in shapes("x")
                for n in (bounds(len(units)) if kind != "StrCopy" else [len(units)]))
    if kind == "StrChr":
        return (((text(units + end), ord(c)), {"n": len(units)})
                for units in shapes("x") for end, c in (((), "c"), (("c",), "c"), ((), "\0")))
    if "Cat" in kind:
        return append(kind)
    if kind in ("StrStr", "StrIStr"):
        return find(kind)
    if "Cmp" in kind:
        return compare(kind)
    if kind in ("StrToken", "StrSplit", "StrTrim"):
        return sets(kind)
    if kind == "StrReplace":
        return replace()
    if kind.startswith("IntTo"):
        return numbers()
    if kind == "StrToInt":
        return (((text(units + end),), {"n": len(units + end)})
                for units in shapes(" ", "9") for end in ((), ("-", "1"), ("0",))
                if " " not in "".join(units).lstrip(" "))
    if kind in ("BytesToWords", "StrToWords"):
        return (((Raw([7] * n), OUT, n), {"n": n}) for n in (*range(24), *LONG))
    assert kind == "StrToStr", name
    return (((text(units), OUT, size), {"n": len(units)})
            for units in shapes("x", 10, 0x4E2D) for size in (2000, 9 * len(units)))


def nulls(arguments):
    """The same call with each choice of its pointers null."""
    choices = [(one, 0) if isinstance(one, tuple) else (one,) for one in arguments]
    return list(product(*choices))[1:]
