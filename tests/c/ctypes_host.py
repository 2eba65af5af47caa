#!/usr/bin/env python3
"""ctypes_host.py LIBRARY
The C interface by its numbers alone, as hosts of other languages call it: files made, changed and
read again."""

import ctypes as c
import math
import os
import sys
import tempfile

library = c.CDLL(sys.argv[1])
library.dcm_last_error.restype = c.c_char_p
SIZE = c.c_size_t
TERMINATED = SIZE(-1)
OK, ARGUMENT, INDEX, TOO_SMALL, NOT_FOUND, TYPE, FILE = range(7)
FESTWERT, FESTWERTEBLOCK, KENNFELD, TEXTSTRING = 0, 1, 6, 9
COMMENT, HEADER = 0, 1
NAME, UNIT, UNIT_X, DISTRIBUTION_X = 0, 4, 5, 7
VALUES, POINTS_X, POINTS_Y = range(3)


def call(name, *arguments):
    return getattr(library, "dcm_" + name)(*arguments)


def expect(result, expected):
    assert result == expected, (result, expected, library.dcm_last_error())


def do(name, *arguments):
    expect(call(name, *arguments), OK)


def text(name, *arguments):
    length = SIZE()
    expect(call(name, *arguments, None, SIZE(0), c.byref(length)), TOO_SMALL)
    # Without room for the final zero nothing is stored.
    buffer = c.create_string_buffer(b"?" * length.value, length.value + 1)
    expect(call(name, *arguments, buffer, length, c.byref(length)), TOO_SMALL)
    assert buffer.raw == b"?" * length.value + b"\0"
    do(name, *arguments, buffer, SIZE(length.value + 1), c.byref(length))
    return buffer.raw[: length.value].decode()


def numbers(parameter, array):
    count = SIZE()
    if call("parameter_get_numbers", parameter, array, None, SIZE(0), c.byref(count)) == OK:
        return []
    room = (c.c_double * count.value)()
    do("parameter_get_numbers", parameter, array, room, count, c.byref(count))
    return list(room)


def set_numbers(parameter, array, values):
    do("parameter_set_numbers", parameter, array, (c.c_double * len(values))(*values), SIZE(len(values)))


def new_document():
    document = c.c_void_p()
    do("document_new", c.byref(document))
    return document


def count_of(document):
    count = SIZE()
    do("document_parameter_count", document, c.byref(count))
    return count.value


def add(document, kind, name):
    parameter = c.c_void_p()
    do("document_add", document, kind, name, SIZE(len(name)), c.byref(parameter))
    return parameter


def find(document, name, after=None):
    parameter = c.c_void_p(1)
    result = call("document_find", document, name.encode(), TERMINATED, after, c.byref(parameter))
    assert (result == NOT_FOUND) == (parameter.value is None)
    return parameter if result == OK else None


# Null is refused everywhere but where nothing is to be freed.
def_file = os.path.join(os.path.dirname(__file__), "../../bindings/c/dcm_c.def")
with open(def_file, encoding="ascii") as file:
    names = [line.strip() for line in file if line.startswith("    dcm_")]
for name in names:
    if name not in ("dcm_last_error", "dcm_document_free", "dcm_set_code_page"):
        expect(getattr(library, name)(*[None] * 6), ARGUMENT)

