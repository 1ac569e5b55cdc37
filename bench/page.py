"""Writes the performance page, its chart and README.md's figures."""
import math
import re
from string import Template

import costs
from calls import DIGIT_SIZES, FUNCTIONS, SIZES

TITLES = {**costs.BUILDS, "gcc-O3": "GCC -O3", "gcc-O0": "GCC -O0", "clang-O0": "Clang -O0",
          "newlib": "newlib", "picolibc-small": "picolibc, small", "picolibc": "picolibc, fast",
          "loop": "naive loop"}
BUILDS = "gcc-O2", "clang-O2", "gcc-Os"  # that the tables of cycles have
LOOPS = "loops-Os", "loops-O2", "loops-O3"
MARKED = re.compile(r"(<!-- figures: .* -->\n).*?(<!-- end of figures -->)", re.S)


def table(heads, lines):
    rule = ["---"] + ["--:"] * (len(heads) - 1)
    return "".join(f"| {' | '.join(map(str, line))} |\n" for line in [heads, rule, *lines])


def with_figures(file, figures):
    """The text of a file with other figures between the two lines that mark them."""
    text, count = MARKED.subn(lambda found: found[1] + figures + found[2], file.read_text())
    if count != 1:
        raise SystemExit(f"{file} must have the lines <!-- figures: ... --> and "
                         f"<!-- end of figures --> once; they are there {count} times")
    return text


def names(function):
    """As a table has them."""
    found = " ".join(f"`{name}`" for name in function.names())
    return function.title_of(found)


def cases(sizes):
    """The calls that are compared: those of numbers if the sizes are digits, or all others."""
    return [(f"`{function.name}`" + (f", {case.about}" if case.about else ""), function, case)
            for function in FUNCTIONS for case in function.cases
            if (case.sizes == DIGIT_SIZES) == (sizes == DIGIT_SIZES)]


def build_table(measured):
    lines = []
    for name, build in measured.builds.items():
        ratios = [f"{ratio.mean:.2f} ({ratio.slower} of {ratio.cases} slower)" for ratio in (
            measured.beside_libraries(name), measured.beside_exact_libraries(name),
            measured.beside_loops(name))]
        lines.append([TITLES[name], f"{build.alone:.0f}", f"{build.bytes:,}", build.stack, *ratios])
    return table(["Build", "one function", "all", "stack", "cycles beside C libraries",
                  "without over-reads", "beside naive loops"], lines)


def readme_table(measured, promised):
    """The stack is the promised one, which holds for other versions of the compilers as well."""
    levels = {"gcc-O2": "GCC `-O2`, also `-Og`, `-O1`", "clang-O2": "Clang `-O2`",
              "gcc-Os": "GCC `-Os`", "clang-Os": "Clang `-Os`", "gcc-O0": "GCC `-O0`"}
    lines = []
    for name, level in levels.items():
        build = measured.builds[name]
        ratios = (measured.beside_exact_libraries(name), measured.beside_libraries(name),
                  measured.beside_loops(name))
        lines.append([level, f"{build.alone:.0f} bytes", f"{build.bytes:,} bytes", 0,
                      f"{promised[name]} bytes", *(f"{ratio.mean:.2f}" for ratio in ratios)])
    return table(["Build", "one function", "all", "static RAM", "stack",
                  "cycles: C libraries without over-reads", "all C libraries", "naive loops"], lines)


def cycle_table(measured, sizes):
    """Ours, of word-aligned strings."""
    columns = [(build, n) for build in BUILDS for n in sizes]
    heads = [f"{TITLES[build]}: {n}" if n == sizes[0] else n for build, n in columns]
    return table(["Function", *heads], [
        [label, *(measured.cycles.get((build, function.name, case.about, n, False), "")
                  for build, n in columns)]
        for label, function, case in cases(sizes)])


def size_table(stated):
    lines = []
    for function in FUNCTIONS:
        found = [stated[build, function.title] for build in costs.BUILDS]
        lines.append([names(function), *(f"{cost.bytes}, {cost.stack}" for cost in found)])
    heads = [f"{title}: bytes, stack" for title in costs.BUILDS.values()]
    return table(["Function", *heads], lines)


def bound_tables(stated):
    return "\n".join(
        table(["Function", f"{title}: cycles, at most"],
              [[names(one), stated[build, one.title].formula()] for one in FUNCTIONS])
        for build, title in costs.BUILDS.items())


def images_of(other):
    return LOOPS if other == "loop" else (other,)


def comparison_table(measured, sizes, shown):
    """GCC -O2 beside the others, in the sizes that are shown."""
    titles = {"gcc-O2": "strutil", **{one: TITLES[one] for one in (*measured.libraries, "loop")}}
    columns = [(other, n) for n in shown for other in titles]
    return table(["Function", *(f"{titles[other]}, {n}" for other, n in columns)], [
        [label, *(comparison_cell(measured, other, function, case, n) for other, n in columns)]
        for label, function, case in cases(sizes)])


