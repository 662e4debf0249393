"""Paths in a process whose file-system encoding is not UTF-8: they convert as os.fsencode and os.fsdecode do."""

from __future__ import annotations

import os
import subprocess
import sys
from pathlib import Path

import pytest

# Names that are ASCII, UTF-8, Latin-1, UTF-8 of a character outside the BMP, and nothing of these.
PROGRAM = r"""
import os, sys
import project_management as pm

assert sys.getfilesystemencoding() == sys.argv[2], sys.getfilesystemencoding()
names = [b"plain.c", b"\xc3\xa4.c", b"\xe4.c", b"\xf0\x9f\x98\x80.c", b"\xff\xfe.c"]
decoded = sorted(map(os.fsdecode, names))
folder = os.fsencode(sys.argv[1]) + b"/\xc3\xa4\xe4"
os.mkdir(folder)
for name in names:
    with open(folder + b"/" + name, "wb") as file:
        file.write(name * 100)

def paths(found):
    return sorted(map(str, found))

with pm.open(folder, create_as="Names") as p:
    assert os.fsencode(p.root) == folder
    p.files.add(*names)
    p.files.remove(*map(os.fsdecode, names))
    p.files.add(*map(os.fsdecode, names))
    assert paths(p.files) == decoded and {os.fsencode(str(file)) for file in p.files} == set(names)
    for name in names:
        file = p.files[os.fsdecode(name)]
        assert file == p.files[name] and os.fsencode(file) == folder + b"/" + name and file in p.files
        with open(file, "rb") as stream:
            assert stream.read() == name * 100
        assert p.files.glob(str(file)) == [file] == p.files.find(below=[file])
    changed = []
    p.events.file_labels_changed.connect(changed.extend)
    label = p.categories.create("Status").labels.create("Open")
    label.put_on(names)
    assert paths(changed) == decoded
    for name in names:
        p.entry_points[name] = pm.EntryPoint()
        p.scopes["Data"][name] = pm.MetadataNode()
    assert paths(p.entry_points) == paths(p.scopes["Data"]) == decoded
    for name in names:
        os.mkdir(folder + b"/folder of " + name)
    p.path.add(*(b"folder of " + name for name in names))
    assert sorted(each.location.name for each in p.path) == sorted("folder of " + name for name in decoded)
    for name in names:
        p.sync_rules.set(b"folder of " + name, included={os.fsdecode(name)})
        open(folder + b"/folder of " + name + b"/" + name, "w").close()
    assert sorted(rule.folder for rule in p.sync_rules) == sorted("folder of " + name for name in decoded)
    assert sorted(pattern for rule in p.sync_rules for pattern in rule.included) == decoded
    assert len(p.sync().added) >= len(names)
    try:
        p.files.remove(b"not there \xe4")
    except pm.FileNotInProject as error:
        assert os.fsencode(error.path) == folder + b"/not there \xe4"
    moved = p.move(b"\xe4.c", to=b"moved \xe4.c")
    assert moved == [pm.Move(os.fsdecode(b"\xe4.c"), os.fsdecode(b"moved \xe4.c"))]
    os.rename(folder + b"/moved \xe4.c", folder + b"/folder of plain.c/moved \xe4.c")
    pair, = p.find_renames().pairs
    assert (os.fsencode(pair.source), os.fsencode(pair.destination)) == (b"moved \xe4.c", b"folder of plain.c/moved \xe4.c")
    text = folder + b"/.projectdata/project.jsonl"
    damaged = open(text, "rb").read().replace(b'"plain.c"', b'"plain.c', 1)
    open(text, "wb").write(damaged)
    try:
        p.name = "Other"
    except pm.StoreError as error:
        assert os.fsencode(error.file) == text
    else:
        raise AssertionError("the damage was not found")
print("end")
"""


def run(program: str, folder: Path, encoding: str, **variables: str) -> str:
    environment = {name: value for name, value in os.environ.items() if not name.startswith(("LC_", "LANG"))}
    done = subprocess.run([sys.executable, "-c", program, folder, encoding], capture_output=True, text=True,
                          env=environment | {"PYTHONUTF8": "0", "PYTHONCOERCECLOCALE": "0"} | variables)
    assert done.returncode == 0, done.stderr
    return done.stdout


@pytest.fixture(scope="session")
def locales(tmp_path_factory: pytest.TempPathFactory) -> Path:
    """A folder with the locale of Latin-1."""
    folder = tmp_path_factory.mktemp("locales")
    subprocess.run(["localedef", "--no-archive", "-i", "de_DE", "-f", "ISO-8859-1", folder / "de_DE.ISO-8859-1"], check=True)
    return folder


def test_paths_are_those_of_python_in_ascii(tmp_path: Path) -> None:
    assert run(PROGRAM, tmp_path, "ascii", LC_ALL="C") == "end\n"


def test_paths_are_those_of_python_in_latin_1(tmp_path: Path, locales: Path) -> None:
    assert run(PROGRAM, tmp_path, "iso8859-1", LC_ALL="de_DE.ISO-8859-1", LOCPATH=str(locales)) == "end\n"


def test_paths_are_those_of_python_in_utf_8(tmp_path: Path) -> None:
    assert run(PROGRAM, tmp_path, "utf-8", LC_ALL="C.UTF-8") == "end\n"


def test_a_project_is_the_same_in_every_encoding(tmp_path: Path, locales: Path) -> None:
    write = (r"import os, sys, project_management as pm" "\n"
             r"folder = os.fsencode(sys.argv[1]); open(folder + b'/\xc3\xa4', 'w').close(); open(folder + b'/\xe4', 'w').close()" "\n"
             r"with pm.open(folder, create_as='Names') as p: p.files.add(b'\xc3\xa4', b'\xe4')")
    read = (r"import os, sys, project_management as pm" "\n"
            r"with pm.open(sys.argv[1]) as p: print({os.fsencode(str(file)) for file in p.files} == {b'\xc3\xa4', b'\xe4'})")
    run(write, tmp_path, "", LC_ALL="de_DE.ISO-8859-1", LOCPATH=str(locales))
    assert run(read, tmp_path, "", LC_ALL="C") == run(read, tmp_path, "", LC_ALL="C.UTF-8") == "True\n"
