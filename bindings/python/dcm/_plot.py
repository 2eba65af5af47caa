"""Parameters as matplotlib draws them."""

from __future__ import annotations

from typing import Any

import numpy as np

from dcm._optional import load
from dcm._parameter import Axis, Kind, Parameter

_LABELS_MAX = 12


def _label(points: Any, step: int) -> list[str]:
    return [one if isinstance(one, str) else f"{one:g}" for one in points[::step]]


def _ticks(axis: Any, points: Any) -> None:
    """The points as labels of equal cells, as many of them as can be read."""
    step = -(-len(points) // _LABELS_MAX)
    axis.set_ticks(np.arange(0, len(points), step), _label(points, step))


def plot(parameter: Parameter, ax: Any, options: dict[str, Any]) -> Any:
    title = parameter._title()
    values = parameter.values
    axes = list(parameter.axes)
    value_label = f"[{parameter.unit}]" if parameter.unit else ""
    if parameter.kind is Kind.STUETZSTELLENVERTEILUNG:
        values, value_label, axes = axes[0].points, axes[0]._label("x"), []
    if parameter.kind in (Kind.FESTWERT, Kind.TEXTSTRING) or values.dtype != np.float64:
        raise TypeError(f"{title} has nothing to draw: it is one value or has texts")
    if ax is None:
        ax = load("matplotlib.pyplot", "plot").subplots(layout="constrained")[1]
    if values.ndim == 2 and values.size:
        image = ax.imshow(values, **({"aspect": "auto", "origin": "lower"} | options))
        ax.figure.colorbar(image, ax=ax, label=value_label)
        for axis, letter, mine in zip((ax.xaxis, ax.yaxis), "xy", axes or (None, None)):
            if mine is not None:
                _ticks(axis, mine.points)
            axis.set_label_text("index" if mine is None else mine._label(letter))
    else:
        over = axes[0] if len(axes) == 1 and len(axes[0]) == len(values) else None
        _line(ax, over, values, {"marker": "o"} | options)
        ax.set_ylabel(value_label)
    longer = f"\n{parameter.langname}" if parameter.langname else ""
    ax.set_title(parameter.name + longer)
    return ax


def _line(ax: Any, over: Axis | None, values: Any, options: dict[str, Any]) -> None:
    if over is None or over.points.dtype != np.float64:
        ax.plot(np.arange(len(values)), values, **options)
        if over is not None:
            _ticks(ax.xaxis, over.points)
    else:
        ax.plot(over.points, values, **options)
        ax.grid(alpha=0.3)
    ax.set_xlabel("index" if over is None else over._label("x"))
