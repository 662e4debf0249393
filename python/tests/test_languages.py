"""Errors are in the language of the locale, or in the one that a program chooses."""

from __future__ import annotations

import os
import subprocess
import sys
from collections.abc import Iterator
from pathlib import Path

import project_management as pm
import pytest


@pytest.fixture
def german() -> Iterator[None]:
    """German, until the test ends."""
    before = pm.language()
    pm.set_language("de_DE")
    yield
    pm.set_language(before)


def printed_by(program: str, folder: Path, **environment: str) -> str:
    """The output of a program in Python with another environment."""
    inherited = {name: value for name, value in os.environ.items() if name not in ("LC_ALL", "LC_MESSAGES", "LANG")}
    result = subprocess.run([sys.executable, "-c", program, folder], env={**inherited, **environment}, check=True,
                            capture_output=True, encoding="utf-8")
    return result.stdout


OPEN_NOTHING = """
import sys
import project_management as pm
sys.stdout.reconfigure(encoding="utf-8")
try:
    pm.open(sys.argv[1])
except pm.StoreError as error:
    print(error)
"""


@pytest.mark.parametrize("variable", ["LC_ALL", "LC_MESSAGES", "LANG"])
def test_errors_of_the_store_are_in_german_when_the_locale_is(tmp_path: Path, variable: str) -> None:
    printed = printed_by(OPEN_NOTHING, tmp_path, **{variable: "de_DE.UTF-8"})

    assert printed == f"{tmp_path}: in diesem Ordner gibt es kein Projekt. " \
                      "Prüfen Sie den Pfad, oder legen Sie dort ein Projekt an.\n"


def test_errors_of_the_store_are_in_english_otherwise(tmp_path: Path) -> None:
    printed = printed_by(OPEN_NOTHING, tmp_path, LC_ALL="C.UTF-8")

    assert printed == f"{tmp_path}: there is no project in this folder. Check the path, or create a project there.\n"


@pytest.mark.usefixtures("german")
def test_the_problem_and_the_remedy_of_a_store_error_are_german(folder: Path, p: pm.Project) -> None:
    p.close()
    (folder / ".projectdata" / "project.jsonl").write_text("hello\n")

    with pytest.raises(pm.StoreError) as raised:
        list(pm.open(folder).files)

    assert raised.value.problem == "die Datei ist keine Projektdefinition"
    assert raised.value.remedy.startswith("Verschieben Sie die Datei")
    assert raised.value.kind is pm.StoreError.Kind.DAMAGED


@pytest.mark.usefixtures("german")
def test_a_move_error_is_german(p: pm.Project) -> None:
    with pytest.raises(pm.MoveError) as raised:
        p.move("src/main.cpp", to="readme.md")

    assert str(raised.value).endswith("/readme.md: dort gibt es schon eine Datei oder einen Ordner.")


@pytest.mark.usefixtures("german")
def test_an_error_of_git_is_german(repository: Path) -> None:
    with pm.open(repository, create_as="Engine controller") as project:
        (repository / ".git" / "index.lock").touch()

        with pytest.raises(pm.GitError) as raised:
            project.files.add("src/main.cpp")

    assert raised.value.problem.startswith("der Index ist gesperrt: git läuft in diesem Repository")
