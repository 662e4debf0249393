"""The messages of the package's own errors. Those of the library are in its catalogs."""

from __future__ import annotations

from . import _core

__all__ = ["message"]

_ENGLISH = {
    "LabelDataInvalid": '"{0}" is not data of the type "{1}", which the category "{2}" has.',
    "ProjectClosed": "The project is closed. Open it again.",
}
_GERMAN = {
    "LabelDataInvalid": "„{0}“ ist kein Wert vom Typ „{1}“, den die Kategorie „{2}“ hat.",
    "ProjectClosed": "Das Projekt ist geschlossen. Öffnen Sie es erneut.",
}


def message(key: str, *arguments: str) -> str:
    """A text in the language of set_language."""
    is_german = _core.language().partition("_")[0] == "de"
    return (_GERMAN if is_german else _ENGLISH)[key].format(*arguments)
