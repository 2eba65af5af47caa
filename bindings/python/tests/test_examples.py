"""The program for a fleet, the documents' code, frames, pictures and types."""

import doctest
import os
import re
import shutil
import subprocess
import sys

import dcm
import matplotlib
import numpy as np
import pandas
import pytest
from conftest import ROOT, SAMPLE

matplotlib.use("Agg")
MAP = "IgnAng_phiBas_GMAP"


@pytest.mark.parametrize("document", ["README.md", "docs/python.md"])
def test_code_of_the_documents(document, tmp_path, monkeypatch):
    monkeypatch.chdir(tmp_path)
    shutil.copy(SAMPLE, "engine.dcm")
    blocks = re.findall(r"(?ms)^```python\n(.*?)^```$", (ROOT / document).read_text())
    assert blocks
    text = "\n".join(blocks)
    if ">>>" not in text:
        exec(compile(text, document, "exec"), {})
        return
    test = doctest.DocTestParser().get_doctest(text, {}, document, document, 0)
    output = []
    result = doctest.DocTestRunner(optionflags=doctest.ELLIPSIS).run(test, out=output.append)
    assert result.attempted > 20 and not result.failed, "".join(output)


def test_frames(sample):
    grid = sample[MAP]
    frame = grid.to_frame()
    assert frame.shape == grid.values.shape and frame.columns.name.endswith("[1/min]")
    assert frame.loc[grid.y.points[1], grid.x.points[2]] == grid.values[1, 2]
    curve = sample["IdlCtl_nSetp_CUR"]
    assert curve.to_frame()[curve.name].loc[curve.x.points[3]] == curve.values[3]
    for parameter in sample.parameters():
        assert isinstance(parameter.to_frame(), pandas.DataFrame)
    table = sample.to_frame()
    assert list(table.index) == [one.name for one in sample.parameters()]
    row = table.loc[MAP]
    assert (row["kind"], row["shape"], row["max"]) == (
        "GRUPPENKENNFELD",
        grid.values.shape,
        grid.values.max(),
    )
    assert table.loc["IdlCtl_nSetpBas_C", "value"] == 720 and table["x_unit"].notna().all()
    assert len(dcm.new().to_frame()) == 0


def test_plots(sample):
    from matplotlib import pyplot

    ax = sample[MAP].plot()
    assert np.array_equal(ax.images[0].get_array(), sample[MAP].values)
    assert "[1/min]" in ax.get_xlabel() and MAP in ax.get_title()
    assert ax.get_xticklabels()[0].get_text() == f"{sample[MAP].x.points[0]:g}"
    curve = sample["IdlCtl_nSetp_CUR"]
    line = curve.plot(ax=pyplot.subplots()[1], color="red").lines[0]
    assert np.array_equal(line.get_xydata().T, [curve.x.points, curve.values])
    assert line.get_color() == "red"
    for name in ("IgnAng_rLd_AX", "TqLim_trqGear_CA", "IdlCtl_coeffFlt_CA", "InjTi_phiEoi_MAP"):
        sample[name].plot(pyplot.subplots()[1]).figure.canvas.draw()
    dcm.Parameter("KENNLINIE", "k", [1, 2], x=["a", "b"]).plot().figure.canvas.draw()
    with pytest.raises(TypeError, match="one value or has texts"):
        sample["IdlCtl_nSetpBas_C"].plot()
    pyplot.close("all")


@pytest.mark.parametrize(
    ("package", "call"), [("pandas", "to_frame()"), ("matplotlib.pyplot", f"[{MAP!r}].plot()")]
)
def test_missing_packages_are_named(package, call):
    code = f"""
import sys
sys.modules[{package!r}] = None
import dcm
cal = dcm.read({str(SAMPLE)!r})
cal{call if call.startswith("[") else "." + call}
"""
    result = subprocess.run([sys.executable, "-c", code], capture_output=True, text=True)
    name = package.partition(".")[0]
    assert f"apt install python3-{name}" in result.stderr


def test_types_agree_with_the_module(tmp_path):
    config = tmp_path / "mypy.ini"
    config.write_text(
        "[mypy]\nstrict = true\ncache_dir = /dev/null\n"
        "[mypy-pandas.*,matplotlib.*]\nignore_missing_imports = true\n"
    )
    # Names of other modules, and what pybind11 does to its classes.
    others = tmp_path / "others"
    others.write_text(
        r"dcm\._\w+\.(Iterable|Mapping|NamedTuple|NDArray|Sequence|pandas|Axes|Document)(\..*)?" "\n"
    )
    command = [sys.executable, "-m", "mypy.stubtest", "dcm", "--mypy-config-file", config]
    command += ["--allowlist", others, "--concise"]
    environment = os.environ | {"MYPYPATH": str(ROOT / "bindings/python")}
    result = subprocess.run(command, capture_output=True, text=True, env=environment, cwd=tmp_path)
    assert result.returncode == 0, result.stdout + result.stderr


def test_public_names_have_docstrings():
    for name in dcm.__all__:
        thing = getattr(dcm, name)
        if callable(thing):
            assert thing.__doc__, name
        members = vars(thing).items() if isinstance(thing, type) else ()
        for member, value in members:
            if not member.startswith("_") and (callable(value) or isinstance(value, property)):
                assert value.__doc__, f"{name}.{member}"


def test_fleet_of_a_hundred_files(tmp_path):
    pytest.importorskip("distributed")
    cal = dcm.read(SAMPLE)
    for i in range(100):
        if i == 7:
            cal[MAP].values[1, 1] += 40
        if i == 8:
            cal[MAP].values[1, 1] -= 40
        folder = tmp_path / f"engine{i % 10}"
        folder.mkdir(exist_ok=True)
        part = cal.filter("Idl*") if i == 50 else cal
        part.write(folder / f"{i}.dcm")
    (tmp_path / "broken.dcm").mkdir()
    csv, picture = tmp_path / "table.csv", tmp_path / "spread.png"
    command = [sys.executable, ROOT / "examples/python/fleet.py", tmp_path, MAP]
    command += ["--workers", "2", "--csv", csv, "--plot", picture]
    result = subprocess.run(command, capture_output=True, text=True, timeout=600)
    assert result.returncode == 0, result.stderr
    table = pandas.read_csv(csv).set_index("file")
    assert len(table) == 101 and "101 of 101 files" in result.stderr
    worst = table.iloc[0]
    assert worst.name.endswith("/7.dcm") and worst["from median"] == 40
    assert (table["from median"] == 0).sum() == 98
    assert table.loc[str(tmp_path / "engine0/50.dcm"), "remark"] == f"no {MAP}"
    assert "directory" in table.loc[str(tmp_path / "broken.dcm"), "remark"]
    assert picture.read_bytes().startswith(b"\x89PNG")
