"""Runs the shell sessions of a page in an empty home folder, and compares their output with the page.

    run_sessions.py [--installed PREFIX] PAGE [PATH...]

The blocks of one page are one session: a shell keeps its folder and its variables from block to block. In the output, three
dots stand for any text, or, alone on a line, for any number of lines; a UUID, a hash and the time of a server stand for
any other. The home folder of the session is shown as /home/ada. A command that fails must have output, which says
so.
"""
import argparse
import os
import re
import shlex
import signal
import subprocess
import sys
import tempfile
import threading
from pathlib import Path

from markdown_blocks import read_blocks

# What differs from run to run: text of this form on the page stands for any other text of the form.
FORMS = {"any": r"(?<!\.)\.\.\.(?!\.)", "uuid": r"[0-9a-f]{8}-[0-9a-f]{4}-[0-9a-f]{4}-[0-9a-f]{4}-[0-9a-f]{12}", "hash": r"\b(?:[0-9a-f]{10}|[0-9a-f]{16})\b",
         "time": r"\d{4}-\d\d-\d\d \d\d:\d\d:\d\d UTC"}
VARYING = re.compile("|".join(f"(?P<{name}>{form})" for name, form in FORMS.items()))
HERE_DOCUMENT = re.compile(r"<<-?\s*['\"]?(\w+)['\"]?")
SECONDS_FOR_A_COMMAND = 120
# The exit code of a shell that lacks a program which the session needs.
NOT_POSSIBLE = 77


def commands_of(block):
    """The commands of a block, each with the lines of its output and the number of its first line."""
    commands = []
    index = 0
    while index < len(block.lines):
        line = block.lines[index]
        if not line.startswith("$ "):
            if not commands:
                raise SystemExit(f"{block.page}:{block.line}: a session begins with '$ '")
            commands[-1][1].append(line)
            index += 1
            continue
        number = block.line + index
        command = line[2:]
        index += 1
        while command.endswith("\\") and index < len(block.lines):
            command += "\n" + block.lines[index]
            index += 1
        end = HERE_DOCUMENT.search(command)
        if end:
            while index < len(block.lines):
                command += "\n" + block.lines[index]
                index += 1
                if block.lines[index - 1] == end[1]:
                    break
        commands.append((command, [], number))
    return commands


def pattern_of(line):
    """The lines that a line of the page stands for, as a regular expression."""
    if line.strip() == "...":
        return r"(?:.*\n)*"
    pattern, end = "", 0
    for match in VARYING.finditer(line):
        form = ".*" if match.lastgroup == "any" else FORMS[match.lastgroup]
        pattern += re.escape(line[end:match.start()]) + form
        end = match.end()
    return pattern + re.escape(line[end:]) + r"\n"


def is_expected(actual, expected):
    """Whether the lines of the output are those of the page."""
    return re.fullmatch("".join(map(pattern_of, expected)), "".join(line + "\n" for line in actual)) is not None


def on_terminal(command):
    """The command with a terminal for its output."""
    return f"script --quiet --return --command {shlex.quote(command)} /dev/null | tr -d '\\r'"


def interrupted(command, meanwhile, lines):
    """Runs one command while another one runs, which is interrupted as soon as it has written a number of lines."""
    return f"""
output=$(mktemp)
written() {{ for _ in {{1..600}}; do [ "$(wc -l < "$output")" -ge "$1" ] && return; sleep 0.1; done; return 1; }}
set -m
( {command} ) > "$output" 2>&1 &
set +m
{meanwhile}
written {lines}
kill -INT -- -$!
wait $! || true
cat "$output" && rm "$output"
"""


