"""The project path, the references to other projects, and the graph of projects that they form."""

from __future__ import annotations

import os
from collections.abc import Iterable, Iterator
from dataclasses import dataclass
from pathlib import Path
from typing import TYPE_CHECKING, Any

from . import _core
from .files import PathArgument

if TYPE_CHECKING:
    from .project import Project

__all__ = ["Edge", "FolderReference", "Node", "ProjectGraph", "References"]


@dataclass(frozen=True)
class FolderReference:
    """A reference to a folder: its place on this machine, and the text that is stored for it."""

    uuid: str
    location: Path
    type: str  #: "Relative" or "Absolute"
    stored_path: str


class References:
    """A list of folders: the project path, or the references to other projects."""

    def __init__(self, project: Project, *, is_path: bool) -> None:
        self._project = project
        self._is_path = is_path

    @staticmethod
    def _reference(values: tuple[str, str, str, str]) -> FolderReference:
        uuid, location, kind, stored_path = values
        return FolderReference(uuid, Path(location), kind, stored_path)

    def __iter__(self) -> Iterator[FolderReference]:
        return iter([self._reference(each) for each in self._project._core.references(self._is_path)])

    def __len__(self) -> int:
        return len(self._project._core.references(self._is_path))

    def __contains__(self, folder: object) -> bool:
        """Whether a folder is in the list."""
        if isinstance(folder, FolderReference):
            return any(each.uuid == folder.uuid for each in self)
        return isinstance(folder, (str, os.PathLike)) and any(
            os.fspath(each.location) == self._project._core.absolute(folder) for each in self)

    def add(self, *folders: PathArgument, absolute: bool = False) -> list[FolderReference]:
        """Adds folders, relative to the project's root or absolute, as one step.

        Raises DuplicatePathEntryException or DuplicateReferenceException for a folder that is in the list.
        """
        return [self._reference(each)
                for each in self._project._core.add_references(self._is_path, folders, absolute)]

    def remove(self, *references: FolderReference) -> None:
        """Removes references, as one step. Those that are not in the list are skipped."""
        self._project._core.remove_references(
            self._is_path, [(each.uuid, os.fspath(each.location), each.type, each.stored_path) for each in references])

    def root_for(self, path: PathArgument) -> FolderReference | None:
        """The first reference whose folder is the path or above it."""
        values = self._project._core.root_reference(self._is_path, path)
        return None if values is None else self._reference(values)


@dataclass(frozen=True)
class Node:
    """A folder in the graph: a project, with its name, or a folder that is missing or is not a project."""

    folder: Path
    name: str
    is_project: bool


@dataclass(frozen=True)
class Edge:
    """A reference from one project to another folder."""

    source: Path
    target: Path
    type: str  #: "Relative" or "Absolute"
    uuid: str


@dataclass(frozen=True)
class ProjectGraph:
    """The projects that a project refers to, directly or through others, as plain nodes and edges."""

    nodes: tuple[Node, ...]
    edges: tuple[Edge, ...]

    def to_networkx(self) -> Any:
        """A networkx.MultiDiGraph. Raises ImportError if networkx is not installed."""
        import networkx  # type: ignore[import]

        graph = networkx.MultiDiGraph()
        for node in self.nodes:
            graph.add_node(node.folder, name=node.name, is_project=node.is_project)
        for edge in self.edges:
            graph.add_edge(edge.source, edge.target, key=edge.uuid, type=edge.type)
        return graph

    def to_pandas(self) -> Any:
        """The edges as a pandas.DataFrame. Raises ImportError if pandas is not installed."""
        import pandas  # type: ignore[import]

        names = {node.folder: node.name for node in self.nodes}
        rows = [(names[each.source], names[each.target], each.source, each.target, each.type) for each in self.edges]
        return pandas.DataFrame(rows, columns=["source", "target", "source_folder", "target_folder", "type"])


def graph_of(project: Project) -> ProjectGraph:
    """The graph that begins with a project. The others are opened for reading, one after the other."""
    nodes: dict[Path, Node] = {}
    edges: list[Edge] = []
    waiting = [project.root]
    while waiting:
        folder = waiting.pop(0)
        if folder in nodes:
            continue
        nodes[folder], references = _read(project, folder)
        for each in references:
            edges.append(Edge(folder, each.location, each.type, each.uuid))
            waiting.append(each.location)
    return ProjectGraph(tuple(nodes.values()), tuple(edges))


def _read(project: Project, folder: Path) -> tuple[Node, Iterable[FolderReference]]:
    from .project import SourceControl, open as open_project

    if folder == project.root:
        return Node(folder, project.name, True), list(project.references)
    if not _core.is_project(folder):
        return Node(folder, folder.name, False), []
    with open_project(folder, source_control=SourceControl.OFF) as other:
        return Node(folder, other.name, True), list(other.references)
