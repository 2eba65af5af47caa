"""Runs the benchmarks and prints their table."""

import argparse
import json
import pathlib
import statistics
import subprocess

BUILD = pathlib.Path("build/bench")
FLAVOURS = ("full", "short")

# What is measured, against what, the contestants' names, and the limits of the ratio, full and
# short; None where nothing is promised. A limit below 0 is a speed: "3.2 times as fast" is -3.2.
ROWS = [
    ("import", "reading floor", "import/dcm", "import/floor", (1.0, 1.1)),
    ("import", "simdjson DOM, copied out", "import/dcm", "import/simdjson", (1.0, 0.9)),
    ("import", "RapidJSON DOM, copied out", "import/dcm", "import/rapidjson", (0.55, 0.8)),
    ("import", "naive host", "import/dcm", "import/naive", (-3.2, -3.0)),
    ("import", "itself, at factor 8", "import/dcm-large", "import/dcm", (1.05, 1.05)),
    ("export", "writing floor", "export/dcm", "export/floor", (0.5, 0.5)),
    ("export", "the same lines with snprintf", "export/dcm", "export/snprintf", (-6.0, -5.0)),
    ("export", "RapidJSON's writer", "export/dcm", "export/rapidjson", (None, None)),
]


def measure(flavour, rounds):
    """The times of all rounds for each contestant, in nanoseconds a number."""
    program = BUILD / "benchmarks/dcm_benchmark"
    arguments = [program, f"--flavour={flavour}", f"--rounds={rounds}"]
    return json.loads(subprocess.run(arguments, check=True, stdout=subprocess.PIPE).stdout)


def ratio(times, name, against):
    """The median over the rounds; None when one of the two did not take part."""
    if name not in times or against not in times:
        return None
    return statistics.median(a / b for a, b in zip(times[name], times[against]))


def show(value, limit):
    """The figure, its limit and whether it is met."""
    if value is None:
        return "not installed", "", ""
    if limit is None:
        return f"{value:.2f} x", "", ""
    if limit < 0:
        return f"{1 / value:.1f} times as fast", f"{-limit:g} times", verdict(1 / value >= -limit)
    return f"{value:.2f} x", f"<= {limit:g} x", verdict(value <= limit)


def verdict(met):
    return "yes" if met else "no"


def table(results):
    lines = [["what", "against"] + [word for f in FLAVOURS for word in (f, "target", "met")]]
    for what, against, name, other, limits in ROWS:
        line = [what, against]
        for flavour, limit in zip(FLAVOURS, limits):
            line += show(ratio(results[flavour], name, other), limit)
        lines.append(line)
    widths = [max(len(line[i]) for line in lines) for i in range(len(lines[0]))]
    lines.insert(1, ["-" * width for width in widths])
    return "\n".join(
        "| " + " | ".join(cell.ljust(width) for cell, width in zip(line, widths)) + " |"
        for line in lines
    )


def main():
    parser = argparse.ArgumentParser(description=__doc__)
    parser.add_argument("--rounds", type=int, default=15)
    arguments = parser.parse_args()
    results = {flavour: measure(flavour, arguments.rounds) for flavour in FLAVOURS}
    (BUILD / "results.json").write_text(json.dumps(results, indent=2))
    print(table(results))


if __name__ == "__main__":
    main()
