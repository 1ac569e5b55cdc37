"""The library's functions: the calls that may be the worst of their lengths, and those that a C
library or a naive loop can make as well. Each function has an entry in FUNCTIONS, at the end."""
from dataclasses import dataclass
from itertools import product
from typing import Callable, NamedTuple

from core import SAME, Buffer

INT_MAX = 0x7FFFFFFF
OUT = Buffer(None)  # as large as need be

# Up to three units every string of some classes of unit is tried. Then come lengths around the
# iterations of a loop that is unrolled four times, and one so long that only the cost per unit
# counts.
SHORT = range(4)
LONG = 5, 8, 16, 17, 18, 19, 34, 35, 64, 65, 66, 67, 131
VERY_LONG = 515


# Candidates for the worst case. Each generator gives pairs: the arguments of a call, and the
# lengths that its upper bound depends on.


def alternate(one, other, length):
    return (one + other) * (length // 2) + one * (length % 2)


def strings(*classes):
    """All short strings of such units; long ones of one unit with another at the end, or of two
    that alternate; very long ones that alternate."""
    for length in SHORT:
        for units in product(classes, repeat=length):
            yield "".join(units)
    for one, other in product(classes, repeat=2):
        for length in LONG:
            yield one * (length - 1) + other
            yield alternate(one, other, length)
        yield alternate(one, other, VERY_LONG)


def counts_around(length):
    """Counts at and around a length, and some that make no sense."""
    return sorted({-1, 0, 1, length - 1, length, length + 1, length + 2, INT_MAX})


def uncounted(_):
    return [INT_MAX]


def taken(length, count):
    """How many units a count takes of so many."""
    return max(0, min(length, count))


def one_string(*classes):
    for string in strings(*classes):
        yield (string,), {"n": len(string)}


def copies(arguments, counts=counts_around):
    """By arguments(src, count), where the count is of units before the terminator."""
    for src in strings("x"):
        for count in counts(len(src)):
            yield arguments(src, count), {"n": taken(len(src), count)}


def appends(arguments, counts=counts_around):
    """By arguments(dst, src, count, capacity)."""
    more = *SHORT, 4, 5, 8, 16, 19, 64, 65, 67, VERY_LONG
    for d, length in product((*SHORT, 16, 17, 64, 67, VERY_LONG), more):
        dst, src = Buffer(None, "a" * d), "b" * length
        for count in counts(length):
            capacity = min(d + count + 1, INT_MAX)
            yield arguments(dst, src, count, capacity), {"d": d, "n": taken(length, count)}


def find_unit():
    for string in strings("x"):
        for end, unit in ("", "c"), ("c", "c"), ("", "\0"):
            yield (string + end, ord(unit)), {"n": len(string)}


def find_string(fold=str):
    patterns, texts = {"", "`", "@"}, list(strings("a", "x"))
    for m in (1, 2, 3, 4, 5, 8, 9, 16):
        for end in "ab":
            pattern = "a" * (m - 1) + end
            patterns |= {pattern, pattern.upper()} if fold("A") == "a" else {pattern}
    for start in "a", "aa", "aaa", "aaaa":  # then units that differ as the cases of a letter do,
        patterns.add(start + "@")
        texts += [start + "`", start + " "]  # also from the terminator of the pattern
    for pattern, string in product(sorted(patterns), texts):
        found = fold(string).find(fold(pattern))
        n = len(string) if found < 0 else found + len(pattern)
        yield (string, pattern), {"n": n, "m": len(pattern)}


def compares(ignores_case=False, has_count=False):
    pairs = [(string, string) for string in strings("x")]
    if ignores_case:
        pairs += [(string, string.upper()) for string in strings("x")]
        pairs += [(string.upper(), string) for string in strings("x")]
    ends = (("", ""), ("1", "2"), ("@", "`"), ("x", ""), ("", "x"), (" ", ""), ("", " "), ("A", "b"),
            ("b", "A"))
    for (one, two), (end1, end2) in product(pairs, ends):
        if has_count:
            for count in counts_around(len(one)):
                yield (one + end1, two + end2, count), {"n": taken(len(one), count)}
        else:
            yield (one + end1, two + end2), {"n": len(one)}


def token_end(string, members):
    """The index from which the next token is looked for."""
    start = len(string) - len(string.lstrip(members or "\0"))
    return next((i + 1 for i in range(start, len(string)) if string[i] in members), len(string))


def with_sets(arguments, end=lambda string, members: len(string)):
    """By arguments(string, set); `end` is how far a call goes."""
    for m in (0, 1, 2, 3, 4, 7, 8, 12):
        members = "".join(chr(ord("!") + i) for i in range(m))
        texts = list(strings(*sorted({"x", *members[:1], *members[-1:]})))
        for n in (4, *LONG, VERY_LONG) if m else ():
            for first, kept in product((0, 1, n // 3), (1, 2, n // 2)):
                texts.append(members[-1] * first + "x" * kept + members[-1] * (n - first - kept))
        for string in texts:
            yield arguments(string, members), {"n": end(string, members), "m": m}


def replaces(result):
    patterns = "a", "b", "aa", "ab", "aab", "aaab", "aaaaaaab", "abababab", "a" * 15 + "b"
    texts = list(product(strings("a", "b"), patterns, (0, 1, 9)))
    for m, w in product(range(1, 18), (*range(6), *range(16, 20), 34, 35)):
        texts += [(orig, "a" * m, w) for orig in ("", "a", "a" * 67 if m == 1 else "aab")]
    for orig, rep, w in texts:
        r = len(orig.replace(rep, "y" * w))
        yield (orig, rep, "y" * w, result), {"n": len(orig), "m": len(rep), "w": w, "r": r}
    yield ("x", "", "y", result), {"n": 0, "m": 1, "w": 1, "r": 0}


def integers():
    for radix in (*range(2, 11), 16, 36, 255, 1000, 46341, INT_MAX):
        values = {INT_MAX}
        for base, power in product((2, 3, radix), range(32)):
            values |= {base ** power, radix ** power - 1}
        for value in sorted(values):
            for signed in (value, -value, -value - 1) if value <= INT_MAX else ():
                k = next(k for k in range(1, 33) if abs(signed) < radix ** k)
                yield (signed, OUT, radix), {"k": k}
    for value, radix in product((0, 7), (0, 1, -1)):
        yield (value, OUT, radix), {"k": 1 if value == 0 and radix == 1 else 0}


def numbers():
    for string in strings(" ", "\t", "9"):
        if string.lstrip(" \t").isdigit() or "9" not in string:
            for end in "", "-", "-1", "-x", "0", "x":
                yield (string + end,), {"n": len((string + end).rstrip("x"))}


def arrays():
    for n in (*range(24), *LONG, VERY_LONG):
        for _ in range(2):  # word-aligned and not
            yield ("x" * n, OUT, n), {"n": n}
    yield ("x", OUT, -1), {"n": 0}


def escapes():
    """With every capacity at which the last unit is the first that may not fit."""
    written = {"x": 1, "\n": 6, "\ua003": 9, "\uaaad": 9}  # digits and letters take different paths
    for string in strings(*written):
        size = sum(written[unit] for unit in string)
        last = written[string[-1]] if string else 1
        for capacity in (*range(size - last + 1, max(size + 2, 12)), INT_MAX):
            yield (string, OUT, capacity), {"n": len(string)}
    for unit, capacity in product("\x80\u0100\u0fff\u1000\u1005\uffff~\x7f", (11, 12, 20)):
        yield (unit, OUT, capacity), {"n": 1}


def characters():
    for c in (0, 64, 65, 90, 91, 97, 122, 123, INT_MAX, -INT_MAX - 1):
        yield (c,), {}


# What others can do as well.

PROSE = ("Set the Alarm to 7 and dim Every lamp in the Hall; if Nobody is at home: Close the "
         "blinds by 9. ") * 3
DIGITS = "1234567890"
SIZES, DIGIT_SIZES, ONE_SIZE = (4, 16, 64, 256), (1, 4, 10), (16,)


class Case(NamedTuple):
    """A call in several sizes: arguments(n, t) gives it for n units, and t are n units of prose.
    One that repeats is made until it returns null."""
    about: str
    arguments: Callable
    sizes: tuple = SIZES
    repeats: bool = False


@dataclass
class Function:
    """A function of the library, and its wide version if it has one. Where it has two upper bounds,
    `about` tells them apart. A C library's `peer` takes the arguments in an `order` of its own.
    `widths` are the bytes of a unit of the first argument and of the others, where the name does
    not say them."""
    name: str
    wide: str
    terms: list  # of the upper bound
    calls: list
    cases: list
    peer: str = ""
    order: tuple = ()
    returns: str = "nothing"  # or "number"; "sign", if a C library promises no more; or "pointer"
    nulls: tuple = (0, 1, 2, 3)  # arguments that may be null, in a call of which all lengths are 0
    about: str = ""
    widths: tuple = ()

    def __post_init__(self):
        calls = list(self.calls)
        longest = max(calls, key=lambda call: sum(call[1].values()))
        self.calls = [*calls, *self.with_nulls(calls[0]), *self.with_nulls(longest)]

    def with_nulls(self, call):
        """The same call with each choice of its pointers null. The pattern's length counts as 1."""
        arguments, lengths = call
        choices = [(one, 0) if index in self.nulls and not isinstance(one, int) else (one,)
                   for index, one in enumerate(arguments)]
        nothing = {length: int(length == "m") for length in lengths}
        return [(some, nothing) for some in list(product(*choices))[1:]]

    def names(self):
        return [name for name in (self.name, self.wide) if name]

    @property
    def title(self):
        return self.title_of(self.name)

    def title_of(self, name):
        return f"{name}, {self.about}" if self.about else name

    def widths_of(self, name):
        return self.widths or ((2, 2) if name == self.wide or name.startswith("W") else (1, 1))


N, APPEND, FIND, SET = ["1", "n"], ["1", "d", "n"], ["1", "n", "n m"], ["1", "n", "n m", "m"]
FUNCTIONS = [
    Function("StrLen", "WStrLen", N, one_string("x"), [
        Case("", lambda n, t: (t,))], "strlen", returns="number"),
    Function("CharToLower", "", ["1"], characters(), []),
    Function("CharToUpper", "", ["1"], characters(), []),
    Function("StrUpper", "WStrUpper", N, one_string("1", "A", "a", "{"), [
        Case("mixed case", lambda n, t: (t,)),
        Case("all lowercase", lambda n, t: ("a" * n,))], "strupr", returns="pointer"),
    Function("StrLower", "WStrLower", N, one_string("1", "A", "a", "{"), [
        Case("mixed case", lambda n, t: (t,))], "strlwr", returns="pointer"),

    Function("StrCopy", "WStrCopy", N, copies(lambda src, _: (OUT, src), uncounted), [
        Case("", lambda n, t: (Buffer(n + 1), t))], "strcpy"),
    Function("StrCopyBuf", "WStrCopyBuf", N,
             copies(lambda src, count: (OUT, min(count + 1, INT_MAX), src)), [
        Case("", lambda n, t: (Buffer(n + 1), n + 1, t))], "strlcpy", (0, 2, 1)),
    Function("StrNCopy", "WStrNCopy", N, copies(lambda src, count: (OUT, src, count)), [
        Case("with the terminator", lambda n, t: (Buffer(n + 4), t, n + 4)),
        Case("truncated", lambda n, t: (Buffer(n), t + "more", n))], "strncpy"),

    Function("StrCat", "WStrCat", APPEND, appends(lambda dst, src, *_: (dst, src), uncounted), [
        Case("", lambda n, t: (Buffer(n + 1, t[:n // 2]), t[n // 2:]))], "strcat"),
    Function("StrCatBuf", "WStrCatBuf", APPEND, appends(lambda dst, src, _, n: (dst, n, src)), [
        Case("", lambda n, t: (Buffer(n + 1, t[:n // 2]), n + 1, t[n // 2:]))],
        "strlcat", (0, 2, 1)),
    Function("WStrNCat", "", APPEND, appends(lambda dst, src, num, _: (dst, src, num)), [
        Case("", lambda n, t: (Buffer(n + 1, t[:n // 2]), t[n // 2:], n))]),
    Function("WStrNCatBuf", "", APPEND, [
        *appends(lambda dst, src, _, n: (dst, n, src, INT_MAX)),
        *appends(lambda dst, src, num, _: (dst, INT_MAX, src, num))], [
        Case("", lambda n, t: (Buffer(n + 1, t[:n // 2]), n + 1, t[n // 2:], n))]),

    Function("StrChr", "WStrChr", N, find_unit(), [
        Case("not found", lambda n, t: (t, ord("~")))], "strchr", returns="pointer"),
    Function("StrStr", "WStrStr", FIND, find_string(), [
        Case("found late", lambda n, t: (t[:-4] + "dawn", "dawn")),
        Case("first unit repeated", lambda n, t: ("a" * n, "ab"))], "strstr", returns="pointer"),
    Function("StrIStr", "WStrIStr", FIND, find_string(str.lower), [
        Case("found late", lambda n, t: (t[:-4] + "dawn", "DaWn")),
        Case("first unit repeated", lambda n, t: ("a" * n, "Ab"))],
        "strcasestr", returns="pointer"),

    Function("StrNCmp", "WStrNCmp", N, compares(has_count=True), [
        Case("to the end", lambda n, t: (t, t, n + 4)),
        Case("to the count", lambda n, t: (t, t, n))], "strncmp", returns="sign"),
    Function("StrNICmp", "WStrNICmp", N, compares(ignores_case=True, has_count=True), [
        Case("other case", lambda n, t: (t, t.swapcase(), n + 4))], "strncasecmp", returns="sign"),
    Function("StrCmp", "WStrCmp", N, compares(), [
        Case("equal", lambda n, t: (t, t)),
        Case("first unit differs", lambda n, t: (t, "~" + t), ONE_SIZE),
        Case("last unit differs", lambda n, t: (t, t[:-1] + "~"))], "strcmp", returns="sign"),
    Function("StrICmp", "WStrICmp", N, compares(ignores_case=True), [
        Case("same case", lambda n, t: (t, t)),
        Case("other case", lambda n, t: (t, t.swapcase()))], "strcasecmp", returns="sign"),

    Function("StrToken", "WStrToken", SET,
             with_sets(lambda s, dlmt: (s, bytes(4), dlmt), token_end), [
        Case("all tokens", lambda n, t: (t, bytes(4), " "), repeats=True)],
        "strtok_r", (0, 2, 1), returns="pointer"),
    Function("StrSplit", "WStrSplit", SET,
             with_sets(lambda s, dlmt: (s, dlmt, bytes(4 * len(s)))), [
        Case("", lambda n, t: (t, " ", bytes(2 * n)))], "peer_split", returns="number"),
    Function("StrTrim", "WStrTrim", SET, [
        *with_sets(lambda s, members: (s, members)),
        *(((s, 0), {"n": len(s), "m": 0}) for s in strings("x"))], [
        Case("a quarter at each end", lambda n, t: (f"{'x' * (n // 2):^{n}}", " \t"))],
        "peer_trim", returns="number", nulls=(0,)),

    Function("StrReplace", "WStrReplace", ["1", "n", "n m", "r"], replaces(OUT), [
        Case("one unit by two", lambda n, t: (t, " ", "__", Buffer(n + t.count(" ") + 1)))],
        "peer_replace", returns="number", nulls=(0, 1, 2)),
    Function("StrReplace", "WStrReplace", ["1", "n", "n m", "m", "w"], [
        *replaces(0), *replaces(SAME)], [], about="null result", nulls=(0, 1, 2)),

    Function("IntToStr", "IntToWStr", ["1", "k"], integers(), [
        Case("radix 10", lambda n, t: (int(DIGITS[:n]), Buffer(n + 1), 10), DIGIT_SIZES)],
        "itoa", returns="pointer"),
    Function("StrToInt", "WStrToInt", N, numbers(), [
        Case("", lambda n, t: (DIGITS[:n],), DIGIT_SIZES)], "atoi", returns="number"),

    Function("BytesToWords", "", N, arrays(), [
        Case("", lambda n, t: (t, Buffer(n), n))], widths=(1, 2)),
    Function("StrToWStr", "", N, copies(lambda src, count: (src, OUT, min(count + 1, INT_MAX))), [
        Case("", lambda n, t: (t, Buffer(n + 1), n + 1))], returns="pointer", widths=(1, 2)),
    Function("WStrToStr", "", N, escapes(), [
        Case("printable", lambda n, t: ("x" * n, Buffer(n + 1), n + 1)),
        Case("escaped", lambda n, t: ("\u4e2d" * n, Buffer(9 * n + 1), 9 * n + 1))],
        returns="pointer", widths=(2, 1)),
    Function("WStrToWords", "", N, arrays(), [
        Case("", lambda n, t: (t, Buffer(n), n))]),
]
