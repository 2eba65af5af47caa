"""Parameters, axes and the mapping."""

import copy

import dcm
import numpy as np
import pytest
from conftest import SAMPLE

MAP = "IgnAng_phiBas_GMAP"


def test_kinds_are_those_of_the_library():
    from dcm import _dcm

    assert tuple(kind.value for kind in dcm.Kind) == _dcm.KINDS


def test_content_of_the_sample(sample):
    grid = sample[MAP]
    assert grid.kind is dcm.Kind.GRUPPENKENNFELD
    assert grid.values.dtype == np.float64
    assert grid.values.shape == (len(grid.y), len(grid.x))
    assert grid.x.distribution and grid.x.unit == "1/min"
    assert sample["IdlCtl_nSetpBas_C"].value == 720.0
    assert sample["IgnAng_phiOfs_C"].unit == "°KW"
    assert "Datenstand" in sample.comment
    text = next(iter(sample.of_kind("TEXTSTRING").values()))
    assert isinstance(text.value, str) and text.values.dtype == object


def test_changes_in_place_are_written(tmp_path, sample):
    sample[MAP].values[2, 3] = 99.5
    sample[MAP].x.points += 0.25
    sample["IdlCtl_nSetpBas_C"].value = 780.0
    sample["IgnAng_phiOfs_C"].unit = "rad"
    sample.write(tmp_path / "out.dcm")
    again, old = dcm.read(tmp_path / "out.dcm"), dcm.read(SAMPLE)
    assert again[MAP].values[2, 3] == 99.5
    assert (again[MAP].x.points == old[MAP].x.points + 0.25).all()
    changed = {one.name for one in old.diff(again)}
    assert changed == {MAP, "IdlCtl_nSetpBas_C", "IgnAng_phiOfs_C"}


def test_mapping_in_the_order_of_export(sample):
    names = list(sample)
    assert len(sample) == len(names) and names[0] in sample and "none" not in sample
    assert [one.kind for one in sample.parameters()] == sorted(
        (one.kind for one in sample.parameters()), key=list(dcm.Kind).index
    )
    assert list(sample.filter("Ign*")) == [name for name in names if name.startswith("Ign")]
    assert sample.filter("Ign*")[MAP] is sample[MAP]
    assert set(sample.of_kind(dcm.Kind.KENNFELD)) <= set(names)
    with pytest.raises(KeyError):
        sample["none"]


def test_names_that_stand_twice(tmp_path):
    cal = dcm.new()
    grid = cal.add(dcm.Parameter("KENNLINIE", "twice", [1.0], x=[0.0]))
    first = cal.add(dcm.Parameter(dcm.Kind.FESTWERT, "twice", 1))
    second = cal.add(dcm.Parameter(dcm.Kind.FESTWERT, "twice", 2))
    assert cal["twice"] is first and cal.all("twice") == [first, second, grid]
    assert len(cal) == 1 and list(cal) == ["twice"] and cal.parameters() == [first, second, grid]
    cal.write(tmp_path / "twice.dcm")
    assert [one.values[0] for one in dcm.read(tmp_path / "twice.dcm").all("twice")] == [1, 2, 1]
    cal.remove("twice")
    assert cal.parameters() == [second, grid]
    with pytest.raises(KeyError):
        cal.remove(first)
    del cal["twice"]
    assert not cal.parameters() and cal.all("twice") == []


@pytest.mark.parametrize(
    ("arguments", "words"),
    [
        (("KENNFELD", "m", np.zeros((3, 4)), [1, 2, 3], [1, 2, 3]), ["KENNFELD m", "(3, 4)", "(3, 3)"]),
        (("KENNLINIE", "k", [1, 2], [1, 2, 3]), ["KENNLINIE k", "(2,)", "(3,)"]),
        (("FESTWERT", "f", [1, 2]), ["FESTWERT f", "(2,)", "(1,)"]),
        (("FESTWERT", "f", 1, [1]), ["FESTWERT f", "axis x"]),
        (("FESTWERTEBLOCK", "b", np.zeros((1, 1, 1))), ["(1, 1, 1)", "two dimensions"]),
        (("STUETZSTELLENVERTEILUNG", "s", [1], [1]), ["(1,)", "(0,)"]),
        (("KENNFELD", "m", [[1.0]], [[1.0]], [1.0]), ["points", "(1, 1)", "one dimension"]),
        (("KENNUNG", "m"), ["KENNUNG"]),
    ],
)
def test_shapes_are_checked(arguments, words):
    kind, name, *rest = arguments
    given = dict(zip(("values", "x", "y"), rest))
    with pytest.raises(ValueError) as caught:
        dcm.Parameter(kind, name, **given)
    for word in words:
        assert word in str(caught.value)


