"""Runs the benchmarks, prints one table of ratios and, when asked, writes the performance page."""

import argparse
import json
import pathlib
import re
import statistics
import subprocess
import tempfile

import chart
import instructions

BUILD = pathlib.Path("build/bench")
PAGE = pathlib.Path("docs/performance.md")
CHART = pathlib.Path("docs/images/performance.svg")
FLAVOURS = ("full", "short")
LARGE = 8
# The most bytes that a report may take for each block of a clean file.
BLOCK_MEMORY = 64
BLOCKS = 28800
# On a quiet machine the rounds' times are this close to each other.
QUIET = 0.05

# What is measured, what it is compared with, the two figures, and the limits of their ratio, full and
# short; None for no limit. A limit below 0 is a speed: "3.2 times as fast" is -3.2.
ROWS = [
    ("import", "reading floor", "import/dcm", "import/floor", (1.0, 1.1)),
    ("import", "simdjson DOM, copied out", "import/dcm", "import/simdjson", (1.0, 0.9)),
    ("import, warm heap", "reading floor", "warm/import/dcm", "warm/import/floor", (None, None)),
    ("import, warm heap", "simdjson DOM, copied out", "warm/import/dcm", "warm/import/simdjson",
     (0.9, 0.95)),
    ("import", "RapidJSON DOM, copied out", "import/dcm", "import/rapidjson", (0.55, 0.8)),
    ("import", "naive host", "import/dcm", "import/naive", (-3.2, -3.0)),
    ("import, instructions a number", "reading floor", "instructions/import", "instructions/floor",
     (1.0, 1.0)),
    ("import, peak memory of the process", "the file's size", "peak", "file", (2.5, 4.0)),
    (f"import, ns a number at factor {LARGE}", "at factor 1", "import/dcm-large", "import/dcm",
     (1.05, 1.05)),
    ("import with a report", "import without one", "import/report", "import/dcm", (1.3, 1.3)),
    ("import with a report, instructions", "import without one", "instructions/report",
     "instructions/import", (None, None)),
    ("import with a report, more memory", f"{BLOCK_MEMORY} bytes a block",
     "report/memory", "one", (1.0, 1.0)),
    ("first import of a process", "the first pass of the floor", "first/dcm", "first/floor",
     (None, None)),
    ("export", "writing floor, one write a block", "export/dcm", "export/floor", (0.5, 0.5)),
    ("export", "the same in a single write", "export/dcm", "export/floor-at-once", (None, None)),
    ("export", "the same lines with `snprintf`", "export/dcm", "export/snprintf", (-6.0, -5.0)),
    ("export", "RapidJSON's writer", "export/dcm", "export/rapidjson", (None, None)),
    (f"export, ns a number at factor {LARGE}", "at factor 1", "export/dcm-large", "export/dcm",
     (None, None)),
    ("number text", "`std::to_chars(general, 17)`", "text/dcm", "text/to_chars", (0.35, 0.4)),
    ("number text", "fmt `{:.17g}`", "text/dcm", "text/fmt", (0.35, 0.2)),
    ("number token", "`std::from_chars`", "token/dcm", "token/from_chars", (None, None)),
    ("`dcm diff` of 100,800 blocks", "both imported, names paired", "diff", "one", (None, 1.2)),
    ("all content by the C interface", "import", "c-interface", "one", (None, 0.3)),
    ("document copy", "the same payload", "copy/dcm", "copy/payload", (1.3, 1.3)),
] + [
    (f"Get of the {kind} list", "the same payload", f"get-{kind}/dcm", f"get-{kind}/payload",
     (1.3, 1.3))
    for kind in ("FESTWERT", "FESTWERTEBLOCK", "STUETZSTELLENVERTEILUNG", "KENNLINIE",
                 "FESTKENNLINIE", "GRUPPENKENNLINIE", "KENNFELD", "FESTKENNFELD",
                 "GRUPPENKENNFELD", "TEXTSTRING")
] + [
    ("hostile texts, the worst of all", "an eighth of the text, time", "hostile/growth", "one",
     (12.0, None)),
    ("hostile texts, the worst of all", "the file's size, memory beside the blocks",
     "hostile/memory", "one", (12.0, None)),
]


def run(program, *arguments):
    """What a benchmark program prints, as JSON."""
    command = [BUILD / "benchmarks" / program, *map(str, arguments)]
    return json.loads(subprocess.run(command, check=True, stdout=subprocess.PIPE).stdout)


def printed_ratio(program):
    """The ratio that a program prints; its exit status is a failure when that is too high."""
    text = subprocess.run([BUILD / "benchmarks" / program], stdout=subprocess.DEVNULL,
                          stderr=subprocess.PIPE, text=True, check=False).stderr
    return float(re.search(r"ratio\D*([\d.]+)", text).group(1))


def measure_in_fresh_processes(flavour, rounds):
    """Time and memory of one import, each in a process of its own."""
    figures = {"first/dcm": [], "first/report": [], "first/floor": [], "peak": [], "file": [],
               "report/memory": []}
    with tempfile.NamedTemporaryFile(suffix=".dcm", dir=fast_folder()) as file:
        numbers = instructions.make_data(flavour, 1, file.name)
        size = pathlib.Path(file.name).stat().st_size
        for _ in range(rounds):
            for reader in ("dcm", "report", "floor"):
                once = run("dcm_import_once", reader, file.name)
                figures[f"first/{reader}"].append(once["seconds"] * 1e9 / numbers)
                if reader == "dcm":
                    figures["peak"].append(once["peak"])
                    figures["file"].append(size)
                elif reader == "report":
                    more = once["peak"] - figures["peak"][-1]
                    figures["report/memory"].append(more / BLOCKS / BLOCK_MEMORY)
    return figures


