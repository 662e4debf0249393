"""The results of moves of files, in paths relative to the root."""

from __future__ import annotations

import enum
from dataclasses import dataclass

__all__ = ["Move", "RecoveredMoves"]


@dataclass(frozen=True)
class Move:
    """A file or folder with its old and its new path."""

    source: str
    destination: str


@dataclass(frozen=True)
class RecoveredMoves:
    """The end of a move that a process did not finish."""

    class Outcome(enum.Enum):
        """Whether it was completed."""

        COMPLETED = 0
        ROLLED_BACK = 1

    outcome: Outcome
    moves: tuple[Move, ...]
    left: tuple[Move, ...]  #: those whose files stay where they are
