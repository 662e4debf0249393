"""The files that another program has renamed on disk, in paths relative to the root."""

from __future__ import annotations

import enum
from dataclasses import dataclass
from typing import Any

from .files import FileKind

__all__ = ["AmbiguousRename", "Rename", "RenamesFound"]


@dataclass(frozen=True)
class Rename:
    """A file or folder of the project that has another path on disk now."""

    class Evidence(enum.Enum):
        """The reason for pairing the two paths."""

        CONTENT = 0  #: the same content
        SIMILARITY = 1  #: a similar content
        FOLDER = 2  #: everything in the folder has moved into the other one
        NAME = 3  #: the same name only: a guess

    source: str
    destination: str
    kind: FileKind
    evidence: Evidence
    similarity: int  #: in percent; 0 if the contents are unknown

    @property
    def is_guess(self) -> bool:
        """True if the two have nothing but their name in common."""
        return self.evidence is Rename.Evidence.NAME


@dataclass(frozen=True)
class AmbiguousRename:
    """Files of which each of the earlier paths may have become each of the later ones."""

    sources: tuple[str, ...]
    destinations: tuple[str, ...]


@dataclass(frozen=True)
class RenamesFound:
    """The result of a search for renames."""

    pairs: tuple[Rename, ...]  #: in the order of the earlier paths; a folder precedes its contents
    ambiguous: tuple[AmbiguousRename, ...]

    @classmethod
    def _of(cls, content: tuple[Any, ...]) -> RenamesFound:
        pairs, ambiguous = content
        return cls(tuple(Rename(source, destination, FileKind(kind), Rename.Evidence(evidence), similarity)
                         for source, destination, kind, evidence, similarity in pairs),
                   tuple(AmbiguousRename(*each) for each in ambiguous))

    def __bool__(self) -> bool:
        return bool(self.pairs or self.ambiguous)
