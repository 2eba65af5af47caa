"""What two calibrations differ in."""

from __future__ import annotations

import enum
from collections.abc import Sequence
from dataclasses import dataclass
from typing import TYPE_CHECKING, Any, NamedTuple, overload

from dcm._parameter import KINDS, Kind, Parameter

if TYPE_CHECKING:
    import pandas


class Change(enum.Enum):
    """What kind of difference there is."""

    #: Only the new calibration has the parameter.
    ADDED = "added"
    #: Only the old one has it.
    REMOVED = "removed"
    #: Both have it, and it differs.
    CHANGED = "changed"


class FieldChange(NamedTuple):
    """A text or a count that differs."""

    #: The keyword in the file, such as "LANGNAME" or "EINHEIT_W"; "X" and "Y" for counts.
    field: str
    old: str
    new: str


class ValueChange(NamedTuple):
    """A value or an axis point that differs. What one side lacks is None there, as is its index."""

    #: Indices into `values` or `points`, a tuple with one number for each dimension.
    old_index: tuple[int, ...] | None
    new_index: tuple[int, ...] | None
    old: float | str | None
    new: float | str | None


@dataclass(frozen=True)
class Difference:
    """One parameter that is not the same on both sides."""

    change: Change
    kind: Kind
    name: str
    #: The parameters; None on the side that has none.
    old: Parameter | None
    new: Parameter | None
    #: For a changed parameter: its texts and counts, points and values that differ.
    fields: list[FieldChange]
    x: list[ValueChange]
    y: list[ValueChange]
    values: list[ValueChange]


def _index(flat: int | None, shape: tuple[int, ...]) -> tuple[int, ...] | None:
    if flat is None:
        return None
    return divmod(flat, shape[1]) if len(shape) == 2 else (flat,)


def _changes(plain: Any, old: tuple[int, ...], new: tuple[int, ...]) -> list[ValueChange]:
    return [ValueChange(_index(i, old), _index(j, new), a, b) for i, j, a, b in plain]


class Differences(Sequence[Difference]):
    """The parameters that differ, in the order of export: a sequence, empty if there are none."""

    def __init__(self, differences: Sequence[Difference] = ()) -> None:
        self._differences = tuple(differences)

    @classmethod
    def _of(cls, plain: Any, old: list[Parameter], new: list[Parameter]) -> Differences:
        result = []
        for change, kind, name, old_index, new_index, fields, x, y, values in plain:
            before = None if old_index is None else old[old_index]
            after = None if new_index is None else new[new_index]
            shapes = [one.values.shape if one and values else () for one in (before, after)]
            result.append(
                Difference(
                    tuple(Change)[change],
                    KINDS[kind],
                    name,
                    before,
                    after,
                    [FieldChange(*one) for one in fields],
                    _changes(x, (), ()),
                    _changes(y, (), ()),
                    _changes(values, *shapes),
                )
            )
        return cls(result)

    @overload
    def __getitem__(self, index: int) -> Difference: ...
    @overload
    def __getitem__(self, index: slice) -> Sequence[Difference]: ...
    def __getitem__(self, index: int | slice) -> Difference | Sequence[Difference]:
        return self._differences[index]

    def __len__(self) -> int:
        return len(self._differences)

    def to_frame(self) -> pandas.DataFrame:
        """A pandas frame with one row for each text, point or value that differs. Needs pandas.

        The columns are name, kind, change, what differs ("LANGNAME", "x", "values" and so on),
        the index on the old side or, where that lacks it, on the new one, old and new content. An
        added or removed parameter is one row.
        """
        from dcm._frames import difference_frame

        return difference_frame(self._differences)

    def __repr__(self) -> str:
        counts = (
            f"{sum(one.change is change for one in self)} {change.value}" for change in Change
        )
        return f"<Differences: {', '.join(counts)}>"
