"""Labels, entry points, references, scopes, texts, transactions, snapshots and errors."""

from __future__ import annotations

import os
import pickle
import subprocess
import sys
import threading
from pathlib import Path

import networkx  # type: ignore[import]
import pandas  # type: ignore[import]
import project_management as pm
import pytest


def test_labels_have_data(p: pm.Project) -> None:
    note = p.categories.create("Note", data_type="String").labels.create("Remark")
    labels = p.files["readme.md"].labels
    labels[note] = "to be checked"
    assert dict(labels) == {note: "to be checked"}
    labels.add(note)
    assert labels[note] == "to be checked"
    labels[note] = ""
    assert list(labels.items()) == [(note, "")]
    del labels[note]
    assert len(labels) == 0
    with pytest.raises(KeyError):
        del labels[note]


def test_data_must_suit_the_data_type(p: pm.Project) -> None:
    logical = p.categories.create("Checked", data_type="Logical")
    label = logical.labels.create("By hand")
    assert logical.is_valid_data("true") and not logical.is_valid_data("yes")
    with pytest.raises(ValueError) as caught:
        label.put_on(["readme.md"], "yes")
    assert isinstance(caught.value, pm.LabelDataInvalid)
    assert (caught.value.data, caught.value.data_type, caught.value.category) == ("yes", "Logical", "Checked")
    assert len(p.files["readme.md"].labels) == 0


def test_a_label_of_a_single_valued_category_replaces_the_other(p: pm.Project) -> None:
    status = p.categories.create("Status", single_valued=True)
    opened, done = status.labels.create("Open"), status.labels.create("Done")
    labels = p.files["readme.md"].labels
    labels.add(opened)
    labels.add(done)
    assert list(labels) == [done]


def test_putting_a_label_twice_changes_nothing(p: pm.Project) -> None:
    label = p.categories.create("Status").labels.create("Open")
    label.put_on(["readme.md"])
    label.put_on(["readme.md", "src"])
    assert list(p.files["readme.md"].labels) == [label]


def test_categories_and_labels_are_found_by_name(p: pm.Project) -> None:
    status = p.categories.create("Status", single_valued=True, data_type="String")
    opened = status.labels.create("Open", state=pm.LabelState.READ_ONLY)
    found = p.categories["Status"]
    assert (found.uuid, found.is_single_valued, found.data_type) == (status.uuid, True, "String")
    assert found.labels["Open"] == opened and found.labels["Open"].state is pm.LabelState.READ_ONLY
    assert "Status" in p.categories and "Open" in found.labels and len(p.categories) == len(found.labels) == 1
    assert status.rename("State").name == "State" and [str(each) for each in p.categories] == ["State"]
    with pytest.raises(pm.CanNotModifyReadOnlyLabel):
        found.labels.delete("Open")
    with pytest.raises(pm.CategoryExistsByName) as caught:
        p.categories.create("State")
    assert caught.value.name == "State"
    with pytest.raises(pm.LabelExistsByName) as label_error:
        found.labels.create("Open")
    assert (label_error.value.category, label_error.value.name) == ("Status", "Open")  # as it was read
    status.delete()
    assert len(p.categories) == 0


def test_personal_labels_are_apart(p: pm.Project) -> None:
    mine = p.personal.categories.create("Mine").labels.create("Look again")
    file = p.files["readme.md"]
    file.personal_labels.add(mine)
    assert list(file.personal_labels) == [mine] and len(file.labels) == 0 and len(p.categories) == 0
    assert p.files.find(mine.category == mine, layers=pm.Layers.PERSONAL) == [file]
    with pytest.raises(ValueError):
        file.labels.add(mine)
    assert p.personal.hidden_files() == []


