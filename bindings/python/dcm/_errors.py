"""What is raised when a file cannot be read or written."""

from __future__ import annotations

import errno
import os

from dcm._report import Finding, Report, Severity


class _FileError(Exception):
    def __init__(self, path: str, finding: Finding, report: Report) -> None:
        super().__init__(path, finding, report)
        #: The file.
        self.path = path
        #: The line in the file, from 1; 0 when none is concerned.
        self.line = finding.line
        #: Keyword and name of the block, such as "KENNFELD IgnMap"; may be empty.
        self.block = finding.block
        #: All findings.
        self.report = report
        self._finding = finding

    def __str__(self) -> str:
        return f"{self.path}: {self._finding}"


class ReadError(_FileError):
    """A file that cannot be read to its end, or with `strict` one that has warnings."""


class WriteError(_FileError):
    """With `strict`: a calibration of which the file would not keep all."""


def file_error(path: str, number: int, report: Report, strict: type[_FileError]) -> Exception:
    """The error for an import or export that has failed, by `number` of the system or without."""
    finding = report.first(Severity.ERROR)
    if finding is None or finding.id == "out-of-memory":
        return MemoryError(path)
    if not number:
        return strict(path, next(f for f in reversed(report) if f.severity is Severity.ERROR), report)
    if number == errno.EACCES and os.path.isdir(path):
        number = errno.EISDIR
    return OSError(number, os.strerror(number), path)
