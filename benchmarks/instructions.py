"""Counts instructions a number with callgrind and compares them with the figures on record.

Other than times, they are the same on a busy machine.
"""

import argparse
import os
import pathlib
import re
import subprocess
import sys
import tempfile

PROGRAMS = pathlib.Path("build/bench/benchmarks")
RECORD = pathlib.Path("benchmarks/instructions.txt")
FLAVOURS = ("full", "short")
KEPT = ("import", "export", "text", "token")
BAND = 0.03
FACTOR = 0.1
# The C library chooses its string functions by the processor; these are in every one.
PLAIN = "glibc.cpu.hwcaps=-AVX2,-AVX,-AVX_Fast_Unaligned_Load,-EVEX,-AVX512VL,-ERMS,-FSRM,-SSSE3"


def make_data(flavour, factor, path):
    """Writes the generated data; returns how many numbers they are."""
    command = [PROGRAMS / "dcm_make_data", flavour, str(factor), path]
    return int(subprocess.run(command, check=True, stdout=subprocess.PIPE).stdout)


def count(what, path):
    """The instructions a number of one thing done with the numbers of a file."""
    command = ["valgrind", "--tool=callgrind", "--callgrind-out-file=/dev/null",
               "--instr-atstart=no", "--collect-atstart=no",
               PROGRAMS / "dcm_instructions", what, path]
    run = subprocess.run(command, check=True, capture_output=True, text=True,
                         env=os.environ | {"GLIBC_TUNABLES": PLAIN})
    collected = re.search(r"Collected *: *(\d+)", run.stderr)
    return int(collected.group(1)) / int(run.stdout)


def count_all(things):
    """Maps each thing and flavour to its figure."""
    figures = {}
    for flavour in FLAVOURS:
        with tempfile.NamedTemporaryFile(suffix=".dcm") as file:
            make_data(flavour, FACTOR, file.name)
            for what in things:
                figures[what, flavour] = count(what, file.name)
    return figures


def main():
    parser = argparse.ArgumentParser(description=__doc__)
    parser.add_argument("--write", action="store_true", help="put today's figures on record")
    figures = count_all(KEPT)
    if parser.parse_args().write:
        lines = ["# Instructions a number, counted by callgrind.\n"]
        lines += [f"{what} {flavour} {figure:.1f}\n" for (what, flavour), figure in figures.items()]
        RECORD.write_text("".join(lines))
    good = True
    for line in RECORD.read_text().splitlines():
        if line.startswith("#"):
            continue
        what, flavour, record = line.split()
        figure = figures.pop((what, flavour))
        change = figure / float(record) - 1
        kept = abs(change) <= BAND
        good = good and kept
        print(f"{what:6} {flavour:5} {figure:8.1f} on record {record:>8} {change:+7.1%}"
              f"{'' if kept else '  outside the band'}")
    for what, flavour in figures:
        good = False
        print(f"{what:6} {flavour:5} has no figure on record")
    if not good:
        sys.exit(f"more than {BAND:.0%} off: mend it, or put it on record with --write")


if __name__ == "__main__":
    main()