def test_entry_points_are_a_mapping(p: pm.Project) -> None:
    tools = p.entry_points.groups.create("Tools")
    p.entry_points["src/main.cpp"] = pm.EntryPoint(type="Startup", name="Engine", group=tools, extensions={"args": "-v"})
    entry = p.entry_points["src/main.cpp"]
    assert (entry.type, entry.name, entry.group, entry.extensions) == ("Startup", "Engine", tools, {"args": "-v"})
    assert [str(file) for file in p.entry_points] == ["src/main.cpp"] and "src/main.cpp" in p.entry_points
    p.entry_points["src/main.cpp"] = pm.EntryPoint()
    assert p.entry_points["src/main.cpp"].uuid == entry.uuid and p.entry_points["src/main.cpp"].name == "main"
    del p.entry_points["src/main.cpp"]
    assert len(p.entry_points) == 0
    with pytest.raises(KeyError):
        p.entry_points["src/main.cpp"]
    with pytest.raises(pm.EntryPointTypeUndefined) as caught:
        p.entry_points["src/main.cpp"] = pm.EntryPoint(type="Nonsense")
    assert caught.value.name == "Nonsense"
    with pytest.raises(pm.FileNotInProject):
        p.entry_points["nowhere"] = pm.EntryPoint()
    assert p.entry_points.groups.rename(tools, "Programs") in list(p.entry_points.groups)
    p.entry_points.groups.delete(tools)
    assert len(p.entry_points.groups) == 1


def test_references_form_a_graph(p: pm.Project, tmp_path: Path) -> None:
    (tmp_path / "library").mkdir()
    with pm.open(tmp_path / "engine/../library", create_as="Library") as library:
        library.references.add(p.root)
        (reference,) = p.references.add(library.root)
        p.references.add("/nowhere/at/all", absolute=True)
        assert (reference.type, reference.stored_path, reference.location) == ("Relative", "../library", library.root)
        graph = p.graph
        assert [(node.name, node.is_project) for node in graph.nodes][:1] == [("Engine controller", True)]
        assert {node.name for node in graph.nodes} == {"Engine controller", "Library", "all"}
        assert len(graph.edges) == 3
        drawn = graph.to_networkx()
        assert isinstance(drawn, networkx.MultiDiGraph) and set(networkx.simple_cycles(networkx.DiGraph(drawn)).__next__()) \
            == {p.root, library.root}
        table = graph.to_pandas()
        assert isinstance(table, pandas.DataFrame) and sorted(table["target"]) == ["Engine controller", "Library", "all"]
        with pytest.raises(pm.DuplicateReferenceException):
            p.references.add(library.root)
        p.references.remove(reference)
        assert library.root not in p.references and len(p.references) == 1


def test_the_project_path_lists_folders(p: pm.Project) -> None:
    (reference,) = p.path.add("src")
    assert "src" in p.path and p.path.root_for("src/io/pump.cpp") == reference
    with pytest.raises(pm.DuplicatePathEntryException):
        p.path.add("src")


def test_a_scope_stores_data_of_applications(p: pm.Project) -> None:
    scope = p.scopes["Metrics"]
    node = pm.MetadataNode("Info", {"lines": "12"}, (pm.MetadataNode("Function", {"UUID": "1", "Name": "main"}),))
    scope["src/main.cpp"] = node
    assert scope["src/main.cpp"] == node and [str(file) for file in scope] == ["src/main.cpp"]
    assert "readme.md" not in scope and len(p.scopes["Other"]) == 0
    del scope["src/main.cpp"]
    with pytest.raises(KeyError):
        scope["src/main.cpp"]


def test_a_transaction_is_one_step_or_nothing(p: pm.Project) -> None:
    with pytest.raises(ZeroDivisionError), p.transaction():
        p.files.remove("readme.md")
        p.name = "Other"
        1 / 0
    assert "readme.md" in p.files and p.name == "Engine controller"
    with p.transaction():
        p.name = "Outer"
        with pytest.raises(ZeroDivisionError), p.transaction():
            p.name = "Inner"
            1 / 0
        assert p.name == "Outer"
    assert p.name == "Outer"


