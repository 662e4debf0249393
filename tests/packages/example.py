"""The first example of the guide for Python, with the installed module. Its working folder contains the folder engine."""

import asyncio
from pathlib import Path

import project_management as pm

with pm.open("engine", create_as="Engine controller") as p:
    p.files.add("src/main.cpp", Path("src/io/pump.cpp"))
    p.files.add_tree("src", ignore=pm.git_ignored)
    status = p.categories.create("Status", single_valued=True)
    reviewed = status.labels.create("Reviewed")
    with p.transaction():
        for f in p.files.glob("**/*.cpp"):
            f.labels.add(reviewed)
    assert [str(f) for f in p.files.find(status == "Reviewed")] == ["src/io/pump.cpp", "src/main.cpp"]
    p.entry_points["src/main.cpp"] = pm.EntryPoint(type="Startup", name="Engine", extensions={"args": "-v"})
    with p.events.file_labels_changed.connected(lambda files: print(files)):
        p.refresh()


async def live() -> pm.Change:
    async for change in pm.watch("engine", interval=0.05):
        return change
    raise AssertionError("the loop ends only with an exception")


async def both() -> pm.Change:
    task = asyncio.create_task(live())
    with pm.open("engine") as p:
        while not task.done():
            await asyncio.sleep(0.2)
            p.name = p.name + "!"
    return await task


print(asyncio.run(both()).event)
