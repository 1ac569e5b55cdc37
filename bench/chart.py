"""The chart of the page and of README.md: written directly, readable on a light and on a dark page."""
SHOWN = [("StrLen", ""), ("StrCopy", ""), ("StrCopyBuf", ""), ("StrCat", ""), ("StrChr", "not found"),
         ("StrCmp", "equal"), ("StrICmp", "same text"), ("StrUpper", "mixed text"),
         ("StrStr", "found late"), ("StrIStr", "found late"), ("StrToken", "to the end"),
         ("StrReplace", "one unit by two")]
SERIES = [("", "strutil", "#1b6ca8"), ("newlib", "newlib", "#d9822b"),
          ("picolibc", "picolibc, built for speed", "#5a9e6f"), ("loop", "the obvious loop", "#999999")]
MOST, UNIT = 60, 7.5  # cycles a unit, of which what is more is cut, and told; pixels of one


def chart(cells, past, ours):
    lines, y = [], 76
    for name, about in SHOWN:
        lines.append(f'<text x="132" y="{y + 25}" text-anchor="end">{name}</text>')
        for who, _, color in SERIES:
            each = cells[who or ours, (name, about), 256, False] / 256
            fill = f'fill="#fff" stroke="{color}"' if (who, name) in past else f'fill="{color}"'
            lines.append(f'<rect x="140" y="{y}" width="{min(each, MOST) * UNIT:.1f}" height="9" {fill}/>')
            end = 144 + min(each, MOST) * UNIT
            lines.append(f'<text x="{end:.1f}" y="{y + 9}" font-size="11">{each:.1f}</text>')
            y += 11
        y += 10
    x = 140
    for _, name, color in SERIES:
        lines.append(f'<rect x="{x}" y="42" width="12" height="12" fill="{color}"/>'
                     f'<text x="{x + 17}" y="53">{name}</text>')
        x += 36 + 7 * len(name)
    return f"""<svg xmlns="http://www.w3.org/2000/svg" viewBox="0 0 660 {y + 6}" font-family="sans-serif"
 font-size="14" fill="#222"><rect width="660" height="{y + 6}" fill="#fff"/>
<text x="330" y="24" text-anchor="middle" font-size="16">Cycles a unit at 256 units: less is better</text>
<text x="140" y="70" font-size="12">hollow: reads past the end of the text</text>
""" + "\n".join(lines) + "\n</svg>\n"
