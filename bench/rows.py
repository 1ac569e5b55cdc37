"""Calls that others can make as well, and what must come of them by Python's own means."""
from search import OUT, Raw, text

PROSE = ("Set the Alarm to 7 and dim Every lamp in the Hall; if Nobody is at home: Close the blinds "
         "by 9. ") * 3
END = "\0"


def at(index):
    """As a result: a pointer to this unit of the first argument that is a text, -1 for null."""
    return "at", index


def row(name, about, call, peer=None, order=None, sizes=(4, 16, 64, 256)):
    """call(n) gives the arguments, the result or None, and the index and units of what is written.
    `order` says which of the arguments, or which numbers, a C library takes."""
    return name, about, call, peer, order, sizes


def compared(n, other, *count, differs=None):
    one, two = PROSE[:n], other(PROSE[:n])
    if differs is not None:
        two = two[:differs] + "~" + two[differs + 1:]
    return (text(one), text(two), *count), 0 if differs is None else -differs - 1, None


def copied(n, *arguments):
    return arguments, None, (0, PROSE[:n] + END)


def appended(n, *bounds, first=False):
    dst, src = text(PROSE[:n // 2]), text(PROSE[n // 2:n])
    return (dst, *bounds[:first], src, *bounds[first:]), None, (0, PROSE[:n] + END)


def mapped(n, before, after):
    return (text(before(PROSE[:n])),), at(0), (0, after(PROSE[:n]) + END)


def line(n):
    return PROSE[:n].replace(" ", ",")


def trimmed(n):
    blanks, kept = " " * (n // 4), PROSE[:n - n // 4 * 2].replace(" ", "_")
    return (text(blanks + kept + blanks), text(" \t")), len(kept), (0, kept + END)


def replaced(n):
    after = PROSE[:n].replace(" ", "__")
    return (text(PROSE[:n]), text(" "), text("__"), OUT), len(after), (3, after + END)


def escaped(n, unit, shown):
    return (text(unit * n), OUT, len(shown) * n + 1), at(None), (1, shown * n + END)


ROWS = [
    row("StrLen", "", lambda n: ((text(PROSE[:n]),), n, None), "strlen"),
    row("StrUpper", "mixed text", lambda n: mapped(n, str, str.upper), "strupr"),
    row("StrUpper", "all to change", lambda n: (
        (text(("abc" * n)[:n]),), at(0), (0, ("ABC" * n)[:n] + END)), "strupr"),
    row("StrLower", "mixed text", lambda n: mapped(n, str, str.lower), "strlwr"),
    row("StrCopy", "", lambda n: copied(n, OUT, text(PROSE[:n])), "strcpy"),
    row("StrCopyBuf", "", lambda n: copied(n, OUT, n + 1, text(PROSE[:n])), "strlcpy", (0, 2, 1)),
    row("StrNCopy", "ended by the text", lambda n: copied(n, OUT, text(PROSE[:n]), n + 4), "strncpy"),
    row("StrNCopy", "ended by its count", lambda n: (
        (OUT, text(PROSE[:n + 4]), n), None, (0, PROSE[:n])), "strncpy"),
    row("StrCat", "", lambda n: appended(n), "strcat"),
    row("StrCatBuf", "", lambda n: appended(n, n + 1, first=True), "strlcat", (0, 2, 1)),
    row("WStrNCat", "", lambda n: appended(n, n)),
    row("WStrNCatBuf", "", lambda n: appended(n, n + 1, n, first=True)),
    row("StrChr", "not found", lambda n: ((text(PROSE[:n]), ord("~")), at(-1), None), "strchr"),
    row("StrStr", "found late", lambda n: (
        (text(PROSE[:n - 4] + "dawn"), text("dawn")), at(n - 4), None), "strstr"),
    row("StrStr", "first unit repeated", lambda n: ((text("a" * n), text("ab")), at(-1), None),
        "strstr"),
    row("StrIStr", "found late", lambda n: (
        (text(PROSE[:n - 4] + "dawn"), text("DaWn")), at(n - 4), None), "strcasestr"),
    row("StrIStr", "first unit repeated", lambda n: ((text("a" * n), text("Ab")), at(-1), None),
        "strcasestr"),
    row("StrNCmp", "ended by the text", lambda n: compared(n, str, n + 4), "strncmp"),
    row("StrNCmp", "ended by its count", lambda n: compared(n, str, n), "strncmp"),
    row("StrNICmp", "other case", lambda n: compared(n, str.swapcase, n + 4), "strncasecmp"),
    row("StrCmp", "equal", lambda n: compared(n, str), "strcmp"),
    row("StrCmp", "first unit differs", lambda n: compared(n, str, differs=0), "strcmp", None, (16,)),
    row("StrCmp", "last unit differs", lambda n: compared(n, str, differs=n - 1), "strcmp"),
    row("StrICmp", "same text", lambda n: compared(n, str), "strcasecmp"),
    row("StrICmp", "other case", lambda n: compared(n, str.swapcase), "strcasecmp"),
    # Called until it gives null; a C library takes the text at the first call only.
    row("StrToken", "to the end", lambda n: (
        (text(line(n)), Raw([0]), text(",")), "walk", (0, line(n).replace(",", END))), "strtok_r",
        (0, 2, 1)),
    row("StrSplit", "", lambda n: (
        (text(line(n)), text(","), OUT), len([word for word in line(n).split(",") if word]),
        (0, line(n).replace(",", END))), "peer_split"),
    row("StrTrim", "a quarter at each end", trimmed, "peer_trim"),
    row("StrReplace", "one unit by two", replaced, "peer_replace"),
    row("IntToStr", "radix 10", lambda n: (
        (int("1234567890"[:n]), OUT, 10), at(None), (1, "1234567890"[:n] + END)), "itoa", None,
        (1, 4, 10)),
    row("StrToInt", "", lambda n: ((text("1234567890"[:n]),), int("1234567890"[:n]), None), "atoi",
        None, (1, 4, 10)),
    row("BytesToWords", "", lambda n: ((text(PROSE[:n]), OUT, n), None, (1, PROSE[:n]))),
    row("StrToWStr", "", lambda n: ((text(PROSE[:n]), OUT, n + 1), at(None), (1, PROSE[:n] + END))),
    row("WStrToStr", "printable", lambda n: escaped(n, "x", "x")),
    row("WStrToStr", "escaped", lambda n: escaped(n, "\u4e2d", "&(0x4e2d)")),
    row("WStrToWords", "", lambda n: ((text(PROSE[:n]), OUT, n), None, (1, PROSE[:n]))),
]


def wide(name):
    return {"IntToStr": "IntToWStr"}.get(name, "W" + name)


ROWS += [row(wide(name), about, call, None, None, sizes)
         for name, about, call, peer, _, sizes in ROWS if peer]
