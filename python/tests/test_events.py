"""Events: exceptions, weak methods, connections; threads, closing while a slot runs, leaks, the end of the interpreter."""

from __future__ import annotations

import asyncio
import gc
import subprocess
import sys
import threading
import weakref
from pathlib import Path

import project_management as pm
import pytest


def test_events_bring_files_categories_and_labels(p: pm.Project) -> None:
    seen: list[object] = []
    p.events.category_added.connect(seen.append)
    p.events.label_modified.connect(seen.append)
    p.events.file_labels_changed.connect(seen.append)
    p.events.name_changed.connect(lambda: seen.append("name"))
    status = p.categories.create("Status")
    label = status.labels.create("Open")
    label.put_on(["readme.md"])
    p.name = "Other"
    assert seen[0] is not status and isinstance(seen[0], pm.Category) and seen[0].uuid == status.uuid
    assert seen[1:] == [label, [p.files["readme.md"]], "name"]


def test_refresh_reports_changes_of_others(p: pm.Project) -> None:
    p.refresh()
    seen: list[list[pm.File]] = []
    p.events.files_changed.connect(seen.append)
    with pm.open(p.root) as other:
        other.files.remove("readme.md")
    assert seen == [] and p.refresh()
    assert [[str(file) for file in files] for files in seen] == [["readme.md"]]
    assert not p.refresh()


def test_an_exception_of_a_slot_propagates_to_the_caller(p: pm.Project) -> None:
    later: list[object] = []

    def fail() -> None:
        raise KeyError("from the slot")

    p.events.name_changed.connect(fail)
    p.events.name_changed.connect(lambda: later.append(1))
    with pytest.raises(KeyError, match="from the slot"):
        p.name = "Stored all the same"
    assert p.name == "Stored all the same" and later == []


def test_a_bound_method_is_held_weakly(p: pm.Project) -> None:
    calls: list[str] = []

    class Listener:
        def changed(self) -> None:
            calls.append(p.name)

    listener = Listener()
    connection = p.events.name_changed.connect(listener.changed)
    p.name = "First"
    alive = weakref.ref(listener)
    del listener
    gc.collect()
    assert alive() is None and not connection.is_connected
    p.name = "Second"
    assert calls == ["First"]


def test_a_connection_lasts_without_its_object_and_until_the_end_of_its_block(p: pm.Project) -> None:
    calls: list[str] = []
    p.events.name_changed.connect(lambda: calls.append("kept"))
    gc.collect()
    with p.events.name_changed.connected(lambda: calls.append("block")) as connection:
        p.name = "First"
    assert not connection.is_connected
    p.name = "Second"
    assert calls == ["kept", "block", "kept"]


def test_a_slot_may_disconnect_itself_and_change_the_project(p: pm.Project) -> None:
    calls: list[str] = []

    def once() -> None:
        connection.disconnect()
        calls.append(p.name)
        p.name = "From the slot"

    connection = p.events.name_changed.connect(once)
    p.name = "First"
    assert calls == ["First"] and p.name == "From the slot"


def test_closing_while_a_slot_runs_is_safe(p: pm.Project) -> None:
    p.events.name_changed.connect(p.close)
    p.name = "Closing"
    assert p.is_closed
    with pm.open(p.root) as again:
        assert again.name == "Closing"


def test_closing_while_another_thread_is_in_a_slot_is_safe(p: pm.Project) -> None:
    entered, closed = threading.Event(), threading.Event()

    def wait() -> None:
        entered.set()
        assert closed.wait(30)

    p.events.name_changed.connect(wait)
    thread = threading.Thread(target=lambda: setattr(p, "name", "Other"))
    thread.start()
    assert entered.wait(30)
    p.close()
    closed.set()
    thread.join(30)
    assert not thread.is_alive()


def test_closing_in_a_transaction_lets_it_end(p: pm.Project) -> None:
    with p.transaction():
        p.name = "Committed"
        p.close()
    with pm.open(p.root) as again:
        assert again.name == "Committed"


def test_two_threads_one_in_a_transaction_one_refreshing_never_hang(folder: Path) -> None:
    rounds = 1000
    with pm.open(folder, create_as="Engine", source_control=pm.SourceControl.OFF) as p:
        p.files.add_tree()
        seen: list[int] = []
        p.events.name_changed.connect(lambda: seen.append(1))
        errors: list[BaseException] = []

        def change() -> None:
            try:
                for number in range(rounds):
                    with p.transaction():
                        p.name = f"Name {number}"
                        list(p.categories)
            except BaseException as error:
                errors.append(error)

        def refresh() -> None:
            try:
                for _ in range(rounds):
                    p.refresh()
                    p.files.find()
            except BaseException as error:
                errors.append(error)

        threads = [threading.Thread(target=change, daemon=True), threading.Thread(target=refresh, daemon=True)]
        for thread in threads:
            thread.start()
        for thread in threads:
            thread.join(240)
            assert not thread.is_alive(), "it hangs"
        assert errors == [] and len(seen) == rounds and p.name == f"Name {rounds - 1}"


