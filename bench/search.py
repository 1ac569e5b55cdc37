"""Calls that may be the dearest of their size: for each function all texts of a few classes of unit up
to three units, then long ones of repeated shapes, with all that ends them. Each comes with the lengths
that a formula of its cycles is of."""
from itertools import product
from typing import NamedTuple

MOST = 0x7FFFFFFF
OUT, INT = [], [0]  # a buffer to write to; one of integers, or of pointers


class Same(NamedTuple):
    """An argument that is the same pointer as an earlier one."""
    index: int


# Around the turns of a loop of four steps, and where a formula is judged; and texts so long that only
# what a unit costs counts.
SHORT = range(4)
LONG = 5, 8, 16, 17, 18, 19, 34, 35, 64, 65, 66, 67, 131
FAR = 514, 515, 1031


# Two costs of one function.
SIZING = ", null result"


def narrow(name):
    """The name of the narrow twin, or what it would be."""
    if name == "IntToWStr":
        return "IntToStr"
    return name[1:] if name.startswith("WStr") else name


def shapes(*classes):
    """Texts of such units: all short ones; long ones of one unit, with another at the end, or of two in
    turn; very long ones of one or two."""
    for length in SHORT:
        for units in product(classes, repeat=length):
            yield "".join(units)
    for length in LONG:
        for one, other in product(classes, repeat=2):
            yield one * (length - 1) + other
            if one != other:
                yield (one + other) * (length // 2) + one * (length % 2)
    for length in FAR:
        for one, other in product(classes, repeat=2):
            yield (one + other) * (length // 2) + one * (length % 2)


def bounds(length):
    """Counts at and around a length, and without meaning."""
    return sorted({-1, 0, 1, length - 1, length, length + 1, length + 2, MOST})


def taken(length, bound):
    """How many units of so many a count takes."""
    return max(0, min(length, bound))


def length_calls(_):
    for text in shapes("x"):
        yield (text,), {"n": len(text)}


def case_calls(_):
    for text in shapes("1", "A", "a", "{"):
        yield (text,), {"n": len(text)}


def copy_calls(name):
    for src in shapes("x"):
        for count in bounds(len(src)) if name != "StrCopy" else [MOST]:
            size = min(count + 1, MOST)
            arguments = {"StrCopy": (OUT, src), "StrCopyBuf": (OUT, size, src),
                         "StrNCopy": (OUT, src, count), "StrToWStr": (src, OUT, size)}
            yield arguments[name], {"n": taken(len(src), count)}
    same = {"StrCopy": ("x", Same(0)), "StrCopyBuf": ("x", 9, Same(0)), "StrNCopy": ("x", Same(0), 9)}
    if name in same:
        yield same[name], {"n": 0}


def append_calls(name):
    for held, more in product((0, 1, 2, 3, 16, 17, 64, 67, 515), (0, 1, 2, 3, 4, 5, 8, 16, 19, 64, 65, 67, 515)):
        dst, src = "a" * held, "b" * more
        for count in bounds(more) if name != "StrCat" else [MOST]:
            room = min(held + count + 1, MOST)
            arguments = {"StrCat": [(dst, src)], "StrCatBuf": [(dst, room, src)],
                         "StrNCat": [(dst, src, count)],
                         "StrNCatBuf": [(dst, room, src, MOST), (dst, MOST, src, count)]}
            for some in arguments[name]:
                yield some, {"d": held, "n": taken(more, count)}


def unit_calls(_):
    for text in shapes("x"):
        for end, unit in ("", "c"), ("c", "c"), ("", "\0"):
            yield (text + end, ord(unit)), {"n": len(text)}


def find_calls(name):
    patterns = {"", "`", "@"}
    for m in (1, 2, 3, 4, 5, 8, 9, 16):
        for end in "ab":
            patterns.add("a" * (m - 1) + end)
            if name == "StrIStr":
                patterns.add(("a" * (m - 1) + end).upper())
    texts = list(shapes("a", "x"))
    for start in "a", "aa", "aaa", "aaaa":  # then units that differ as the cases of a letter do
        patterns.add(start + "@")
        texts.append(start + "`")
    for pattern, text in product(sorted(patterns), texts):
        found = (text.lower() if name == "StrIStr" else text).find(
            pattern.lower() if name == "StrIStr" else pattern)
        n = len(text) if found < 0 else found + len(pattern)
        yield (text, pattern), {"n": n, "m": len(pattern)}


def compare_calls(name):
    folds = "I" in name
    starts = list(shapes("x"))
    pairs = [(text, text) for text in starts]
    if folds:
        pairs += [(text, text.upper()) for text in starts] + [(text.upper(), text) for text in starts]
    ends = ("", ""), ("1", "2"), ("@", "`"), ("x", ""), ("", "x"), ("A", "b"), ("b", "A")
    for (one, two), (end1, end2) in product(pairs, ends):
        n = len(one)  # the units before the first difference
        for count in bounds(n) if "N" in name else [MOST]:
            arguments = (one + end1, two + end2, count) if "N" in name else (one + end1, two + end2)
            yield arguments, {"n": taken(n, count)}
    yield (("x", Same(0), 9) if "N" in name else ("x", Same(0))), {"n": 0}


def set_calls(name):
    for m in (0, 1, 2, 3, 4, 7, 8, 12):
        members = "".join(chr(ord("!") + i) for i in range(m))
        texts = list(shapes(*sorted({"x", *members[:1], *members[-1:]})))
        for n in (4, *LONG, *FAR) if m else ():
            for first, kept in product((0, 1, n // 3), (1, 2, n // 2)):
                last = members[-1]
                texts.append(last * first + "x" * kept + last * (n - first - kept))
        for text in texts:
            n = len(text)
            if name == "StrToken":
                start = n - len(text.lstrip(members or "\0"))
                n = next((i + 1 for i in range(start, n) if text[i] in members), n)
            arguments = {"StrToken": (text, INT, members), "StrSplit": (text, members, INT),
                         "StrTrim": (text, members)}
            yield arguments[name], {"n": n, "m": m}
            if name == "StrTrim" and m == 0:
                yield (text, 0), {"n": n, "m": m}


def replaced():
    """Texts, patterns, and lengths of what replaces them."""
    for m, w in product(range(1, 18), (*range(6), *range(16, 20), 34, 35)):
        for orig in ("", "a", "a" * 67 if m == 1 else "aab"):
            yield orig, "a" * m, w
    patterns = "a", "b", "aa", "ab", "aab", "aaab", "aaaaaaab", "abababab", "a" * 15 + "b"
    for rep, w in product(patterns, (0, 1, 9)):
        for orig in shapes("a", "b"):
            yield orig, rep, w


def replace_calls(_):
    for orig, rep, w in replaced():
        size = len(orig.replace(rep, "y" * w))
        yield (orig, rep, "y" * w, OUT), {"n": len(orig), "m": len(rep), "w": w, "r": size}
    yield ("x", "", "y", OUT), {"n": 0, "m": 1, "w": 1, "r": 0}


def size_calls(_):
    for orig, rep, w in replaced():
        yield (orig, rep, "y" * w, 0), {"n": len(orig), "m": len(rep), "w": w}
    yield ("x", "a", "y", Same(0)), {"n": 1, "m": 1, "w": 1}
    yield ("x", "", "y", 0), {"n": 0, "m": 1, "w": 1}


def int_calls(_):
    for radix in (*range(2, 11), 16, 36, 255, 1000, 46341, MOST):
        values = {MOST}
        for base, power in product((2, 3, radix), range(32)):
            values |= {base ** power, radix ** power - 1}
        for value in sorted(values):
            for signed in (value, -value, -value - 1) if value <= MOST else ():
                k = next(k for k in range(1, 33) if abs(signed) < radix ** k)
                yield (signed, OUT, radix), {"k": k}
    for value, radix in product((0, 7), (0, 1, -1)):
        yield (value, OUT, radix), {"k": 1 if value == 0 and radix == 1 else 0}


def number_calls(_):
    for text in shapes(" ", "\t", "9"):
        if text.lstrip(" \t").isdigit() or "9" not in text:
            for end in "", "-", "-1", "-x", "0", "x":
                yield (text + end,), {"n": len((text + end).rstrip("x"))}


def word_calls(_):
    for n in (*range(24), *LONG, *FAR):
        yield ("x" * n, OUT, n), {"n": n}
    yield ("x", OUT, -1), {"n": 0}


def escape_calls(_):
    written = {"x": 1, "\n": 6, "\uffff": 9}
    for text in shapes(*written):
        size = sum(written[unit] for unit in text)
        cuts = range(max(size - 10, 0), size) if len(text) < 16 else []
        for bufsize in (*cuts, size, size + 1, MOST):
            room = bufsize - 1
            n = 0
            for unit in text:
                n += 1  # the unit that does not fit is read
                room -= written[unit]
                if room < 0:
                    break
            yield (text, OUT, bufsize), {"n": n}
    for unit in "\x80\u0100\u0fff\u1000~\x7f":
        yield (unit, OUT, 20), {"n": 1}


def char_calls(_):
    for c in (0, 64, 65, 90, 91, 97, 122, 123, MOST, -MOST - 1):
        yield (c,), {}


# The calls of each function, and the terms that its formula may have, of the lengths that come with the
# calls: n units of the text that is walked, d that the destination holds, m of the pattern or set, w of
# the replacement, r of the result, k digits.
FAMILIES = [
    (length_calls, ["1", "n"], ["StrLen"]),
    (case_calls, ["1", "n"], ["StrUpper", "StrLower"]),
    (copy_calls, ["1", "n"], ["StrCopy", "StrCopyBuf", "StrNCopy", "StrToWStr"]),
    (append_calls, ["1", "d", "n"], ["StrCat", "StrCatBuf", "StrNCat", "StrNCatBuf"]),
    (unit_calls, ["1", "n"], ["StrChr"]),
    (find_calls, ["1", "n", "n m"], ["StrStr", "StrIStr"]),
    (compare_calls, ["1", "n"], ["StrNCmp", "StrNICmp", "StrCmp", "StrICmp"]),
    (set_calls, ["1", "n", "n m", "m"], ["StrToken", "StrSplit", "StrTrim"]),
    (replace_calls, ["1", "n", "n m", "n / m", "m", "w", "r"], ["StrReplace"]),
    (size_calls, ["1", "n", "n m", "n / m", "m", "w"], ["StrReplace" + SIZING]),
    (int_calls, ["1", "k"], ["IntToStr"]),
    (number_calls, ["1", "n"], ["StrToInt"]),
    (word_calls, ["1", "n"], ["BytesToWords", "StrToWords"]),
    (escape_calls, ["1", "n"], ["StrToStr"]),
    (char_calls, ["1"], ["CharToLower", "CharToUpper"]),
]


class Searched(NamedTuple):
    calls: list  # pairs of the arguments and the lengths
    terms: list


SEARCHED = {name: Searched(list(calls(name)), terms) for calls, terms, names in FAMILIES for name in names}


def with_nulls(name, call):
    """The same call with each choice of its pointers null, for which the formula's lengths are 0. A null set
    of StrTrim is an empty one, and a null result of StrReplace a cost of its own."""
    arguments, lengths = call
    choices = [(one,) if isinstance(one, int) else (one, 0) for one in arguments]
    nothing = {length: 1 if length == "m" else 0 for length in lengths}
    for some in list(product(*choices))[1:]:
        is_other = (name == "StrTrim" and some[0] != 0) or (name == "StrReplace" and some[3] == 0)
        if not is_other and not any(isinstance(one, Same) for one in some):
            yield some, nothing


def calls_of(name):
    """All calls of a function, narrow or wide: arguments, lengths, and whether the buffers are misaligned,
    which takes turns; both ways where that makes a difference."""
    name = narrow(name)
    calls = SEARCHED[name].calls
    longest = max(calls, key=lambda call: sum(call[1].values()))
    everything = [*calls, *with_nulls(name, calls[0]), *with_nulls(name, longest)]
    for index, (arguments, lengths) in enumerate(everything):
        if "Words" in name:
            yield arguments, lengths, False
            yield arguments, lengths, True
        else:
            yield arguments, lengths, index % 2 == 1
