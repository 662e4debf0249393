"""Conditions on the labels of files, which Files.find takes."""

from __future__ import annotations

import enum
from dataclasses import dataclass

__all__ = ["Condition", "Layers"]

# A label as the UUIDs of its category and its own, which is empty for any label of the category.
_LabelChoice = tuple[str, str]


class Layers(enum.Enum):
    """The labels that a search concerns."""

    BOTH = 0
    PROJECT = 1
    PERSONAL = 2


@dataclass(frozen=True)
class _Alternative:
    """Labels that a file has, and labels that it does not have."""

    present: frozenset[_LabelChoice] = frozenset()
    absent: frozenset[_LabelChoice] = frozenset()

    def joined(self, other: _Alternative) -> _Alternative:
        return _Alternative(self.present | other.present, self.absent | other.absent)

    def opposite(self) -> Condition:
        return Condition(tuple(_Alternative(absent=frozenset([label])) for label in sorted(self.present))
                         + tuple(_Alternative(present=frozenset([label])) for label in sorted(self.absent)))


class Condition:
    """A condition on the labels of a file. Comparing a category with a label, or with its name, creates one.

    Combine conditions with & (and), | (or) and ~ (not); Python's words `and`, `or` and `not` cannot do that.
    """

    __slots__ = ("_alternatives",)

    def __init__(self, alternatives: tuple[_Alternative, ...]) -> None:
        self._alternatives = alternatives

    @classmethod
    def _of(cls, category: str, label: str = "") -> Condition:
        return cls((_Alternative(present=frozenset([(category, label)])),))

    def __and__(self, other: Condition) -> Condition:
        return Condition(tuple(left.joined(right) for left in self._alternatives
                               for right in other._alternatives))

    def __or__(self, other: Condition) -> Condition:
        return Condition(self._alternatives + other._alternatives)

    def __invert__(self) -> Condition:
        result = Condition((_Alternative(),))
        for alternative in self._alternatives:
            result &= alternative.opposite()
        return result

    def __bool__(self) -> bool:
        raise TypeError("a condition has no truth value: combine conditions with &, | and ~")

    def _lists(self) -> list[tuple[list[_LabelChoice], list[_LabelChoice]]]:
        return [(sorted(each.present), sorted(each.absent)) for each in self._alternatives]
