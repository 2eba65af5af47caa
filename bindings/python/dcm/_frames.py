"""Parameters and differences as pandas frames."""

from __future__ import annotations

from collections.abc import Iterable
from typing import Any

import numpy as np

from dcm._difference import Change, Difference
from dcm._optional import load
from dcm._parameter import Axis, Kind, Parameter


def parameter_frame(parameter: Parameter) -> Any:
    pandas = load("pandas", "to_frame")
    values, axes = parameter.values, parameter.axes
    if parameter.kind is Kind.STUETZSTELLENVERTEILUNG:
        return pandas.DataFrame({parameter.name: parameter.x.points})

    def index(axis: Axis, letter: str) -> Any:
        return pandas.Index(axis.points, name=axis._label(letter))

    if len(axes) == 2 and values.ndim == 2:
        return pandas.DataFrame(values, index=index(axes[1], "y"), columns=index(axes[0], "x"))
    if values.ndim == 2:
        return pandas.DataFrame(values)
    if len(axes) == 1 and len(axes[0]) == len(values):
        return pandas.DataFrame({parameter.name: values}, index=index(axes[0], "x"))
    return pandas.DataFrame({parameter.name: values})


def calibration_frame(parameters: Iterable[Parameter]) -> Any:
    pandas = load("pandas", "to_frame")
    rows = []
    for one in parameters:
        numbers = one.values
        if one.kind is Kind.STUETZSTELLENVERTEILUNG:
            numbers = one.x.points
        row: dict[str, Any] = {
            "name": one.name,
            "kind": one.kind.value,
            "langname": one.langname,
            "displayname": one.displayname,
            "function": one.function,
            "unit": one.unit,
            "shape": numbers.shape,
            "value": one.value if one.kind in (Kind.FESTWERT, Kind.TEXTSTRING) else None,
            "min": np.nan,
            "mean": np.nan,
            "max": np.nan,
        }
        for letter, axis in zip("xy", one.axes):
            row[f"{letter}_unit"] = axis.unit
            row[f"{letter}_distribution"] = axis.distribution
        if numbers.dtype == np.float64 and not np.isnan(numbers).all():
            row |= {"min": np.nanmin(numbers), "max": np.nanmax(numbers), "mean": np.nanmean(numbers)}
        rows.append(row)
    columns = """kind langname displayname function unit x_unit x_distribution y_unit y_distribution
        shape value min mean max""".split()
    frame = pandas.DataFrame(rows, columns=["name", *columns]).set_index("name")
    texts = columns[:9]
    frame[texts] = frame[texts].fillna("")
    return frame


def difference_frame(differences: Iterable[Difference]) -> Any:
    pandas = load("pandas", "to_frame")
    rows: list[tuple[Any, ...]] = []
    for one in differences:
        head = (one.name, one.kind.value, one.change.value)
        if one.change is not Change.CHANGED:
            rows.append((*head, "", None, None, None))
        rows += [(*head, field, None, old, new) for field, old, new in one.fields]
        for what in ("x", "y", "values"):
            for change in getattr(one, what):
                index = change.new_index if change.old_index is None else change.old_index
                rows.append((*head, what, index, change.old, change.new))
    columns = ["name", "kind", "change", "what", "index", "old", "new"]
    return pandas.DataFrame(rows, columns=columns)
