"""Merging the texts in which definitions are stored, and comparing them."""

from __future__ import annotations

import enum
from collections.abc import Mapping, Sequence
from dataclasses import dataclass
from typing import Any

from . import _core

__all__ = ["DefinitionChange", "Merge", "MergeConflict", "Side", "ValueChange", "changes_between", "merge"]


class Side(enum.Enum):
    """One of the two sides of a merge."""

    OURS = 0
    THEIRS = 1


@dataclass(frozen=True)
class MergeConflict:
    """Two changes that the merge cannot combine, so that a person must choose one."""

    class Kind(enum.Enum):
        """What both sides changed."""

        KEY = 0
        TYPE = 1
        NESTED = 2
        SUBTREE = 3

    kind: Kind
    address: tuple[tuple[str, str], ...]  #: the steps to the node in the tree, each a type and a location
    nested: tuple[tuple[str, str, str], ...]  #: the steps to the nested node: type, identifying key, its value
    key: str
    removed_by: Side | None  #: the side that removed something
    base: str | None  #: for a key: its value in the common version
    ours: str | None
    theirs: str | None

    @classmethod
    def _of(cls, content: tuple[Any, ...]) -> MergeConflict:
        kind, address, nested, key, removed_by, values = content
        return cls(cls.Kind(kind), tuple(address), tuple(nested), key,
                   None if removed_by is None else Side(removed_by), *values)


class Merge:
    """Two versions of a text, merged with their common version."""

    def __init__(self, core: _core.TextMerge) -> None:
        self._core = core
        #: The conflicts, sorted by address; empty if the merge is clean.
        self.conflicts = tuple(map(MergeConflict._of, core.conflicts()))

    def text(self, choices: Sequence[Side] = ()) -> bytes:
        """The merged text. `choices` names the side that wins for each conflict, in their order."""
        return self._core.text([choice.value for choice in choices])

    def text_with_markers(self) -> bytes:
        """The merged text with conflict markers around the lines in conflict."""
        return self._core.text_with_markers()


def merge(base: bytes, ours: bytes, theirs: bytes, *, our_renames: Mapping[str, str] | None = None,
          their_renames: Mapping[str, str] | None = None) -> Merge:
    """Merges the definitions in three texts. Renames are the earlier and the later paths of files of a side."""
    return Merge(_core.merge_texts(base, ours, theirs, dict(our_renames or {}), dict(their_renames or {})))


@dataclass(frozen=True)
class ValueChange:
    """A setting that changed."""

    key: str
    before: str
    after: str


@dataclass(frozen=True)
class DefinitionChange:
    """A change between two versions of a definition."""

    class Subject(enum.Enum):
        """The part of the definition."""

        NAME = 0
        DESCRIPTION = 1
        FILE = 2
        FILE_LABEL = 3
        FILE_DATA = 4
        CATEGORY = 5
        LABEL = 6
        ENTRY_POINT = 7
        GROUP = 8
        PROJECT_PATH = 9
        REFERENCE = 10
        OTHER = 11

    class Kind(enum.Enum):
        """The kind of the change."""

        ADDED = 0
        REMOVED = 1
        RENAMED = 2
        CHANGED = 3

    subject: Subject
    kind: Kind
    name: str  #: the name or path; the later one
    earlier: str  #: of something renamed, the earlier one
    category: str
    label: str
    is_folder: bool
    is_with_folder: bool  #: whether a file moved with a folder that was renamed as a whole
    values: tuple[ValueChange, ...]

    @classmethod
    def _of(cls, content: tuple[Any, ...]) -> DefinitionChange:
        subject, kind, name, earlier, category, label, is_folder, is_with_folder, values = content
        return cls(cls.Subject(subject), cls.Kind(kind), name, earlier, category, label, is_folder, is_with_folder,
                   tuple(ValueChange(*value) for value in values))


def changes_between(before: bytes, after: bytes, *,
                    renames: Mapping[str, str] | None = None) -> list[DefinitionChange]:
    """The changes between two texts of a project. An empty text is a project without anything."""
    return [DefinitionChange._of(each) for each in _core.differences(before, after, dict(renames or {}))]
