"""Calibrations: what a file holds, as a mapping."""

from __future__ import annotations

import fnmatch
import os
from collections.abc import Iterable, Iterator, Mapping
from itertools import chain
from typing import TYPE_CHECKING, Any

from dcm import _dcm
from dcm._difference import Differences
from dcm._encoding import code_page, unknown
from dcm._errors import ReadError, WriteError, file_error
from dcm._parameter import KINDS, Kind, Parameter
from dcm._report import Report, Severity

if TYPE_CHECKING:
    import pandas
    from numpy.typing import NDArray


def _path(path: str | os.PathLike[str]) -> str:
    text = os.fspath(path)
    if not isinstance(text, str):
        raise TypeError(f"the path is a {type(text).__name__}; it must be a str")
    if "\0" in text:
        raise ValueError("a path cannot hold a zero character")
    return text


def _first_doubt(report: Report, strict: bool) -> Any:
    return report.first(Severity.WARNING, Severity.ERROR) if strict else None


class Calibration(Mapping[str, Parameter]):
    """What a file holds: a mapping from names to parameters, in the order of export.

    That is the order of the kinds, within a kind that of the file or of adding. Names that stand
    twice are one key: `cal[name]` is the first parameter, `all(name)` are all of them, and so are
    `parameters()`. `len` counts the names.
    """

    #: The text at the top of the file without its "* ", each line ended by a line feed.
    comment: str
    #: Name of the codec with which the file was read; `write` takes it unless it is told another.
    encoding: str
    #: What reading has met; empty for a calibration that was not read.
    report: Report

    def __init__(
        self,
        parameters: Iterable[Parameter] = (),
        *,
        comment: str = "",
        encoding: str = "cp1252",
    ) -> None:
        self.comment = comment
        self.encoding = encoding
        self.report = Report()
        self._document: _dcm.Document | None = None
        self._kinds: dict[Kind, list[Parameter]] = {kind: [] for kind in KINDS}
        self._names: dict[str, list[Parameter]] | None = None
        for parameter in parameters:
            self.add(parameter)

    @property
    def _named(self) -> dict[str, list[Parameter]]:
        """The parameters of each name; made when a name is asked for."""
        if self._names is None:
            self._names = {}
            for parameter in self.parameters():
                self._names.setdefault(parameter.name, []).append(parameter)
        return self._names

    @property
    def _of_kind(self) -> dict[Kind, list[Parameter]]:
        """The parameters of each kind. Those of a file are made when one is asked for."""
        if self._document is not None:
            # They are in the order of export.
            parameters, kinds = Parameter._all_of(self._document), self._document.kinds()
            start = 0
            for number, kind in enumerate(KINDS):
                end = start + kinds.count(number)
                self._kinds[kind] = parameters[start:end]
                start = end
            self._document = None
        return self._kinds

    def __getstate__(self) -> dict[str, Any]:
        self._of_kind  # makes the parameters, which hold what the document does
        return self.__dict__

    def __getitem__(self, name: str) -> Parameter:
        """The first parameter of this name; KeyError if there is none."""
        return self._ordered(self._named[name])[0]

    def __iter__(self) -> Iterator[str]:
        return iter(dict.fromkeys(parameter.name for parameter in self.parameters()))

    def __len__(self) -> int:
        return len(self._named)

    def __contains__(self, name: object) -> bool:
        return name in self._named

    def __delitem__(self, name: str) -> None:
        """Removes all parameters of this name; KeyError if there is none."""
        for parameter in self._named.pop(name):
            self._drop(parameter)

    def all(self, name: str) -> list[Parameter]:
        """All parameters of this name, in the order of export; empty if there is none."""
        return self._ordered(self._named.get(name, []))

    def parameters(self) -> list[Parameter]:
        """All parameters in the order of export, those with equal names included."""
        return list(chain.from_iterable(self._of_kind.values()))

    def arrays(self) -> dict[str, NDArray[Any]]:
        """Copies of the values of all parameters by name, as `Parameter.values` has them.

        Faster than asking each parameter. Of names that stand twice it has the first. After a read
        the arrays of numbers are views of one block of memory: to keep a few for long, copy them.
        """
        if self._document is not None:
            return self._document.arrays()
        return {name: parameter.values.copy() for name, parameter in self.items()}

    def filter(self, pattern: str) -> Calibration:
        """The parameters whose names match a pattern such as "Ign*" (with *, ?, [...]).

        A calibration with the same parameters, not copies, comment and encoding.
        """
        return self._part(
            one for one in self.parameters() if fnmatch.fnmatchcase(one.name, pattern)
        )

    def of_kind(self, kind: Kind | str) -> Calibration:
        """The parameters of a kind, as `filter` gives them."""
        return self._part(self._of_kind[Kind(kind)])

    def add(self, parameter: Parameter) -> Parameter:
        """Adds a parameter after the others of its kind, itself and not a copy, and returns it."""
        if not isinstance(parameter, Parameter):
            raise TypeError(f"a {type(parameter).__name__} was given; it must be a Parameter")
        self._named.setdefault(parameter.name, []).append(parameter)
        self._of_kind[parameter.kind].append(parameter)
        return parameter

    def remove(self, parameter: Parameter | str) -> None:
        """Removes one parameter, or the first of a name; KeyError if it is not there."""
        if isinstance(parameter, str):
            parameter = self[parameter]
        same = self._named.get(parameter.name, [])
        position = next((i for i, one in enumerate(same) if one is parameter), None)
        if position is None:
            raise KeyError(parameter.name)
        del same[position]
        if not same:
            del self._named[parameter.name]
        self._drop(parameter)

    def write(
        self,
        path: str | os.PathLike[str],
        encoding: str | None = None,
        *,
        strict: bool = False,
    ) -> Report:
        """Writes a file beside `path` and renames it, and returns what the file does not keep.

        The file at `path` is whole and old or whole and new, whatever happens. A character that
        the encoding lacks is written as "?". With `strict` a `WriteError` is raised, and nothing
        written, if data would be lost or altered. Raises OSError, such as PermissionError or
        BlockingIOError (the file is open elsewhere), LookupError for an unknown encoding, TypeError
        for an entry of a parameter that is neither number nor text.
        """
        text = _path(path)
        encoding = self.encoding if encoding is None else encoding
        page = code_page(encoding)
        plain = [parameter._plain() for parameter in self.parameters()]
        report = Report()
        for to_null_device in (True, False) if strict else (False,):
            try:
                written, number, found = _dcm.write(text, page, self.comment, plain, to_null_device)
            except KeyError:
                raise unknown(encoding) from None
            report = Report(found)
            if not written:
                raise file_error(text, number, report, WriteError)
            doubt = _first_doubt(report, strict)
            if doubt:
                raise WriteError(text, doubt, report)
        return report

    def diff(
        self,
        other: Calibration,
        *,
        rtol: float = 0.0,
        atol: float = 0.0,
        ignore_texts: bool = False,
        ignore_units: bool = False,
        ignore_axes: bool = False,
    ) -> Differences:
        """What `other`, the new one, has otherwise than this one, the old one.

        Parameters are paired by kind and name. Numbers are the same when they differ by at most
        `atol`, or by at most `rtol` of the larger one (1e-6 is a millionth); with neither, only bit
        by bit. Leaves out LANGNAME, DISPLAYNAME and FUNKTION, units, or axes (values are then
        compared by index) if told so.
        """
        old, new = self.parameters(), other.parameters()
        plain = _dcm.diff(
            [one._plain() for one in old],
            [one._plain() for one in new],
            atol,
            rtol,
            ignore_texts,
            ignore_units,
            ignore_axes,
        )
        return Differences._of(plain, old, new)

    def to_frame(self) -> pandas.DataFrame:
        """A pandas frame with one row a parameter, names as index. Needs pandas.

        The columns are kind, texts, units and distributions, the shape of the values, the value of
        a FESTWERT or TEXTSTRING and the least, mean and largest number.
        """
        from dcm._frames import calibration_frame

        return calibration_frame(self.parameters())

    def _part(self, parameters: Iterable[Parameter]) -> Calibration:
        return Calibration(parameters, comment=self.comment, encoding=self.encoding)

    def _ordered(self, same: list[Parameter]) -> list[Parameter]:
        return sorted(same, key=lambda one: KINDS.index(one.kind)) if len(same) > 1 else list(same)

    def _drop(self, parameter: Parameter) -> None:
        same = self._of_kind[parameter.kind]
        del same[next(i for i, one in enumerate(same) if one is parameter)]

    def __repr__(self) -> str:
        return f"<Calibration: {len(self.parameters())} parameters>"


def new(*, comment: str = "", encoding: str = "cp1252") -> Calibration:
    """A calibration without parameters."""
    return Calibration(comment=comment, encoding=encoding)


def read(
    path: str | os.PathLike[str], encoding: str = "cp1252", *, strict: bool = False
) -> Calibration:
    """Reads a file; `encoding` is a name of Python's, such as "utf-8", "latin-1" or "cp850".

    Other threads run meanwhile, and the file is closed afterwards. With `strict` a `ReadError` is
    raised at the first warning or error of the report. Raises `ReadError`, too, for a file that
    cannot be read to its end, OSError for one that cannot be opened, such as FileNotFoundError,
    PermissionError or BlockingIOError (it is open elsewhere), LookupError for an unknown encoding.
    """
    text = _path(path)
    try:
        complete, number, document, found = _dcm.read(text, code_page(encoding))
    except KeyError:
        raise unknown(encoding) from None
    report = Report(found)
    if not complete:
        raise file_error(text, number, report, ReadError)
    doubt = _first_doubt(report, strict)
    if doubt:
        raise ReadError(text, doubt, report)
    result = Calibration(comment=document.comment, encoding=encoding)
    result._document = document
    result.report = report
    return result
