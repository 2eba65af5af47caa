"""What reading or writing a file has met."""

from __future__ import annotations

import enum
from collections.abc import Sequence
from typing import Any, NamedTuple, overload


class Severity(enum.Enum):
    """How much a finding matters."""

    #: Something is not kept, or may be meant so; no data are lost.
    NOTE = "note"
    #: Data are doubtful, or altered in a way that may matter.
    WARNING = "warning"
    #: Data are lost, or the work ended before its end.
    ERROR = "error"


class Finding(NamedTuple):
    """One thing that reading or writing has met."""

    severity: Severity
    #: The kind of finding, such as "unfinished-block"; the same in all later versions.
    id: str
    #: The line in the file, from 1; 0 when the finding concerns no line.
    line: int
    #: Keyword and name, such as "KENNFELD IgnMap"; empty outside of a block.
    block: str
    #: One English sentence.
    message: str

    def __str__(self) -> str:
        line = f"line {self.line}: " if self.line else ""
        block = f" ({self.block})" if self.block else ""
        return f"{line}{self.severity.value}: {self.message}{block}"


_SEVERITIES = tuple(Severity)


class Report(Sequence[Finding]):
    """The findings of a file, in the order of their lines: a sequence.

    At most 1000 findings of one id are listed, all are counted; `incomplete` tells whether some are
    not listed.
    """

    def __init__(self, plain: Any = ((), 0, 0, 0, False)) -> None:
        findings, *counts, incomplete = plain
        self._findings = tuple(
            Finding(_SEVERITIES[severity], *rest) for severity, *rest in findings
        )
        self._counts = dict(zip(_SEVERITIES, counts))
        #: Whether there were more findings than are listed.
        self.incomplete: bool = incomplete

    @overload
    def __getitem__(self, index: int) -> Finding: ...
    @overload
    def __getitem__(self, index: slice) -> Sequence[Finding]: ...
    def __getitem__(self, index: int | slice) -> Finding | Sequence[Finding]:
        return self._findings[index]

    def __len__(self) -> int:
        return len(self._findings)

    def number_of(self, severity: Severity) -> int:
        """How many findings of this severity there were, listed or not."""
        return self._counts[severity]

    def first(self, *severities: Severity) -> Finding | None:
        """The first finding of one of these severities; None if there is none."""
        return next((one for one in self if one.severity in severities), None)

    def __str__(self) -> str:
        return "\n".join(map(str, self)) or "no findings"

    def __repr__(self) -> str:
        counts = ", ".join(f"{n} {one.value}s" for one, n in self._counts.items())
        return f"<Report: {counts}>"
