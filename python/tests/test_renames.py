"""Files that other programs have renamed: finding them, adopting them, and following them with a rule."""

from __future__ import annotations

import subprocess
from pathlib import Path

import project_management as pm
import pytest


def lines(first: int, count: int) -> str:
    return "".join(f"line {number}\n" for number in range(first, first + count))


@pytest.fixture
def committed(repository: Path) -> Path:
    """A repository with a project whose files have a label each, all of it committed."""
    for number, name in enumerate(("readme.md", "src/main.cpp", "src/io/pump.cpp", "src/io/pump.hpp")):
        (repository / name).write_text(lines(number * 1000, 100))
    with pm.open(repository, create_as="Engine") as p:
        p.files.add_tree()
        p.categories.create("Status").labels.create("Open").put_on(p.files.find(kind=pm.FileKind.FILE))
    subprocess.run(["git", "-C", repository, "add", "--all"], check=True)
    subprocess.run(["git", "-C", repository, "-c", "user.name=test", "-c", "user.email=test@example.org", "commit", "--quiet",
                    "--message", "all"], check=True)
    return repository


def test_a_file_that_was_renamed_and_edited_is_found_and_adopted(committed: Path) -> None:
    (committed / "src/main.cpp").rename(committed / "src/start.cpp")
    with open(committed / "src/start.cpp", "a") as file:
        file.write(lines(9000, 10))
    (committed / "readme.md").rename(committed / "README.md")
    with pm.open(committed) as p:
        found = p.find_renames()
        assert [(each.source, each.destination, each.evidence) for each in found.pairs] == [
            ("readme.md", "README.md", pm.Rename.Evidence.CONTENT),
            ("src/main.cpp", "src/start.cpp", pm.Rename.Evidence.SIMILARITY)]
        equal, similar = found.pairs
        assert found and found.ambiguous == () and equal.similarity == 100 and 80 < similar.similarity < 100
        assert similar.kind is pm.FileKind.FILE and not similar.is_guess
        assert p.find_renames(similarity=similar.similarity).pairs == found.pairs
        assert p.find_renames(similarity=similar.similarity + 1).pairs == (equal,)

        p.adopt({each.source: each.destination for each in found.pairs})

        assert [str(label) for label in p.files["src/start.cpp"].labels] == ["Open"]
        assert not p.find_renames()


def test_a_folder_that_was_renamed_precedes_its_contents(committed: Path) -> None:
    (committed / "src/io").rename(committed / "src/hardware")
    with pm.open(committed) as p:
        folder, *contents = p.find_renames().pairs
    assert (folder.source, folder.destination, folder.kind, folder.evidence) == (
        "src/io", "src/hardware", pm.FileKind.FOLDER, pm.Rename.Evidence.FOLDER)
    assert [each.destination for each in contents] == ["src/hardware/pump.cpp", "src/hardware/pump.hpp"]


def test_without_git_a_pair_is_a_guess(p: pm.Project) -> None:
    (p.root / "other").mkdir()
    (p.root / "src/main.cpp").rename(p.root / "other/main.cpp")
    (pair,) = p.find_renames().pairs
    assert (pair.source, pair.destination, pair.evidence) == ("src/main.cpp", "other/main.cpp", pm.Rename.Evidence.NAME)
    assert pair.is_guess and pair.similarity == 0


def test_git_can_be_left_out(committed: Path) -> None:
    (committed / "src/main.cpp").rename(committed / "src/start.cpp")
    with pm.open(committed) as p:
        assert p.find_renames().pairs and not p.find_renames(uses_git=False)


def test_equal_files_are_ambiguous(committed: Path) -> None:
    with pm.open(committed) as p:
        for name in ("one", "two"):
            (committed / name).write_text("the same\n")
        p.files.add("one", "two")
        for name in ("one", "two"):
            (committed / name).rename(committed / f"{name} later")
        found = p.find_renames()
    assert found.pairs == ()
    assert found.ambiguous == (pm.AmbiguousRename(("one", "two"), ("one later", "two later")),)


def test_a_folder_with_a_rule_follows_renames(committed: Path) -> None:
    with pm.open(committed) as p:
        p.sync_rules.set("src")
        (committed / "src/main.cpp").rename(committed / "src/start.cpp")
        plan = p.plan_sync()
        assert plan and plan.renamed == () and [str(each.file) for each in plan.removed] == ["src/main.cpp"]
        assert plan.removed[0].labels and plan.removed[0].entry_points == ()

        done = p.sync()

        assert done and done.renamed == (pm.Move("src/main.cpp", "src/start.cpp"),) and not done.added and not done.removed
        assert [str(label) for label in p.files["src/start.cpp"].labels] == ["Open"]


@pytest.mark.parametrize("options", [{"follows_renames": False}, {"similarity": 100}])
def test_a_rule_does_not_follow_renames_that_it_must_not(committed: Path, options: dict[str, int]) -> None:
    with pm.open(committed) as p:
        p.sync_rules.set("src")
        (committed / "src/main.cpp").rename(committed / "src/start.cpp")
        with open(committed / "src/start.cpp", "a") as file:
            file.write(lines(9000, 10))

        done = p.sync(**options)  # type: ignore[arg-type]

        assert done.renamed == () and [str(each) for each in done.added] == ["src/start.cpp"]
        assert len(p.files["src/start.cpp"].labels) == 0


def test_folders_of_rules_that_do_not_exist_are_reported(p: pm.Project) -> None:
    p.sync_rules.set("src")
    (p.root / "empty").mkdir()
    p.sync_rules.set("empty")
    (p.root / "empty").rmdir()
    (p.root / "src").rename(p.root / "elsewhere")
    plan = p.plan_sync()
    assert plan.missing == ("src",) and plan.absent == ("empty",)
    with pytest.raises(pm.SyncFolderMissing) as caught:
        p.sync()
    assert caught.value.path == f"{p.root}/src"
    assert "src/main.cpp" in {str(each.file) for each in p.sync(removes_missing_folders=True).removed}


@pytest.mark.parametrize("similarity", [0, 101])
def test_a_similarity_is_a_percentage(p: pm.Project, similarity: int) -> None:
    for search in (p.find_renames, p.sync):
        with pytest.raises(ValueError, match=str(similarity)):
            search(similarity=similarity)


def test_hidden_personal_labels_follow_a_file(p: pm.Project) -> None:
    p.personal.categories.create("Mine").labels.create("Look again").put_on(["readme.md"])
    with pm.open(p.root) as other:  # as if somebody else had renamed it
        (p.root / "readme.md").rename(p.root / "README.md")
        text = p.root / ".projectdata/project.jsonl"
        text.write_text(text.read_text().replace("readme.md", "README.md"))
        assert other.personal.hidden_files() == ["readme.md"]
        assert other.personal.follow_hidden({"readme.md": "README.md", "src": "src"}) == [pm.Move("readme.md", "README.md")]
        assert [str(label) for label in other.files["README.md"].personal_labels] == ["Look again"]
        assert other.personal.hidden_files() == []
