#!/usr/bin/python3
"""Measures the work that has a goal, and prints it as one table: figure, goal, and whether it is met.

  bench/report.py                 every group
  bench/report.py core dll64      these groups: core, files, dll32, dll64, lines
  bench/report.py --picture FILE  also draws the growth of time with size, from the group lines (needs matplotlib)

Everything must be built; ./benchmark sees to that. A goal that is missed is a figure, not an error. The table is also
written to build/benchmark.md, for docs/performance.md.
"""
import argparse
import json
import math
import os
import pathlib
import re
import subprocess
import sys
from collections import defaultdict, namedtuple

TOP = pathlib.Path(__file__).resolve().parent.parent
BUILD = pathlib.Path(os.environ.get("TALUTIL_BUILD", TOP / "build"))
TALUTIL = BUILD / "bench/talutil"
STEEPEST = 1.05  # The exponent of time against size above which a line is not straight.

# `figure` names a measurement, or two with " / " between them, whose ratio counts.
Goal = namedtuple("Goal", "work against unit most group figure")


def core(work, against, most, figure, unit="ratio"):
    return Goal(work, against, unit, most, "core", figure)


def files(work, against, most, figure, unit="ratio"):
    return Goal(work, against, unit, most, "files", figure)


def both_widths(work, against, most, figure, unit="ratio"):
    return [Goal(f"{work}, {bits} bit", against, unit, most, f"dll{bits}", figure) for bits in (32, 64)]


GOALS = [
    *both_widths("load, create an object, release, unload", "`FileSystemObject`", 1.2,
                 "load, create, release, first in a process"),
    *both_widths("late-bound `StripNulls`", "`GetExtensionName`", 0.25, "late-bound text call"),
    *both_widths("early-bound property get", "", 5, "early-bound property get of a 32-bit integer", "ns"),
    *both_widths("early-bound `StripNulls` of 5 characters", "", 80, "early-bound StripNulls of 5 characters", "ns"),
    *both_widths("`TALUtil.dll`, stripped", "", 1.3, "size", "MB"),
    core("`SelectGridRows` on 10,000 rows, natively", "a bare loop", 1.1,
         "grids_bench/SelectGridRows / grids_bench/SelectRowsBare"),
    *both_widths("`SelectGridRows` on 10,000 rows", "a bare loop", 1.1, "SelectGridRows on 10,000 rows"),
    core("export of 10,000 x 20 cells, natively", "bare reads and writing", 1.3,
         "grids_bench/ExportGridData / grids_bench/ExportBare"),
    *both_widths("export of 10,000 x 20 cells", "bare reads and writing", 1.3, "export of 10,000 x 20 cells"),
    core("memory of a cell", "", 40, "grids_bench/MemoryOfGrid:bytes_a_cell", "bytes"),
    core("`LoadTextBox` of 60 MB", "its bytes", 1.3, "files_bench/load_text_box / files_bench/bytes_alone"),
    core("lines of a 60 MB file", "`std::getline`", 1.0, "files_bench/our_lines / files_bench/getline_loop"),
    core("`VerifyTextData`, 1 MB of other letters", "eight flat passes", 1.1,
         "text_bench/verify_text_data/bytes:1048576/letters:2 / "
         "text_bench/eight_passes_by_code/bytes:1048576/letters:2"),
    core("`VerifyTextData`, 1 MB of plain text", "eight flat passes", 0.8,
         "text_bench/verify_text_data/bytes:1048576/letters:0 / text_bench/eight_passes/bytes:1048576/letters:0"),
    core("a million dates, read and written", "the `date` library", 1.0,
         "dates_bench/million_texts / dates_bench/million_texts_by_date_library"),
    files("packing 190 MB of mixed files", "`7z -tzip -mx=1`, all cores", 1.0, "packing, against 7z -mx=1"),
    files("size of that archive", "that of `7z -mx=1`", 1.0, "size, against 7z -mx=1"),
    files("unpacking it", "`unzip`", 0.35, "unpacking, against unzip"),
    files("unpacking it", "`7z x`, all cores", 1.0, "unpacking, against 7z"),
    files("PDF of 10,000 rows and 200 columns: time", "", 2, "10,000 x 200 cells, seconds", "s"),
    files("PDF of 10,000 rows and 200 columns: memory", "", 150, "10,000 x 200 cells, memory", "MB"),
    files("PDF of 10,000 rows and 200 columns", "a bare writer of the same cells", 2,
          "10,000 x 200 cells, against a bare writer"),
    *both_widths("preview: drawing a full page again", "", 8, "drawing a full page again at 100 %", "ms"),
    files("`talutil clean`, 1,000,000 rows of 9 columns", "`mawk` copying the fields", 3, "cleaning a million rows"),
    files("memory of that", "", 20, "cleaning a million rows, memory", "MB"),
]