@pytest.mark.parametrize(
    ("change", "words"),
    [
        (lambda p: setattr(p, "values", [[1.0, {}], [2, 3]]), ["values of KENNFELD m[0, 1]", "dict"]),
        (lambda p: p.set(x=[1, 2j]), ["points of x of KENNFELD m[1]", "complex"]),
        (lambda p: setattr(p, "unit", 3), ["unit of KENNFELD m", "int"]),
        (lambda p: p.copy(name=3), ["name", "int"]),
    ],
)
def test_wrong_types_say_which_and_where(change, words):
    grid = dcm.Parameter("KENNFELD", "m", [[1, 2], [3, 4]], x=[1, 2], y=[1, 2])
    with pytest.raises(TypeError) as caught:
        change(grid)
    for word in words:
        assert word in str(caught.value)
    assert grid.values.tolist() == [[1, 2], [3, 4]] and grid.x.points.tolist() == [1, 2]


def test_wrong_type_in_place_is_met_when_writing(tmp_path):
    cal = dcm.new()
    block = cal.add(dcm.Parameter("FESTWERTEBLOCK", "b", ["a", "b"]))
    block.values[1] = []
    with pytest.raises(TypeError, match=r"FESTWERTEBLOCK b\[1\] is a list"):
        cal.write(tmp_path / "no.dcm")
    assert not (tmp_path / "no.dcm").exists()


def test_axes_and_values_change_together():
    curve = dcm.Parameter("KENNLINIE", "k", [1, 2], x=dcm.Axis([1, 2], "s"))
    with pytest.raises(ValueError, match=r"\(3,\).*\(2,\)"):
        curve.x.points = [1, 2, 3]
    with pytest.raises(ValueError, match=r"\(3,\).*\(2,\)"):
        curve.values = [1, 2, 3]
    curve.set([1, 2, 3], x=[4, 5, 6])
    assert curve.x.points.tolist() == [4, 5, 6] and curve.x.unit == "s"
    with pytest.raises(AttributeError):
        curve.y
    with pytest.raises(AttributeError):
        curve.value
    mine = np.array([7.0, 8.0, 9.0])
    curve.values = mine
    mine[0] = 0
    assert curve.values[0] == 7, "the parameter has an array of its own"


def test_rows_of_a_value_block(tmp_path):
    cal = dcm.new()
    cal.add(dcm.Parameter("FESTWERTEBLOCK", "rows", [[1, 2, 3], [4, 5, 6]]))
    cal.add(dcm.Parameter("FESTWERTEBLOCK", "list", [1, 2, 3]))
    cal.write(tmp_path / "rows.dcm")
    again = dcm.read(tmp_path / "rows.dcm")
    assert again["rows"].values.tolist() == [[1, 2, 3], [4, 5, 6]]
    assert again["list"].values.shape == (3,)


def test_entries_without_a_value_and_grids_that_are_not_filled(tmp_path):
    file = tmp_path / "odd.dcm"
    file.write_text(
        "FESTWERT none\nEND\n\n"
        "KENNFELD full 2 1\nST/X 1 2\nST/Y 1\nWERT 1 2\nEND\n\n"
        "KENNLINIE short 3\nST/X 1 2 3\nWERT 1 2\nEND\n\n"
    )
    cal = dcm.read(file)
    assert cal["none"].value is None and cal["none"].values.shape == (0,)
    assert cal["short"].values.tolist() == [1, 2] and len(cal["short"].x) == 3
    assert cal["full"].values.shape == (1, 2)
    cal["short"].values[0] = 5
    cal["full"].values[0, 0] = np.nan
    cal.write(tmp_path / "out.dcm")
    assert dcm.read(tmp_path / "out.dcm")["short"].values.tolist() == [5, 2]
    cal["none"].value = "word"
    assert cal["none"].values.dtype == object
    cal["none"].value = None
    assert cal["none"].value is None
    mixed = dcm.Parameter("FESTWERTEBLOCK", "b", ["a", None, 3])
    assert mixed.values.tolist() == ["a", None, 3.0]
    assert np.isnan(dcm.Parameter("FESTWERTEBLOCK", "b", [1, None]).values[1])


