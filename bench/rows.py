"""Calls that others can make as well, and what must come of them by Python's own means."""
from typing import Callable, NamedTuple

from search import INT, OUT

TEXT_SIZES = 4, 16, 64, 256
DIGIT_SIZES = 1, 4, 10
ONE_SIZE = (16,)
# Those of which the page shows the ratios.
SHOWN_SIZES = {TEXT_SIZES: (16, 256), DIGIT_SIZES: (4, 10), ONE_SIZE: (16, 256)}

PROSE = ("Set the Alarm to 7 and dim Every lamp in the Hall; if Nobody is at home: Close the blinds "
         "by 9. ") * 3
DIGITS = "1234567890"
END = "\0"
NULL = None, 0


class Row(NamedTuple):
    """make(n, t), t being prose of n units, gives the arguments; the result, which is a number, the index
    of an argument and of the unit of it that a pointer points to, or None; and the index and the units of
    what is written, or None. `order` says which of the arguments a C library takes."""
    name: str
    about: str
    make: Callable
    peer: str = ""
    order: tuple = ()
    sizes: tuple = TEXT_SIZES


ROWS = [
    Row("StrLen", "", lambda n, t: ((t,), n, None), "strlen"),
    Row("StrUpper", "mixed text", lambda n, t: ((t,), (0, 0), (0, t.upper() + END)), "strupr"),
    Row("StrUpper", "all to change", lambda n, t: (("a" * n,), (0, 0), (0, "A" * n + END)), "strupr"),
    Row("StrLower", "mixed text", lambda n, t: ((t,), (0, 0), (0, t.lower() + END)), "strlwr"),
    Row("StrCopy", "", lambda n, t: ((OUT, t), None, (0, t + END)), "strcpy"),
    Row("StrCopyBuf", "", lambda n, t: ((OUT, n + 1, t), None, (0, t + END)), "strlcpy", (0, 2, 1)),
    Row("StrNCopy", "ended by the text", lambda n, t: ((OUT, t, n + 4), None, (0, t + END)), "strncpy"),
    Row("StrNCopy", "ended by its count", lambda n, t: ((OUT, t + "more", n), None, (0, t)), "strncpy"),
    Row("StrCat", "", lambda n, t: ((t[:n // 2], t[n // 2:]), None, (0, t + END)), "strcat"),
    Row("StrCatBuf", "", lambda n, t: ((t[:n // 2], n + 1, t[n // 2:]), None, (0, t + END)), "strlcat",
        (0, 2, 1)),
    Row("WStrNCat", "", lambda n, t: ((t[:n // 2], t[n // 2:], n), None, (0, t + END))),
    Row("WStrNCatBuf", "", lambda n, t: ((t[:n // 2], n + 1, t[n // 2:], n), None, (0, t + END))),
    Row("StrChr", "not found", lambda n, t: ((t, ord("~")), NULL, None), "strchr"),
    Row("StrStr", "found late", lambda n, t: ((t[:-4] + "dawn", "dawn"), (0, n - 4), None), "strstr"),
    Row("StrStr", "first unit repeated", lambda n, t: (("a" * n, "ab"), NULL, None), "strstr"),
    Row("StrIStr", "found late", lambda n, t: ((t[:-4] + "dawn", "DaWn"), (0, n - 4), None), "strcasestr"),
    Row("StrIStr", "first unit repeated", lambda n, t: (("a" * n, "Ab"), NULL, None), "strcasestr"),
    Row("StrNCmp", "ended by the text", lambda n, t: ((t, t, n + 4), 0, None), "strncmp"),
    Row("StrNCmp", "ended by its count", lambda n, t: ((t, t, n), 0, None), "strncmp"),
    Row("StrNICmp", "other case", lambda n, t: ((t, t.swapcase(), n + 4), 0, None), "strncasecmp"),
    Row("StrCmp", "equal", lambda n, t: ((t, t), 0, None), "strcmp"),
    Row("StrCmp", "first unit differs", lambda n, t: ((t, "~" + t), -1, None), "strcmp", (), ONE_SIZE),
    Row("StrCmp", "last unit differs", lambda n, t: ((t, t[:-1] + "~"), -n, None), "strcmp"),
    Row("StrICmp", "same text", lambda n, t: ((t, t), 0, None), "strcasecmp"),
    Row("StrICmp", "other case", lambda n, t: ((t, t.swapcase()), 0, None), "strcasecmp"),
    Row("StrToken", "to the end", lambda n, t: ((t, INT, " "), "walk", (0, t.replace(" ", END))), "strtok_r",
        (0, 2, 1)),
    Row("StrSplit", "", lambda n, t: ((t, " ", INT), len(t.split()), (0, t.replace(" ", END))), "peer_split"),
    Row("StrTrim", "a quarter at each end", lambda n, t: (
        (f"{'x' * (n // 2):^{n}}", " \t"), n // 2, (0, "x" * (n // 2) + END)), "peer_trim"),
    Row("StrReplace", "one unit by two", lambda n, t: (
        (t, " ", "__", OUT), n + t.count(" "), (3, t.replace(" ", "__") + END)), "peer_replace"),
    Row("IntToStr", "radix 10", lambda n, t: (
        (int(DIGITS[:n]), OUT, 10), (1, 0), (1, DIGITS[:n] + END)), "itoa", (), DIGIT_SIZES),
    Row("StrToInt", "", lambda n, t: ((DIGITS[:n],), int(DIGITS[:n]), None), "atoi", (), DIGIT_SIZES),
    Row("BytesToWords", "", lambda n, t: ((t, OUT, n), None, (1, t))),
    Row("StrToWStr", "", lambda n, t: ((t, OUT, n + 1), (1, 0), (1, t + END))),
    Row("WStrToStr", "printable", lambda n, t: (("x" * n, OUT, n + 1), (1, 0), (1, "x" * n + END))),
    Row("WStrToStr", "escaped", lambda n, t: (
        ("\u4e2d" * n, OUT, 9 * n + 1), (1, 0), (1, "&(0x4e2d)" * n + END))),
    Row("WStrToWords", "", lambda n, t: ((t, OUT, n), None, (1, t))),
]
ROWS += [row._replace(name={"IntToStr": "IntToWStr"}.get(row.name, "W" + row.name), peer="")
         for row in ROWS if row.peer]
