"""Measures the Python module against an import in C++, and many files by one process and by two."""

import argparse
import concurrent.futures
import functools
import json
import os
import pathlib
import re
import statistics
import subprocess
import sys
import tempfile
import time

BUILD = pathlib.Path("build/bench")
PAGE = pathlib.Path("docs/performance.md")
SMALL = 1000
sys.path.insert(0, str(BUILD / "bindings/python"))
import dcm  # noqa: E402


def timed(work):
    start = time.process_time()
    result = work()
    return time.process_time() - start, result


def read_once(path):
    """Processor seconds of reading, and of taking all values at once and one by one."""
    reading, cal = timed(lambda: dcm.read(path))
    at_once, arrays = timed(cal.arrays)
    one_by_one, values = timed(lambda: [one.values for one in cal.parameters()])
    assert len(arrays) > 20000 and len(values) >= len(arrays)
    return reading, at_once, one_by_one


def library(program, path):
    """The processor seconds of one import in C++, of a process of its own."""
    command = [BUILD / "benchmarks/dcm_import_once", program, path]
    return json.loads(subprocess.run(command, check=True, stdout=subprocess.PIPE).stdout)["seconds"]


def own_process(path):
    """`read_once` in a process of its own, as the import in C++ is."""
    command = [sys.executable, __file__, "--once", path]
    return json.loads(subprocess.run(command, check=True, stdout=subprocess.PIPE).stdout)


def look(path, name):
    return dcm.read(path)[name].value


def small_files(folder, pool):
    """Seconds to read one value out of each of the small files."""
    paths = [folder / f"{i}.dcm" for i in range(SMALL)]
    work = functools.partial(look, name="IdlCtl_nSetpBas_C")
    start = time.perf_counter()
    found = list(pool.map(work, paths, chunksize=50) if pool else map(work, paths))
    assert found == [720.0] * SMALL
    return time.perf_counter() - start


def table(rows):
    rows = [("what", "against", "ratio", "target", "met"), *rows]
    widths = [max(len(one[i]) for one in rows) for i in range(len(rows[0]))]
    lines = ["| " + " | ".join(c.ljust(w) for c, w in zip(one, widths)) + " |" for one in rows]
    lines.insert(1, "| " + " | ".join("-" * width for width in widths) + " |")
    return "\n".join(lines)


def main():
    parser = argparse.ArgumentParser(prog="bench python")
    parser.add_argument("--write", action="store_true", help="renew docs/performance.md")
    parser.add_argument("--rounds", type=int, default=9)
    parser.add_argument("--once", help=argparse.SUPPRESS)
    options = parser.parse_args()
    if options.once:
        print(json.dumps(read_once(options.once)))
        return

    memory = "/dev/shm" if os.path.isdir("/dev/shm") else None
    with tempfile.TemporaryDirectory(dir=memory) as name:
        folder = pathlib.Path(name)
        large = folder / "large.dcm"
        subprocess.run([BUILD / "benchmarks/dcm_make_data", "full", "1", large], check=True,
                       stdout=subprocess.DEVNULL)
        sample = pathlib.Path("examples/data/sample.dcm").read_bytes()
        for i in range(SMALL):
            (folder / f"{i}.dcm").write_bytes(sample)
        bulk, single, plain, shared = [], [], [], []
        with concurrent.futures.ProcessPoolExecutor(2) as pool:
            small_files(folder, pool)  # starts the processes
            for i in range(options.rounds):
                print(f"\rround {i + 1} of {options.rounds}", end="", file=sys.stderr, flush=True)
                reported, unreported = library("report", large), library("dcm", large)
                reading, at_once, one_by_one = own_process(large)
                bulk.append((reading + at_once) / reported)
                plain.append((reading + at_once) / unreported)
                single.append((reading + one_by_one) / reported)
                shared.append(small_files(folder, pool) / small_files(folder, None))
        print(file=sys.stderr)

    def row(what, against, ratios, limit):
        ratio = statistics.median(ratios)
        met = "" if limit is None else "yes" if ratio <= limit else "no"
        return (what, against, f"{ratio:.2f} x", f"<= {limit} x" if limit else "", met)

    figures = table([
        row("reading, all values by `arrays`", "the same import in C++, with report", bulk, 1.5),
        row("reading, all values by `arrays`", "import in C++ without a report", plain, None),
        row("reading, `values` of each parameter", "the same import in C++, with report", single, None),
        row(f"{SMALL} small files by two processes", "by one process", shared, None),
    ])
    print(figures)
    if options.write:
        begin, end = "<!-- figures of the Python module -->\n", "<!-- end of the module's figures -->"
        text = PAGE.read_text()
        PAGE.write_text(re.sub(f"(?s){begin}.*?{end}", lambda _: f"{begin}{figures}\n{end}", text))


main()
