"""Measures the page of a file in a headless browser against the page of the first version."""

import argparse
import pathlib
import re
import statistics
import subprocess
import sys
import tempfile
import time

sys.path.insert(0, "tests/report")
import browser  # noqa: E402

PAGE = pathlib.Path("docs/performance.md")
DATA = "build/bench/benchmarks/dcm_make_data"
COMMAND = ["build/program/tools/dcm", "report"]
FIRST = "e43d885"  # the last commit with the page of the first version
BLOCKS = 5000
WORDS = "ZndWnkl"  # typed letter by letter; a part of names

# The time of each key from its event until the browser has laid out what it changes; then that of
# emptying the box, and how long the blocks beside the index take to follow.
KEYS = """(async words => {
  const box = document.getElementById('search');
  const pause = () => new Promise(done => setTimeout(done, 400));
  const key = text => {
    const start = performance.now();
    box.value = text;
    box.dispatchEvent(new Event('input', {bubbles: true}));
    document.body.offsetHeight;
    return performance.now() - start;
  };
  await pause();
  const times = [];
  for (let n = 1; n <= words.length; ++n) {
    times.push(key(words.slice(0, n)));
    await pause();
  }
  times.push(key(''));
  await pause();
  const blocks = document.getElementById('blocks');
  const start = performance.now();
  let follows = key(words);
  if (blocks)
    follows = await new Promise(done => new MutationObserver((_, observer) => {
      observer.disconnect();
      document.body.offsetHeight;
      done(performance.now() - start);
    }).observe(blocks, {childList: true}));
  return {times, follows};
})"""


def first_version(folder):
    """The program of the first version; None where its source or a compiler is missing."""
    try:
        (folder / "examples").mkdir()
        for name in ("examples/report.cpp", "examples/report_page.h"):
            source = subprocess.run(["git", "show", f"{FIRST}:{name}"], check=True,
                                    stdout=subprocess.PIPE, stderr=subprocess.DEVNULL).stdout
            (folder / name).write_bytes(source)
        library = pathlib.Path("build/program/dcm").resolve()
        subprocess.run(["c++", "-std=c++20", "-O2", f"-I{folder}", "-I.", "-Ibuild/program/include",
                        folder / "examples/report.cpp", "-o", folder / "report", f"-L{library}",
                        "-ldcm", f"-Wl,-rpath,{library}"], check=True)
        return folder / "report"
    except (OSError, subprocess.CalledProcessError):
        return None


def opened(path, shown):
    """A browser, and the seconds that it took to open a page until an expression is true."""
    tab = browser.Browser()
    tab.look()
    start = time.monotonic()
    if shown is None:
        tab.open(path)
        tab.run("new Promise(done => requestAnimationFrame(() => requestAnimationFrame(done)))")
    else:
        tab.open(path, wait=False)
        tab.until(shown)
    return tab, time.monotonic() - start


def measure(path):
    """Milliseconds of one round with the page of BLOCKS blocks."""
    tab, load = opened(path, None)
    with tab:
        keys = tab.run(f"{KEYS}({WORDS!r})")
    return {"load": 1000 * load, "key": statistics.mean(keys["times"]), "slowest": max(keys["times"]),
            "follows": keys["follows"]}


def measure_large(path):
    tab, index = opened(path, "document.querySelector('nav a') !== null")
    with tab:
        start = time.monotonic()
        tab.run(f"search.value = {WORDS!r}; search.dispatchEvent(new Event('input'))")
        tab.until("/ of /.test(document.getElementById('count').textContent)")
        answer = time.monotonic() - start
    return {"index": 1000 * index, "answer": 1000 * (index + answer)}


def medians(rounds):
    return {key: statistics.median(one[key] for one in rounds) for key in rounds[0]}


def table(new, old, large, sizes):
    def row(what, key, limit):
        mine, theirs = new[key], old and old[key]
        ratio = f"{mine / theirs:.3f} x" if old else "-"
        met = "" if limit is None or not old else "yes" if mine <= limit * theirs else "no"
        return (what, f"{mine:.1f} ms", f"{theirs:.0f} ms" if old else "-", ratio,
                f"<= {limit:.3g} x" if limit else "", met)

    def row_large(what, key):
        return (what, f"{large[key] / 1000:.2f} s", "-", "", "<= 5 s", "yes" if large[key] <= 5000 else "no")

    rows = [("what", "this page", "the first version's", "ratio", "target", "met"),
            row(f"{BLOCKS:,} blocks: loading", "load", 1 / 3),
            row("a keystroke of the search, on average", "key", 0.1),
            row("the slowest keystroke", "slowest", 0.1),
            row("until the blocks follow the search", "follows", None),
            row_large(f"a file of {sizes[0]:.0f} MB: the index is there", "index"),
            row_large("and the search has answered", "answer")]
    widths = [max(len(one[i]) for one in rows) for i in range(len(rows[0]))]
    lines = ["| " + " | ".join(cell.ljust(width) for cell, width in zip(one, widths)) + " |" for one in rows]
    lines.insert(1, "| " + " | ".join("-" * width for width in widths) + " |")
    return "\n".join(lines)


def main():
    parser = argparse.ArgumentParser(prog="bench page")
    parser.add_argument("--write", action="store_true", help="renew docs/performance.md")
    parser.add_argument("--rounds", type=int, default=9)
    options = parser.parse_args()
    if browser.find() is None:
        sys.exit("bench page: no Chromium to measure with")

    with tempfile.TemporaryDirectory() as name:
        folder = pathlib.Path(name)

        def page(program, factor, flavour, title, *output):
            data, result = folder / f"{title}.dcm", folder / f"{title}.html"
            subprocess.run([DATA, flavour, str(factor), data], check=True, stdout=subprocess.DEVNULL)
            subprocess.run([*program, data, *output, result], check=True)
            return data.stat().st_size / 1e6, result

        _, new_page = page(COMMAND, BLOCKS / 28800, "full", "new", "-o")
        size, large_page = page(COMMAND, 3.7, "full", "large", "-o")
        old = first_version(folder)
        old_page = old and page([old], BLOCKS / 28800, "full", "old")[1]
        rounds = {"new": [], "old": [], "large": []}
        for i in range(options.rounds):
            print(f"\rround {i + 1} of {options.rounds}", end="", file=sys.stderr, flush=True)
            rounds["new"].append(measure(new_page))
            if old:
                rounds["old"].append(measure(old_page))
            rounds["large"].append(measure_large(large_page))
        print(file=sys.stderr)
        figures = table(medians(rounds["new"]), medians(rounds["old"]) if old else None,
                        medians(rounds["large"]), (size,))
    print(figures)
    if options.write:
        begin, end = "<!-- figures of the page -->\n", "<!-- end of the page's figures -->"
        text = PAGE.read_text()
        PAGE.write_text(re.sub(f"(?s){begin}.*?{end}", lambda _: f"{begin}{figures}\n{end}", text))


main()
