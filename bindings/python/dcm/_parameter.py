"""Parameters and their axes."""

from __future__ import annotations

import copy
import enum
import numbers
from typing import TYPE_CHECKING, Any, overload

import numpy as np
from numpy.typing import ArrayLike, NDArray

if TYPE_CHECKING:
    import pandas
    from matplotlib.axes import Axes

    from dcm._dcm import Document


class Kind(enum.Enum):
    """The kinds of blocks, in the order in which a file is written."""

    FESTWERT = "FESTWERT"
    FESTWERTEBLOCK = "FESTWERTEBLOCK"
    STUETZSTELLENVERTEILUNG = "STUETZSTELLENVERTEILUNG"
    KENNLINIE = "KENNLINIE"
    FESTKENNLINIE = "FESTKENNLINIE"
    GRUPPENKENNLINIE = "GRUPPENKENNLINIE"
    KENNFELD = "KENNFELD"
    FESTKENNFELD = "FESTKENNFELD"
    GRUPPENKENNFELD = "GRUPPENKENNFELD"
    TEXTSTRING = "TEXTSTRING"


KINDS = tuple(Kind)
_ORDER = {kind: index for index, kind in enumerate(KINDS)}
_SINGLE = (Kind.FESTWERT, Kind.TEXTSTRING)
_CURVES = (Kind.KENNLINIE, Kind.FESTKENNLINIE, Kind.GRUPPENKENNLINIE)
_MAPS = (Kind.KENNFELD, Kind.FESTKENNFELD, Kind.GRUPPENKENNFELD)


def _checked(entries: NDArray[Any], what: str) -> list[float | str | None]:
    """The entries of an array of objects, each as a number, a text or None."""
    result: list[float | str | None] = []
    for i, entry in enumerate(entries.ravel()):
        if entry is None:
            result.append(None)
        elif isinstance(entry, str):
            result.append(str(entry))
        elif isinstance(entry, (numbers.Real, np.bool_)):
            result.append(float(entry))
        else:
            index = ", ".join(map(str, np.unravel_index(i, entries.shape)))
            raise TypeError(
                f"{what}[{index}] is a {type(entry).__name__}; it must be a number, a text or None"
            )
    return result


def _array(given: ArrayLike, what: str) -> NDArray[Any]:
    """A new array of float64, or of objects if there is a text among the entries."""
    if isinstance(given, np.ndarray) and given.dtype.kind in "biuf":
        return np.array(given, dtype=np.float64, order="C")
    objects = np.array(given, dtype=object)
    entries = _checked(objects, what)
    if any(isinstance(entry, str) for entry in entries):
        result = np.empty(len(entries), dtype=object)
        result[:] = entries
    else:
        result = np.array(entries, dtype=np.float64)
    return result.reshape(objects.shape)


def _plain(entries: NDArray[Any], what: str) -> NDArray[np.float64] | list[float | str | None]:
    return entries if entries.dtype == np.float64 else _checked(entries, what)


def _shape_error(what: str, got: tuple[int, ...], wanted: object) -> ValueError:
    return ValueError(f"{what} have the shape {got}, and {wanted} is needed")


def _text(value: object, what: str) -> str:
    if not isinstance(value, str):
        raise TypeError(f"{what} is a {type(value).__name__}; it must be a str")
    return value


class _Text:
    """A text of a parameter, which is loaded when it is needed."""

    def __init__(self, doc: str) -> None:
        self.__doc__ = doc

    def __set_name__(self, owner: type, name: str) -> None:
        self._name = name
        self._slot = "_" + name

    @overload
    def __get__(self, instance: None, owner: type) -> _Text: ...
    @overload
    def __get__(self, instance: Parameter, owner: type) -> str: ...
    def __get__(self, instance: Parameter | None, owner: type) -> _Text | str:
        if instance is None:
            return self
        instance._load()
        text: str = getattr(instance, self._slot)
        return text

    def __set__(self, instance: Parameter, value: str) -> None:
        instance._load()
        setattr(instance, self._slot, _text(value, f"{self._name} of {instance._title()}"))


