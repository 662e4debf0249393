"""Writes a source with one test for each C++ block of a page, which compiles and runs the block.

    generate_cpp.py PAGE SOURCE

A block is the body of a function that gets `session`, an open project in an empty folder; or a whole program with main; or,
with `definitions`, code at namespace scope for the blocks after it.
"""
import re
import sys
from pathlib import Path

from markdown_blocks import read_blocks

INCLUDE = re.compile(r"^#include [<\"].*[>\"]$")


def literal(text):
    return "R\"docs(" + text + ")docs\""


def at_line(block, page):
    return [f'#line {block.line} "{page}"']


def body(block):
    """The block without its includes, whose lines stay empty so that errors have the line of the page."""
    return ["" if INCLUDE.match(line) else line for line in block.lines]


def test_of(block, expected, page, name):
    """The lines of a test for one block."""
    lines = []
    before = block.notes.get("before", "").split("\n")
    is_program = any(re.match(r"int main\(", line) for line in block.lines)
    if is_program:
        code = [re.sub(r"^int main\(\)", "int program(int, char**)", re.sub(r"^int main\(int", "int program(int", line))
                for line in body(block)]
        if any(line.startswith("int program") for line in code) and "return" not in block.text:
            code[len(code) - 1 - code[::-1].index("}")] = "return 0; }"
        lines += [f"namespace line_{block.line} {{", *at_line(block, page), *code, "}"]
        words = ", ".join(f'"{word}"' for word in block.notes.get("arguments", "").split())
        run = f"docs::runProgram(line_{block.line}::program, {{{words}}})"
    else:
        lines += [f"static void line_{block.line}([[maybe_unused]] project::session::Session& session) {{", *before,
                  *at_line(block, page), *body(block), "}"]
        run = f"docs::runBlock(line_{block.line})"
    lines += [f"TEST({name}, line{block.line}) {{"]
    if expected is None:
        lines += [f"    EXPECT_NO_THROW({run});"]
    else:
        lines += [f"    EXPECT_EQ({run}, {literal(expected)});"]
    return lines + ["}", ""]


def source_of(page, text):
    """The whole source for a page."""
    blocks = [block for block in read_blocks(page, text) if block.language == "cpp" or "output" in block.notes]
    name = re.sub(r"\W", "_", page.removesuffix(".md"))
    includes = sorted({line for block in blocks for line in block.lines if INCLUDE.match(line)})
    lines = ["// Generated from the page by tests/docs/generate_cpp.py.", '#include "docs/Blocks.hpp"', *includes,
             f"namespace {name} {{", ""]
    for index, block in enumerate(blocks):
        if block.language != "cpp" or "not run" in block.notes:
            continue
        if "definitions" in block.notes:
            lines += [*at_line(block, page), *body(block), ""]
            continue
        following = blocks[index + 1] if index + 1 < len(blocks) else None
        expected = following.text + "\n" if following and "output" in following.notes else None
        lines += test_of(block, expected, page, name)
    return "\n".join(lines + [f"}} // namespace {name}", ""])


def main():
    root = Path(__file__).resolve().parents[2]
    page, source = map(Path, sys.argv[1:])
    Path(source).write_text(source_of(str(page.resolve().relative_to(root)), page.read_text()))


if __name__ == "__main__":
    main()
