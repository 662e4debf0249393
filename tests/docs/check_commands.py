"""Checks that the commands which the text of the documentation names exist: verbs and options of projectctl, and scripts.

    check_commands.py REPOSITORY PROJECTCTL

Only code in the text is checked, as in `projectctl list --tree`: the sessions of the pages run. Words in capital letters stand
for anything.
"""
import json
import re
import shlex
import subprocess
import sys
from pathlib import Path

from check_blocks import GENERATED, pages
from markdown_blocks import read_blocks

CODE = re.compile(r"(?<!`)`([^`\n]+)`(?!`)")
OPTION = re.compile(r"--?[A-Za-z0-9][\w-]*")
# The guide shows that an unknown verb calls another program.
OTHER_PROGRAMS = {"review"}


class Tool:
    """The verbs of projectctl, and the options of each."""

    def __init__(self, program):
        self.program = program
        self.options = {}
        self.read("")
        self.everywhere = self.options[""]

    def read(self, verb):
        text = subprocess.run([self.program, "help", *verb.split(), "--json"], check=True, stdout=subprocess.PIPE).stdout
        help_of_verb = json.loads(text)
        self.options[verb] = {name for option in help_of_verb["options"] for name in option["names"]}
        for inner in help_of_verb["verbs"]:
            self.read(inner["name"])

    def has_inner(self, verb):
        return any(other.startswith(f"{verb} ") for other in self.options)

    def problem_of(self, words):
        """What is wrong with a call without the program's name; nothing if it is right."""
        verb, rest = "", list(words)
        options = []
        while rest:
            word = rest.pop(0)
            if OPTION.match(word):
                options.append(word.split("=")[0])
                if word == "-C":
                    rest = rest[1:]
            elif (longer := f"{verb} {word}".strip()) in self.options:
                verb = longer
            elif (not verb or self.has_inner(verb)) and not options and not is_placeholder(word):
                return None if word in OTHER_PROGRAMS else f"there is no command '{longer}'"
        # A command without its verb, as in `--json`, or without the inner one, as in `label --personal`, may be any of these.
        inner = (names for other, names in self.options.items() if not verb or f"{other} ".startswith(f"{verb} "))
        known = self.everywhere.union(*inner)
        wrong = [option for option in options if option not in known]
        return f"'projectctl {verb}' has no option {wrong[0]}" if wrong else None


def is_placeholder(word):
    return word.upper() == word


def problem_of_script(words, root):
    """What is wrong with a call of a script; nothing if it is right."""
    script = root / words[0]
    if not script.is_file():
        return f"{words[0]} does not exist"
    text = script.read_text()
    wrong = [word for word in words[1:] if OPTION.fullmatch(word) and word not in text]
    return f"{words[0]} has no option {wrong[0]}" if wrong else None


def problem_of(code, tool, root):
    """What is wrong with code in the text."""
    try:
        words = shlex.split(code.split(" | ")[0])
    except ValueError:
        return None
    if words[:1] == ["projectctl"]:
        return tool.problem_of(words[1:])
    if words and re.fullmatch(r"scripts/[\w.-]+", words[0]):
        return problem_of_script(words, root)
    if words and words[0].startswith("--") and len(words[0]) > 2:
        return tool.problem_of(words)
    is_call = len(words) > 1 and words[0] in tool.options and any(word.startswith("--") for word in words)
    return tool.problem_of(words) if is_call else None


def text_of(page, content):
    """The lines of a page without its blocks, which stay empty."""
    lines = content.split("\n")
    for block in read_blocks(page, content):
        for number in range(block.line - 1, block.line + len(block.lines) - 1):
            lines[number] = ""
    return lines


def main():
    root, tool = Path(sys.argv[1]), Tool(sys.argv[2])
    problems, count = [], 0
    for path in pages(root):
        page = str(path.relative_to(root))
        if page in GENERATED:
            continue
        for number, line in enumerate(text_of(page, path.read_text()), 1):
            for code in CODE.findall(line):
                problem = problem_of(code, tool, root)
                count += code.startswith(("projectctl ", "scripts/"))
                if problem:
                    problems.append(f"{page}:{number}: `{code}`: {problem}")
    print(*problems, f"{count} commands, {len(problems)} problems", sep="\n")
    if not count:
        raise SystemExit("no page names a command")
    sys.exit(1 if problems else 0)


if __name__ == "__main__":
    main()
