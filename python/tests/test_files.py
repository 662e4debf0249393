"""The file list: adding, removing, searching, moving, synchronising."""

from __future__ import annotations

import os
import shutil
import subprocess
from pathlib import Path

import project_management as pm
import pytest


def names(files: list[pm.File]) -> list[str]:
    return [str(file) for file in files]


def test_files_are_in_the_order_of_paths(p: pm.Project) -> None:
    assert names(list(p.files)) == ["readme.md", "src", "src/io", "src/io/pump.cpp", "src/io/pump.hpp", "src/main.cpp"]
    assert len(p.files) == 6


def test_a_file_is_a_path(p: pm.Project) -> None:
    file = p.files["src/main.cpp"]
    assert (str(file), os.fspath(file), file.path) == ("src/main.cpp", f"{p.root}/src/main.cpp", p.root / "src/main.cpp")
    assert open(file).read() == "src/main.cpp"
    assert (file.name, file.kind, p.files["src"].is_folder) == ("main.cpp", pm.FileKind.FILE, True)
    assert file == p.files[b"src/main.cpp"] == p.files[p.root / "src/main.cpp"] == p.files["./src/io/../main.cpp"]
    assert {file: 1}[p.files["src/main.cpp"]] == 1


def test_a_path_through_a_link_to_the_root_is_that_of_the_file(p: pm.Project, tmp_path: Path) -> None:
    (tmp_path / "link").symlink_to(p.root)
    assert tmp_path / "link/readme.md" in p.files


def test_a_path_that_is_not_in_the_project_is_a_lookup_error(p: pm.Project) -> None:
    with pytest.raises(LookupError) as caught:
        p.files["nowhere"]
    assert isinstance(caught.value, pm.FileNotInProject)
    assert caught.value.path == f"{p.root}/nowhere"
    assert "nowhere" not in p.files


def test_a_missing_file_is_not_found(p: pm.Project) -> None:
    with pytest.raises(FileNotFoundError) as caught:
        p.files.add("nowhere")
    assert isinstance(caught.value, pm.FileDoesNotExistError)
    assert caught.value.filename == f"{p.root}/nowhere"


def test_adding_again_keeps_labels_unless_asked(p: pm.Project) -> None:
    label = p.categories.create("Status").labels.create("Open")
    label.put_on(["src/main.cpp", "src"])
    assert p.files.add("src/main.cpp") == 0
    assert label in p.files["src/main.cpp"].labels
    p.files.add("src/main.cpp", anew=True)
    assert label not in p.files["src/main.cpp"].labels


def test_a_new_file_keeps_the_labels_of_the_folders_above(p: pm.Project) -> None:
    label = p.categories.create("Status").labels.create("Open")
    label.put_on(["src"])
    (p.root / "src/new.cpp").touch()
    assert p.files.add("src/new.cpp") == 1
    assert label in p.files["src"].labels


def test_add_tree_takes_an_ignore_of_shutil(folder: Path) -> None:
    with pm.open(folder, create_as="Engine") as p:
        p.files.add_tree(ignore=shutil.ignore_patterns("*.hpp", "io"))
        assert names(list(p.files)) == ["readme.md", "src", "src/main.cpp"]


def test_add_tree_leaves_out_what_git_ignores(repository: Path) -> None:
    (repository / ".gitignore").write_text("io/\n")
    with pm.open(repository, create_as="Engine") as p:
        p.files.add_tree("src", ignore=pm.git_ignored)
        assert names(list(p.files)) == ["src", "src/main.cpp"]


def test_removing_returns_everything_below(p: pm.Project) -> None:
    assert sorted(names(p.files.remove("src/io"))) == ["src/io", "src/io/pump.cpp", "src/io/pump.hpp"]
    assert (p.root / "src/io/pump.cpp").exists()


def test_a_search_combines_conditions(p: pm.Project) -> None:
    status = p.categories.create("Status")
    opened, done = status.labels.create("Open"), status.labels.create("Done")
    opened.put_on(["readme.md", "src/main.cpp"])
    done.put_on(["src/main.cpp", "src/io/pump.cpp"])
    find = p.files.find
    assert names(find(status == "Open")) == ["readme.md", "src/main.cpp"]
    assert names(find((status == opened) & (status == done))) == ["src/main.cpp"]
    assert names(find((status == "Open") | (status == "Done"))) == ["readme.md", "src/io/pump.cpp", "src/main.cpp"]
    assert names(find((status == "Open") & (status != "Done"))) == ["readme.md"]
    assert names(find(~((status == "Open") | (status == "Done")), kind=pm.FileKind.FILE)) == ["src/io/pump.hpp"]
    assert names(find(~((status == "Open") & (status == "Done")) & status.any)) == ["readme.md", "src/io/pump.cpp"]
    assert find(unlabelled=True, below=["src/io"]) == [p.files["src/io"], p.files["src/io/pump.hpp"]]
    assert names(p.files.glob("**/*.cpp")) == ["src/io/pump.cpp", "src/main.cpp"]
    with pytest.raises(TypeError):
        bool(status == "Open")
    with pytest.raises(KeyError):
        status == "Unknown"


def test_a_search_for_entry_points(p: pm.Project) -> None:
    p.entry_points["src/main.cpp"] = pm.EntryPoint()
    assert names(p.files.find(entry_point=True)) == ["src/main.cpp"]


def test_a_file_moves_with_its_labels(p: pm.Project) -> None:
    label = p.categories.create("Status").labels.create("Open")
    label.put_on(["src/io/pump.cpp"])
    assert p.move("src/io", to="src/hardware") == [pm.Move("src/io", "src/hardware")]
    assert label in p.files["src/hardware/pump.cpp"].labels
    assert (p.root / "src/hardware/pump.cpp").exists()
    with pytest.raises(pm.MoveError) as caught:
        p.move("readme.md", to="src/main.cpp")
    assert caught.value.reason is pm.MoveError.Reason.EXISTS
    assert p.take_recovered_moves() is None and not p.has_unfinished_move


def test_a_move_of_another_program_is_adopted(p: pm.Project) -> None:
    (p.root / "readme.md").rename(p.root / "README.md")
    p.adopt({"readme.md": "README.md"})
    assert "README.md" in p.files and "readme.md" not in p.files


def test_a_folder_with_a_rule_is_synchronised(p: pm.Project) -> None:
    p.sync_rules.set("src", included={"**/*.cpp"})
    assert list(p.sync_rules) == [pm.SyncRule("src", frozenset({"**/*.cpp"}))]
    (p.root / "src/new.cpp").touch()
    (p.root / "src/new.txt").touch()
    (p.root / "src/main.cpp").unlink()
    assert names(list(p.plan_sync().added)) == ["src/new.cpp"]
    done = p.sync()
    assert names(list(done.added)) == ["src/new.cpp"] and [str(each.file) for each in done.removed] == ["src/main.cpp"]
    assert not p.plan_sync()
    assert p.sync_rules.remove("src") and not p.sync_rules.remove("src")


def test_changes_are_staged_in_git(repository: Path) -> None:
    def staged() -> str:
        return subprocess.run(["git", "-C", repository, "diff", "--cached", "--name-only"], check=True,
                              capture_output=True, text=True).stdout

    with pm.open(repository, create_as="Engine") as p:
        p.files.add("readme.md")
    assert "readme.md" in staged() and ".projectdata/project.jsonl" in staged()
    with pm.open(repository, source_control=pm.SourceControl.OFF) as p:
        p.files.add("src/main.cpp")
    assert "src/main.cpp" not in staged()
