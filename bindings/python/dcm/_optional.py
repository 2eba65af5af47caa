"""Packages that only a part of the module needs."""

import importlib
from typing import Any


def load(module: str, purpose: str) -> Any:
    """The module; ImportError with what to install if it is not there."""
    try:
        return importlib.import_module(module)
    except ImportError as error:
        package = module.partition(".")[0]
        raise ImportError(
            f"{purpose} needs {package}; install it with `apt install python3-{package}` or "
            f"`pip install {package}`",
            name=package,
        ) from error
