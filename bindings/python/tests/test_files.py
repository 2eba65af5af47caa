"""Files: there and back, encodings, errors, threads, processes and memory."""

import concurrent.futures
import errno
import fcntl
import os
import pathlib
import pickle
import resource
import shutil
import subprocess
import sys
import threading
import time

import dcm
import numpy as np
import pytest
from conftest import FILES, SAMPLE
from hypothesis import HealthCheck, given, settings
from hypothesis import strategies as st

FINITE = st.floats(allow_nan=False)
NAMES = st.from_regex(r"[A-Za-z_][A-Za-z0-9_.]{0,20}", fullmatch=True)
# What a text in the file keeps: cp1252 without line breaks, quotes and outer blanks.
TEXTS = st.text(st.sampled_from("abcXYZ019 _-/%°äöüßµÄ€"), max_size=12).map(str.strip)
WORDS = TEXTS.filter(len)


@st.composite
def parameters(draw):
    kind = draw(st.sampled_from(dcm.Kind))
    names = dict(zip(("langname", "displayname", "function"), draw(st.tuples(TEXTS, NAMES, NAMES))))
    numbers = draw(st.booleans())

    def entries(count):
        entry = FINITE if numbers else WORDS
        return draw(st.lists(entry, min_size=count, max_size=count))

    def axis(count):
        return dcm.Axis(entries(count), draw(TEXTS), draw(NAMES) if "GRUPPEN" in kind.value else "")

    columns, rows = draw(st.integers(1, 9)), draw(st.integers(1, 4))
    name = draw(NAMES)
    if kind is dcm.Kind.STUETZSTELLENVERTEILUNG:
        return dcm.Parameter(kind, name, x=axis(columns), **names)
    names["unit"] = draw(TEXTS)
    if kind is dcm.Kind.TEXTSTRING:
        return dcm.Parameter(kind, name, [draw(WORDS)], **names)
    if kind is dcm.Kind.FESTWERT:
        return dcm.Parameter(kind, name, entries(1), **names)
    if kind is dcm.Kind.FESTWERTEBLOCK:
        return dcm.Parameter(kind, name, entries(columns), **names)
    if "KENNLINIE" in kind.value:
        return dcm.Parameter(kind, name, entries(columns), x=axis(columns), **names)
    values = np.array(entries(columns * rows), dtype=object).reshape(rows, columns)
    return dcm.Parameter(kind, name, values, x=axis(columns), y=axis(rows), **names)


def content(parameter):
    """All of a parameter, numbers by their bits."""
    def bits(array):
        return array.shape, array.tobytes() if array.dtype == np.float64 else array.tolist()

    texts = [getattr(parameter, n) for n in "langname displayname function unit".split()]
    axes = [(axis.unit, axis.distribution, bits(axis.points)) for axis in parameter.axes]
    return parameter.kind, parameter.name, texts, axes, bits(parameter.values)


@settings(max_examples=60, deadline=None, suppress_health_check=list(HealthCheck))
@given(given=st.lists(parameters(), max_size=6), comment=st.lists(WORDS, max_size=3))
def test_random_parameters_there_and_back(tmp_path, given, comment):
    cal = dcm.Calibration(given, comment="".join(line + "\n" for line in comment))
    cal.write(tmp_path / "made.dcm")
    back = dcm.read(tmp_path / "made.dcm")
    assert back.comment == cal.comment
    for old, new in zip(cal.parameters(), back.parameters(), strict=True):
        # A file has no rows of one value block, and an axis of a group alone has a distribution.
        assert content(new) == content(old)


@pytest.mark.parametrize("file", FILES, ids=lambda file: file.name)
@pytest.mark.parametrize("touched", [False, True])
def test_files_are_written_as_read(tmp_path, file, touched):
    cal = dcm.read(file)
    if touched:
        for parameter in cal.parameters():
            assert parameter.values is parameter.values
            assert parameter.unit is not None
    first, second = tmp_path / "first.dcm", tmp_path / "second.dcm"
    cal.write(first)
    again = dcm.read(first)
    again.write(second)
    assert first.read_bytes() == second.read_bytes()
    assert cal.comment == again.comment
    if file == SAMPLE:  # The others have what no file keeps, such as more digits in rows.
        assert [content(p) for p in again.parameters()] == [content(p) for p in cal.parameters()]


