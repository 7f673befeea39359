#!/usr/bin/env python3
"""What the pages say of one another holds.

    check.py links SOURCE_DIR     every relative link and picture leads to a file, every # to a heading
    check.py tables SOURCE_DIR    README's rows stand in docs/speed.md and docs/accuracy.md
"""

import pathlib
import re
import sys

SKIPPED = {"build", "node_modules", ".git"}


def anchor(heading: str) -> str:
    """The fragment that forges make of a heading."""
    text = re.sub(r"[`*_]|\]\([^)]*\)|\[", "", heading).strip().lower()
    return re.sub(r"\s", "-", re.sub(r"[^\w\s-]", "", text))


def prose(page: pathlib.Path) -> str:
    """A page without its fenced blocks."""
    return re.sub(r"^```.*?^```", "", page.read_text(encoding="utf-8"), flags=re.S | re.M)


def links(source: pathlib.Path) -> list[str]:
    wrong, count = [], 0
    for page in sorted(source.rglob("*.md")):
        if SKIPPED & set(page.relative_to(source).parts):
            continue
        text = prose(page)
        found = re.findall(r"\]\(([^)\s]+)\)|<img[^>]* src=\"([^\"]+)\"", text)
        for target in (one or other for one, other in found):
            if re.match(r"[a-z]+:", target):
                continue
            count += 1
            path, _, fragment = target.partition("#")
            there = (page.parent / path).resolve() if path else page
            place = f"{page.relative_to(source)}: {target}"
            if not there.exists():
                wrong.append(f"{place} is not there")
            elif fragment and fragment not in map(anchor, re.findall(r"^#+ (.*)$", prose(there), re.M)):
                wrong.append(f"{place} has no such heading")
    print(f"{count} links")
    return wrong


def table(text: str, head: str) -> list[list[str]]:
    """The rows of the table whose head begins so."""
    found = re.search(rf"^{re.escape(head)}.*\n\|[-| ]+\|\n((?:\|.*\n)+)", text, re.M)
    if not found:
        return []
    return [[cell.strip() for cell in line.strip("| \n").split(" | ")]
            for line in found[1].splitlines()]


def tables(source: pathlib.Path) -> list[str]:
    wrong = []
    readme = (source / "README.md").read_text(encoding="utf-8")
    speed = (source / "docs" / "speed.md").read_text(encoding="utf-8")
    rows = {}
    for line in speed.splitlines():
        cells = [cell.strip() for cell in line.strip("| ").split(" | ")]
        if line.startswith("| "):
            rows.setdefault(cells[0], []).append(cells[1:])
    fast = table(readme, "| operation ")
    for name, *figures in fast:
        numbers = [number for cell in figures for number in re.findall(r"^[\d.]+", cell)]
        if not any(all(float(n) in map(float, re.findall(r"(?<![^| ])[\d.]+(?![^| ])", " ".join(cells)))
                       for n in numbers) for cells in rows.get(name, ())):
            wrong.append(f"README.md: the row {name!r} with {', '.join(numbers)} is not in docs/speed.md")
    true = table(readme, "| what | against ")
    page = table((source / "docs" / "accuracy.md").read_text(encoding="utf-8"), "| what | against ")
    wrong += [f"README.md: {row} is not in docs/accuracy.md" for row in true if row not in page]
    if not fast or not true:
        wrong.append("README.md: a table is missing")
    if readme.count("\n") >= 150:
        wrong.append("README.md has 150 lines or more")
    print(f"{len(fast)} rows of speed, {len(true)} of accuracy")
    return wrong


def main() -> None:
    wrong = {"links": links, "tables": tables}[sys.argv[1]](pathlib.Path(sys.argv[2]).resolve())
    print("\n".join(wrong))
    sys.exit(1 if wrong else 0)


main()