def test_copies_have_arrays_of_their_own(sample):
    for other in (sample[MAP].copy(), copy.deepcopy(sample[MAP]), sample[MAP].copy("other")):
        other.values[0, 0] = 1e9
        other.x.unit = "x"
        assert sample[MAP].values[0, 0] != 1e9 and sample[MAP].x.unit != "x"
    assert other.name == "other" and MAP in repr(sample[MAP])


@pytest.mark.parametrize(
    ("x", "y", "wanted"),
    [
        (1, 10, 0), (3, 10, 2), (1.5, 10, 0.5), (1.5, 20, 10.5), (2.5, 15, 6.5),
        (-9, -9, 0), (99, 99, 12), (99, 10, 2), (1, 99, 10),
        ([1, 2, 3], 15, [5, 6, 7]),
        ([[1], [2]], [10, 20], [[0, 10], [1, 11]]),
    ],
)
def test_interpolation_of_a_map(x, y, wanted):
    grid = dcm.Parameter("KENNFELD", "m", [[0, 1, 2], [10, 11, 12]], x=[1, 2, 3], y=[10, 20])
    assert np.array_equal(grid.interpolate(x, y=y), wanted)


def test_interpolation_of_curves_and_odd_points():
    curve = dcm.Parameter("KENNLINIE", "k", [0, 4, 6, np.inf], x=[0, 2, 2, 3])
    assert [curve.interpolate(x) for x in (-1, 0, 1, 2, 4)] == [0, 0, 2, 6, np.inf]
    assert np.isnan(curve.interpolate(np.nan))
    assert dcm.Parameter("KENNLINIE", "k", [7], x=[1]).interpolate([0, 1, 2]).tolist() == [7, 7, 7]
    for wrong, error in [
        (dcm.Parameter("KENNLINIE", "k", [1, 2], x=[2, 1]), ValueError),
        (dcm.Parameter("KENNLINIE", "k", [1, 2], x=["a", "b"]), TypeError),
        (dcm.Parameter("KENNLINIE", "k", ["a"], x=[2]), TypeError),
        (dcm.Parameter("FESTWERT", "f", 1), TypeError),
        (dcm.Parameter("KENNFELD", "m", [[1]], x=[1], y=[1]), TypeError),
    ]:
        with pytest.raises(error):
            wrong.interpolate(1.0)


def test_diff_has_objects(sample):
    other = dcm.read(SAMPLE)
    other[MAP].values[1, 2] += 1e-7
    other["IdlCtl_nSetp_CUR"].x.points[0] -= 10
    other["IdlCtl_nSetpBas_C"].unit = "rpm"
    removed = other["IgnAng_phiOfs_C"]
    other.remove(removed)
    added = other.add(removed.copy("added"))
    found = sample.diff(other)
    by_name = {one.name: one for one in found}
    assert len(found) == len(by_name) == 5
    assert by_name["added"].change is dcm.Change.ADDED and by_name["added"].new is added
    assert by_name["IgnAng_phiOfs_C"].change is dcm.Change.REMOVED
    assert by_name["IgnAng_phiOfs_C"].new is None
    assert by_name["IdlCtl_nSetpBas_C"].fields == [("EINHEIT_W", "1/min", "rpm")]
    grid, curve = by_name[MAP], by_name["IdlCtl_nSetp_CUR"]
    assert curve.x[0].old_index == (0,) and curve.x[0].new == curve.x[0].old - 10
    assert [one.old_index for one in grid.values] == [(1, 2)]
    assert grid.old is sample[MAP] and grid.values[0].new == other[MAP].values[1, 2]
    assert MAP not in {one.name for one in sample.diff(other, rtol=1e-6)}
    assert not sample.diff(sample)
    assert {one.name for one in sample.diff(other, ignore_units=True, ignore_axes=True, atol=1)} == {
        "added",
        "IgnAng_phiOfs_C",
    }
    frame = found.to_frame()
    assert frame[frame.what == "EINHEIT_W"].iloc[0].tolist()[-2:] == ["1/min", "rpm"]
    assert len(frame) == 2 + 1 + 1 + len(curve.x) + len(curve.values)
