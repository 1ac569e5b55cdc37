"""Calls that may be the dearest of their size: for each function all texts of a few classes of unit up
to three units, then long ones of repeated shapes, with all that ends them. Each comes with the
lengths that a formula of its cycles is of. A str is a text, a list a buffer of integers."""
from itertools import product

LONG = 5, 8, 16, 17, 18, 19, 34, 35, 64, 65, 66, 67
LONGEST = 131  # for the patterns of an eighth of it
MOST = 0x7FFFFFFF
OUT, INT = [], [0]


def narrow(name):
    """The name of the narrow twin, or what it would be."""
    return "IntToStr" if name == "IntToWStr" else name[name.startswith("WStr"):]


def shapes(*classes):
    for length in range(4):
        yield from map("".join, product(classes, repeat=length))
    for length in LONG:
        for one, other in product(classes, repeat=2):
            yield one * (length - 1) + other
            if one != other:
                yield (one + other) * (length // 2) + one * (length % 2)


def bounds(length):
    return sorted({-1, 0, 1, length - 1, length, length + 1, length + 2, MOST})


def taken(length, bound):
    return max(0, min(length, bound))


def letters(name):
    for units in shapes(*("x" if name == "StrLen" else "1Aa{")):
        yield (units,), {"n": len(units)}


def copy(name):
    for src in shapes("x"):
        for bound in bounds(len(src)) if name != "StrCopy" else [MOST]:
            size = min(bound + 1, MOST)
            yield {"StrCopy": (OUT, src), "StrCopyBuf": (OUT, size, src), "StrNCopy": (OUT, src, bound),
                   "StrToWStr": (src, OUT, size)}[name], {"n": taken(len(src), bound)}


def append(name):
    for held, more in product((0, 1, 2, 3, 16, 17, 64, 67), (0, 1, 2, 3, 4, 5, 8, 16, 19, 64, 65, 67)):
        dst, src = "a" * held, "b" * more
        for bound in bounds(more) if name != "StrCat" else [MOST]:
            room = min(held + bound + 1, MOST)
            for arguments in {"StrCat": [(dst, src)], "StrCatBuf": [(dst, room, src)],
                              "StrNCat": [(dst, src, bound)],
                              "StrNCatBuf": [(dst, room, src, MOST), (dst, MOST, src, bound)]}[name]:
                yield arguments, {"d": held, "n": taken(more, bound)}


def find(name):
    other = str.swapcase if "I" in name else str
    for m in (0, 1, 2, 3, 4, 5, 8, 9, 16):
        for end, case in product("ab", dict.fromkeys((str, other))):
            pattern = "a" * (m - 1) + end if m else ""
            for units in [*shapes("a", "x"), "a" * LONGEST]:
                n = units.find(pattern) + m if pattern in units else len(units)
                yield (units, case(pattern)), {"n": n, "m": m}


def compare(name):
    fold = str.lower if "I" in name else str
    ends = ("", ""), ("1", "2"), ("@", "`"), ("x", ""), ("", "x"), ("A", "b"), ("b", "A")
    for units, (end1, end2) in product(shapes("xx", *("xX", "Xx") * ("I" in name)), ends):
        a, b = units[::2] + end1, units[1::2] + end2
        same = next((i for i, (x, y) in enumerate(zip(a, b)) if fold(x) != fold(y)), min(len(a), len(b)))
        for count in bounds(same) if "N" in name else [MOST]:
            yield (a, b, *[count] * ("N" in name)), {"n": taken(same, count)}


def sets(name):
    for m in (0, 1, 2, 3, 4, 7, 8, 12):
        members = "!\"#$%&'()*+,"[:m]
        edges = [members[-1] * first + "x" * kept + members[-1] * (n - first - kept)
                 for n in (4, *LONG) for first in (0, 1, n // 3) for kept in (1, 2, n // 2) if m]
        for units in [*shapes(*sorted({"x", *members[:1], *members[-1:]})), *edges]:
            n = len(units)
            if name == "StrToken":
                start = n - len(units.lstrip(members or "\0"))
                n = next((i + 1 for i in range(start, n) if units[i] in members), n)
            yield {"StrToken": (units, INT, members), "StrSplit": (units, members, INT),
                   "StrTrim": (units, members)}[name], {"n": n, "m": m}


def replace(_):
    def both(orig, rep, w):
        for out, r in (OUT, len(orig.replace(rep, "y" * w))), (0, 0):
            yield (orig, rep, "y" * w, out), {"n": len(orig), "m": len(rep), "w": w, "r": r}

    for m, w in product(range(1, 18), (*range(6), *range(16, 20), 34, 35)):
        for orig in ("", "a", "a" * 67 if m == 1 else "aab"):
            yield from both(orig, "a" * m, w)
    for rep, w in product(("a", "b", "aa", "ab", "aab", "aaab", "aaaaaaab", "abababab", "a" * 15 + "b"),
                          (0, 1, 9)):
        for units in [*shapes("a", "b"), "a" * LONGEST]:
            yield from both(units, rep, w)


def numbers(_):
    for radix in (*range(2, 11), 16, 36, 255, 1000, 46341, MOST):
        powers = [(base ** power, radix ** power - 1) for base in (2, 3, radix) for power in range(32)]
        for value in sorted({*sum(powers, ()), MOST}):
            for signed in (value, -value, -value - 1) if value <= MOST else ():
                k = next(k for k in range(1, 33) if abs(signed) < radix ** k)
                yield (signed, OUT, radix), {"k": k}
    for radix in (0, 1, -1):
        yield (7, OUT, radix), {"k": 0}


def number(_):
    for units in shapes(" ", "\t", "9"):
        if units.lstrip(" \t").isdigit() or "9" not in units:
            for end in "", "-1", "0":
                yield (units + end,), {"n": len(units + end)}


# The lengths that a formula is of: n units of the text that is walked, d that the destination holds,
# m of the pattern or set, w of the replacement, r of the result, k digits.
FAMILIES = [
    (letters, "n", "StrLen StrUpper StrLower"),
    (copy, "n", "StrCopy StrCopyBuf StrNCopy StrToWStr"),
    (append, "d, n", "StrCat StrCatBuf StrNCat StrNCatBuf"),
    (lambda _: (((units + end, ord(unit)), {"n": len(units)}) for units in shapes("x")
                for end, unit in (("", "c"), ("c", "c"), ("", "\0"))), "n", "StrChr"),
    (find, "n, n m", "StrStr StrIStr"),
    (compare, "n", "StrNCmp StrNICmp StrCmp StrICmp"),
    (sets, "n, n m, m", "StrToken StrSplit StrTrim"),
    (replace, "n, n m, n / m, m, w, r", "StrReplace"),
    (numbers, "k", "IntToStr"),
    (number, "n", "StrToInt"),
    (lambda _: ((("x" * n, OUT, n), {"n": n}) for n in (*range(24), *LONG)), "n", "BytesToWords StrToWords"),
    (lambda _: (((units, OUT, size), {"n": len(units)}) for units in shapes("x", "\n", "\uffff")
                for size in (2000, *range(9 * len(units) - 1, 9 * len(units) + 3))), "n", "StrToStr"),
    (lambda _: (((c,), {}) for c in (0, 64, 65, 90, 91, 97, 122, 123, MOST, -MOST - 1)), "",
     "CharToLower CharToUpper")]
# By name: pairs of the arguments and the lengths, and the terms.
CALLS = {name: (list(calls(name)), f"1, {terms}".rstrip(", ").split(", "))
         for calls, terms, names in FAMILIES for name in names.split()}
