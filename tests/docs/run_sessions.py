"""Runs the shell sessions of a page in an empty folder, and compares their output with the page.

    run_sessions.py PAGE WORK [PATH...]

The blocks of one page are one session: a shell keeps its folder and its variables from block to block. In the output, three
dots stand for any text, or, alone on a line, for any number of lines; a UUID stands for any UUID. The home folder of
the session is shown as /home/ada. A command that fails must have output, which says so.
"""
import os
import re
import shutil
import signal
import subprocess
import sys
from pathlib import Path

from markdown_blocks import read_blocks

UUID = re.compile(r"[0-9a-f]{8}-[0-9a-f]{4}-[0-9a-f]{4}-[0-9a-f]{4}-[0-9a-f]{12}")
HERE_DOCUMENT = re.compile(r"<<-?\s*['\"]?(\w+)['\"]?")
SECONDS_FOR_A_COMMAND = 120


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


def is_expected(actual, expected):
    """Whether the lines of the output are those of the page."""
    pattern = []
    for line in expected:
        if line.strip() == "...":
            pattern.append(r"(?:.*\n)*")
        else:
            words = UUID.sub("\0", line).split("...")
            pattern.append(".*".join(re.escape(word) for word in words).replace("\0", UUID.pattern) + r"\n")
    return re.fullmatch("".join(pattern), "".join(line + "\n" for line in actual)) is not None


class Shell:
    """A shell that runs one command after the other."""

    def __init__(self, page, work, paths):
        self.work = work
        self.home = work / "home" / "ada"
        shutil.rmtree(work, ignore_errors=True)
        environment = {name: os.environ[name] for name in ("PATH", "LD_LIBRARY_PATH", "CXX", "CC") if name in os.environ}
        environment.update(
            HOME=str(self.home), PAGE=str(page), PATH=":".join(paths + [environment["PATH"]]), LC_ALL="C.UTF-8", TERM="dumb",
            GIT_CONFIG_NOSYSTEM="1", GIT_AUTHOR_NAME="Ada Lovelace", GIT_AUTHOR_EMAIL="ada@example.invalid",
            GIT_COMMITTER_NAME="Ada Lovelace", GIT_COMMITTER_EMAIL="ada@example.invalid",
            ASAN_OPTIONS="detect_leaks=0")
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
        signal.alarm(SECONDS_FOR_A_COMMAND)
        for line in self.process.stdout:
            end = re.fullmatch(r"@(\d+)@\n", line)
            if end:
                signal.alarm(0)
                if lines and lines[-1] == "":
                    lines.pop()
                return int(end[1]), lines
            lines.append(line.rstrip("\n").replace(str(self.home), "/home/ada"))
        raise SystemExit(f"the shell has ended: {command}\n" + "\n".join(lines))

    def begin_again(self):
        self.run(f"cd '{self.home}' && find . -mindepth 1 -delete")

    def end(self):
        self.process.stdin.close()
        self.process.wait()


def run_page(page, shell):
    """Runs all sessions of a page. Returns the differences, and the number of commands that ran."""
    problems = []
    count = 0

    def prepare(commands, number):
        code, output = shell.run(commands)
        if code:
            problems.append(f"{page}:{number}: 'before' has failed\n" + "\n".join(output))

    for block in read_blocks(str(page), page.read_text()):
        if block.language != "console" or "not run" in block.notes:
            continue
        if "new folder" in block.notes:
            shell.begin_again()
        if "before" in block.notes:
            prepare(block.notes["before"], block.line)
        for command, expected, number in commands_of(block):
            code, output = shell.run(command)
            count += 1
            if not is_expected(output, expected):
                problems.append(f"{page}:{number}: $ {command}\n  the page shows:\n    " + "\n    ".join(expected) +
                                "\n  the command wrote:\n    " + "\n    ".join(output))
            elif code and not expected:
                problems.append(f"{page}:{number}: $ {command}\n  ended with {code}, without any output")
    return problems, count


def main():
    page, work, *paths = sys.argv[1:]
    shell = Shell(Path(page).resolve(), Path(work).resolve(), paths)
    problems, count = run_page(Path(page), shell)
    shell.end()
    print("\n".join(problems), f"{count} commands, {len(problems)} problems", sep="\n")
    if not count:
        raise SystemExit(f"{page}: there is no session")
    sys.exit(1 if problems else 0)


if __name__ == "__main__":
    main()
