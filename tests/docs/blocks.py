#!/usr/bin/env python3
"""The code that the documentation shows, taken out of it, run, and held against what it shows.

    blocks.py console SOURCE_DIR COMMAND_DIR         the shell's sessions, names in tables
    blocks.py sources SOURCE_DIR OUTPUT              C++ or C (by OUTPUT's ending) as one program
    blocks.py program SOURCE_DIR OUTPUT PROGRAM      that program's output
    blocks.py sql SOURCE_DIR COMMAND...              statements, each block's to COMMAND's input

A fenced block of `console` holds commands behind "$ " and what they write.  A block of `cpp`, `c`,
`sql` or `python` may be followed by one of `text`: what it writes.  "..." in an output stands for
anything.  A word behind the language ("cpp peer") exempts a block: it shows another library.
python/tests/test_docs.py runs the blocks of Python.
"""

import os
import pathlib
import re
import shutil
import subprocess
import sys
import tempfile
from typing import Iterator, NamedTuple

PAGES = ["README.md", "docs/command.md", "docs/cookbook.md", "docs/from-proj.md",
         "docs/from-pyproj.md", "docs/library.md", "docs/systems.md"]
GRIDS = ["/usr/share/proj/ntf_r93.gsb", "/usr/share/proj/egm96_15.gtx"]
SKIPPED = 77


class Block(NamedTuple):
    page: str
    line: int  # of its first line
    code: str
    output: str

    @property
    def place(self) -> str:
        return f"{self.page}:{self.line}"


def blocks(source: pathlib.Path, language: str) -> Iterator[Block]:
    """All blocks of a language, in the order of the pages."""
    for page in PAGES:
        text = (source / page).read_text(encoding="utf-8")
        fence = re.compile(rf"^```{language}\n(.*?)^```\n(?:\n```text\n(.*?)^```$)?", re.S | re.M)
        for match in fence.finditer(text):
            yield Block(page, text.count("\n", 0, match.start()) + 2, match[1], match[2] or "")


def agrees(wanted: str, got: str) -> bool:
    """Whether an output is the one that is shown."""
    pattern = re.escape(wanted.strip("\n")).replace(re.escape("..."), "(?:.|\n)*")
    return re.fullmatch(pattern, got.strip("\n")) is not None


class Count:
    """What was compared, and what differs."""

    def __init__(self) -> None:
        self.done = self.failed = 0

    def compare(self, place: str, what: str, wanted: str, got: str) -> None:
        self.done += 1
        if not agrees(wanted, got):
            self.failed += 1
            print(f"{place}: {what}\n--- shown\n{wanted}\n--- written\n{got}\n")

    def end(self, what: str) -> None:
        print(f"{self.done} {what}, {self.failed} differ from what the documentation shows")
        sys.exit(1 if self.failed or not self.done else 0)


def declared(source: pathlib.Path, name: str) -> bool:
    """Whether a public header, or the SQL extension, has a C name or a member of a C++ class."""
    parts = [rf"\b{part}\b" for part in name.split("::")]
    places = [*(source / "include/tidewater").glob("*.h*"), source / "postgres/tidewater.sql"]
    return any(all(re.search(part, place.read_text(encoding="utf-8")) for part in parts)
               for place in places)


def console(source: pathlib.Path, commands: str) -> None:
    count = Count()
    environment = {**os.environ, "PATH": f"{commands}:{os.environ['PATH']}", "LC_ALL": "C.UTF-8"}

    def shell(command: str) -> str:
        return subprocess.run(["bash", "-c", command], stdout=subprocess.PIPE, text=True,
                              stderr=subprocess.STDOUT, env=environment, check=False).stdout

    for block in blocks(source, "console"):
        for part in re.split(r"^\$ ", block.code, flags=re.M)[1:]:
            lines = part.rstrip("\n").split("\n")
            command = lines.pop(0)
            while command.endswith("\\"):
                command = command[:-1] + lines.pop(0)
            count.compare(block.place, f"$ {command}", "\n".join(lines), shell(command))

    # Options that tables name ("`convert --grid`") are ones that the command has.
    tasks = "convert|line|magnetic|factors|geoid|systems show|systems search|doctor"
    for page in PAGES:
        rows = re.findall(r"^\|.*$", (source / page).read_text(encoding="utf-8"), re.M)
        for task, option in re.findall(rf"`({tasks}) (--[a-z-]+)", "\n".join(rows)):
            known = re.findall(r"--[a-z-]+", shell(f"tidewater {task} --help"))
            count.compare(page, f"{task} {option}", "known", "known" if option in known else "")
        for name in re.findall(r"`(tw_\w+|[A-Z][a-z]\w+::\w+)", "\n".join(rows)):
            count.compare(page, name, "known", "known" if declared(source, name) else "")
    count.end("commands and names")


