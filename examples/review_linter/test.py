#!/usr/bin/env python3
"""test.py LINTER PROJECTCTL: the linter labels a project in a new folder, and follows the changes of its files."""

import ctypes
import os
import pathlib
import struct
import subprocess
import sys
import tempfile

linter, projectctl = sys.argv[1:]


def run(*command, status=0):
    done = subprocess.run(command, cwd=folder, capture_output=True, text=True)
    assert done.returncode == status, f"{command} ended with {done.returncode}:\n{done.stdout}{done.stderr}"
    return done.stdout


def lint(status):
    return run(linter, str(folder), status=status).splitlines()


def reviewed():
    return run(projectctl, "list", "--kind", "file", "--label", "Linter=Reviewed").split()


def expect(found, expected, situation):
    assert found == expected, f"{situation}: {found} instead of {expected}"


class Commits:
    """Counts how often the text of the project is replaced: once for each change that is committed."""

    MOVED_TO = 0x80  # of <sys/inotify.h>

    def __init__(self):
        libc = ctypes.CDLL(None)
        self.file = libc.inotify_init1(os.O_NONBLOCK)
        watch = libc.inotify_add_watch(self.file, os.fsencode(folder / ".projectdata"), self.MOVED_TO)
        assert self.file >= 0 and watch >= 0, "inotify is not available"

    def take(self):
        try:
            events = os.read(self.file, 65536)
        except BlockingIOError:
            return 0
        count = 0
        while events:
            length = struct.unpack_from("iIII", events)[3]
            count += events[16:16 + length].rstrip(b"\0") == b"project.jsonl"
            events = events[16 + length:]
        return count


with tempfile.TemporaryDirectory() as name:
    folder = pathlib.Path(name).resolve()
    (folder / "good.txt").write_text("one\ntwo\n")
    (folder / "bad.txt").write_text("one\n\ttwo\nthree \nfour")
    (folder / "empty.txt").write_text("")
    (folder / "picture.bin").write_bytes(b"\0\t \n")
    (folder / "other.txt").write_text("\t\n")
    run(projectctl, "init", "--no-source-control")
    run(projectctl, "add", "good.txt", "bad.txt", "empty.txt", "picture.bin")

    commits = Commits()
    expect(lint(1), [
        "bad.txt:2: tab",
        "bad.txt:3: blank at the end of the line",
        "bad.txt:4: no line end after the last line",
        "2 reviewed, 0 not reviewed any more"], "the first run")
    expect(reviewed(), ["empty.txt", "good.txt"], "the first run")

    expect(commits.take(), 1, "the label, the files that have it and the hashes are one change")

    expect(lint(1)[-1], "0 reviewed, 0 not reviewed any more", "a run without changes")
    expect(commits.take(), 0, "a run without changes")

    (folder / "good.txt").write_text("one\ntwo \n")
    expect(lint(1)[-2:], ["good.txt:2: blank at the end of the line", "0 reviewed, 1 not reviewed any more"],
           "a file that was spoilt")
    expect(reviewed(), ["empty.txt"], "a file that was spoilt")

    (folder / "good.txt").write_text("one\nthree\n")
    (folder / "bad.txt").write_text("one\n")
    (folder / "empty.txt").unlink()
    expect(lint(0), ["2 reviewed, 1 not reviewed any more"], "repaired files and one that is gone")
    expect(reviewed(), ["bad.txt", "good.txt"], "repaired files and one that is gone")
    expect(commits.take(), 2, "one change for each of the two runs that had one")

    (folder / "good.txt").write_text("one\nfour\n")
    expect(lint(0), ["1 reviewed, 0 not reviewed any more"], "a file that was changed and is still good")
    expect(lint(0), ["0 reviewed, 0 not reviewed any more"], "the run after it: the hash was replaced")
    run(projectctl, "check")  # the labels with their data are a correct definition

    (folder / "good.txt").write_text("one\t\n")
    (folder / ".projectdata/project.jsonl").write_text("damaged\n")
    lint(2)
