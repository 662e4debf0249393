"""Checks that every code block of the documentation is tested.

    check_blocks.py REPOSITORY CMAKE_LISTS

C++ blocks and sessions must be on a page that a test of CMAKE_LISTS runs. A block that no test runs says why, and such
blocks are rare. Commands are sessions, and not indented text or blocks of a shell script.
"""
import json
import re
import sys
from pathlib import Path

from markdown_blocks import WrongPage, read_blocks

# The page is generated from the texts of the help, and compared with these by a test.
GENERATED = {"docs/guide/verbs.md"}
# Tests build the recipes, and run the workflows and the hooks, exactly as the pages print them.
# Sessions on these pages are illustrations, each in a situation of its own, which no test runs. No page may be added.
ILLUSTRATED = {"README.md", "docs/guide/projectctl.md", "docs/guide/builds.md", "docs/guide/continuous-integration.md",
               "docs/store/shared-administration.md"}
RUN_BY_OTHER_TESTS = {"cmake", "make", "meson", "yaml"}
DATA = {"", "jsonl", "text", "{toctree}", "sql", "ini", "dot"}
LARGEST_SHARE_NOT_RUN = 0.15


def pages_of(call, cmake):
    """The pages that are listed in the calls of a function."""
    return {word for arguments in re.findall(rf"^ *{call}\(([^)]*)\)", cmake, re.MULTILINE) for word in arguments.split()
            if word.endswith(".md")}


def problem_of(block, compiled, run):
    """The reason why a block is not tested; nothing if it is."""
    if block.language == "cpp":
        return None if block.page in compiled else "the page is not listed in docs_add_blocks"
    if block.language == "console":
        return None if block.page in run else "the page is not listed in docs_add_sessions"
    if block.language == "json":
        json.loads(block.text)
        return None
    if block.language == "sh" and block.page in ILLUSTRATED:
        return None
    if block.language in RUN_BY_OTHER_TESTS | DATA:
        return None
    return f"a block has the language '{block.language}', which no test knows"


def check_page(page, text, compiled, run):
    """The problems of a page, its tested blocks, and those that are not run."""
    problems, tested, not_run = [], 0, 0
    blocks = read_blocks(page, text)
    for block in blocks:
        if "not run" in block.notes:
            not_run += 1
            continue
        tested += block.language in ("cpp", "console")
        problem = problem_of(block, compiled, run)
        if problem:
            problems.append(f"{page}:{block.line}: {problem}")
    inside = {line for block in blocks for line in range(block.line, block.line + len(block.lines))}
    for number, line in enumerate(text.split("\n"), 1):
        if line.startswith("    $ ") and number not in inside and page not in ILLUSTRATED:
            problems.append(f"{page}:{number}: a command is not in a block with the language 'console'")
    return problems, tested, not_run


def main():
    root, cmake = Path(sys.argv[1]), Path(sys.argv[2]).read_text()
    compiled, run = pages_of("docs_add_blocks", cmake), pages_of("docs_add_sessions", cmake)
    problems, tested, not_run = [], 0, 0
    for path in [*root.glob("*.md"), *sorted((root / "docs").rglob("*.md"))]:
        page = str(path.relative_to(root))
        if page in GENERATED:
            continue
        try:
            new_problems, new_tested, new_not_run = check_page(page, path.read_text(), compiled, run)
        except (WrongPage, json.JSONDecodeError) as error:
            new_problems, new_tested, new_not_run = [f"{page}: {error}"], 0, 0
        problems += new_problems
        tested += new_tested
        not_run += new_not_run
    if not_run > LARGEST_SHARE_NOT_RUN * (tested + not_run):
        problems.append(f"{not_run} of {tested + not_run} blocks are not run")
    print(*problems, f"{tested} blocks are tested, {not_run} are not run", sep="\n")
    sys.exit(1 if problems else 0)


if __name__ == "__main__":
    main()