def sources(source: pathlib.Path, output: pathlib.Path) -> None:
    """One program of all blocks: each is a function of its own, its includes stand at the top."""
    plain_c = output.suffix == ".c"
    includes = {"#include <stdio.h>"} if plain_c else {"#include <cstdio>", "#include <exception>"}
    functions, calls = [], []
    for number, block in enumerate(blocks(source, "c" if plain_c else "cpp")):
        lines = block.code.rstrip("\n").split("\n")
        includes.update(line for line in lines if line.startswith("#include"))
        body = "\n".join("" if line.startswith("#include") else line for line in lines)
        name = f"block_{number}"
        whole = re.search(r"^int main\((void)?\)", body, re.M)
        if whole:
            body = body.replace(whole[0], f"static int {name}(void)").rstrip("}\n") + "return 0;\n}"
        else:
            body = f"static int {name}(void) {{\n#line {block.line}\n{body}\nreturn 0;\n}}"
        functions.append(f'#line {block.line} "{source / block.page}"\n{body}\n')
        calls.append(f'  std::puts("@@ {block.place}");\n  failed += {name}();\n')
    program = "\n".join(sorted(includes)) + "\n" + "\n".join(functions)
    if plain_c:
        calls = [call.replace("std::", "") for call in calls]
        program += f"int main(void) {{\n  int failed = 0;\n{''.join(calls)}  return failed;\n}}\n"
    else:
        program += ("int main() try {\n  int failed = 0;\n" + "".join(calls) + "  return failed;\n"
                    "} catch (const std::exception& error) {\n  std::puts(error.what());\n"
                    "  return 1;\n}\n")
    output.write_text(program, encoding="utf-8")


def program(source: pathlib.Path, output: str, binary: str) -> None:
    count = Count()
    run = subprocess.run([binary], stdout=subprocess.PIPE, text=True, check=False)
    if run.returncode:
        print(f"{binary} ends with {run.returncode}")
        count.failed += 1
    parts = re.split(r"^@@ (.*)\n", run.stdout, flags=re.M)[1:]
    written = dict(zip(parts[::2], parts[1::2]))
    for block in blocks(source, "c" if output.endswith(".c") else "cpp"):
        count.compare(block.place, "output", block.output, written.get(block.place, "nothing"))
    count.end("blocks")


def sql(source: pathlib.Path, *command: str) -> None:
    count = Count()
    for block in blocks(source, "sql"):
        run = subprocess.run(command, input=block.code, stdout=subprocess.PIPE, text=True,
                             stderr=subprocess.STDOUT, check=False)
        count.compare(block.place, "output", block.output, run.stdout)
    count.end("blocks of SQL")


if __name__ == "__main__":
    task, tree, *rest = sys.argv[1:]
    tree = pathlib.Path(tree).resolve()
    if task == "sources":
        sources(tree, pathlib.Path(rest[0]))
        sys.exit(0)
    if not all(map(os.path.exists, GRIDS)):
        sys.exit(SKIPPED)
    if task == "sql":
        sql(tree, *rest)
    rest = [os.path.abspath(path) for path in rest]
    # The examples' files stand where the sessions look for them, and nothing is written there.
    with tempfile.TemporaryDirectory() as work:
        shutil.copytree(tree / "examples", pathlib.Path(work) / "examples")
        os.chdir(work)
        {"console": console, "program": program}[task](tree, *rest)
