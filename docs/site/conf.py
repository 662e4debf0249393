"""The settings of Sphinx for the site that scripts/docs builds."""
import sys
from pathlib import Path

from pygments.lexers.special import TextLexer

sys.path.insert(0, str(Path(__file__).parent))

project = "project-management"
extensions = ["myst_parser"]
exclude_patterns = ["site"]
myst_heading_anchors = 4
html_theme = "furo"
html_title = "project-management"
html_static_path = ["style"]
html_css_files = ["site.css"]
html_copy_source = False
html_show_sphinx = False
html_show_copyright = False
pygments_style = "site_colours.Light"
pygments_dark_style = "site_colours.Dark"


def setup(app):
    app.add_lexer("jsonl", TextLexer)