with tempfile.TemporaryDirectory() as folder:
    path = os.path.join(folder, "Prüfstand.dcm").encode()
    document = new_document()
    do("document_set_text", document, COMMENT, b"made\nby hand", TERMINATED)
    assert text("document_get_text", document, HEADER) == "* made\n* by hand"
    map_ = add(document, KENNFELD, b"Map")
    set_numbers(map_, POINTS_X, [1.0, 2.0, 3.0])
    set_numbers(map_, POINTS_Y, [10.0, 20.0])
    set_numbers(map_, VALUES, [0.1, 0.2, 0.3, math.inf, -0.0, 1e300])
    do("parameter_set_text", map_, UNIT, "°KW".encode(), SIZE(4))
    do("parameter_set_text", map_, DISTRIBUTION_X, b"Speed", SIZE(5))
    note = add(document, TEXTSTRING, b"Note")
    do("parameter_set_element_text", note, VALUES, SIZE(0), "grün".encode(), TERMINATED)
    block = add(document, FESTWERTEBLOCK, b"Block")
    set_numbers(block, VALUES, [5.0, 6.0])
    do("parameter_set_number", block, VALUES, SIZE(2), c.c_double(7.0))
    do("parameter_set_number", block, VALUES, SIZE(0), c.c_double(4.0))
    copy = c.c_void_p()
    do("document_add_copy", document, map_, c.byref(copy))
    do("document_save", document, path)
    do("document_free", document)

    document = new_document()
    do("document_open", document, path)
    assert text("document_get_text", document, COMMENT) == "made\nby hand\n"
    assert count_of(document) == 4
    first = find(document, "Map")
    second = find(document, "Map", first)
    assert second and second.value != first.value and find(document, "Map", second) is None
    for parameter in (first, second):
        assert numbers(parameter, POINTS_X) == [1.0, 2.0, 3.0]
        assert numbers(parameter, POINTS_Y) == [10.0, 20.0]
        values = numbers(parameter, VALUES)
        assert values == [0.1, 0.2, 0.3, math.inf, 0.0, 1e300]
        assert math.copysign(1.0, values[4]) == -1.0
        assert text("parameter_get_text", parameter, UNIT) == "°KW"
        assert text("parameter_get_text", parameter, DISTRIBUTION_X) == "Speed"
        columns = SIZE()
        do("parameter_columns", parameter, c.byref(columns))
        assert columns.value == 3
    # The first line of a block tells the counts of points, also when they have changed.
    set_numbers(second, POINTS_X, [1.0, 2.0])
    set_numbers(second, VALUES, [1.0, 2.0, 3.0, 4.0])
    do("document_save", document, path)
    with open(path, "rb") as file:
        lines = file.read().splitlines()
    assert b"KENNFELD Map 3 2" in lines and b"KENNFELD Map 2 2" in lines, lines
    block = find(document, "Block")
    assert numbers(block, VALUES) == [4.0, 6.0, 7.0]
    note = find(document, "Note")
    assert text("parameter_get_element_text", note, VALUES, SIZE(0)) == "grün"
    number = c.c_double()
    expect(call("parameter_get_number", note, VALUES, SIZE(0), c.byref(number)), TYPE)
    kind = c.c_int32()
    do("parameter_kind", note, c.byref(kind))
    assert text("kind_keyword", kind) == "TEXTSTRING"

    # Names are found after each change.
    do("parameter_set_text", first, NAME, b"Other", TERMINATED)
    assert find(document, "Other").value == first.value
    assert find(document, "Map").value == second.value
    do("document_remove", document, second)
    assert find(document, "Map") is None and count_of(document) == 3
    added = add(document, FESTWERT, b"Map")
    assert find(document, "Map").value == added.value

    # What is refused changes nothing.
    other = new_document()
    expect(call("document_remove", other, added), ARGUMENT)
    expect(call("document_find", other, b"Map", TERMINATED, added, c.byref(copy)), ARGUMENT)
    expect(call("document_parameter", document, SIZE(4), c.byref(copy)), INDEX)
    expect(call("parameter_set_number", added, VALUES, SIZE(1), number), INDEX)
    expect(call("parameter_set_numbers", added, VALUES, (c.c_double * 2)(), SIZE(2)), ARGUMENT)
    expect(call("parameter_set_numbers", added, POINTS_X, (c.c_double * 1)(), SIZE(1)), ARGUMENT)
    expect(call("parameter_set_text", added, UNIT_X, b"s", SIZE(1)), ARGUMENT)
    expect(call("document_add", document, 10, b"n", SIZE(1), c.byref(copy)), ARGUMENT)
    expect(call("set_code_page", 99999), ARGUMENT)
    assert count_of(document) == 4 and numbers(added, VALUES) == []

    # A file that cannot be read leaves the document, and a finding says why.
    expect(call("document_open", document, path + b".missing"), FILE)
    assert b"missing" in library.dcm_last_error()
    assert count_of(document) == 4
    count, severity, line = SIZE(), c.c_int32(), c.c_int64()
    do("document_finding_count", document, c.byref(count))
    assert count.value == 1
    do("document_finding", document, SIZE(0), c.byref(severity), c.byref(line))
    assert severity.value == 2 and text("document_finding_text", document, SIZE(0), 0)
    do("document_severity_count", document, 2, c.byref(count))
    assert count.value == 1
    do("document_free", document)
    do("document_free", other)
    do("document_free", None)
