"""Completes the theme, for pages that are opened as files. In Debian's package, Furo loads a style from the root of a server,
and a script as a module, which browsers refuse for files. Its style sheet lacks the dark scheme of the system: the rule is
inside two conditions, and the package's compiler drops the inner one. Its script fails on short pages."""
import re
from pathlib import Path

NORMALIZE = Path("/usr/share/javascript/normalize.css/normalize.css")


def replaced(pattern, replacement, text):
    """Replaces the only place where a pattern matches: another version of the theme may not need this."""
    result, count = re.subn(pattern, lambda _: replacement, text, flags=re.MULTILINE)
    if count != 1:
        raise SystemExit(f"docs/site/complete_theme.py: the theme has {count} places like {pattern}")
    return result


def with_dark_scheme(style):
    """The style sheet, with its dark colours also where the system is dark and the reader has chosen nothing."""
    dark = re.search(r'^  body\[data-theme="dark"\] (\{[^}]*\})', style, re.MULTILINE)[1]
    return f'{style}\n@media screen and (prefers-color-scheme: dark) {{ body:not([data-theme="light"]) {dark} }}\n'


def complete_theme(static):
    """Completes the files of the theme in the folder of a site."""
    style = static / "styles/furo.css"
    own = replaced(r"^@import url\(/javascript/[^)]*\);$", "", style.read_text())
    style.write_text(NORMALIZE.read_text() + with_dark_scheme(own))
    script = static / "scripts/furo.js"
    spy = static / "scripts/gumshoe-patched.js"
    on_short_pages = replaced(r"^      if \(useLastItem\(last, settings\)\)", "      if (last && useLastItem(last, settings))",
                              spy.read_text())
    script.write_text(on_short_pages + replaced(r'^import Gumshoe from "\./gumshoe-patched\.js";$', "", script.read_text()))
    spy.unlink()
