"""The chart of the page and of README.md: written directly, readable on a light and on a dark page."""
SHOWN = [("StrLen", ""), ("StrCopy", ""), ("StrCopyBuf", ""), ("StrCat", ""), ("StrChr", "not found"),
         ("StrCmp", "equal"), ("StrICmp", "same text"), ("StrUpper", "mixed text"),
         ("StrStr", "found late"), ("StrIStr", "found late"), ("StrToken", "to the end"),
         ("StrReplace", "one unit by two")]
SERIES = [("", "strutil", "#2f81c1"), ("newlib", "newlib", "#d9822b"),
          ("picolibc", "picolibc, built for speed", "#5a9e6f"), ("loop", "the obvious loop", "#999999")]
UNITS = 256
MOST = 50  # cycles a unit; what is more is cut, and marked
LEFT, SCALE, BAR, GAP = 200, 7.5, 9, 7  # pixels: of the bars' beginning, a cycle, a bar and between groups


def bar(y, cycles, fill):
    """A bar with its number, cut by a slanted gap if it is too long."""
    length = min(cycles, MOST) * SCALE
    lines = [f'<rect x="{LEFT}" y="{y}" width="{length:.1f}" height="{BAR - 1}" {fill}/>']
    if cycles > MOST:
        x = LEFT + length - 24
        lines.append(f'<path d="M{x} {y + BAR} l5 -{BAR + 1} h5 l-5 {BAR + 1} z" class="page"/>')
    lines.append(f'<text x="{LEFT + length + 4:.1f}" y="{y + BAR - 1}" font-size="10">{cycles:.1f}</text>')
    return lines


def chart(counted, ours):
    lines, y = [], 62
    for name, about in SHOWN:
        label = f"{name}, {about}" if about else name
        lines.append(f'<text x="{LEFT - 8}" y="{y + 2 * BAR + 2}" text-anchor="end">{label}</text>')
        for who, _, color in SERIES:
            cycles = counted.cells[who or ours, (name, about), UNITS, False] / UNITS
            is_hollow = (who, name) in counted.past
            lines += bar(y, cycles, f'fill="none" stroke="{color}"' if is_hollow else f'fill="{color}"')
            y += BAR
        y += GAP
    x = LEFT
    for _, name, color in SERIES:
        lines.append(f'<rect x="{x}" y="28" width="10" height="10" fill="{color}"/>'
                     f'<text x="{x + 14}" y="37">{name}</text>')
        x += 30 + 6 * len(name)
    size = f'width="640" height="{y}" viewBox="0 0 640 {y}"'
    return f"""<svg xmlns="http://www.w3.org/2000/svg" {size} font-family="sans-serif" font-size="12">
<style>text {{ fill: #1f2328 }} .page {{ fill: #fff }}
@media (prefers-color-scheme: dark) {{ text {{ fill: #e6edf3 }} .page {{ fill: #0d1117 }} }}</style>
<rect width="640" height="{y}" class="page"/>
<text x="320" y="16" text-anchor="middle" font-size="14">Cycles a unit at {UNITS} units: less is better</text>
<text x="{LEFT}" y="54" font-size="11">hollow: reads past the end of the text</text>
""" + "\n".join(lines) + "\n</svg>\n"
