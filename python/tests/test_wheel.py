"""The wheel is built without a network, installed into an environment of its own, and used there."""

from __future__ import annotations

import os
import shutil
import subprocess
import sys
import venv
from pathlib import Path

PYTHON = Path(__file__).parents[1]


def test_the_wheel_is_built_installed_and_used(folder: Path, tmp_path: Path) -> None:
    source = tmp_path / "python"  # setuptools writes beside its sources
    shutil.copytree(PYTHON, source, ignore=shutil.ignore_patterns("build", "dist", "*.egg-info", "tests"))
    subprocess.run([sys.executable, "-m", "build", "--no-isolation", "--wheel", source], check=True,
                   env=os.environ | {"http_proxy": "http://127.0.0.1:9", "https_proxy": "http://127.0.0.1:9"})
    (wheel,) = (source / "dist").glob("*.whl")
    assert wheel.name == "project_management-0.1.0-cp311-cp311-linux_x86_64.whl" or os.uname().machine != "x86_64"
    environment = tmp_path / "environment"
    venv.create(environment, with_pip=True)
    python = environment / "bin/python"
    subprocess.run([python, "-m", "pip", "install", "-q", "--no-index", "--no-deps", wheel], check=True)
    program = ("import sys, project_management as pm\n"
               "assert sys.prefix in pm.__file__, pm.__file__\n"
               "with pm.open(sys.argv[1], create_as='Engine') as p:\n"
               "    print(p.files.add_tree(), [str(f) for f in p.files.glob('**/*.cpp')])\n")
    variables = {name: value for name, value in os.environ.items() if name != "PYTHONPATH"}
    shown = subprocess.run([python, "-c", program, folder], check=True, capture_output=True, text=True, env=variables)
    assert shown.stdout == "6 ['src/io/pump.cpp', 'src/main.cpp']\n"
    installed = {path.name for path in environment.glob("lib/*/site-packages/project_management/*")}
    assert {"__init__.py", "_core.pyi", "py.typed"} <= installed
