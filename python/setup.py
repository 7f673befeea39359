"""Builds the native part with CMake; all else stands in pyproject.toml."""

import os
import pathlib
import re
import subprocess
import sys

from setuptools import Extension, setup
from setuptools.command.build_ext import build_ext

HERE = pathlib.Path(__file__).resolve().parent
# A build tree that is there already serves as well.
BUILD = pathlib.Path(os.environ.get("TIDEWATER_BUILD", HERE.parent / "build" / "python"))


class CMakeBuild(build_ext):
    """Lays library, store and native module into the package."""

    def build_extension(self, ext):
        configure = ["cmake", "-S", str(HERE.parent), "-B", str(BUILD), "-DTIDEWATER_PYTHON=ON",
                     f"-DPython3_EXECUTABLE={sys.executable}"]
        if not (BUILD / "CMakeCache.txt").exists():
            configure += ["-G", "Ninja", "-DCMAKE_BUILD_TYPE=Release", "-DTIDEWATER_TESTS=OFF",
                          "-DTIDEWATER_BENCHMARKS=OFF"]
        subprocess.run(configure, check=True)
        subprocess.run(["cmake", "--build", str(BUILD), "--target", "tidewater_python"], check=True)
        package = pathlib.Path(self.get_ext_fullpath(ext.name)).resolve().parent
        subprocess.run(["cmake", "--install", str(BUILD), "--component", "python",
                        "--prefix", str(package.parent)], check=True)
        # A wheel has no links: each library stands there once, by the name it is loaded by.
        for link in [path for path in package.iterdir() if path.is_symlink()]:
            file = link.resolve()
            link.unlink()
            file.rename(link)

VERSION = re.search(r'define TIDEWATER_VERSION "(.*)"',
                    (HERE.parent / "include/tidewater/version.h").read_text()).group(1)

setup(version=VERSION, ext_modules=[Extension("tidewater._core", sources=[])],
      cmdclass={"build_ext": CMakeBuild})
