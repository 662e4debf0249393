"""The language of the library's messages."""

from __future__ import annotations

import locale
import os

from . import _core

__all__ = ["language", "set_language"]


def _locale_of_process() -> str:
    """The locale that the program has set; else that of the environment."""
    current = locale.setlocale(locale.LC_MESSAGES)
    if current not in ("C", "POSIX", "C.UTF-8"):
        return current
    for variable in ("LC_ALL", "LC_MESSAGES", "LANG"):
        if value := os.environ.get(variable):
            return value
    return "C"


def set_language(name: str | None = None) -> None:
    """Chooses the language of messages: a name such as "de" or "de_AT", or that of the locale.

    The package calls it without a name when it is imported. Call it again after locale.setlocale.
    """
    chosen = (name or _locale_of_process()).partition(".")[0].partition("@")[0]
    _core.set_language("en" if chosen in ("", "C", "POSIX") else chosen)


def language() -> str:
    """The language of messages."""
    return _core.language()


set_language()
