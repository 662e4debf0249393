"""The first example of the guide, as it is."""

from __future__ import annotations

import asyncio
import os
from pathlib import Path

import project_management as pm
import pytest


def test_the_example_runs(repository: Path, monkeypatch: pytest.MonkeyPatch,
                          capsys: pytest.CaptureFixture[str]) -> None:
    (repository / ".gitignore").write_text("*.o\n")
    (repository / "src/main.o").write_text("")
    monkeypatch.chdir(repository.parent)

    with pm.open("engine", create_as="Engine controller") as p:       # pm.NotAProject when there is none and no create_as
        p.files.add("src/main.cpp", Path("src/io/pump.cpp"))          # relative to p.root; str, bytes or os.PathLike
        p.files.add_tree("src", ignore=pm.git_ignored)
        status = p.categories.create("Status", single_valued=True)
        reviewed = status.labels.create("Reviewed")
        with p.transaction():                                         # one step, or nothing when the block raises
            for f in p.files.glob("**/*.cpp"):
                f.labels.add(reviewed)
        print([str(f) for f in p.files.find(status == "Reviewed")])   # File is os.PathLike
        p.entry_points["src/main.cpp"] = pm.EntryPoint(type="Startup", name="Engine", extensions={"args": "-v"})
        with p.events.file_labels_changed.connected(lambda files: print(files)):
            p.refresh()

        assert isinstance(f, os.PathLike)
        assert "src/main.o" not in p.files
        assert "src/io/pump.hpp" in p.files
        assert p.entry_points["src/main.cpp"].extensions == {"args": "-v"}
    assert capsys.readouterr().out == "['src/io/pump.cpp', 'src/main.cpp']\n"


def test_the_asynchronous_example_runs(p: pm.Project, monkeypatch: pytest.MonkeyPatch,
                                       capsys: pytest.CaptureFixture[str]) -> None:
    monkeypatch.chdir(p.root.parent)

    async def live() -> None:
        async for change in pm.watch("engine"):                       # polls refresh off the loop's thread; no thread of C++
            print(change.event, change.files)
            break

    async def both() -> None:
        task = asyncio.create_task(live())
        await asyncio.sleep(0.3)
        status = p.categories.create("Status")
        for number in range(100):
            if task.done():
                break
            status.labels.create(str(number)).put_on(["readme.md"])
            await asyncio.sleep(0.1)
        await asyncio.wait_for(task, 10)

    asyncio.run(both())
    assert capsys.readouterr().out in ("category_added ()\n", "file_labels_changed (<File 'readme.md'>,)\n")


def test_a_folder_without_a_project_raises_not_a_project(tmp_path: Path) -> None:
    with pytest.raises(pm.NotAProject) as caught:
        pm.open(tmp_path)
    assert caught.value.kind is pm.StoreError.Kind.REFUSED
    assert isinstance(caught.value, pm.StoreError)
    with pytest.raises(pm.NotAProject):
        pm.open(tmp_path / "missing")


def test_a_project_is_not_created_in_a_folder_that_does_not_exist(tmp_path: Path) -> None:
    with pytest.raises(pm.StoreError) as caught:
        pm.open(tmp_path / "missing", create_as="Engine")
    assert caught.value.kind is pm.StoreError.Kind.REFUSED and not isinstance(caught.value, pm.NotAProject)
    assert not (tmp_path / "missing").exists()