def test_a_transaction_belongs_to_its_thread(p: pm.Project) -> None:
    transaction = p.transaction()
    transaction.__enter__()
    errors: list[BaseException] = []

    def end() -> None:
        try:
            transaction.__exit__(None, None, None)
        except RuntimeError as error:
            errors.append(error)

    thread = threading.Thread(target=end)
    thread.start()
    thread.join()
    assert len(errors) == 1
    p.name = "Still possible"
    transaction.__exit__(None, None, None)
    assert p.name == "Still possible"


def test_a_snapshot_shows_one_state(p: pm.Project) -> None:
    def rename() -> None:
        with pm.open(p.root) as other:
            other.name = "Changed"

    with p.snapshot() as snapshot:
        assert snapshot.name == "Engine controller"
        thread = threading.Thread(target=rename)
        thread.start()
        thread.join()
        assert snapshot.name == "Engine controller"
        with pytest.raises(RuntimeError):
            p.name = "Not possible"
    assert p.name == "Changed"


def test_texts_are_compared_and_merged(p: pm.Project) -> None:
    text = p.root / ".projectdata/project.jsonl"
    base = text.read_bytes()
    p.name = "Ours"
    ours = text.read_bytes()
    p.name = "Theirs"
    p.files.remove("readme.md")
    theirs = text.read_bytes()
    removed, = (each for each in pm.changes_between(base, theirs) if each.subject is pm.DefinitionChange.Subject.FILE)
    assert (removed.kind, removed.name) == (pm.DefinitionChange.Kind.REMOVED, "readme.md")
    merged = pm.merge(base, ours, theirs)
    conflict, = merged.conflicts
    assert (conflict.kind, conflict.ours, conflict.theirs) == (pm.MergeConflict.Kind.KEY, "Ours", "Theirs")
    assert b"<<<<<<<" in merged.text_with_markers()
    text.write_bytes(merged.text([pm.Side.OURS]))
    assert p.name == "Ours" and "readme.md" not in p.files
    with pytest.raises(ValueError):
        merged.text()


def test_an_error_of_the_store_has_a_kind(p: pm.Project) -> None:
    text = p.root / ".projectdata/project.jsonl"
    text.write_bytes(text.read_bytes().replace(b'"src/main.cpp"', b'"src/main.cpp', 1))
    with pytest.raises(pm.StoreError) as caught:
        p.name = "Other"
    assert caught.value.kind is pm.StoreError.Kind.DAMAGED
    assert caught.value.line > 0 and caught.value.file.endswith("project.jsonl")


def test_an_error_of_git_has_a_kind(repository: Path) -> None:
    (repository / ".git/index.lock").touch()
    with pm.open(repository, source_control=pm.SourceControl.OFF, create_as="Engine"):
        pass
    with pm.open(repository) as p, pytest.raises(pm.GitError) as caught:
        p.files.add("readme.md")
    assert caught.value.kind is pm.GitError.Kind.BUSY and caught.value.file.endswith("index.lock")


def test_every_class_of_the_catalog_has_its_arguments() -> None:
    catalog = (Path(__file__).parents[2] / "include/project/metadata/Messages.hpp").read_text()
    import re
    classes = re.findall(r"^class PROJECT_METADATA_EXPORT (\w+)", catalog, re.MULTILINE)
    assert len(classes) > 10
    for name in classes:
        count = int(re.search(rf'"{name}", (\d)\)', catalog)[1])  # type: ignore[index]
        error = getattr(pm, name)
        assert issubclass(error, pm.ProjectException) and len(error.argument_names) == count, name


