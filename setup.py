"""Builds the Python module by CMake, with the library inside. What it is called is in pyproject.toml."""

import pathlib
import re
import subprocess
import sys

from setuptools import Extension, setup
from setuptools.command.build_ext import build_ext

ROOT = pathlib.Path(__file__).resolve().parent
NUMBERS = re.findall(
    r"#define DCM_VERSION_[A-Z]+ ([0-9]+)", (ROOT / "dcm/library/version.h").read_text()
)


class CMakeBuild(build_ext):
    def build_extension(self, ext):
        build = pathlib.Path(self.build_temp).resolve()
        target = pathlib.Path(self.get_ext_fullpath(ext.name)).resolve()
        options = {
            "CMAKE_BUILD_TYPE": "Release",
            "BUILD_SHARED_LIBS": "OFF",
            "DCM_BUILD_PYTHON": "ON",
            "DCM_BUILD_EXAMPLES": "OFF",
            "DCM_BUILD_TESTS": "OFF",
            "Python_EXECUTABLE": sys.executable,
        }
        settings = [f"-D{name}={value}" for name, value in options.items()]
        subprocess.run(["cmake", "-S", ROOT, "-B", build, *settings], check=True)
        subprocess.run(["cmake", "--build", build, "--parallel", "--target", "_dcm"], check=True)
        target.parent.mkdir(parents=True, exist_ok=True)
        self.copy_file(build / "bindings/python/dcm" / target.name, target)


setup(
    version=".".join(NUMBERS),
    ext_modules=[Extension("dcm._dcm", sources=[])],
    cmdclass={"build_ext": CMakeBuild},
)
