"""Fixtures: an open project in a new folder, with some files on disk."""

from __future__ import annotations

import subprocess
from collections.abc import Iterator
from pathlib import Path

import project_management as pm
import pytest


@pytest.fixture
def folder(tmp_path: Path) -> Path:
    """A folder with files, outside every repository."""
    root = tmp_path / "engine"
    for name in ("src/main.cpp", "src/io/pump.cpp", "src/io/pump.hpp", "readme.md"):
        path = root / name
        path.parent.mkdir(parents=True, exist_ok=True)
        path.write_text(name)
    return root


@pytest.fixture
def p(folder: Path) -> Iterator[pm.Project]:
    """The project in it, with all files."""
    with pm.open(folder, create_as="Engine controller") as project:
        project.files.add_tree()
        yield project


@pytest.fixture
def repository(folder: Path) -> Path:
    """The folder as a git repository."""
    subprocess.run(["git", "init", "-q", folder], check=True)
    return folder