class Axis:
    """One axis of a curve or map, or the points of a distribution.

    `points` is an array of shape (number of points,): float64 in the unit of the axis, or objects
    where there are texts. A point without content is NaN, among texts None.
    """

    __slots__ = ("_points", "_fixed", "unit", "distribution")

    _points: NDArray[Any]
    #: Unit of the points, such as "1/min", as the file has it; empty for none.
    unit: str
    #: Name of the STUETZSTELLENVERTEILUNG that the axis shares; empty for none.
    distribution: str

    def __init__(self, points: ArrayLike = (), unit: str = "", distribution: str = "") -> None:
        self._fixed = False
        self.unit = _text(unit, "the unit of an axis")
        self.distribution = _text(distribution, "the distribution of an axis")
        self._points = self._checked(points)

    @property
    def points(self) -> NDArray[Any]:
        """The points, an array of the axis's own; a change in place is written.

        New points of an axis of a curve or map must be as many as the old ones: `Parameter.set`
        changes points and values together. Raises ValueError for another shape, TypeError for what
        is neither number nor text.
        """
        return self._points

    @points.setter
    def points(self, points: ArrayLike) -> None:
        self._points = self._checked(points)

    def _checked(self, points: ArrayLike) -> NDArray[Any]:
        array = _array(points, "points")
        if array.ndim != 1:
            raise _shape_error("points", array.shape, "one dimension")
        if self._fixed and len(array) != len(self._points):
            raise _shape_error("points", array.shape, f"{self._points.shape} of the axis")
        return array

    def __len__(self) -> int:
        return len(self._points)

    def _label(self, letter: str) -> str:
        name = self.distribution or letter
        return f"{name} [{self.unit}]" if self.unit else name

    def __repr__(self) -> str:
        return f"Axis({self._points!r}, unit={self.unit!r}, distribution={self.distribution!r})"


_NO_AXIS = Axis()


