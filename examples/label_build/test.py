#!/usr/bin/env python3
"""test.py GENERATOR PROJECTCTL COMPILER: builds the demo, changes the labels of its files, and builds it again."""

import pathlib
import shutil
import subprocess
import sys
import tempfile

generator, projectctl, compiler = sys.argv[1:]
example = pathlib.Path(__file__).parent


def call(*command):
    return subprocess.run(command, cwd=folder, capture_output=True, text=True)


def run(*command):
    done = call(*command)
    assert done.returncode == 0, f"{command} ended with {done.returncode}:\n{done.stdout}{done.stderr}"
    return done.stdout


def label(*files):
    run(projectctl, "label", "put", "Build", "Yes", *files)


def unlabel(*files):
    run(projectctl, "label", "take", "Build", "Yes", *files)


def build():
    return run("cmake", "--build", "build")


with tempfile.TemporaryDirectory() as name:
    folder = pathlib.Path(name).resolve() / "two words"
    shutil.copytree(example / "demo", folder)
    run(projectctl, "init", "--no-source-control")
    run(projectctl, "category", "create", "Build")
    run(projectctl, "label", "create", "Build", "Yes")
    run(projectctl, "add", "src/main.cpp", "src/plain.cpp", "src/fancy.cpp")
    label("src/main.cpp", "src/plain.cpp")

    run("cmake", "-S", ".", "-B", "build", "-G", "Ninja", f"-DUNITY_SOURCE={generator}", f"-DCMAKE_CXX_COMPILER={compiler}")
    build()
    assert run("build/demo") == "plain\n", run("build/demo")
    said = build()
    assert "no work to do" in said, said

    unlabel("src/plain.cpp")
    label("src/fancy.cpp")
    build()
    assert run("build/demo") == "fancy\n", run("build/demo")

    run(projectctl, "description", "Nothing for the compiler")
    said = build()
    assert "Building" not in said, f"compiled although the list is the same:\n{said}"

    (folder / "src/fancy.cpp").write_text('char const* extra = "fancier";\n')
    build()
    assert run("build/demo") == "fancier\n", run("build/demo")

    failed = call(generator, ".", "Build=No", "out.cpp")
    assert failed.returncode == 1 and "no label Build=No" in failed.stderr, failed
    assert not (folder / "out.cpp").exists()
    failed = call(generator, "src", "Build=Yes", "out.cpp")
    assert failed.returncode == 1 and failed.stderr.startswith("unity_source: "), failed
    failed = call(generator, ".", "Build=Yes", "missing/out.cpp")
    assert failed.returncode == 1 and "missing/out.cpp" in failed.stderr, failed