@pytest.mark.parametrize(
    ("encoding", "unit"),
    [("cp1252", b"\xb0C"), ("latin-1", b"\xb0C"), ("utf-8", b"\xc2\xb0C"), ("cp850", b"\xf8C")],
)
def test_encodings(tmp_path, encoding, unit):
    cal = dcm.new()
    cal.add(dcm.Parameter("FESTWERT", "t", 20.0, unit="°C"))
    file = tmp_path / "unit.dcm"
    cal.write(file, encoding)
    assert unit in file.read_bytes()
    again = dcm.read(str(file), encoding)
    assert again["t"].unit == "°C" and again.encoding == encoding
    # Without a name `write` takes that of the reading; the next call has the default again.
    again.write(file)
    assert unit in file.read_bytes()
    assert dcm.read(file)["t"].unit == unit.decode("cp1252")


@pytest.mark.parametrize("encoding", ["no-such", "rot13", "utf-16", "cp424242"])
def test_unknown_encoding(encoding):
    with pytest.raises(LookupError):
        dcm.read(SAMPLE, encoding)
    with pytest.raises(LookupError):
        dcm.new().write("/dev/null", encoding)


def test_file_errors(tmp_path):
    with pytest.raises(FileNotFoundError) as caught:
        dcm.read(tmp_path / "missing.dcm")
    assert caught.value.errno == errno.ENOENT and caught.value.filename.endswith("missing.dcm")
    with pytest.raises(IsADirectoryError):
        dcm.read(tmp_path)
    with pytest.raises(FileNotFoundError):
        dcm.new().write(tmp_path / "no" / "folder.dcm")
    with pytest.raises(NotADirectoryError):
        dcm.read(SAMPLE / "below")
    with pytest.raises(OSError):
        dcm.new().write("/dev/full")
    for wrong in (3, None, b"bytes"):
        with pytest.raises(TypeError):
            dcm.read(wrong)
    locked = tmp_path / "locked.dcm"
    locked.write_bytes(SAMPLE.read_bytes())
    with open(locked, "rb") as file:
        fcntl.flock(file, fcntl.LOCK_EX)
        with pytest.raises(BlockingIOError):
            dcm.read(locked)
        with pytest.raises(BlockingIOError):
            dcm.new().write(locked)
    assert locked.read_bytes() == SAMPLE.read_bytes()


@pytest.mark.skipif(os.geteuid() != 0, reason="needs another user to try as")
def test_no_permission(tmp_path):
    file = tmp_path / "closed.dcm"
    file.write_bytes(b"")
    file.chmod(0)
    code = f"import os, dcm; os.setuid(65534); dcm.read({str(file)!r})"
    result = subprocess.run([sys.executable, "-c", code], capture_output=True, text=True)
    assert "PermissionError" in result.stderr


def test_read_error_has_line_and_block(tmp_path):
    file = tmp_path / "broken.dcm"
    file.write_text('FESTWERT a\nWERT 1\nEND\n\nFESTWERTEBLOCK b 2\nWERT "\nEND\n\n')
    with pytest.raises(dcm.ReadError) as caught:
        dcm.read(file)
    assert (caught.value.line, caught.value.block) == (6, "FESTWERTEBLOCK b")
    assert str(file) in str(caught.value) and "line 6" in str(caught.value)
    assert pickle.loads(pickle.dumps(caught.value)).line == 6


def test_strict_raises_on_warnings(tmp_path):
    file = tmp_path / "cut.dcm"
    file.write_text("FESTWERT a\nWERT 1\nEND\n\nFESTWERT b\nWERT 2\nEND")
    cal = dcm.read(file)
    assert list(cal) == ["a"]
    finding = cal.report.first(dcm.Severity.ERROR)
    assert (finding.id, finding.line, finding.block) == ("unfinished-block", 5, "FESTWERT b")
    assert cal.report.number_of(dcm.Severity.ERROR) == 1 and str(finding) in str(cal.report)
    with pytest.raises(dcm.ReadError) as caught:
        dcm.read(file, strict=True)
    assert caught.value.line == 5 and caught.value.report[0] == cal.report[0]
    assert dcm.read(SAMPLE).report is not None