class Shell:
    """A shell that runs one command after the other."""

    def __init__(self, work, paths, prefix=None, seconds=SECONDS_FOR_A_COMMAND):
        self.seconds = seconds
        self.work = work
        self.home = work / "home" / "ada"
        environment = {name: os.environ[name] for name in ("PATH", "LD_LIBRARY_PATH", "CXX", "CC") if name in os.environ}
        environment.update(
            HOME=str(self.home), ROOT=str(Path(__file__).resolve().parents[2]), PATH=":".join(paths + [environment["PATH"]]), LC_ALL="C.UTF-8", TERM="dumb",
            GIT_CONFIG_NOSYSTEM="1", GIT_AUTHOR_NAME="Ada Lovelace", GIT_AUTHOR_EMAIL="ada@example.invalid",
            GIT_COMMITTER_NAME="Ada Lovelace", GIT_COMMITTER_EMAIL="ada@example.invalid",
            ASAN_OPTIONS="detect_leaks=0")
        if prefix:
            flags = next(prefix.rglob("project-management.pc")).parent
            environment.update(PKG_CONFIG_PATH=str(flags), CMAKE_PREFIX_PATH=str(prefix.resolve()), LD_LIBRARY_PATH=str(flags.parent))
        self.home.mkdir(parents=True)
        self.process = subprocess.Popen(["bash", "--norc"], stdin=subprocess.PIPE, stdout=subprocess.PIPE,
                                        stderr=subprocess.STDOUT, env=environment, cwd=self.home, text=True,
                                        errors="surrogateescape", start_new_session=True)

    def run(self, command):
        """Returns the exit code and the lines of the output."""
        script = self.work / "command"
        script.write_text(command.replace("/home/ada", str(self.home)) + "\n")
        self.process.stdin.write(f". '{script}' 2>&1 < /dev/null; printf '\\n@%s@\\n' $?\n")
        self.process.stdin.flush()
        lines = []
        # Its end closes the pipe that is read below.
        late = threading.Timer(self.seconds, os.killpg, (self.process.pid, signal.SIGTERM))
        late.start()
        try:
            for line in self.process.stdout:
                end = re.fullmatch(r"@(\d+)@\n", line)
                if end:
                    if lines and lines[-1] == "":
                        lines.pop()
                    return int(end[1]), lines
                lines.append(line.rstrip("\n").replace(str(self.home), "/home/ada"))
        finally:
            late.cancel()
        print(f"the shell has ended, or a command took more than {self.seconds} s: {command}", *lines, sep="\n")
        sys.exit(NOT_POSSIBLE if self.process.wait() == NOT_POSSIBLE else 1)

    def begin_again(self):
        self.run(f"cd '{self.home}' && find . -mindepth 1 -delete")

    def end(self):
        self.process.stdin.close()
        self.process.wait()
        self.process.stdout.close()


def is_run(block, is_installed):
    """Whether the session uses a block."""
    if "not run" in block.notes or "installed" in block.notes and not is_installed:
        return False
    return block.language == "console" or bool({"file", "input"} & set(block.notes))


def run_page(page, shell, is_installed=False):
    """Runs all sessions of a page. Returns the differences, and the number of commands that ran."""
    problems = []
    count = 0

    def prepare(commands, number):
        code, output = shell.run(commands)
        if code:
            problems.append(f"{page}:{number}: hidden commands have failed, or those that read the block\n" + "\n".join(output))

    for block in read_blocks(str(page), page.read_text()):
        if not is_run(block, is_installed):
            continue
        if "new folder" in block.notes:
            shell.begin_again()
        if "before" in block.notes:
            prepare(block.notes["before"], block.line)
        if block.language != "console":
            reader = block.notes.get("input") or f"cat > {block.notes['file']}"
            prepare(f"{reader} <<'END OF BLOCK'\n{block.text}\nEND OF BLOCK", block.line)
            count += 1
            continue
        for command, expected, number in commands_of(block):
            run = on_terminal(command) if "terminal" in block.notes else command
            if "meanwhile" in block.notes:
                run = interrupted(command, block.notes["meanwhile"], sum(line.strip() != "..." for line in expected))
            code, output = shell.run(run)
            count += 1
            if not is_expected(output, expected):
                problems.append(f"{page}:{number}: $ {command}\n  the page shows:\n    " + "\n    ".join(expected) +
                                "\n  the command wrote:\n    " + "\n    ".join(output))
            elif code and not expected:
                problems.append(f"{page}:{number}: $ {command}\n  ended with {code}, without any output")
    return problems, count


def main():
    parser = argparse.ArgumentParser()
    parser.add_argument("--installed", type=Path, metavar="PREFIX", dest="prefix")
    parser.add_argument("page", type=Path)
    parser.add_argument("paths", type=Path, nargs="*")
    arguments = parser.parse_args()
    with tempfile.TemporaryDirectory() as work:  # outside of this repository, which the tool would find
        shell = Shell(Path(work), [str(path.resolve()) for path in arguments.paths], arguments.prefix)
        problems, count = run_page(arguments.page, shell, arguments.prefix is not None)
        shell.end()
    print("\n".join(problems), f"{count} commands, {len(problems)} problems", sep="\n")
    if not count:
        raise SystemExit(f"{arguments.page}: there is no session")
    sys.exit(1 if problems else 0)


if __name__ == "__main__":
    main()
