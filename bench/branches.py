"""Which ways conditional branches never go in the search, and why not."""
from collections import Counter

# By function: how many ways, and the reason. A number that is too high fails as well.
NOT_EMPTY = 1, "asks whether a set is empty, of which a unit was just found"
DIFFERS = 1, "asks for the end of the pattern, of which a unit just differed"
IN_SET = 1, "asks whether a unit is the terminator that was just found in the set"
HAS_ROOM = 1, "asks whether a unit may be appended, where the capacity has room for one"
DIVISION = {
    "__aeabi_idiv": (10, "the only negative dividend is the most negative int; no divisor is negative, and 1 "
                         "divides 0 alone"),
    "__aeabi_idivmod": (1, "no divisor is 0"),
}
NEVER = {
    "gcc-O2": {"WStrToken": NOT_EMPTY, "StrSplit": NOT_EMPTY, "WStrSplit": NOT_EMPTY,
               "StrReplace": DIFFERS, "WStrReplace": DIFFERS, **DIVISION},
    "clang-O2": DIVISION,
    "gcc-Os": {"StrCatBuf": HAS_ROOM, "WStrCatBuf": HAS_ROOM, "StrToken": IN_SET, "WStrToken": IN_SET,
               **DIVISION},
}


def untaken(core, names):
    """The ways that were not taken, as pairs of a function and the number and way of its branch; and the
    number of all ways."""
    found, ways, seen = [], 0, set()
    for symbol, address in sorted(core.functions.items(), key=lambda one: one[1]):
        if address in seen:  # two names for one
            continue
        seen.add(address)
        for number, behind in enumerate(core.branches(symbol)):
            for taken in (False, True):
                ways += 1
                if (behind, taken) not in core.directions:
                    found.append((names.get(symbol, symbol), f"branch {number + 1} {'' if taken else 'not '}taken"))
    return found, ways


def check(who, title, core, names):
    """Fails where a way is not taken that is not listed, or listed but taken; gives the numbers of ways that
    are taken and of all."""
    found, ways = untaken(core, names)
    listed = NEVER[who]
    counts = Counter(name for name, _ in found)
    for name in {*counts, *listed}:
        expected = listed.get(name, (0, ""))[0]
        if counts[name] != expected:
            which = ", ".join(way for one, way in found if one == name)
            raise SystemExit(f"{title}: {name}: {counts[name]} ways of branches are not taken, "
                             f"bench/branches.py has {expected}: {which}")
    return ways - len(found), ways
