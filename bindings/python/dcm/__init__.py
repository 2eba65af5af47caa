"""Reads and writes calibration data in the DCM text format.

>>> import dcm
>>> cal = dcm.read("engine.dcm")
>>> cal["IdlCtl_nSetpBas_C"].value = 780.0
>>> cal.write("out.dcm")

A `Calibration` maps names to parameters. The values of a `Parameter` and the points of its axes are
numpy arrays of float64, or of objects where there are texts; what is changed in them is written.
"""

from dcm._calibration import Calibration, new, read
from dcm._dcm import VERSION as __version__
from dcm._difference import Change, Difference, Differences, FieldChange, ValueChange
from dcm._errors import ReadError, WriteError
from dcm._parameter import Axis, Kind, Parameter
from dcm._report import Finding, Report, Severity

__all__ = [
    "Axis",
    "Calibration",
    "Change",
    "Difference",
    "Differences",
    "FieldChange",
    "Finding",
    "Kind",
    "Parameter",
    "ReadError",
    "Report",
    "Severity",
    "ValueChange",
    "WriteError",
    "__version__",
    "new",
    "read",
]
