"""Checks the links of the site: every page, file and heading that a page of the site leads to exists, and nothing that a
page needs is loaded from the network.

    check_links.py SITE
"""
import sys
from html.parser import HTMLParser
from pathlib import Path
from urllib.parse import unquote, urldefrag

LOADED = {("script", "src"), ("img", "src"), ("iframe", "src"), ("source", "src"), ("object", "data")}
# Doxygen writes this link for a class whose nested classes are all private.
DOXYGEN_MISTAKES = {"#nested-classes"}
LOADED_BY_LINK = {"stylesheet", "icon", "preload", "modulepreload", "manifest"}


class Page(HTMLParser):
    """The headings of a page, its links, and the files that it loads."""

    def __init__(self, text):
        super().__init__()
        self.anchors, self.links, self.loaded = set(), [], []
        self.feed(text)

    def handle_starttag(self, tag, attributes):
        values = dict(attributes)
        for name in ("id", "name"):
            if values.get(name):
                self.anchors.add(values[name])
        if tag == "a" and values.get("href"):
            self.links.append(values["href"])
        if tag == "link" and LOADED_BY_LINK & set((values.get("rel") or "").split()):
            self.loaded.append(values.get("href") or "")
        for name, value in attributes:
            if (tag, name) in LOADED and value:
                self.loaded.append(value)


def is_remote(address):
    return address.startswith(("http:", "https:", "//"))


def problems_of(path, pages):
    """The links of a page that lead nowhere."""
    page = pages[path]
    for address in page.loaded:
        if is_remote(address):
            yield f"{path}: loads {address} from the network"
    for address in page.links + page.loaded:
        if address in DOXYGEN_MISTAKES or is_remote(address) or address.startswith(("data:", "mailto:", "javascript:")):
            continue
        file, anchor = urldefrag(address)
        target = (path.parent / unquote(file).split("?")[0]).resolve() if file else path
        if target.is_dir() or not target.exists():
            yield f"{path}: {address} does not exist"
        elif anchor and target in pages and unquote(anchor) not in pages[target].anchors:
            yield f"{path}: {address} has no such heading"


def main():
    site = Path(sys.argv[1]).resolve()
    pages = {path: Page(path.read_text()) for path in site.rglob("*.html")}
    problems = [problem.replace(f"{site}/", "") for path in sorted(pages) for problem in problems_of(path, pages)]
    links = sum(len(page.links) for page in pages.values())
    print(*problems, f"{len(pages)} pages, {links} links, {len(problems)} problems", sep="\n")
    if not links:
        raise SystemExit(f"{site}: there are no links")
    sys.exit(1 if problems else 0)


if __name__ == "__main__":
    main()
