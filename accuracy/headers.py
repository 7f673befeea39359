"""Writes into each public header what docs/accuracy.md tells of its functions, or checks it.

A header quotes its rows under "Accuracy" in the docstring of its file and holds no other figure of
accuracy.  Needs nothing but Python.  `accuracy/headers.py` writes, `accuracy/headers.py --check`
says what differs and ends in 1.
"""

import re
import sys
import textwrap
from pathlib import Path

SOURCE = Path(__file__).resolve().parent.parent
PAGE = SOURCE / "docs" / "accuracy.md"
HEADERS = SOURCE / "include" / "tidewater"
BEGINS = " * Accuracy, worst (and what 95 of 100 points stay below), of docs/accuracy.md:\n"
NO_FIGURE = " * Accuracy: no figure; "
BOUND = "\0"  # a space at which no line ends
# What would be a figure of accuracy beside the quoted ones.
LOOSE = re.compile(r"\d (?:nm|um|µm|mm)\b|\b[Mm]easured (?:against|on|over)|\bRound trip on\b")


def declared(text):
    """The functions and classes of a header."""
    text = re.sub(r"/\*.*?\*/", "", text, flags=re.S)
    return set(re.findall(r"\bTW_API\s+\w+\s+(\w+)\(|TW_SYSTEMS_C_API\s+[\w\s*]*?\b(\w+)\(|"
                          r"class TW_SYSTEMS_API (\w+)|TW_SYSTEMS_API\s+[\w:]+\s+(\w+)\(", text))


def names_of(text):
    return {name for found in declared(text) for name in found if name}


def rows(page):
    """Cells of the tables with a column of calls."""
    for line in page.splitlines():
        cells = [cell.strip() for cell in line.strip("|").split(" | ")]
        if line.startswith("| ") and len(cells) == 9 and cells[1].startswith("`"):
            yield cells


def calls_any(cell, names):
    for call in re.findall(r"`([\w*]+)`", cell):
        if call.endswith("*"):
            if any(name.startswith(call[:-1]) for name in names):
                return True
        elif call in names:
            return True
    return False


def sentence(cells):
    """"Mercator, lat -89 to 89: forward 4.6 nm (2.0 nm), inverse ..." """
    family, _, domain, *errors = cells[:6]
    told = [f"{name} {error}" for name, error in zip(("forward", "inverse", "scale"), errors)
            if error != "–"]
    if len(told) == 1 and told[0].startswith("forward "):
        told = [errors[0]]
    told = re.sub(r"(?<=\d) (?=\S*m|rad|nT|deg)|(?<=<) ", BOUND, ", ".join(told))
    return f"{family}, {domain}: {told}".replace("µ", "u").replace("²", "^2")


def paragraph(header, text, page):
    names = names_of(text)
    if not names:
        return ""
    # Every method of projection has a row of its own: too many for a header, which has their sum.
    quoted = [cells for cells in rows(page) if cells[1] != "`Projection`" and calls_any(cells[1], names)]
    if quoted:
        lines = [textwrap.fill(sentence(cells) + ";", 99, initial_indent=" * - ",
                               subsequent_indent=" *   ", break_on_hyphens=False) for cells in quoted]
        return BEGINS + "\n".join(lines)[:-1].replace(BOUND, " ") + ".\n"
    reason = re.search(rf"^- ([^:]*): .*`{re.escape(header.name)}`", page, re.M)
    if reason is None:
        raise SystemExit(f"{header.name}: docs/accuracy.md has neither a row for it nor a reason why not")
    return textwrap.fill(NO_FIGURE[3:] + reason[1] + " (docs/accuracy.md).", 99, initial_indent=" * ",
                         subsequent_indent=" * ") + "\n"


def split(text):
    """What stands before the paragraph, the paragraph, what stands behind it."""
    found = re.search(r"( \*\n)( \* Accuracy(?:, worst| ?: no figure).*?\n)(?= \*\n| \*/)", text, re.S)
    if found:
        return text[:found.start(2)], found[2], text[found.end(2):]
    # before the source, or what a family has in common, or at the end
    head = re.search(r"\n \*/", text).start() + 1
    for mark in ("\n *\n * Source:", "\n *\n * What all "):
        at = text.find(mark, 0, head) + 4
        if at > 4:
            return text[:at], "", " *\n" + text[at:]
    return text[:head] + " *\n", "", text[head:]


def main():
    page, wrong = PAGE.read_text(encoding="utf-8"), 0
    for header in sorted([*HEADERS.glob("*.h"), *HEADERS.glob("*.hpp")]):
        text = header.read_text(encoding="utf-8")
        wanted = paragraph(header, text, page)
        if not wanted:
            continue
        before, found, behind = split(text)
        loose = LOOSE.search(before + behind)
        if loose:
            line = (before + behind)[:loose.start()].count("\n") + 1
            print(f"{header.name}, near line {line}: {loose[0]!r} is no figure of docs/accuracy.md")
            wrong += 1
        if found == wanted:
            continue
        if "--check" in sys.argv:
            print(f"{header.name}: under Accuracy stands\n{found}where docs/accuracy.md has\n{wanted}")
            wrong += 1
        else:
            header.write_text(before + wanted + behind, encoding="utf-8")
    sys.exit(1 if wrong else 0)


if __name__ == "__main__":
    main()