def resident() -> int:
    return int(Path("/proc/self/statm").read_text().split()[1]) * 4096


def test_opening_and_closing_many_times_leaks_nothing(folder: Path) -> None:
    with pm.open(folder, create_as="Engine", source_control=pm.SourceControl.OFF) as p:
        p.files.add_tree()

    def once() -> weakref.ref[pm.Project]:
        with pm.open(folder, source_control=pm.SourceControl.OFF) as opened:
            opened.events.files_changed.connect(lambda files: print(opened, files))
            for file in opened.files:
                list(file.labels)
            opened.refresh()
        return weakref.ref(opened)

    for _ in range(100):
        once()
    gc.collect()
    before, descriptors = resident(), len(list(Path("/proc/self/fd").iterdir()))
    projects = [once() for _ in range(1000)]
    gc.collect()
    assert all(each() is None for each in projects)
    assert len(list(Path("/proc/self/fd").iterdir())) == descriptors
    assert resident() - before < 4 << 20  # some 4 KiB for each project would be a leak


def test_a_project_that_is_not_closed_is_collected_with_its_slots(folder: Path) -> None:
    p = pm.open(folder, create_as="Engine")
    p.events.name_changed.connect(lambda: print(p.name))
    alive = weakref.ref(p)
    del p
    gc.collect()
    assert alive() is None


SHUTDOWNS = {
    "anOpenProject": "",
    "aTransaction": "t = p.transaction(); t.__enter__(); p.name = 'x'",
    "aSnapshot": "s = p.snapshot(); s.__enter__()",
    "aWaitingThread": "threading.Thread(target=p.wait, args=(600,), daemon=True).start(); time.sleep(0.2)",
    "aThreadInASlot": "p.events.name_changed.connect(lambda: time.sleep(600))\n"
                      "threading.Thread(target=setattr, args=(p, 'name', 'x'), daemon=True).start(); time.sleep(0.3)",
    "aTransactionOfAnotherThread": "def run():\n    with p.transaction():\n        time.sleep(600)\n"
                                   "threading.Thread(target=run, daemon=True).start(); time.sleep(0.2)",
    "busyThreads": "def run():\n    while True:\n        p.refresh(); list(p.files); p.name = 'x'\n"
                   "for _ in range(4): threading.Thread(target=run, daemon=True).start()\ntime.sleep(0.3)",
}


@pytest.mark.parametrize("case", SHUTDOWNS)
def test_the_interpreter_ends_with(p: pm.Project, case: str) -> None:
    program = ("import sys, threading, time, project_management as pm\n"
               "p = pm.open(sys.argv[1], source_control=pm.SourceControl.OFF)\n"
               "p.events.name_changed.connect(lambda: None)\n" + SHUTDOWNS[case] + "\nprint('end')\n")
    for _ in range(3):
        done = subprocess.run([sys.executable, "-c", program, p.root], timeout=60, capture_output=True, text=True)
        assert (done.returncode, done.stdout, done.stderr) == (0, "end\n", "")


def test_a_watch_that_is_cancelled_ends(p: pm.Project) -> None:
    async def run() -> None:
        async def watch() -> None:
            async for _ in pm.watch(p, interval=0.01):
                pass

        task = asyncio.create_task(watch())
        await asyncio.sleep(0.1)
        task.cancel()
        with pytest.raises(asyncio.CancelledError):
            await task

    asyncio.run(run())
    assert p._connections == set()


def test_a_watch_does_not_block_the_loop(p: pm.Project) -> None:
    ticks = 0

    async def run() -> None:
        nonlocal ticks

        async def watch() -> None:
            async for _ in pm.watch(p.root, interval=0.01):
                pass

        task = asyncio.create_task(watch())
        with pm.open(p.root) as other:
            for _ in range(50):
                other.files.find()
                await asyncio.sleep(0.001)
                ticks += 1
        task.cancel()
        await asyncio.gather(task, return_exceptions=True)

    asyncio.run(asyncio.wait_for(run(), 30))
    assert ticks == 50
