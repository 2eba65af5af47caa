"""Code pages by the names that Python has for them."""

from __future__ import annotations

import codecs
import re

#: Windows' identifiers of the codecs whose names do not tell them.
_CODE_PAGES = {
    "ascii": 20127,
    "gb18030": 54936,
    "gbk": 936,
    "koi8-r": 20866,
    "koi8-u": 21866,
    "utf-8": 65001,
}


def code_page(encoding: str) -> int:
    """The identifier of a codec's code page. Raises LookupError for one that is unknown."""
    name = codecs.lookup(encoding).name
    if name in _CODE_PAGES:
        return _CODE_PAGES[name]
    number = re.fullmatch(r"cp(\d+)|iso8859-(\d+)", name)
    if not number:
        raise unknown(encoding)
    return int(number[1]) if number[1] else 28590 + int(number[2])


def unknown(encoding: str) -> LookupError:
    """The error for an encoding that no code page goes with."""
    return LookupError(f"files cannot be in the encoding {encoding!r}")
