"""Checks the groups of the reference: every class is in one, every group has members, and its first page leads to each.

    check_groups.py REFERENCE
"""
import re
import sys
from pathlib import Path


def is_nested(page, titles):
    """Whether a class is a part of another one, in whose group it is."""
    return titles[page].rpartition("::")[0] in titles.values()


def problems_of(reference):
    pages = {page.name: page.read_text() for page in reference.glob("*.html")}
    classes = {name: text for name, text in pages.items()
               if name.startswith(("class", "struct")) and name != "classes.html" and not name.endswith("-members.html")}
    titles = {name: re.search(r"<title>([\w:]+)", text)[1] for name, text in classes.items()}
    groups = {name: text for name, text in pages.items() if name.startswith("group__")}
    if not classes or not groups:
        yield f"{reference}: there are no classes or no groups"
    for name, text in classes.items():
        if 'class="ingroups"' not in text and not is_nested(name, titles):
            yield f"{titles[name]} is in no group: add its header to docs/site/reference_filter.py"
    for name, text in groups.items():
        if "memItemLeft" not in text:
            yield f"{name}: the group is empty"
        if f'href="{name}"' not in pages["index.html"]:
            yield f"{name}: the first page does not lead to the group"


def main():
    problems = sorted(problems_of(Path(sys.argv[1])))
    print(*problems, f"{len(problems)} problems", sep="\n")
    sys.exit(1 if problems else 0)


if __name__ == "__main__":
    main()
