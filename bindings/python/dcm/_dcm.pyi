from typing import Any

from numpy.typing import NDArray

KINDS: tuple[str, ...]
VERSION: str

_Report = tuple[list[tuple[int, str, int, str, str]], int, int, int, bool]
_Index = int | None
_Values = list[tuple[_Index, _Index, float | str | None, float | str | None]]

class Document:
    @property
    def comment(self) -> str: ...
    def __len__(self) -> int: ...
    def name(self, index: int) -> str: ...
    def kinds(self) -> bytes: ...
    def values(self, index: int) -> NDArray[Any]: ...
    def arrays(self) -> dict[str, NDArray[Any]]: ...
    def attributes(self, index: int) -> tuple[Any, ...]: ...

def read(path: str, code_page: int) -> tuple[bool, int, Document, _Report]: ...
def write(
    path: str,
    code_page: int,
    comment: str,
    parameters: list[tuple[Any, ...]],
    to_null_device: bool,
) -> tuple[bool, int, _Report]: ...
def diff(
    old: list[tuple[Any, ...]],
    new: list[tuple[Any, ...]],
    absolute: float,
    relative: float,
    ignore_texts: bool,
    ignore_units: bool,
    ignore_axes: bool,
) -> list[
    tuple[int, int, str, _Index, _Index, list[tuple[str, str, str]], _Values, _Values, _Values]
]: ...
