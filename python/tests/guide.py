"""The blocks of a page of the guide.

    guide.py PAGE PROGRAM      writes the blocks of C++ of a page as one program
"""

from __future__ import annotations

import re
import sys
from pathlib import Path

HEAD = """#include <filesystem>
#include <fstream>
#include <iostream>
#include <vector>

#include <project/metadata/MetadataNodeSpecification.hpp>
#include <project/session.hpp>

using namespace project::management;

int main() {
"""


def blocks_of(page: Path, language: str, *, on_server: bool = False) -> list[str]:
    """The contents of the blocks in a language, in order: those that need a server, or all others."""
    blocks = re.findall(r"^(<!-- on a server -->\n)?^```(\w*)\n(.*?)^```$", page.read_text(), re.MULTILINE | re.DOTALL)
    return [content for comment, of, content in blocks if of == language and bool(comment) == on_server]


def cpp_program(page: Path) -> str:
    """A program of the blocks: the names of the first one are those of all, others are of their block."""
    first, *others = blocks_of(page, "cpp")
    return HEAD + first + "".join(f"{{\n{block}}}\n" for block in others) + "}\n"


if __name__ == "__main__":
    Path(sys.argv[2]).write_text(cpp_program(Path(sys.argv[1])))