def test_strict_write_keeps_the_old_file(tmp_path):
    file = tmp_path / "kept.dcm"
    cal = dcm.new()
    cal.add(dcm.Parameter("FESTWERT", "a", "\u4e00"))
    cal.write(file, "utf-8", strict=True)
    before = file.read_bytes()
    assert [finding.id for finding in cal.write(tmp_path / "other.dcm")] == ["not-in-code-page"]
    with pytest.raises(dcm.WriteError):
        cal.write(file, strict=True)
    assert file.read_bytes() == before


def test_threads_read_side_by_side_with_their_own_code_pages(tmp_path):
    large = dcm.new()
    for i in range(300):
        large.add(dcm.Parameter("FESTWERTEBLOCK", f"ä{i}", np.arange(500) / 7))
    # A file can be open once at a time, so each has its own.
    files = [(tmp_path / f"in{i}.dcm", ("cp1252", "utf-8")[i % 2]) for i in range(24)]
    for file in files:
        large.write(*file)

    def work(number):
        cal = dcm.read(*files[number])
        assert cal["ä299"].values[499] == 499 / 7
        cal.write(tmp_path / f"{number}.dcm")
        return len(cal)

    with concurrent.futures.ThreadPoolExecutor(4) as pool:
        assert list(pool.map(work, range(24))) == [300] * 24
    assert (tmp_path / "1.dcm").read_bytes() == files[1][0].read_bytes()


def test_lock_is_released_while_a_file_is_read(tmp_path):
    cal = dcm.new()
    cal.add(dcm.Parameter("FESTWERTEBLOCK", "much", np.arange(400_000) / 3))
    cal.write(tmp_path / "large.dcm")
    steps, done = [], threading.Event()

    def count():
        while not done.is_set():
            steps.append(time.monotonic())
            time.sleep(0.0005)

    counter = threading.Thread(target=count)
    # No switch by time: the counter only runs when the reader lets go of the lock.
    interval = sys.getswitchinterval()
    sys.setswitchinterval(1000)
    try:
        counter.start()
        start = time.monotonic()
        for _ in range(5):
            dcm.read(tmp_path / "large.dcm")
        end = time.monotonic()
    finally:
        sys.setswitchinterval(interval)
        done.set()
        counter.join()
    assert sum(start < step < end for step in steps) > 5


def test_arrays_are_copies_of_all_values(sample):
    arrays = sample.arrays()
    assert list(arrays) == list(sample)
    # Once taken by the compiled part at once, once from the parameters.
    for again in (arrays, sample.arrays()):
        for name, array in again.items():
            assert content(sample[name])[-1] == (array.shape, array.tobytes()) or (
                array.tolist() == sample[name].values.tolist()
            )
            assert not np.shares_memory(array, sample[name].values)
        for number, array in enumerate(again.values()):
            array[...] = number
        assert all((array == number).all() for number, array in enumerate(again.values()))


def read_in_process(path):
    return dcm.read(path)


def test_pickling(sample, tmp_path):
    again = pickle.loads(pickle.dumps(sample))
    assert [content(p) for p in again.parameters()] == [content(p) for p in sample.parameters()]
    assert (again.comment, list(again.report)) == (sample.comment, list(sample.report))
    one = pickle.loads(pickle.dumps(sample["IgnAng_phiBas_GMAP"]))
    assert content(one) == content(sample["IgnAng_phiBas_GMAP"])
    files = [shutil.copy(SAMPLE, tmp_path / f"{i}.dcm") for i in range(4)]
    with concurrent.futures.ProcessPoolExecutor(2) as pool:
        for cal in pool.map(read_in_process, files):
            assert not sample.diff(cal)


def test_no_file_stays_open_and_memory_does_not_grow(tmp_path):
    def used():
        pages = int(pathlib.Path("/proc/self/statm").read_text().split()[1])
        return pages * resource.getpagesize()

    def open_files():
        return len(os.listdir("/proc/self/fd"))

    def read(times):
        for _ in range(times):
            cal = dcm.read(SAMPLE)
            for parameter in cal.parameters():
                assert parameter.values is not None and parameter._load() is None
            cal.diff(cal)
        cal.write(tmp_path / "out.dcm")

    read(100)
    before, files = used(), open_files()
    read(1000)
    assert used() - before < 1 << 20
    assert open_files() == files
