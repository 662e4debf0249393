"""Checks that every code block of the documentation is tested.

    check_blocks.py REPOSITORY CMAKE_LISTS

C++ blocks and sessions must be on a page that a test of CMAKE_LISTS runs. A block that no test runs says why, and such
blocks are rare. Code is in fences with a language, and commands are sessions.
"""
import json
import re
import sys
from pathlib import Path

from markdown_blocks import WrongPage, read_blocks

# The page is generated from the texts of the help, whose examples a test runs, and compared with these by a test.
GENERATED = {"docs/guide/verbs.md"}
# Languages that other tests take from the page, and blocks that need an installed library: the source of each test names the
# page.
IN_OTHER_TESTS = {
    "docs/guide/builds.md": {"cmake": "tests/consumer/CMakeLists.txt", "make": "tests/tools/CMakeLists.txt",
                             "meson": "tests/tools/CMakeLists.txt"},
    "docs/guide/continuous-integration.md": {"yaml": "tests/tools/CMakeLists.txt"},
    "docs/guide/python.md": {"python": "python/tests/test_guide.py", "cpp": "python/tests/CMakeLists.txt"},
    "docs/guide/python-labels.md": {"python": "python/tests/test_guide.py"},
    "docs/guide/start.md": {"installed": "tests/consumer/CMakeLists.txt"},
    "docs/store/format.md": {"jsonl": "tests/stores/CMakeLists.txt"},
} | {f"examples/{name}/README.md": {"console": "tests/consumer/CMakeLists.txt"}
     for name in ("label_build", "project_panel", "review_linter", "sqlite_store")}
# Nothing that a test could run.
PROSE = {"text", "{toctree}"}
INCLUDES = ("{include} ", "{literalinclude} ")  # of files that have tests of their own
LARGEST_SHARE_NOT_RUN = 0.04


def pages_of(call, cmake):
    """The pages that are listed in the calls of a function."""
    return {word for arguments in re.findall(rf"^ *{call}\(([^)]*)\)", cmake, re.MULTILINE) for word in arguments.split()
            if word.endswith(".md")}


def is_in_other_test(block, root):
    """Whether another test takes the block from the page."""
    kind = "installed" if "installed" in block.notes else block.language
    test = IN_OTHER_TESTS.get(block.page, {}).get(kind)
    path = Path(block.page)
    return test is not None and (path.parent.name if path.name == "README.md" else path.name) in (root / test).read_text()


def problem_of(block, compiled, run, root):
    """The reason why a block is not tested; nothing if it is."""
    if block.language == "json":
        json.loads(block.text)
        return None
    if block.language.startswith(INCLUDES) or is_in_other_test(block, root):
        return None
    if block.language == "cpp":
        return None if block.page in compiled else "the page is not listed in docs_add_blocks"
    if "installed" in block.notes:
        return "no test of the page has an installed library"
    if block.language == "console" or {"file", "input"} & set(block.notes):
        return None if block.page in run else "the page is not listed in docs_add_sessions"
    if block.language in PROSE:
        return "a command is not in a session" if any(line.startswith("$ ") for line in block.lines) else None
    return f"a block has the language '{block.language}', which no test knows"


def check_page(page, text, compiled, run, root):
    """The problems of a page, its tested blocks, and those that are not run."""
    problems, tested, not_run = [], 0, 0
    blocks = read_blocks(page, text)
    for block in blocks:
        if "not run" in block.notes:
            not_run += 1
            continue
        tested += block.language not in PROSE or "file" in block.notes
        problem = problem_of(block, compiled, run, root)
        if problem:
            problems.append(f"{page}:{block.line}: {problem}")
    inside = {line for block in blocks for line in range(block.line, block.line + len(block.lines))}
    lines = ["", *text.split("\n")]
    for number, line in enumerate(lines):
        begins = not lines[number - 1] or lines[number - 1].startswith("<!--")
        if line.startswith("    ") and begins and number not in inside:
            problems.append(f"{page}:{number}: code is indented, and not in a fence with a language")
    return problems, tested, not_run


def pages(root):
    """All pages of the repository."""
    folders = [path for path in root.iterdir() if path.is_dir() and path.name != "build" and not path.name.startswith(".")]
    return sorted([*root.glob("*.md"), *(page for folder in folders for page in folder.rglob("*.md"))])


def main():
    root, cmake = Path(sys.argv[1]), Path(sys.argv[2]).read_text()
    compiled, run = pages_of("docs_add_blocks", cmake), pages_of("docs_add_sessions", cmake)
    problems, tested, not_run = [], 0, 0
    for path in pages(root):
        page = str(path.relative_to(root))
        if page in GENERATED:
            continue
        try:
            new_problems, new_tested, new_not_run = check_page(page, path.read_text(), compiled, run, root)
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