@pytest.mark.parametrize("variables", [{"LANG": "de_DE.UTF-8"}, {"LC_ALL": "de_AT.UTF-8", "LANG": "en_US.UTF-8"}])
def test_errors_are_german_when_the_locale_is(p: pm.Project, variables: dict[str, str]) -> None:
    program = ("import sys, project_management as pm\n"
               "with pm.open(sys.argv[1]) as p:\n"
               "    try: p.files['nowhere']\n"
               "    except LookupError as error: print(error)\n")
    environment = {name: value for name, value in os.environ.items() if not name.startswith("LC_")}
    shown = subprocess.run([sys.executable, "-X", "utf8", "-c", program, p.root], check=True, capture_output=True,
                           encoding="utf-8", env=environment | variables).stdout
    assert "Projekt" in shown and "nowhere" in shown


def test_the_language_can_be_chosen(p: pm.Project) -> None:
    before = pm.language()
    try:
        pm.set_language("de")
        with pytest.raises(pm.FileNotInProject, match="Projekt"):
            p.files.remove("nowhere")
        pm.set_language("en")
        with pytest.raises(pm.FileNotInProject, match="project"):
            p.files.remove("nowhere")
    finally:
        pm.set_language(before)


GERMAN = """
import sys, project_management as pm
for name in pm.errors.__all__:
    assert issubclass(getattr(pm, name), pm.Error), name

def shown(error, function, *arguments):
    try:
        function(*arguments)
    except error as raised:
        print(raised)
    else:
        raise AssertionError("no error")

with pm.open(sys.argv[1]) as p:
    shown(pm.FileDoesNotExistError, p.files.add, "nowhere")
    shown(pm.CategoryExistsByName, p.categories.create, p.categories.create("Status", data_type="Logical").name)
    label = p.categories["Status"].labels.create("Open")
    shown(pm.LabelDataInvalid, label.put_on, ["readme.md"], "yes")
    p.references.add("../library")
    shown(pm.DuplicateReferenceException, p.references.add, "../library")
    shown(pm.SyncFolderUnsuitable, p.sync_rules.set, "nowhere")
shown(pm.ProjectClosed, p.refresh)
"""


def test_every_error_of_the_package_and_of_the_catalog_is_german(p: pm.Project) -> None:
    done = subprocess.run([sys.executable, "-X", "utf8", "-c", GERMAN, p.root], check=True, capture_output=True,
                          encoding="utf-8", env=os.environ | {"LC_ALL": "de_DE.UTF-8"})
    texts = done.stdout.splitlines()
    assert len(texts) == 6
    for text, german in zip(texts, ("Projekt", "Kategorie", "kein Wert vom Typ", "verwiesen", "Ordner", "geschlossen")):
        assert german in text


def test_the_package_has_each_of_its_messages_in_both_languages() -> None:
    from project_management import messages
    assert messages._ENGLISH.keys() == messages._GERMAN.keys()
    assert {name for name in pm.errors.__all__ if name in messages._ENGLISH} == set(messages._ENGLISH)


def test_errors_survive_pickling(p: pm.Project) -> None:
    """They come back from other processes, for example those of concurrent.futures."""
    p.close()
    errors = [pm.FileDoesNotExistError("text", "/path"), pm.FileNotInProjectRoot("text", "/path", "/root"),
              pm.StoreError("text", 1, "file", 3, "problem", "remedy"), pm.NotAProject("text", 0, "file", 0, "", ""),
              pm.GitError("text", 1, "file", "problem", "remedy"), pm.MoveError("text", 3, "/from", "/to", ""),
              pm.LabelDataInvalid("yes", "Logical", "Checked"), pm.ProjectClosed()]
    for error in errors:
        copy = pickle.loads(pickle.dumps(error))
        assert type(copy) is type(error) and str(copy) == str(error) and vars(copy) == vars(error)


def test_a_closed_project_says_so(folder: Path) -> None:
    with pm.open(folder, create_as="Engine") as p:
        transaction = p.transaction()
    for use in (lambda: p.name, lambda: list(p.files), transaction.__enter__, p.refresh,
                lambda: p.events.name_changed.connect(print)):
        with pytest.raises(pm.ProjectClosed):
            use()
    p.close()
    assert p.is_closed and "closed" in repr(p) and issubclass(pm.ProjectClosed, ValueError)
