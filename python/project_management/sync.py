"""Folders that keep themselves up to date."""

from __future__ import annotations

from collections.abc import Iterator
from dataclasses import dataclass
from typing import TYPE_CHECKING, Any

from .files import File, PathArgument
from .moves import Move

if TYPE_CHECKING:
    from .project import Project

__all__ = ["RemovedFile", "SyncPlan", "SyncRule", "SyncRules"]


@dataclass(frozen=True)
class SyncRule:
    """Says which new files of a folder are added to the project. Patterns are relative to the folder."""

    folder: str
    included: frozenset[str] = frozenset()  #: all new files if it is empty
    excluded: frozenset[str] = frozenset()
    uses_git_ignore: bool = True


@dataclass(frozen=True)
class RemovedFile:
    """A file that a synchronisation removes, with its labels and the names of its entry points."""

    file: File
    labels: tuple[tuple[str, str], ...]  #: as UUIDs of categories and labels
    entry_points: tuple[str, ...]


@dataclass(frozen=True)
class SyncPlan:
    """What a synchronisation changes, or has changed."""

    renamed: tuple[Move, ...]  #: files that the project has followed; plan_sync leaves them in removed and added
    added: tuple[File, ...]
    removed: tuple[RemovedFile, ...]
    missing: tuple[str, ...]  #: folders with a rule that are missing or empty, although files below them are listed
    absent: tuple[str, ...]  #: folders with a rule that do not exist, and below which nothing is listed
    unreadable: tuple[tuple[str, int], ...]  #: folders that could not be read, with the system's error numbers

    @classmethod
    def _of(cls, content: tuple[Any, ...]) -> SyncPlan:
        renamed, added, removed, missing, absent, unreadable = content
        files = (RemovedFile(file, tuple(labels), tuple(entries)) for file, labels, entries in removed)
        return cls(tuple(Move(*pair) for pair in renamed), tuple(added), tuple(files), tuple(missing), tuple(absent),
                   tuple(unreadable))

    def __bool__(self) -> bool:
        return bool(self.renamed or self.added or self.removed)


class SyncRules:
    """The rules of a project's folders."""

    def __init__(self, project: Project) -> None:
        self._project = project

    def __iter__(self) -> Iterator[SyncRule]:
        for folder, included, excluded, uses_git_ignore in self._project._core.sync_rules():
            yield SyncRule(folder, frozenset(included), frozenset(excluded), uses_git_ignore)

    def __len__(self) -> int:
        return len(self._project._core.sync_rules())

    def set(self, folder: PathArgument, *, included: set[str] | frozenset[str] = frozenset(),
            excluded: set[str] | frozenset[str] = frozenset(), uses_git_ignore: bool = True) -> None:
        """Stores a rule, in place of the one that the folder may have."""
        self._project._core.set_sync_rule(folder, set(included), set(excluded), uses_git_ignore)

    def remove(self, folder: PathArgument) -> bool:
        """Removes the rule of a folder. Returns False if it has none."""
        return self._project._core.remove_sync_rule(folder)
