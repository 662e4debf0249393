"""The fenced code blocks of a page, with the comments in front of them that say how a test treats each.

    <!-- before: COMMANDS -->     run first, and not shown: commands of a session, statements of C++
    <!-- new folder -->           the session begins again in an empty folder
    <!-- meanwhile: COMMANDS -->  run while the one command of a session runs, which is then interrupted
    <!-- terminal -->             the commands of a session write to a terminal
    <!-- file: NAME -->           the session stores the block in this file
    <!-- input: COMMAND -->       the session runs this command, which reads the block
    <!-- installed -->            only in the test of the page that has an installed library
    <!-- definitions -->          C++ at namespace scope, for the blocks that follow
    <!-- arguments: WORDS -->     of a C++ program
    <!-- output -->               the text that the block in front of this one has written
    <!-- not run: REASON -->      only where a test cannot run the block
"""
import re
from dataclasses import dataclass, field

NOTES = "before|new folder|meanwhile|terminal|file|input|installed|definitions|arguments|output|not run"
COMMENT = re.compile(rf"<!--\s*({NOTES})(?::\s*(.*?))?\s*-->", re.DOTALL)


@dataclass
class Block:
    page: str
    line: int  # of its first line of code, counted from 1
    language: str
    lines: list
    notes: dict = field(default_factory=dict)

    @property
    def text(self):
        return "\n".join(self.lines)


class WrongPage(Exception):
    """A page that the tests cannot read; names the page and the line."""


def read_blocks(page, text):
    """All blocks of a page in their order."""
    blocks = []
    notes = {}
    lines = text.split("\n")
    index = 0
    while index < len(lines):
        line = lines[index]
        if line.startswith("<!--"):
            comment = line
            while "-->" not in comment:
                index += 1
                if index == len(lines):
                    raise WrongPage(f"{page}: a comment does not end")
                comment += "\n" + lines[index]
            match = COMMENT.fullmatch(comment.strip())
            if match:
                notes[match[1]] = match[2] or ""
        elif line.startswith("```"):
            fence = re.match(r"`+", line)[0]
            begin = index + 1
            index = begin
            while index < len(lines) and lines[index] != fence:
                index += 1
            if index == len(lines):
                raise WrongPage(f"{page}:{begin}: a block does not end")
            if "not run" in notes and not notes["not run"]:
                raise WrongPage(f"{page}:{begin}: 'not run' needs a reason")
            blocks.append(Block(page, begin + 1, line[len(fence):].strip(), lines[begin:index], notes))
            notes = {}
        elif line.strip():
            if notes:
                raise WrongPage(f"{page}:{index + 1}: a comment for a block is in front of text")
        index += 1
    return blocks
