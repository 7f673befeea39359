"""The blocks of Python that the documentation shows, page by page."""

import contextlib
import doctest
import io
import pathlib
import re
import sys

import pytest

import tidewater

ROOT = pathlib.Path(__file__).parents[2]
sys.path.insert(0, str(ROOT / "tests/docs"))
import blocks  # noqa: E402

SHOWN = list(blocks.blocks(ROOT, "python"))


@pytest.mark.parametrize("page", sorted({block.page for block in SHOWN}))
def test_blocks_write_what_the_page_shows(page, grid_folder, monkeypatch):
    monkeypatch.chdir(ROOT)
    runner = doctest.DocTestRunner(optionflags=doctest.ELLIPSIS, verbose=False)
    names = {}
    for block in [block for block in SHOWN if block.page == page]:
        if ">>>" not in block.code:
            written = io.StringIO()
            with contextlib.redirect_stdout(written):
                exec(compile(block.code, block.place, "exec"), names)
            assert blocks.agrees(block.output, written.getvalue()), block.place
            continue
        test = doctest.DocTestParser().get_doctest(block.code, names, page, block.place, block.line)
        runner.run(test, clear_globs=False)
        names = test.globs
    assert runner.summarize(verbose=False).failed == 0


def test_names_in_tables_are_the_package_s():
    rows = re.findall(r"^\|.*$", (ROOT / "docs/from-pyproj.md").read_text(encoding="utf-8"), re.M)
    here = "\n".join(row.split("|", 2)[2] for row in rows)  # the first column is pyproj's
    names = re.findall(r"`([A-Z]\w+)(?:\.(\w+))?", here)
    assert len(names) > 30
    for kind, member in names:
        assert hasattr(tidewater, kind), kind
        assert not member or hasattr(getattr(tidewater, kind), member), f"{kind}.{member}"
