"""The settings of Sphinx for the site that scripts/docs builds."""
import sys
from pathlib import Path

from pygments.lexers.special import TextLexer

sys.path.insert(0, str(Path(__file__).parent))

from complete_theme import complete_theme  # noqa: E402

project = "project-management"
extensions = ["myst_parser"]
exclude_patterns = ["site"]
myst_heading_anchors = 4
smartquotes = False  # the options of commands have two hyphens
html_theme = "furo"
html_title = "project-management"
html_static_path = ["style"]
html_css_files = ["site.css"]
templates_path = ["templates"]
html_use_index = False
html_copy_source = False
html_show_sphinx = False
html_show_search_summary = False  # needs a server
html_show_copyright = False
pygments_style = "site_colours.Light"
pygments_dark_style = "site_colours.Dark"


def finish(app, exception):
    if not exception:
        complete_theme(Path(app.outdir) / "_static")


def setup(app):
    app.add_lexer("jsonl", TextLexer)
    app.connect("build-finished", finish)
