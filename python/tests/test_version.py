import importlib.metadata
import pathlib
import re

import tidewater

HEADER = pathlib.Path(__file__).parents[2] / "include/tidewater/version.h"


def test_package_library_and_headers_are_of_one_version():
    version = re.search(r'define TIDEWATER_VERSION "(.*)"', HEADER.read_text()).group(1)
    assert tidewater.__version__ == version
    assert importlib.metadata.version("tidewater") == version
