"""Projects on a server: two processes of Python change and watch one, and the server stops."""

from __future__ import annotations

import shutil
import subprocess
import sys
from collections.abc import Iterator
from pathlib import Path

import project_management as pm
import pytest
from guide import blocks_of
from server import Server, programs

GUIDE = Path(__file__).parents[2] / "docs/guide/python.md"

# Programs of a second process, with the project's folder as their argument.
CHANGE = """
import sys, project_management as pm
with pm.open(sys.argv[1]) as p:
    p.files.add("src/io/pump.cpp")
    p.categories.create("Status").labels.create("Open").put_on(["src/main.cpp"])
"""
WATCH = """
import sys, project_management as pm
with pm.open(sys.argv[1]) as p:
    p.refresh()
    p.events.file_labels_changed.connect(lambda files: print([str(file) for file in files], flush=True))
    print("ready", flush=True)
    assert p.wait(60)
    print([str(label) for label in p.files["readme.md"].labels], flush=True)
"""
MANY = """
import sys, project_management as pm
with pm.open(sys.argv[1]) as p:
    labels = p.categories["Status"].labels
    for number in range(20):
        labels.create(f"{sys.argv[2]} {number}").put_on(["readme.md"])
        p.refresh()
"""


@pytest.fixture(scope="module")
def server() -> Iterator[Server]:
    if programs() is None:
        pytest.skip("the package postgresql is not installed")
    server = Server()
    yield server
    server.close()


@pytest.fixture
def shared(server: Server, folder: Path, monkeypatch: pytest.MonkeyPatch) -> Iterator[pm.Project]:
    """A project on the server."""
    monkeypatch.setenv("PGSERVICEFILE", str(server.service_file))
    name = folder.parent.name  # that of the test
    with pm.create_shared(folder, "Engine", service="engine", reader=f"r_{name}", writer=f"w_{name}",
                          source_control=pm.SourceControl.OFF) as p:
        p.files.add("src/main.cpp", "readme.md")
        yield p


@pytest.fixture
def elsewhere(shared: pm.Project, tmp_path: Path) -> Path:
    """The same folder on another machine, as after a checkout."""
    return Path(shutil.copytree(shared.root, tmp_path / "elsewhere", ignore=shutil.ignore_patterns("cache", "local")))


def run(program: str, *arguments: str | Path) -> subprocess.Popen[str]:
    return subprocess.Popen([sys.executable, "-c", program, *arguments], stdout=subprocess.PIPE, text=True)


def result(process: subprocess.Popen[str]) -> str:
    shown, _ = process.communicate(timeout=120)
    assert process.returncode == 0
    return shown


def test_changes_of_another_process_arrive(shared: pm.Project, elsewhere: Path) -> None:
    assert shared.is_shared and not (shared.root / ".projectdata/project.jsonl").exists()
    shared.refresh()
    added: list[str] = []
    labelled: list[str] = []
    shared.events.files_changed.connect(lambda files: added.extend(map(str, files)))
    shared.events.file_labels_changed.connect(lambda files: labelled.extend(map(str, files)))

    result(run(CHANGE, elsewhere))

    assert added == [] and shared.refresh() and not shared.refresh()
    assert "src/io/pump.cpp" in added and labelled == ["src/main.cpp"]
    assert shared.files.find(shared.categories["Status"] == "Open") == [shared.files["src/main.cpp"]]


def test_another_process_waits_for_a_change(shared: pm.Project, elsewhere: Path) -> None:
    label = shared.categories.create("Status").labels.create("Open")
    process = run(WATCH, elsewhere)
    assert process.stdout is not None and process.stdout.readline() == "ready\n"

    label.put_on(["readme.md"])

    assert result(process) == "['readme.md']\n['Open']\n"


def test_two_processes_that_change_a_project_lose_nothing(shared: pm.Project, elsewhere: Path) -> None:
    shared.categories.create("Status")
    shared.refresh()

    processes = [run(MANY, shared.root, "here"), run(MANY, elsewhere, "there")]
    for process in processes:
        result(process)

    expected = {f"{place} {number}" for place in ("here", "there") for number in range(20)}
    assert {str(label) for label in shared.files["readme.md"].labels} == expected
    assert shared.refresh()


def test_a_server_that_has_stopped_is_unreachable(shared: pm.Project, server: Server) -> None:
    with pm.open(shared.root, reads_last_state=True) as patient:
        assert "readme.md" in patient.files
        server.stop()
        try:
            with pytest.raises(pm.StoreError) as caught:  # only after half a minute, in which the server could return
                shared.files.add("src/io/pump.cpp")
            assert caught.value.kind is pm.StoreError.Kind.UNREACHABLE
            assert "readme.md" in patient.files
        finally:
            server.start()
        assert patient.files.add("src/io/pump.cpp") == 1 and "src/io/pump.cpp" in shared.files


def test_the_block_of_the_guide_creates_a_project(server: Server, folder: Path, monkeypatch: pytest.MonkeyPatch) -> None:
    monkeypatch.setenv("PGSERVICEFILE", str(server.service_file))
    monkeypatch.chdir(folder.parent)
    folder.rename("engine")
    (block,) = blocks_of(GUIDE, "python", on_server=True)
    names: dict[str, object] = {"pm": pm}
    exec(compile(block, str(GUIDE), "exec"), names)
    p = names["p"]
    assert isinstance(p, pm.Project) and p.name == "Engine controller" and p.is_shared
    p.close()


def test_a_service_that_is_not_configured_is_refused(shared: pm.Project, tmp_path: Path) -> None:
    (tmp_path / "other").mkdir()
    with pytest.raises(pm.StoreError) as caught:
        pm.create_shared(tmp_path / "other", "Engine", service="nowhere", reader="r_nowhere", writer="w_nowhere")
    assert caught.value.kind is pm.StoreError.Kind.REFUSED and "nowhere" in str(caught.value)
    assert not pm.is_project(tmp_path / "other")


def test_a_project_without_a_loss_of_history_reports_none(shared: pm.Project) -> None:
    assert shared.take_history_loss() is None


def test_errors_of_the_library_that_is_loaded_for_servers_are_german(tmp_path: Path, monkeypatch: pytest.MonkeyPatch) -> None:
    (tmp_path / "services").write_text("[gone]\nhost=/nonexistent\nsslmode=disable\n")
    monkeypatch.setenv("PGSERVICEFILE", str(tmp_path / "services"))
    before = pm.language()
    pm.set_language("de")
    try:
        with pytest.raises(pm.StoreError, match="der Server ist nicht erreichbar") as caught:
            pm.create_shared(tmp_path, "Engine", service="gone", reader="reader", writer="writer")
    finally:
        pm.set_language(before)
    assert caught.value.kind is pm.StoreError.Kind.UNREACHABLE
