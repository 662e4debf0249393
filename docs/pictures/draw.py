#!/usr/bin/env python3
"""The source of the pictures in this folder.

    draw.py            writes them
    draw.py --check    reports the pictures that differ from their source
"""
import sys
from html import escape
from pathlib import Path

LIGHT = {"text": "#1f2328", "soft": "#57606a", "box": "#f6f8fa #57606a", "strong": "#ddf4ff #0550ae", "warm": "#fff1e5 #953800"}
DARK = {"text": "#e6edf3", "soft": "#9ea7b3", "box": "#1c1f24 #9ea7b3", "strong": "#0d2d4d #79b8ff", "warm": "#3d2410 #ffa657"}
LINE = 18  # the distance of two lines of text


def colours(scheme):
    boxes = (f".{kind} {{ fill: {scheme[kind].split()[0]}; stroke: {scheme[kind].split()[1]} }}" for kind in ("box", "strong", "warm"))
    return (f"text {{ fill: {scheme['text']} }} .soft {{ fill: {scheme['soft']} }} {' '.join(boxes)} "
            f".line {{ stroke: {scheme['soft']} }} .tip {{ fill: {scheme['soft']} }}")


class Picture:
    """A picture that follows the scheme of the page which shows it. Lengths are pixels."""

    def __init__(self, title, width, height):
        self.head = (f'<svg xmlns="http://www.w3.org/2000/svg" viewBox="0 0 {width} {height}" width="{width}" height="{height}" '
                     f'role="img">\n<title>{escape(title)}</title>')
        self.parts = []

    def text(self, x, y, text, kind="", anchor="start"):
        self.parts.append(f'<text class="{kind}" x="{x}" y="{y}" text-anchor="{anchor}">{escape(text)}</text>')

    def box(self, x, y, width, height, kind, *lines):
        """A box with lines in its middle. A line is (kind, text): "" is a name, "soft" a remark, "mono" code."""
        self.parts.append(f'<rect class="{kind}" x="{x}" y="{y}" width="{width}" height="{height}" rx="6"/>')
        first = y + height / 2 - (len(lines) - 1) * LINE / 2 + 5
        for index, (line_kind, line) in enumerate(lines):
            self.text(x + width // 2, round(first + index * LINE), line, line_kind, "middle")

    def arrow(self, *points):
        self.parts.append('<polyline class="line" marker-end="url(#tip)" points="' + " ".join(f"{x},{y}" for x, y in points) + '"/>')

    def bracket(self, x, top, bottom):
        self.parts.append(f'<path class="line" d="M{x} {top} h10 V{bottom} h-10"/>')

    def svg(self):
        style = ("text { font: 14px system-ui, sans-serif } .soft { font-size: 12px } "
                 ".mono { font: 12px ui-monospace, monospace } .line { fill: none }")
        tip = ('<defs><marker id="tip" viewBox="0 0 8 8" refX="7" refY="4" markerWidth="8" markerHeight="8" orient="auto">'
               '<path class="tip" d="M0 0 8 4 0 8z"/></marker></defs>')
        schemes = f"{colours(LIGHT)}\n@media (prefers-color-scheme: dark) {{ {colours(DARK)} }}"
        return "\n".join([self.head, f"<style>\n{style}\n{schemes}\n</style>", tip, *self.parts, "</svg>\n"])


def layers():
    picture = Picture("The layers of the library", 680, 412)
    users = [("applications", "examples/"), ("Python", "python/"), ("projectctl", "tools/projectctl/")]
    lower = [("managers", "files, labels, entry points, …"), ("stores", "the text, the log of a server"),
             ("adapter for git", "stages what has changed")]
    for column in range(3):
        x = 20 + 220 * column
        picture.box(x, 16, 200, 52, "strong", ("", users[column][0]), ("soft", users[column][1]))
        picture.arrow((x + 100, 68), (x + 100, 100))
        picture.arrow((x + 100, 152), (x + 100, 184))
        picture.box(x, 184, 200, 52, "box", ("", lower[column][0]), ("soft", lower[column][1]))
        picture.arrow((x + 100, 236), (x + 100, 268 if column < 2 else 344))
    picture.box(20, 100, 640, 52, "box", ("", "session"), ("soft", "the complete stack: one object, one step for each change"))
    picture.box(20, 268, 420, 52, "box", ("", "metadata"), ("soft", "addresses, nodes, the interface of a store, errors"))
    picture.arrow((230, 320), (230, 344))
    picture.box(20, 344, 640, 52, "box", ("", "platform"),
                ("soft", "paths, the lock, the interface of an adapter, texts in several languages"))
    return picture


def text():
    picture = Picture("A text with its tail", 680, 330)
    picture.box(20, 16, 440, 40, "strong", ("mono", '{"format":"project-definition","version":1}'))
    picture.text(475, 40, "the first line", "soft")
    picture.box(20, 56, 440, 100, "box", ("mono", '"readme.md"'), ("mono", '"src/"'),
                ("mono", '{"file":"src/main.cpp","children":[…]}'), ("soft", "sorted lines, one for each address"))
    picture.text(475, 101, "the body: the definition", "soft")
    picture.text(475, 119, "as of the last rewrite", "soft")
    picture.box(20, 156, 440, 40, "strong", ("mono", '{"end":"project-definition"}'))
    picture.text(475, 180, "a text without it is incomplete", "soft")
    closing = '{"batch":{"lines":1,"after":"…","sum":"…"}}'
    for y, line in [(204, '"src/pump.cpp"'), (264, '{"remove":"readme.md"}')]:
        picture.box(20, y, 440, 52, "warm", ("mono", line), ("mono", closing))
    picture.text(475, 226, "the tail: appended batches,", "soft")
    picture.text(475, 244, "chained by their checksums", "soft")
    picture.text(475, 294, "a torn batch is ignored", "soft")
    return picture


def add():
    picture = Picture("The steps of one add", 680, 412)
    steps = [("lock", "the write guard: other threads, then other processes wait"),
             ("look", "read what others have changed in the text"),
             ("check", "in the project? outside the root? missing on disk?"),
             ("write", "change the tree; prepare the bytes"),
             ("git", "take the lock of the index; prepare the new index"),
             ("commit", "append to the text, or rewrite it, and sync: now it is durable"),
             ("stage", "write the index, with the file and the text"),
             ("unlock", "other writers continue"),
             ("observers", "are called, with no lock held")]
    for index, (name, remark) in enumerate(steps):
        y = 16 + 44 * index
        picture.box(20, y, 110, 32, "warm" if name == "commit" else "box", ("", name))
        picture.text(146, y + 21, remark, "soft")
        if index:
            picture.arrow((75, y - 12), (75, y))
    picture.bracket(548, 24, 262)
    picture.text(566, 138, "an error rolls", "soft")
    picture.text(566, 156, "all of it back", "soft")
    return picture


def merge():
    picture = Picture("A merge by meaning", 680, 332)
    picture.arrow((280, 76), (130, 112))
    picture.arrow((400, 76), (550, 112))
    picture.arrow((150, 186), (290, 224))
    picture.arrow((530, 186), (390, 224))
    picture.box(240, 20, 200, 56, "box", ("", "common version"), ("mono", "main.cpp"))
    picture.box(20, 112, 260, 74, "strong", ("", "ours"), ("mono", "main.cpp: Status = Reviewed"), ("mono", "valve.cpp"))
    picture.box(400, 112, 260, 74, "warm", ("", "theirs"), ("mono", "lib/main.cpp (renamed)"), ("mono", "pump.cpp"))
    picture.box(190, 224, 300, 92, "box", ("", "merged, without a conflict"), ("mono", "lib/main.cpp: Status = Reviewed"),
                ("mono", "pump.cpp"), ("mono", "valve.cpp"))
    return picture


def main():
    is_check = sys.argv[1:] == ["--check"]
    different = []
    for draw in (layers, text, add, merge):
        file = Path(__file__).with_name(f"{draw.__name__}.svg")
        if not is_check:
            file.write_text(draw().svg())
        elif file.read_text() != draw().svg():
            different.append(f"{file} differs from its source: run docs/pictures/draw.py")
    print(*different, sep="\n", end="\n" if different else "")
    sys.exit(1 if different else 0)


if __name__ == "__main__":
    main()