def run(*command, **options):
    """The output of a program, which is also shown; a program that fails is named, and what it printed counts."""
    done = subprocess.run([str(word) for word in command], cwd=TOP, stdout=subprocess.PIPE, text=True, **options)
    if done.returncode != 0:
        print(f"{command[0]}: ended with status {done.returncode}", file=sys.stderr)
    return done.stdout.replace("\r", "")


def names_of(group):
    return [name for goal in GOALS if goal.group == group for name in goal.figure.split(" / ")]


def measure_core():
    """Nanoseconds and counters of the native benchmarks that goals name: the least of some interleaved repetitions."""
    wanted = defaultdict(set)
    for name in names_of("core"):
        program, work = name.split("/", 1)
        wanted[program].add(work.split(":bytes_a")[0])
    figures = {}
    for program, works in wanted.items():
        output = run(BUILD / "bench/bench" / program, "--benchmark_format=json", "--benchmark_repetitions=5",
                     "--benchmark_enable_random_interleaving=true",
                     "--benchmark_filter=^(" + "|".join(map(re.escape, works)) + ")(/|$)")
        for result in json.loads(output)["benchmarks"]:
            if result["run_type"] != "iteration":
                continue
            name = re.sub(r"/(min_time|real_time|iterations|repeats).*", "", result["run_name"])
            scale = {"ns": 1, "us": 1e3, "ms": 1e6, "s": 1e9}[result["time_unit"]]
            seen = {f"{program}/{name}": result["real_time"] * scale}
            seen |= {f"{program}/{name}:{key}": value for key, value in result.items() if key.startswith("bytes_a")}
            for key, value in seen.items():
                figures[key] = min(value, figures.get(key, math.inf))
    return figures


def figures_in(output):
    """Of each line "WHAT: ... ratio R", the ratio; of another line "WHAT: ...", its first number."""
    figures = {}
    for line in output.splitlines():
        print("  " + line, flush=True)
        what, colon, rest = line.partition(": ")
        number = re.search(r"ratio ([\d.]+)", rest) or re.search(r"(\d[\d.]*)", rest)
        if colon and number:
            figures[what] = float(number[1].rstrip("."))
    return figures


def measure_dll(folder):
    size = (BUILD / folder / "TALUtil.dll").stat().st_size
    return {"size": size / 1e6} | figures_in(run("bench/hosts/run.sh", folder))


def measure_files():
    figures = {}
    for script in ("archives", "documents", "cleaning"):
        figures |= figures_in(run(f"bench/{script}.sh", TALUTIL))
    return figures


# ---- the growth of time with size

# Beyond the processor's caches, even a copy takes more than four times as long for four times the size.
COPY = "a bare copy"


def kind_of(name):
    if name in ("pack", "unpack", "test"):
        return "archives, by entries"
    if name in ("text", "table"):
        return "reports, by pages"
    return "grids and lists, by rows" if "Grid" in name or name in ("IndexInList", "SaveBigFile") else "texts, by bytes"


def measure_lines():
    """The points of each line: name, then size and seconds."""
    lines = defaultdict(list)
    for command in ([BUILD / "bench/bench/lines_bench"], ["bench/archives.sh", TALUTIL, "lines"],
                    ["bench/documents.sh", TALUTIL, "lines"]):
        for row in run(*command).splitlines():
            parts = row.split("\t")
            if len(parts) == 3:
                lines[parts[0]].append((float(parts[1]), float(parts[2])))
    return lines