def fast_folder():
    """A folder in memory where there is one."""
    return "/dev/shm" if pathlib.Path("/dev/shm").is_dir() else None


def measure(rounds):
    """For each flavour, each figure's values in all rounds; times in nanoseconds a number."""
    results = {}
    for flavour in FLAVOURS:
        results[flavour] = run("dcm_benchmark", f"--flavour={flavour}", f"--rounds={rounds}",
                               f"--growth={LARGE}")
        results[flavour].update(measure_in_fresh_processes(flavour, rounds))
        warm = run("dcm_benchmark", f"--flavour={flavour}", f"--rounds={rounds}", "--heap=warm")
        results[flavour].update({"warm/" + name: times for name, times in warm.items()})
    for name, program in (("diff", "dcm_diff"), ("c-interface", "dcm_c_interface")):
        results["short"][name] = [printed_ratio(program)]
    for (what, flavour), figure in instructions.count_all((*instructions.KEPT, "report", "floor")).items():
        results[flavour]["instructions/" + what] = [figure]
    # Its exit status is a failure when a limit is exceeded; the table shows that too.
    hostile = subprocess.run([BUILD / "benchmarks/dcm_hostile"], stdout=subprocess.PIPE,
                             stderr=subprocess.DEVNULL, check=False)
    for name, figure in json.loads(hostile.stdout).items():
        results["full"]["hostile/" + name] = [figure]
    for figures in results.values():
        figures["one"] = [1] * rounds
    return results


def ratio(figures, name, against):
    """The median of the ratio over the rounds; None when one of the two was not measured."""
    if name not in figures or against not in figures:
        return None
    return statistics.median(a / b for a, b in zip(figures[name], figures[against]))


def cells(value, limit):
    """The figure, its limit and whether it is met."""
    if value is None:
        return "-", "", ""
    if limit is None:
        return f"{value:.2f} x", "", ""
    if limit < 0:
        return f"1 / {1 / value:.2f}", f"<= 1 / {-limit:g}", verdict(1 / value >= -limit)
    return f"{value:.2f} x", f"<= {limit:g} x", verdict(value <= limit)


def verdict(met):
    return "yes" if met else "no"


def table(results):
    lines = [["what", "against"] + [word for f in FLAVOURS for word in (f, "target", "met")]]
    for what, against, name, other, limits in ROWS:
        line = [what, against]
        for flavour, limit in zip(FLAVOURS, limits):
            line += cells(ratio(results[flavour], name, other), limit)
        lines.append(line)
    widths = [max(len(line[i]) for line in lines) for i in range(len(lines[0]))]
    lines.insert(1, ["-" * width for width in widths])
    return "\n".join(
        "| " + " | ".join(cell.ljust(width) for cell, width in zip(line, widths)) + " |"
        for line in lines
    )


def processor():
    """The model of the processor."""
    match = re.search(r"model name\s*: (.*)", pathlib.Path("/proc/cpuinfo").read_text())
    return match.group(1).strip() if match else "unknown"


def spread(results):
    """How far apart the middle half of the rounds' times are, as a share of their median: the median
    of this for all imports and exports."""
    shares = []
    for figures in results.values():
        for name, times in figures.items():
            if name.startswith(("import/", "export/")) and len(times) > 3:
                quarters = statistics.quantiles(times, n=4)
                shares.append((quarters[2] - quarters[0]) / quarters[1])
    return statistics.median(shares) if shares else 0


def machine(results):
    """The processor, and whether other work of the machine disturbed the measurement."""
    share = spread(results)
    state = "quiet" if share <= QUIET else "busy with other work"
    return (f"Processor: {processor()}. The machine was {state}: the middle half of a contestant's "
            f"rounds\nwas within {share:.0%} of their median.")


def replace_section(figures, section):
    """The figures of all processors with `section` in the place of the one with the same heading."""
    sections = [part for part in re.split(r"(?=^### )", figures, flags=re.MULTILINE) if part.strip()]
    heading = section.split("\n")[0]
    kept = [part.rstrip() for part in sections if part.split("\n")[0] != heading]
    return "\n\n".join([section, *kept]) + "\n"


def write_page(results):
    """Replaces this processor's figures on the page, which has those of each processor between two
    comments, and draws the chart."""
    medians = {
        flavour: {name: statistics.median(values) for name, values in figures.items()}
        for flavour, figures in results.items()
    }
    CHART.parent.mkdir(parents=True, exist_ok=True)
    CHART.write_text(chart.draw(medians))
    section = f"### {processor()}\n\n{table(results)}\n\n{machine(results)}"
    page = re.sub(r"(<!-- figures -->\n)(.*?)(<!-- end of figures -->)",
                  lambda marks: marks.group(1) + replace_section(marks.group(2), section) +
                  marks.group(3), PAGE.read_text(), flags=re.DOTALL)
    PAGE.write_text(page)


def main():
    parser = argparse.ArgumentParser(description=__doc__)
    parser.add_argument("--rounds", type=int, default=11)
    parser.add_argument("--write", action="store_true", help="write the performance page")
    arguments = parser.parse_args()
    results = measure(arguments.rounds)
    (BUILD / "results.json").write_text(json.dumps(results, indent=1))
    print(table(results))
    print(machine(results))
    if arguments.write:
        write_page(results)


if __name__ == "__main__":
    main()