def comparison_cell(measured, other, function, case, n):
    """Word-aligned and, if that differs, not."""
    if n not in case.sizes:
        return ""
    cycles = [measured.fastest(images_of(other), function.name, case.about, n, misaligned)
              for misaligned in (False, True)]
    if cycles[0] is None:
        return "no equivalent"
    mark = "†" if (other, function.name) in measured.over_reads else ""
    return " / ".join(f"{one}{mark}" for one in dict.fromkeys(cycles))


def wide_extra(measured):
    """By how many percent a wide function is slower than its narrow one, at most."""
    ratios = [measured.cycles[build, function.wide, case.about, n, False]
              / measured.cycles[build, function.name, case.about, n, False]
              for build in BUILDS for function in FUNCTIONS if function.wide
              for case in function.cases for n in case.sizes]
    return math.ceil(100 * max(ratios) - 100)


def make(source, stated, measured, versions, promised):
    """The files that this writes: their new contents, by name."""
    example = stated["gcc-O2", "StrCmp"]
    page = Template((source / "bench/page.md").read_text()).substitute(
        versions=", ".join(versions),
        example=f"{example.formula().replace(' n', ' x 16')} = {example.of({'n': 16}):g}",
        example_cycles=measured.cycles["gcc-O2", "StrCmp", "equal", 16, False],
        wide_extra=wide_extra(measured),
        build_table=build_table(measured),
        cycle_table=cycle_table(measured, SIZES),
        digit_table=cycle_table(measured, DIGIT_SIZES),
        size_table=size_table(stated),
        bound_tables=bound_tables(stated),
        comparison_table=comparison_table(measured, SIZES, (16, 256)),
        digit_comparison=comparison_table(measured, DIGIT_SIZES, (4, 10)))
    readme = with_figures(source / "README.md", readme_table(measured, promised))
    return {"docs/performance.md": page, "docs/performance.svg": chart(measured),
            "README.md": readme}


# The chart is written directly, for light and for dark pages.
SHOWN = [("StrLen", ""), ("StrCopy", ""), ("StrCopyBuf", ""), ("StrCat", ""),
         ("StrChr", "not found"), ("StrCmp", "equal"), ("StrICmp", "same case"),
         ("StrUpper", "mixed case"), ("StrStr", "found late"), ("StrToken", "all tokens"),
         ("StrReplace", "one unit by two")]
SERIES = [("gcc-O2", "strutil", "#2f81c1"), ("newlib", "newlib", "#d9822b"),
          ("picolibc", "picolibc, built for speed", "#5a9e6f"), ("loop", "naive loop", "#999999")]
UNITS = 256
LEFT, SCALE, BAR, GAP = 200, 6.5, 9, 7  # pixels: where bars begin, a cycle, a bar, between groups


def chart(measured):
    lines, y = [], 62
    for name, about in SHOWN:
        shown = f"{name}, {about}" if about else name
        lines.append(f'<text x="{LEFT - 8}" y="{y + 2 * BAR + 2}" text-anchor="end">{shown}</text>')
        for image, _, color in SERIES:
            cycles = measured.fastest(images_of(image), name, about, UNITS, False)
            if cycles is not None:
                is_hollow = (image, name) in measured.over_reads
                fill = f'fill="none" stroke="{color}"' if is_hollow else f'fill="{color}"'
                lines += bar(y, cycles / UNITS, fill)
            y += BAR
        y += GAP
    x = LEFT
    for _, name, color in SERIES:
        lines.append(f'<rect x="{x}" y="28" width="10" height="10" fill="{color}"/>'
                     f'<text x="{x + 14}" y="37">{name}</text>')
        x += 30 + 6 * len(name)
    size = f'width="640" height="{y}" viewBox="0 0 640 {y}"'
    title = f"Cycles per unit, strings of {UNITS} units (lower is better)"
    return f"""<svg xmlns="http://www.w3.org/2000/svg" {size}
 font-family="sans-serif" font-size="12">
<style>text {{ fill: #1f2328 }} .page {{ fill: #fff }}
@media (prefers-color-scheme: dark) {{ text {{ fill: #e6edf3 }} .page {{ fill: #0d1117 }} }}</style>
<rect width="640" height="{y}" class="page"/>
<text x="320" y="16" text-anchor="middle" font-size="14">{title}</text>
<text x="{LEFT}" y="54" font-size="11">hollow bar: reads past the end of the string</text>
""" + "\n".join(lines) + "\n</svg>\n"


def bar(y, cycles, fill):
    """A bar and its number."""
    length = cycles * SCALE
    place = f'x="{LEFT + length + 4:.1f}" y="{y + BAR - 1}"'
    return [f'<rect x="{LEFT}" y="{y}" width="{length:.1f}" height="{BAR - 1}" {fill}/>',
            f'<text {place} font-size="10">{cycles:.1f}</text>']