def exponent_of(points):
    """The slope of a straight line through the logarithms, by least squares over the upper half of the sizes: the
    lower half shows what a call costs at all."""
    upper = [(math.log(size), math.log(seconds)) for size, seconds in sorted(points)[len(points) // 2:] if seconds > 0]
    if len(upper) < 2:
        return math.nan
    mean_x, mean_y = (sum(values) / len(upper) for values in zip(*upper))
    return (sum((x - mean_x) * (y - mean_y) for x, y in upper) / sum((x - mean_x) ** 2 for x, _ in upper))


def print_lines(lines, write):
    copy = exponent_of(lines[COPY]) if COPY in lines else 1
    write("")
    write("| work | sizes | exponent | straight |")
    write("|---|---|---|---|")
    for name, points in sorted(lines.items()):
        exponent = exponent_of(points)
        sizes = f"{min(points)[0]:,.0f} to {max(points)[0]:,.0f}"
        straight = "yes" if exponent <= STEEPEST else "as a copy" if exponent <= copy else "**no**"
        write(f"| {name} | {sizes} | {exponent:.2f} | {straight} |")


def draw(lines, path):
    """Time against size on logarithmic scales, one part a kind of work; every line is drawn from its least size."""
    import matplotlib
    matplotlib.use("agg")
    matplotlib.rcParams["font.size"] = 8
    from matplotlib import pyplot
    kinds = defaultdict(list)
    for name in sorted(lines):
        kinds[kind_of(name)].append(name)
    figure, parts = pyplot.subplots(2, 2, figsize=(11, 11), squeeze=False)
    for part, (kind, names) in zip(parts.flat, sorted(kinds.items())):
        for name in names:
            style = {"color": "black", "linewidth": 2} if name == COPY else {"linewidth": 0.8}
            part.loglog(*zip(*sorted(lines[name])), marker=".", label=name, **style)
        part.set_title(kind)
        part.set_ylabel("seconds")
        part.grid(True, linewidth=0.3)
        part.set_aspect("equal", adjustable="datalim")
        part.legend(fontsize=5, frameon=False, ncol=2, loc="upper left")
    figure.tight_layout()
    figure.savefig(path, dpi=110)


# ---- the table


def figure_of(goal, figures):
    values = [figures.get(name) for name in goal.figure.split(" / ")]
    if None in values:
        return None
    return values[0] if len(values) == 1 else values[0] / values[1]


def print_table(measured, write):
    write("| work | against | measured | goal: at most | met |")
    write("|---|---|---|---|---|")
    for goal in GOALS:
        if goal.group not in measured:
            continue
        figure = figure_of(goal, measured[goal.group])
        unit = "" if goal.unit == "ratio" else " " + goal.unit
        shown = "not measured" if figure is None else f"{figure:.2f}{unit}"
        met = "" if figure is None else "yes" if round(figure, 2) <= goal.most else "**no**"
        write(f"| {goal.work} | {goal.against} | {shown} | {goal.most:g}{unit} | {met} |")


GROUPS = {
    "core": measure_core,
    "files": measure_files,
    "dll32": lambda: measure_dll("windows"),
    "dll64": lambda: measure_dll("windows64"),
}


def main():
    parser = argparse.ArgumentParser(description=__doc__.splitlines()[0])
    parser.add_argument("groups", nargs="*", metavar="GROUP", help="core, files, dll32, dll64 or lines")
    parser.add_argument("--picture", metavar="FILE", help="draw the growth of time with size as a picture")
    options = parser.parse_args()
    groups = options.groups or [*GROUPS, "lines"]
    if unknown := set(groups) - {*GROUPS, "lines"}:
        parser.error(f"there is no group {', '.join(sorted(unknown))}; the groups are {', '.join(GROUPS)} and lines")
    with open(BUILD / "benchmark.md", "w") as copy:
        def write(line):
            print(line, flush=True)
            copy.write(line + "\n")

        measured = {}
        for group in groups:
            print(f"== measuring {group}", file=sys.stderr, flush=True)
            if group in GROUPS:
                measured[group] = GROUPS[group]()
        lines = measure_lines() if "lines" in groups else {}
        if measured:
            print_table(measured, write)
        if lines:
            print_lines(lines, write)
            if options.picture:
                draw(lines, options.picture)


if __name__ == "__main__":
    main()
