"""Values between the points of the axes."""

from __future__ import annotations

from typing import Any

import numpy as np
from numpy.typing import ArrayLike, NDArray

from dcm._parameter import Axis, Parameter

_Numbers = NDArray[np.float64]


def _position(axis: Axis, at: ArrayLike, what: str) -> tuple[NDArray[np.intp], Any, _Numbers]:
    """Between which two points `at` is, and how much of the way to the second one."""
    points = axis.points
    if points.dtype != np.float64:
        raise TypeError(f"{what} has texts as points")
    if not len(points) or not (np.diff(points) >= 0).all():
        raise ValueError(f"the points of {what} must increase and be at least one")
    wanted = np.asarray(at, dtype=np.float64)
    low = np.clip(np.searchsorted(points, wanted, side="right") - 1, 0, max(len(points) - 2, 0))
    high = np.minimum(low + 1, len(points) - 1)
    # Steps of infinite length, or of none, have no way in between: only their ends.
    with np.errstate(invalid="ignore", divide="ignore"):
        part = (wanted - points[low]) / (points[high] - points[low])
    part = np.where(wanted <= points[low], 0.0, np.where(wanted >= points[high], 1.0, part))
    return low, high, part


def _between(first: _Numbers, second: _Numbers, part: _Numbers) -> _Numbers:
    # At a point its value counts alone, even beside an infinite one.
    with np.errstate(invalid="ignore"):
        inside = first + (second - first) * part
    result: _Numbers = np.where(part == 0, first, np.where(part == 1, second, inside))
    return result


def interpolate(parameter: Parameter, x: ArrayLike, y: ArrayLike | None) -> Any:
    axes, values, title = parameter.axes, parameter.values, parameter._title()
    if not axes or parameter.values.size == 0:
        raise TypeError(f"{title} has no values over axes")
    if (y is None) != (len(axes) == 1):
        raise TypeError(f"{title} is looked up at {'x' if len(axes) == 1 else 'x and y'}")
    if values.dtype != np.float64:
        raise TypeError(f"the values of {title} are texts")
    if values.shape != tuple(len(axis) for axis in reversed(axes)):
        raise ValueError(f"the values of {title} do not fill its grid")
    low, high, part = _position(axes[0], x, f"axis x of {title}")
    if y is None:
        result = _between(values[low], values[high], part)
    else:
        row, next_row, down = _position(axes[1], y, f"axis y of {title}")
        row, next_row, down, low, high, part = np.broadcast_arrays(
            row, next_row, down, low, high, part
        )
        first = _between(values[row, low], values[row, high], part)
        second = _between(values[next_row, low], values[next_row, high], part)
        result = _between(first, second, down)
    return result if result.ndim else float(result)
