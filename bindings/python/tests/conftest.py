import atexit
import pathlib
import shutil
import tempfile

import pytest

ROOT = pathlib.Path(__file__).resolve().parents[3]
# Copies: a file can be open once at a time, and other tests read these too.
FOLDER = pathlib.Path(tempfile.mkdtemp())
atexit.register(shutil.rmtree, FOLDER)
FILES = [
    pathlib.Path(shutil.copy(file, FOLDER))
    for file in (ROOT / "examples/data/sample.dcm", *sorted((ROOT / "tests/data").glob("*.dcm")))
]
SAMPLE = FILES[0]


@pytest.fixture
def sample():
    import dcm

    return dcm.read(SAMPLE)
