"""The type stubs describe the module, the guide and the example have the right types, help() explains everything."""

from __future__ import annotations

import inspect
import os
import pydoc
import subprocess
import sys
from pathlib import Path

import project_management as pm
from guide import blocks_of

GUIDE = Path(__file__).parents[2] / "docs/guide"
PACKAGE = Path(pm.__file__).resolve().parent


def mypy(*arguments: str | Path, folder: Path) -> str:
    done = subprocess.run([sys.executable, "-m", *arguments], capture_output=True, text=True, cwd=folder,
                          env=os.environ | {"MYPYPATH": str(PACKAGE.parent), "MYPY_CACHE_DIR": str(folder / "cache")})
    assert done.returncode == 0, done.stdout + done.stderr
    return done.stdout


def test_the_stub_describes_the_module_in_cpp(tmp_path: Path) -> None:
    mypy("mypy.stubtest", "project_management._core", "--allowlist", Path(__file__).parent / "stubtest-allowlist.txt",
         folder=tmp_path)


def test_the_package_the_guide_and_the_example_are_strictly_typed(tmp_path: Path) -> None:
    (tmp_path / "guide_page.py").write_text("\n".join(blocks_of(GUIDE / "python.md", "python")))
    example = (Path(__file__).parent / "test_example.py").read_text()
    (tmp_path / "example.py").write_text(example)
    mypy("mypy", "--strict", "-p", "project_management", folder=tmp_path)
    mypy("mypy", "--strict", "guide_page.py", "example.py", folder=tmp_path)


def test_a_wrong_type_is_reported(tmp_path: Path) -> None:
    (tmp_path / "wrong.py").write_text("import project_management as pm\npm.open('x').files.add(1)\n")
    done = subprocess.run([sys.executable, "-m", "mypy", "--strict", "wrong.py"], capture_output=True, text=True,
                          cwd=tmp_path, env=os.environ | {"MYPYPATH": str(PACKAGE.parent)})
    assert done.returncode == 1 and "arg-type" in done.stdout


def test_help_explains_every_public_name() -> None:
    missing = []
    for name in pm.__all__:
        member = getattr(pm, name)
        if inspect.isclass(member) or inspect.isfunction(member):
            if not inspect.getdoc(member):
                missing.append(name)
        if inspect.isclass(member):
            missing += [f"{name}.{each}" for each, value in vars(member).items()
                        if not each.startswith("_") and (inspect.isfunction(value) or isinstance(value, property))
                        and not inspect.getdoc(value)]
    assert missing == []
    assert "Moves files and folders on disk" in pydoc.render_doc(pm.Project)
