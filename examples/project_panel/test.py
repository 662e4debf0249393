#!/usr/bin/env python3
"""test.py PANEL PROJECTCTL: runs the panel in a pseudo terminal while projectctl changes the project."""

import fcntl
import os
import pathlib
import pty
import re
import select
import signal
import struct
import subprocess
import sys
import tempfile
import termios
import time

panel, projectctl = sys.argv[1:]
PATIENCE = 30  # seconds, for a machine that is busy
UP, DOWN, LEFT, RIGHT, ENTER = b"\x1b[A", b"\x1b[B", b"\x1b[D", b"\x1b[C", b"\r"


def ctl(*arguments):
    subprocess.run([projectctl, *arguments], cwd=folder, check=True, stdout=subprocess.DEVNULL)


class Screen:
    """A panel that runs in a terminal of 12 rows and 60 columns."""

    def __init__(self):
        self.pid, self.terminal = pty.fork()
        if self.pid == 0:
            os.environ["LC_ALL"] = "C.UTF-8"
            os.execv(panel, [panel, str(folder)])
        fcntl.ioctl(self.terminal, termios.TIOCSWINSZ, struct.pack("HHHH", 12, 60, 0, 0))
        os.kill(self.pid, signal.SIGWINCH)
        self.output = ""

    def press(self, *keys):
        os.write(self.terminal, b"".join(keys))

    def read(self):
        """Reads what there is. Returns False after the end of the panel."""
        if not select.select([self.terminal], [], [], 0.1)[0]:
            return True
        try:
            data = os.read(self.terminal, 65536)
        except OSError:  # the end of a pseudo terminal
            return False
        self.output += data.decode()
        return bool(data)

    def lines(self):
        """The lines of the last complete picture, which begins at the top left and ends with a clearing."""
        pictures = re.findall(r"\x1b\[H((?:(?!\x1b\[H).)*)\x1b\[J", self.output, re.DOTALL)
        text = re.sub(r"\x1b\[[0-9;?]*[A-Za-z]", "", pictures[-1]) if pictures else ""
        return text.split("\r\n")[:-1]

    def selected(self):
        """The line that is shown in reverse."""
        return re.findall(r"\x1b\[7m(.*?)\x1b\[0m", self.output)[-1].strip()

    def expect(self, *lines):
        end = time.monotonic() + PATIENCE
        while self.lines() != list(lines):
            if not self.read() or time.monotonic() > end:
                sys.exit(f"expected {list(lines)}\nfound {self.lines()}\nin {self.output[-300:]!r}")

    def expect_selected(self, name):
        end = time.monotonic() + PATIENCE
        while self.selected() != name:
            if not self.read() or time.monotonic() > end:
                sys.exit(f"expected {name} to be selected, found {self.selected()}")

    def expect_end(self, end_of_output="\x1b[?25h\x1b[?1049l"):
        while self.read():
            pass
        status = os.waitstatus_to_exitcode(os.waitpid(self.pid, 0)[1])
        assert status == 0, f"the panel ended with {status}"
        assert self.output.endswith(end_of_output), f"the screen was not restored: {self.output[-80:]!r}"


with tempfile.TemporaryDirectory() as name:
    folder = pathlib.Path(name).resolve()
    (folder / "src/deep").mkdir(parents=True)
    for file in ("src/a.cpp", "src/deep/b.cpp", "top.txt", "src/new.cpp", "src/zo\u00eb\x1b[31m.cpp"):
        (folder / file).touch()
    ctl("init", "--no-source-control")
    ctl("add", "src/a.cpp", "src/deep/b.cpp", "top.txt")
    ctl("category", "create", "Status")
    ctl("label", "create", "Status", "Done")
    ctl("label", "put", "Status", "Done", "src/a.cpp")

    screen = Screen()
    a, deep, b, top = "    a.cpp  [Status: Done]", "  - deep", "      b.cpp", "  top.txt"
    screen.expect("- src", a, deep, b, top)

    # The changes of another process appear.
    ctl("add", "src/new.cpp")
    screen.expect("- src", a, deep, b, "    new.cpp", top)
    ctl("label", "put", "Status", "Done", "src/new.cpp")
    screen.expect("- src", a, deep, b, "    new.cpp  [Status: Done]", top)
    ctl("category", "rename", "Status", "Progress")
    a = "    a.cpp  [Progress: Done]"
    screen.expect("- src", a, deep, b, "    new.cpp  [Progress: Done]", top)
    ctl("remove", "src/new.cpp")
    screen.expect("- src", a, deep, b, top)

    # The keys move and fold.
    screen.press(DOWN, DOWN, ENTER)
    screen.expect("- src", a, "  + deep", top)
    screen.expect_selected("+ deep")
    screen.press(UP, UP, UP, LEFT)
    screen.expect("+ src", top)
    ctl("add", "src/new.cpp")  # below a folded folder, so nothing appears
    screen.press(RIGHT)
    screen.expect("- src", a, "  + deep", "    new.cpp", top)
    screen.press(*[DOWN] * 20)
    screen.expect_selected("top.txt")

    # The name of a file cannot control the terminal.
    ctl("add", "src/zo\u00eb\x1b[31m.cpp")
    screen.expect("- src", a, "  + deep", "    new.cpp", "    zo\u00eb?[31m.cpp", top)

    # A text that is incomplete for a moment is a message, and the next check continues.
    text = (folder / ".projectdata/project.jsonl").read_bytes()
    (folder / ".projectdata/project.jsonl").write_bytes(b"not a definition\n")
    end = time.monotonic() + PATIENCE
    while "project.jsonl" not in screen.output:
        assert screen.read() and time.monotonic() < end, "the problem is not shown"
    (folder / ".projectdata/project.jsonl").write_bytes(text)
    ctl("remove", "top.txt")
    screen.expect("- src", a, "  + deep", "    new.cpp", "    zo\u00eb?[31m.cpp")

    screen.press(b"q")
    screen.expect_end()

    # A signal ends the panel as the key does.
    screen = Screen()
    screen.expect("- src", a, deep, b, "    new.cpp", "    zo\u00eb?[31m.cpp")
    os.kill(screen.pid, signal.SIGTERM)
    screen.expect_end()

    piped = subprocess.run([panel, str(folder)], stdin=subprocess.DEVNULL, capture_output=True, text=True)
    assert piped.returncode == 1 and "needs a terminal" in piped.stderr, piped
