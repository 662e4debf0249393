#!/usr/bin/env python3
"""Adds, lists and finds files: the Python module beside the same in C++, and beside the sqlite3 of Python.

    files.py PROGRAM [FILES] [ROUNDS]     PROGRAM is the target project_python_benchmark, of the build of the module

Each round runs all of them in random order, each in a new process and a new project. Prints the medians as a table of
Markdown, and fails if the module takes more than twice as long as C++.
"""

from __future__ import annotations

import os
import random
import shutil
import sqlite3
import statistics
import subprocess
import sys
import tempfile
import time
from collections.abc import Callable
from pathlib import Path

LIMIT = 2  # times the duration in C++
OPERATIONS = {"add": "add all files", "list": "list all files", "find-glob": "find all files by a pattern",
              "find-label": "find a tenth of the files by a label"}


def measure(name: str, work: Callable[[], int]) -> None:
    begin = time.perf_counter()
    count = work()
    print(name, time.perf_counter() - begin, count)


def run_module(folder: str, paths: list[str]) -> None:
    import project_management as pm

    with pm.open(folder, create_as="Benchmark", source_control=pm.SourceControl.OFF) as p:
        measure("add", lambda: p.files.add(*paths))
        status = p.categories.create("Status")
        status.labels.create("Reviewed").put_on(paths[::10])
        measure("list", lambda: len(list(p.files)))
        measure("find-glob", lambda: len(p.files.glob("**/*.cpp")))
        measure("find-label", lambda: len(p.files.find(status == "Reviewed")))


def run_sqlite(folder: str, paths: list[str]) -> None:
    """The same with a table of files and a table of labels, set up as for production use."""
    database = sqlite3.connect(os.path.join(folder, "files.db"))
    database.execute("PRAGMA journal_mode=WAL")
    database.execute("PRAGMA synchronous=FULL")
    database.execute("CREATE TABLE files (path TEXT PRIMARY KEY, folder INTEGER) WITHOUT ROWID")
    database.execute("CREATE TABLE labels (path TEXT, label TEXT, PRIMARY KEY (path, label)) WITHOUT ROWID")

    def add() -> int:
        with database:  # each path must exist, as for a project
            found = {path: False for path in paths if os.path.lexists(os.path.join(folder, path))}
            for path in paths:
                above = path.rpartition("/")[0]
                while above and above not in found:
                    found[above] = True
                    above = above.rpartition("/")[0]
            database.executemany("INSERT INTO files VALUES (?, ?)", found.items())
        return len(paths)

    measure("add", add)
    with database:
        database.executemany("INSERT INTO labels VALUES (?, 'Reviewed')", ((path,) for path in paths[::10]))
    measure("list", lambda: len(database.execute("SELECT path, folder FROM files ORDER BY path").fetchall()))
    measure("find-glob", lambda: len(database.execute(
        "SELECT path, folder FROM files WHERE path GLOB '*.cpp' ORDER BY path").fetchall()))
    measure("find-label", lambda: len(database.execute(
        "SELECT path, folder FROM labels JOIN files USING (path) WHERE label = 'Reviewed' ORDER BY path").fetchall()))


def create(folder: str, paths: list[str]) -> None:
    for above in {os.path.dirname(path) for path in paths}:
        os.makedirs(os.path.join(folder, above))
    for path in paths:
        os.close(os.open(os.path.join(folder, path), os.O_CREAT | os.O_WRONLY))


def times(command: list[str], folder: str, paths: list[str]) -> dict[str, tuple[float, int]]:
    shown = subprocess.run([*command, folder], input="\n".join(paths) + "\n", text=True, check=True,
                           stdout=subprocess.PIPE).stdout
    shutil.rmtree(os.path.join(folder, ".projectdata"), ignore_errors=True)
    for database in Path(folder).glob("files.db*"):
        database.unlink()
    lines = (line.split() for line in shown.splitlines())
    return {name: (float(seconds), int(count)) for name, seconds, count in lines}


def main() -> int:
    files, rounds = (int(value) for value in (sys.argv[2:4] + ["100000", "5"][len(sys.argv) - 2:]))
    paths = [f"module{number % 50}/part{number // 50 % 100}/file{number}.cpp" for number in range(files)]
    commands = {"module": [sys.executable, __file__, "--module"], "C++": [sys.argv[1]],
                "sqlite3": [sys.executable, __file__, "--sqlite"]}
    results: dict[tuple[str, str], list[float]] = {}
    with tempfile.TemporaryDirectory() as folder:
        create(folder, paths)
        for _ in range(rounds):
            counts: dict[str, set[int]] = {}
            for name in random.sample(list(commands), len(commands)):
                for operation, (seconds, count) in times(commands[name], folder, paths).items():
                    results.setdefault((name, operation), []).append(seconds)
                    counts.setdefault(operation, set()).add(count)
            assert all(len(each) == 1 for each in counts.values()), f"they do not do the same: {counts}"
    print(f"| {files:,} files | module | C++ | ratio | sqlite3 | ratio |\n|---|--:|--:|--:|--:|--:|")
    is_within = True
    for operation, title in OPERATIONS.items():
        module, cpp, sqlite = (statistics.median(results[name, operation]) for name in ("module", "C++", "sqlite3"))
        is_within = is_within and module <= LIMIT * cpp
        ratio = f"{module / cpp:.2f}" if module <= LIMIT * cpp else f"**{module / cpp:.2f}**"
        print(f"| {title} | {module * 1000:.0f} ms | {cpp * 1000:.0f} ms | {ratio} | {sqlite * 1000:.0f} ms |"
              f" {module / sqlite:.2f} |")
    return 0 if is_within else 3


if __name__ == "__main__":
    runs = {"--module": run_module, "--sqlite": run_sqlite}
    if sys.argv[1] in runs:
        runs[sys.argv[1]](sys.argv[2], sys.stdin.read().splitlines())
    else:
        sys.exit(main())
