#!/usr/bin/python3 -B
"""api.py SOURCE: prints the names of the library's functions, as SubName.h has them."""
import re
import sys
from pathlib import Path


def functions(source):
    """The link symbols of the functions, by name."""
    header = Path(source, "include/SubName.h").read_text()
    found = re.findall(r"^#define (\w+) (VELKO_\d+)$", header, re.M)
    if not found:
        sys.exit("include/SubName.h: no function is found")
    return dict(found)


if __name__ == "__main__":
    print("\n".join(functions(sys.argv[1])))
