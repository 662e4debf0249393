"""The blocks of the guide run, those of Python and of C++ create the same, and the types are right."""

from __future__ import annotations

import os
import re
import subprocess
from pathlib import Path

import project_management as pm
import pytest
from guide import blocks_of

GUIDE = Path(__file__).parents[2] / "docs/guide"
PAGES = ["python.md", "python-labels.md"]


def run(page: str) -> dict[str, object]:
    names: dict[str, object] = {"__name__": "guide"}
    for number, block in enumerate(blocks_of(GUIDE / page, "python"), 1):
        exec(compile(block, f"{page}, block {number}", "exec"), names)
    return names


def definition(root: Path) -> list[str]:
    """What a project contains, without its UUIDs, and without the empty record that the data of a label leaves."""
    changes = pm.changes_between(b"", (root / ".projectdata/project.jsonl").read_bytes())
    return sorted(re.sub(r"[0-9a-f]{8}-[0-9a-f-]{27}", "UUID", repr(change)) for change in changes
                  if change.category != "LabelData Data")


@pytest.fixture(autouse=True)
def beside_the_project(repository: Path, monkeypatch: pytest.MonkeyPatch) -> None:
    monkeypatch.chdir(repository.parent)
    Path("library").mkdir()


def test_the_blocks_of_python_and_of_cpp_create_the_same(repository: Path, capfd: pytest.CaptureFixture[str]) -> None:
    program = os.environ["PYTHON_GUIDE_IN_CPP"]
    Path("other").mkdir()
    subprocess.run(["cp", "-r", "engine", "library", "other"], check=True)
    run("python.md")
    subprocess.run([program], check=True, cwd="other")
    shown = capfd.readouterr().out
    assert "REMOVED FILE src/new.cpp" in shown and "name_changed" in shown
    ours = definition(Path("engine"))
    assert len(ours) > 10
    assert ours == definition(Path("other/engine"))


def drawing(file: Path) -> tuple[list[str], list[str]]:
    """The texts and the shapes of a plot, without its identifiers, which are random."""
    svg = file.read_text()
    return re.findall(r"<!-- (.*?) -->", svg), re.findall(r'<path d="(.*?)"', svg, re.DOTALL)


def test_the_page_of_labels_shows_its_table_and_plot(repository: Path, capsys: pytest.CaptureFixture[str]) -> None:
    run("python-labels.md")
    (table,) = blocks_of(GUIDE / "python-labels.md", "text")
    assert capsys.readouterr().out == table
    texts, shapes = drawing(Path("labels.svg"))
    assert "Labels by folder" in texts and {"Open", "Released", "Reviewed", "none"} <= set(texts) and len(shapes) > 4
    assert drawing(GUIDE / "python-labels.svg") == (texts, shapes)