class Parameter:
    """One named block of any kind.

    What a kind does not have cannot be given: a FESTWERT or TEXTSTRING has one value and no axes, a
    FESTWERTEBLOCK values alone, a STUETZSTELLENVERTEILUNG the points of `x` alone, a curve `x` and
    values, a map `x`, `y` and values. `x` and `y` are an `Axis`, which is copied, or its points.
    Raises ValueError when the shapes of values and axes do not go together, TypeError for an entry
    that is neither number nor text.
    """

    __slots__ = (
        "_source",
        "_index",
        "_kind",
        "_name",
        "_loaded",
        "_langname",
        "_displayname",
        "_function",
        "_unit",
        "_counts",
        "_x",
        "_y",
        "_values",
        "__weakref__",
    )

    # Where the parameter was read. Its name is loaded when it is asked for, its texts and axes
    # together (then `_loaded` is true), its values (then not None), each by itself.
    _source: Document | None
    _name: str
    _counts: tuple[int, int]
    _values: NDArray[Any] | None

    langname = _Text("The long name; empty for none.")
    displayname = _Text("The short name for displays; empty for none.")
    function = _Text("The function that the parameter belongs to; empty for none.")
    unit = _Text('Unit of the values, such as "°C", as the file has it; empty for none.')

    def __init__(
        self,
        kind: Kind | str,
        name: str,
        values: ArrayLike = (),
        *,
        x: Axis | ArrayLike | None = None,
        y: Axis | ArrayLike | None = None,
        unit: str = "",
        langname: str = "",
        displayname: str = "",
        function: str = "",
    ) -> None:
        self._source = None
        self._index = 0
        self._loaded = True
        self._kind = Kind(kind)
        self._name = _text(name, "the name of a parameter")
        self._counts = (0, 0)
        self._x = self._y = _NO_AXIS
        self._values = np.empty(0)
        self.unit = unit
        self.langname = langname
        self.displayname = displayname
        self.function = function
        self.set(values, x=() if x is None else x, y=() if y is None else y)

    @classmethod
    def _all_of(cls, document: Document) -> list[Parameter]:
        """The parameters of a file. Their content is loaded when it is needed."""
        create = cls.__new__
        result = []
        for index, kind in enumerate(document.kinds()):
            one = create(cls)
            one._source = document
            one._index = index
            one._kind = KINDS[kind]
            one._loaded = False
            one._values = None
            result.append(one)
        return result

    def _load(self) -> None:
        if self._loaded:
            return
        assert self._source is not None
        texts = self._source.attributes(self._index)
        self._langname, self._displayname, self._function, self._unit = texts[:4]
        self._counts = (texts[4], texts[5])
        fixed = self._kind is not Kind.STUETZSTELLENVERTEILUNG
        for slot, (unit, distribution, points) in (("_x", texts[6:9]), ("_y", texts[9:12])):
            axis = Axis.__new__(Axis)
            axis._points = points
            axis._fixed = fixed
            axis.unit = unit
            axis.distribution = distribution
            setattr(self, slot, axis)
        self._loaded = True

    def _title(self) -> str:
        return f"{self._kind.value} {self.name}"

    @property
    def kind(self) -> Kind:
        """The kind of the block."""
        return self._kind

    @property
    def name(self) -> str:
        """The name. `copy` makes a parameter with another one."""
        try:
            return self._name
        except AttributeError:
            assert self._source is not None
            self._name = self._source.name(self._index)
            return self._name

    def _has(self, letter: str) -> bool:
        if letter == "x" and self._kind in (*_CURVES, Kind.STUETZSTELLENVERTEILUNG):
            return True
        return self._kind in _MAPS

    def _axis(self, letter: str) -> Axis:
        if not self._has(letter):
            raise AttributeError(f"{self._title()} has no axis {letter}")
        self._load()
        return self._x if letter == "x" else self._y

    @property
    def x(self) -> Axis:
        """The axis along the columns. AttributeError for kinds without it."""
        return self._axis("x")

    @x.setter
    def x(self, axis: Axis | ArrayLike) -> None:
        self.set(x=axis)

    @property
    def y(self) -> Axis:
        """The axis along the rows of a map. AttributeError for kinds without it."""
        return self._axis("y")

    @y.setter
    def y(self, axis: Axis | ArrayLike) -> None:
        self.set(y=axis)

    @property
    def axes(self) -> tuple[Axis, ...]:
        """The axes that the kind has: none, x, or x and y."""
        return tuple(self._axis(letter) for letter in "xy" if self._has(letter))

    @property
    def values(self) -> NDArray[Any]:
        """The values in `unit`, an array of the parameter's own; a change in place is written.

        The shape is (points of y, points of x) for a map, (points of x,) for a curve, (rows,
        columns) for a FESTWERTEBLOCK in rows and (number of values,) for one without, (1,) for a
        FESTWERT or TEXTSTRING, (0,) when that has no value. Values of a file that do not fill the
        grid are one row. Numbers are float64; where there are texts the array is one of objects.
        An entry without a value is NaN, among texts None, and is not written as a number.

        New values must have the shape that the axes ask for; those of a FESTWERTEBLOCK may have any
        of one or two dimensions. Raises ValueError for another shape, TypeError for what is neither
        number nor text.
        """
        if self._values is None:
            assert self._source is not None
            self._values = self._source.values(self._index)
        return self._values

    @values.setter
    def values(self, values: ArrayLike) -> None:
        self.set(values)

    @property
    def value(self) -> float | str | None:
        """The value of a FESTWERT (in `unit`) or TEXTSTRING; None when there is none.

        AttributeError for other kinds.
        """
        self._need_single()
        if self.values.size == 0:
            return None
        entry: float | str | None = self.values.item(0)
        return None if entry != entry else entry

    @value.setter
    def value(self, value: float | str | None) -> None:
        self._need_single()
        array = _array(() if value is None else [value], f"values of {self._title()}")
        if array.shape == self.values.shape and array.dtype == self.values.dtype:
            self.values[:] = array
        else:
            self.set(array)

    def _need_single(self) -> None:
        if self._kind not in _SINGLE:
            raise AttributeError(f"{self._title()} has values and no single value")

    def set(
        self,
        values: ArrayLike | None = None,
        *,
        x: Axis | ArrayLike | None = None,
        y: Axis | ArrayLike | None = None,
    ) -> None:
        """Gives values and axes together; what is not given stays, and so do units.

        An `Axis` is copied. Raises ValueError, and changes nothing, when their shapes do not go
        together; TypeError for an entry that is neither number nor text.
        """
        self._load()
        title = self._title()
        axes: dict[str, Axis] = {}
        for letter, given, old in (("x", x, self._x), ("y", y, self._y)):
            if given is None:
                continue
            if isinstance(given, Axis):
                axis = Axis(given.points, given.unit, given.distribution)
            else:
                axis = Axis(_array(given, f"points of {letter} of {title}"), old.unit, old.distribution)
            if len(axis) and not self._has(letter):
                raise ValueError(f"{title} has no axis {letter}")
            axis._fixed = self._kind is not Kind.STUETZSTELLENVERTEILUNG
            axes[letter] = axis
        columns = len(axes.get("x", self._x))
        rows = len(axes.get("y", self._y))
        array = self.values if values is None else _array(values, f"values of {title}")
        if array.ndim == 0:
            array = array.reshape(1)
        if not array.size and values is not None and self._kind in _MAPS:
            array = array.reshape(rows, columns) if rows * columns == 0 else array
        counts = self._counts
        what = f"values of {title}"
        if self._kind is Kind.FESTWERTEBLOCK:
            if array.ndim > 2:
                raise _shape_error(what, array.shape, "one or two dimensions")
            if values is not None:
                if not array.size:
                    array = array.reshape(0)
                counts = (array.shape[1], array.shape[0]) if array.ndim == 2 else (0, 0)
        else:
            if values is not None or axes:
                counts = (0, 0)
            self._check(what, array, rows, columns)
        self._values = array
        self._counts = counts
        self._x = axes.get("x", self._x)
        self._y = axes.get("y", self._y)

    def _check(self, what: str, array: NDArray[Any], rows: int, columns: int) -> None:
        wanted: tuple[int, ...]
        if self._kind in _SINGLE:
            if array.shape not in ((0,), (1,)):
                raise _shape_error(what, array.shape, "(1,)")
            if self._kind is Kind.TEXTSTRING and array.size and not isinstance(array[0], str):
                raise TypeError(f"{what}[0] is a {type(array[0]).__name__}; it must be a text")
            return
        if self._kind is Kind.STUETZSTELLENVERTEILUNG:
            wanted = (0,)
        else:
            wanted = (columns,) if self._kind in _CURVES else (rows, columns)
        if array.shape != wanted:
            points = "" if wanted == (0,) else " for the points of its axes"
            raise _shape_error(what, array.shape, f"{wanted}{points}")

    def copy(self, name: str | None = None) -> Parameter:
        """A copy with arrays of its own, under another name if one is given."""
        result = copy.deepcopy(self)
        if name is not None:
            result._name = _text(name, "the name of a parameter")
        return result

    def interpolate(self, x: ArrayLike, y: ArrayLike | None = None) -> Any:
        """The value at a point between those of the axes, as a control unit looks it up.

        Linear between the points; beyond the first and last their values are held. `x` and `y` are
        in the units of the axes, numbers or arrays, whose shapes are broadcast; the result has
        that shape and is in `unit`. A curve takes `x`, a map `x` and `y`. Raises TypeError for
        other kinds and for texts, ValueError when points decrease or there are none.
        """
        from dcm._interpolate import interpolate

        return interpolate(self, x, y)

    def to_frame(self) -> pandas.DataFrame:
        """A pandas frame: columns are the points of x, the index those of y; a curve and the points
        of a distribution have one column. Needs pandas."""
        from dcm._frames import parameter_frame

        return parameter_frame(self)

    def plot(self, ax: Axes | None = None, **options: Any) -> Axes:
        """Draws the values with matplotlib, which it needs, and returns the matplotlib axes.

        A curve is a line over its points, a map a grid of colours with the points of its axes, a
        FESTWERTEBLOCK a line or a grid over the indices, a distribution a line of its points. `ax`
        are axes to draw in, otherwise a new figure is made; `options` go to `plot` or `imshow`.
        Raises TypeError for a FESTWERT, a TEXTSTRING and values that are texts.
        """
        from dcm._plot import plot

        return plot(self, ax, options)

    def _plain(self) -> tuple[Any, ...]:
        """What the compiled part takes. Without a change that is where the parameter came from."""
        if self._source is not None and not self._loaded and self._values is None:
            return (self._source, self._index)
        self._load()
        title = self._title()
        axes = []
        for letter, axis in (("x", self._x), ("y", self._y)):
            axes += [
                _text(axis.unit, f"unit of {letter} of {title}"),
                _text(axis.distribution, f"distribution of {letter} of {title}"),
                _plain(axis.points, f"points of {letter} of {title}"),
            ]
        texts = (self.name, self._langname, self._displayname, self._function, self._unit)
        values = _plain(self.values, f"values of {title}")
        return (_ORDER[self._kind], *texts, *self._counts, *axes, values)

    def __getstate__(self) -> dict[str, Any]:
        self._load()
        state = {"_values": self.values, "_name": self.name, "_source": None, "_index": 0}
        kept = [slot for slot in self.__slots__ if slot not in state and slot != "__weakref__"]
        return state | {slot: getattr(self, slot) for slot in kept}

    def __setstate__(self, state: dict[str, Any]) -> None:
        for slot, value in state.items():
            setattr(self, slot, value)

    def __repr__(self) -> str:
        shape = " x ".join(map(str, self.values.shape))
        if self._kind is Kind.STUETZSTELLENVERTEILUNG:
            shape = str(len(self.x))
        what = repr(self.value) if self._kind in _SINGLE else shape
        return f"<{self._title()}: {what}{' ' if self.unit else ''}{self.unit}>"
