"""Data of applications: one node for each file, in a scope of its own."""

from __future__ import annotations

import os
from collections.abc import Iterator, Mapping, MutableMapping
from dataclasses import dataclass, field
from typing import TYPE_CHECKING, Any

from .files import File, PathArgument

if TYPE_CHECKING:
    from .project import Project

__all__ = ["MetadataNode", "Scope", "Scopes"]


@dataclass(frozen=True)
class MetadataNode:
    """A value that is stored for a file: a type, keys with values, and nested nodes."""

    type: str = "Info"
    values: Mapping[str, str] = field(default_factory=dict)
    children: tuple[MetadataNode, ...] = ()

    @classmethod
    def _of(cls, content: tuple[str, dict[str, str], list[Any]]) -> MetadataNode:
        return cls(content[0], content[1], tuple(map(cls._of, content[2])))

    def _content(self) -> tuple[str, dict[str, str], list[Any]]:
        return (self.type, dict(self.values), [child._content() for child in self.children])


class Scope(MutableMapping[PathArgument, MetadataNode]):
    """The nodes of a scope by file. A scope shares nothing with another, nor with the file list."""

    def __init__(self, project: Project, name: str) -> None:
        self._project = project
        self.name = name

    def __iter__(self) -> Iterator[File]:
        for path, _ in self._project._core.scope_nodes(self.name):
            yield File(self._project, path)

    def __len__(self) -> int:
        return len(self._project._core.scope_nodes(self.name))

    def __contains__(self, path: object) -> bool:
        return isinstance(path, (str, bytes, os.PathLike)) \
            and self._project._core.scope_node(self.name, path) is not None

    def __getitem__(self, path: PathArgument) -> MetadataNode:
        content = self._project._core.scope_node(self.name, path)
        if content is None:
            raise KeyError(path)
        return MetadataNode._of(content)

    def __setitem__(self, path: PathArgument, node: MetadataNode) -> None:
        self.store({path: node})

    def __delitem__(self, path: PathArgument) -> None:
        if path not in self:
            raise KeyError(path)
        self._project._core.remove_scope_nodes(self.name, [path])

    def store(self, nodes: Mapping[PathArgument, MetadataNode]) -> None:
        """Stores nodes of several files as one step."""
        self._project._core.set_scope_nodes(self.name, [(path, node._content()) for path, node in nodes.items()])


class Scopes:
    """The scopes of a project by name. A scope exists as long as something is stored in it."""

    def __init__(self, project: Project) -> None:
        self._project = project

    def __getitem__(self, name: str) -> Scope:
        return Scope(self._project, name)
