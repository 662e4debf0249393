#!/usr/bin/env python3
"""Fails when a room (a folder of sources) includes a header of a room that it must not know.

    check_includes.py [ROOT]     ROOT is the checkout; by default the one that this file belongs to

ROOMS lists, for each folder of sources, its rooms from the lowest to the highest, and for each room the rooms that it
may include besides itself. A new room needs a line here.
"""

import pathlib
import re
import sys

ROOMS = {
    "stores/src": {
        "texts": [],
        "tree": ["texts"],
        "disk": ["texts"],
        "line": ["texts"],
        "node": ["texts", "line"],
        "text": ["texts", "line", "node"],
        "moves": ["texts", "line", "node", "text"],
        "merge": ["texts", "line", "node", "text", "moves"],
        "comparison": ["texts", "line", "node", "text", "moves"],
        "writing": ["texts", "line", "node", "text"],
        "journal": ["texts", "line", "node", "text"],
        "copy": ["texts", "line", "node", "text", "writing", "journal"],
    },
    "adapters/git/src": {
        "texts": [],
        "repository": ["texts"],
        "rules": ["texts", "repository"],
        "states": ["texts", "repository", "rules"],
        "index": ["texts", "repository", "rules", "states"],
    },
    "adapters/postgresql/src": {
        "texts": [],
        "connection": ["texts"],
        "journal": ["texts", "connection"],
    },
    "tools/projectctl": {
        "texts": [],
        "output": ["texts"],
        "cli": ["texts", "output"],
        "git": ["texts", "output"],
        "project": ["texts", "output", "cli", "git"],
        "changes": ["texts", "output", "cli", "git", "project"],
        "files": ["texts", "output", "cli", "git", "project", "changes"],
        "labels": ["texts", "output", "cli", "git", "project", "changes"],
        "entrypoints": ["texts", "output", "cli", "git", "project"],
        "references": ["texts", "output", "cli", "git", "project"],
        "merge": ["texts", "output", "cli", "git", "project"],
        "history": ["texts", "output", "cli", "git", "project"],
        "watch": ["texts", "output", "cli", "git", "project"],
        "manual": ["texts", "cli"],
        "shared": ["texts", "output", "cli", "git", "project"],
        "batch": ["texts", "output", "cli", "git", "project", "changes"],
        "renames": ["texts", "output", "cli", "git", "project", "changes", "files"],
        "checks": ["texts", "output", "cli", "git", "project", "files", "labels", "entrypoints", "references", "merge", "renames"],
        "sync": ["texts", "output", "cli", "git", "project", "changes", "files", "renames"],
        "exchange": ["texts", "output", "cli", "git", "project", "changes", "files"],
        "report": ["texts", "output", "cli", "git", "project", "files", "references", "history", "checks"],
        "completion": ["texts", "output", "cli", "git", "project", "files", "entrypoints", "references"],
    },
    "src": {
        "metadata": [],
        "files": ["metadata"],
        "labels": ["metadata"],
        "entrypoints": ["metadata"],
        "references": ["metadata"],
        "core": ["metadata", "files", "labels", "entrypoints", "references"],
        "decorators": ["metadata"],
        "cm": ["metadata", "files"],
    },
}

INCLUDE = re.compile(r'\s*#\s*include\s*"([^"]+)"')


def included_room(folder: pathlib.Path, source: pathlib.Path, include: str) -> str | None:
    """The room of an included header, or None if the header does not lie in this folder of sources."""
    for header in (folder / include, source.parent / include):
        if header.is_file() and folder in header.resolve().parents:
            return header.resolve().relative_to(folder).parts[0]
    return None


def wrong_includes(root: pathlib.Path, name: str, rooms: dict[str, list[str]]) -> list[str]:
    folder = (root / name).resolve()
    problems = []
    for source in sorted(folder.rglob("*.?pp")):
        parts = source.relative_to(folder).parts
        if len(parts) == 1:
            continue  # files beside the rooms put them together
        room, shown = parts[0], source.relative_to(root.resolve())
        if room not in rooms:
            problems.append(f"{shown}: the room {name}/{room} is not listed in {pathlib.Path(__file__).name}")
            continue
        allowed = [room, *rooms[room]]
        for number, line in enumerate(source.read_text(encoding="utf-8").splitlines(), 1):
            match = INCLUDE.match(line)
            target = included_room(folder, source, match[1]) if match else None
            if target is not None and target not in allowed:
                below = ", ".join(rooms[room]) or "no other room"
                problems.append(f'{shown}:{number}: {room}/ includes "{match[1]}", but {room}/ may include {below}')
    return problems


def main() -> int:
    root = pathlib.Path(sys.argv[1]) if len(sys.argv) > 1 else pathlib.Path(__file__).resolve().parents[2]
    folders = [name for name in ROOMS if (root / name).is_dir()]
    problems = [problem for name in folders for problem in wrong_includes(root, name, ROOMS[name])]
    print("\n".join(problems) or f"the rooms of {', '.join(folders)} include in the allowed directions only")
    return 1 if problems or not folders else 0


if __name__ == "__main__":
    sys.exit(main())
