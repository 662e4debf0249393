"""No operation keeps other threads of Python from running while it waits for the project."""

from __future__ import annotations

import faulthandler
import re
import threading
import time
from collections.abc import Callable, Iterator
from pathlib import Path

import project_management as pm
import pytest
from project_management import _core

STUB = Path(_core.__file__).parent / "_core.pyi"
IGNORED = {
    "is_closed": "has no lock but that of a pointer", "root": "is a constant", "relative": "has no lock",
    "absolute": "has no lock", "is_shared": "is a constant", "wake": "must work while another thread waits",
    "connect": "has no lock but that of the list of slots", "raise_metadata_changed": "calls slots only",
    "take_recovered_moves": "has no lock but that of a list", "take_history_loss": "concerns shared projects",
    "close": "has a test of its own",
}


def of(method: str, *arguments: object) -> Callable[[pm.Project], object]:
    return lambda p: getattr(p._core, method)(*arguments)


def category(p: pm.Project) -> tuple[str, str, bool, bool, str]:
    return p.categories["Status"]._values


def label(p: pm.Project) -> tuple[str, str, int]:
    return p.categories["Status"].labels["Open"]._values


# Each operation of the module on a project. It waits while another thread is in a transaction that has changed the
# project, or reads the state before; in both cases the other threads of Python run.
OPERATIONS: dict[str, Callable[[pm.Project], object]] = {
    "name": of("name"),
    "set_name": of("set_name", "Other"),
    "description": of("description"),
    "set_description": of("set_description", "Other"),
    "refresh": of("refresh"),
    "watch": of("watch", 0.0),
    "stage": of("stage"),
    "begin": lambda p: p._core.begin().end(),
    "read": lambda p: p._core.read().end(),
    "add_files": of("add_files", ["readme.md"], True),
    "remove_files": of("remove_files", ["readme.md"]),
    "has_file": of("has_file", "readme.md"),
    "count_files": of("count_files"),
    "find": lambda p: p.files.find(),
    "children": of("children", "src"),
    "categories": of("categories", False),
    "create_category": of("create_category", False, "New", "", False, False, "None"),
    "delete_category": lambda p: p._core.delete_category(False, category(p)),
    "rename_category": lambda p: p._core.rename_category(False, category(p), "State"),
    "labels": lambda p: p._core.labels(False, category(p)),
    "create_label": lambda p: p._core.create_label(False, category(p), "New", "", 2),
    "delete_label": lambda p: p._core.delete_label(False, category(p), label(p)),
    "add_label": lambda p: p._core.add_label(False, ["src/main.cpp"], category(p), label(p), None),
    "remove_label": lambda p: p._core.remove_label(False, ["src/main.cpp"], category(p), label(p)),
    "remove_category": lambda p: p._core.remove_category(False, ["src/main.cpp"], category(p)),
    "labels_of_file": of("labels_of_file", False, "src/main.cpp"),
    "hidden_files": of("hidden_files"),
    "remove_hidden": of("remove_hidden"),
    "follow_hidden": of("follow_hidden", []),
    "entry_points": of("entry_points"),
    "entry_point": of("entry_point", "src/main.cpp"),
    "set_entry_point": of("set_entry_point", "src/main.cpp", "", "main", "Basic", True, None, {}),
    "remove_entry_point": of("remove_entry_point", "src/main.cpp"),
    "groups": of("groups"),
    "create_group": of("create_group", "New", ""),
    "rename_group": lambda p: p.entry_points.groups.rename(p.entry_points.groups["Tools"], "Programs"),
    "delete_group": lambda p: p.entry_points.groups.delete(p.entry_points.groups["Tools"]),
    "references": of("references", False),
    "add_references": of("add_references", True, ["src"], False),
    "remove_references": lambda p: p.references.remove(*p.references),
    "root_reference": of("root_reference", True, "src"),
    "scope_nodes": of("scope_nodes", "Metrics"),
    "scope_node": of("scope_node", "Metrics", "src/main.cpp"),
    "set_scope_nodes": of("set_scope_nodes", "Metrics", [("src/main.cpp", ("Info", {}, []))]),
    "remove_scope_nodes": of("remove_scope_nodes", "Metrics", ["src/main.cpp"]),
    "move": of("move", ["src/main.cpp"], "src/io"),
    "adopt": of("adopt", []),
    "find_renames": of("find_renames", 50, True),
    "has_unfinished_move": of("has_unfinished_move"),
    "sync_rules": of("sync_rules"),
    "set_sync_rule": of("set_sync_rule", "src", set(), set(), True),
    "remove_sync_rule": of("remove_sync_rule", "src"),
    "plan_sync": lambda p: p.plan_sync(),
    "sync": lambda p: p.sync(),
}


@pytest.fixture(autouse=True)
def no_hang() -> Iterator[None]:
    """Ends the process if it hangs: a thread that waits with the interpreter's lock lets no other code run."""
    faulthandler.dump_traceback_later(120, exit=True)
    yield
    faulthandler.cancel_dump_traceback_later()


def test_the_table_has_every_operation() -> None:
    body = re.search(r"^class OpenProject:\n(.*?)^def ", STUB.read_text(), re.MULTILINE | re.DOTALL)
    assert body is not None
    assert set(re.findall(r"    def (\w+)", body[1])) == set(OPERATIONS) | set(IGNORED)


@pytest.mark.parametrize("operation", OPERATIONS)
def test_others_run_during(p: pm.Project, operation: str) -> None:
    p.categories.create("Status").labels.create("Open").put_on(["readme.md"])
    p.entry_points.groups.create("Tools")
    p.references.add("../library")
    errors: list[BaseException] = []
    ticks = 0

    def run() -> None:
        try:
            OPERATIONS[operation](p)
        except BaseException as error:
            errors.append(error)

    thread = threading.Thread(target=run, daemon=True)
    with p.transaction():
        p.description = "from the transaction"
        thread.start()
        for _ in range(20):  # the other thread is in the operation now, and this one runs all the same
            ticks += 1
            time.sleep(0.001)
    thread.join(60)
    assert not thread.is_alive() and errors == [] and ticks == 20


def test_others_run_while_a_project_is_opened_and_closed(p: pm.Project) -> None:
    def run() -> None:
        with pm.open(p.root) as other:
            other.name = "From the other"

    thread = threading.Thread(target=run, daemon=True)
    with p.transaction():
        p.description = "from the transaction"
        thread.start()
        time.sleep(0.05)
    thread.join(60)
    assert not thread.is_alive() and p.name == "From the other"


def test_others_run_while_the_disk_is_read(p: pm.Project, tmp_path: Path) -> None:
    """A path through a link is resolved on disk, and a folder is read: neither keeps the lock of the interpreter."""
    (tmp_path / "link").symlink_to(p.root)
    text = (p.root / ".projectdata/project.jsonl").read_bytes()
    stop = threading.Event()

    def run() -> None:
        while not stop.is_set():
            assert (tmp_path / "link/readme.md") in p.files
            _core.read_folder(p.root)
            pm.is_project(p.root)
            pm.merge(text, text, text).text()
            pm.changes_between(b"", text)

    threads = [threading.Thread(target=run, daemon=True) for _ in range(4)]
    for thread in threads:
        thread.start()
    for _ in range(100):
        assert p.name
    stop.set()
    for thread in threads:
        thread.join(60)
        assert not thread.is_alive()
