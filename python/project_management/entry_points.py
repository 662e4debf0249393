"""The entry points of a project, which are files that users start from, and their groups."""

from __future__ import annotations

import os
from collections.abc import Iterator, Mapping, MutableMapping
from dataclasses import dataclass, field
from typing import TYPE_CHECKING, Optional

from .files import File, PathArgument

if TYPE_CHECKING:
    from .project import Project

__all__ = ["EntryPoint", "EntryPointGroup", "EntryPointGroups", "EntryPoints"]

_GroupValues = tuple[str, str]
_EntryValues = tuple[str, str, str, str, bool, Optional[_GroupValues], dict[str, str]]


@dataclass(frozen=True)
class EntryPointGroup:
    """A named group of entry points. The UUID identifies it."""

    uuid: str
    name: str


@dataclass(frozen=True)
class EntryPoint:
    """A file that users start from. Without a name, it is stored with the file's name without extension."""

    type: str = "Basic"  #: "Basic", "Startup", "Shutdown" or "Batch_Job"
    name: str | None = None
    visible: bool = True
    group: EntryPointGroup | None = None  #: None for the default group
    extensions: Mapping[str, str] = field(default_factory=dict)  #: data of applications
    uuid: str = ""  #: of a stored one; otherwise it is stored under that of the file's entry point, or a new one


class EntryPoints(MutableMapping[PathArgument, EntryPoint]):
    """The entry points by file: `p.entry_points["src/main.cpp"] = EntryPoint(type="Startup")`."""

    def __init__(self, project: Project) -> None:
        self._project = project

    @staticmethod
    def _entry(values: _EntryValues) -> EntryPoint:
        _, uuid, name, kind, visible, group, extensions = values
        return EntryPoint(kind, name, visible, None if group is None else EntryPointGroup(*group), extensions, uuid)

    def __iter__(self) -> Iterator[File]:
        for values in self._project._core.entry_points():
            yield File(self._project, values[0])

    def __len__(self) -> int:
        return len(self._project._core.entry_points())

    def __contains__(self, path: object) -> bool:
        return isinstance(path, (str, bytes, os.PathLike)) and self._project._core.entry_point(path) is not None

    def __getitem__(self, path: PathArgument) -> EntryPoint:
        values = self._project._core.entry_point(path)
        if values is None:
            raise KeyError(path)
        return self._entry(values)

    def __setitem__(self, path: PathArgument, entry: EntryPoint) -> None:
        group = None if entry.group is None else (entry.group.uuid, entry.group.name)
        self._project._core.set_entry_point(path, entry.uuid, entry.name, entry.type, entry.visible, group,
                                            dict(entry.extensions))

    def __delitem__(self, path: PathArgument) -> None:
        if path not in self:
            raise KeyError(path)
        self._project._core.remove_entry_point(path)

    @property
    def groups(self) -> EntryPointGroups:
        """The groups of entry points."""
        return EntryPointGroups(self._project)


class EntryPointGroups:
    """The groups of entry points: first the default group, then the stored ones."""

    def __init__(self, project: Project) -> None:
        self._project = project

    def __iter__(self) -> Iterator[EntryPointGroup]:
        return (EntryPointGroup(*values) for values in self._project._core.groups())

    def __len__(self) -> int:
        return len(self._project._core.groups())

    def __getitem__(self, name: str) -> EntryPointGroup:
        """The group with this name. Raises KeyError if there is none."""
        for group in self:
            if group.name == name:
                return group
        raise KeyError(name)

    def create(self, name: str, *, uuid: str = "") -> EntryPointGroup:
        """Creates a group. Raises EntryPointGroupNameDefined if one has this name."""
        return EntryPointGroup(*self._project._core.create_group(name, uuid))

    def rename(self, group: EntryPointGroup, name: str) -> EntryPointGroup:
        """Stores another name for a group. Returns the group with it."""
        self._project._core.rename_group((group.uuid, group.name), name)
        return EntryPointGroup(group.uuid, name)

    def delete(self, group: EntryPointGroup) -> None:
        """Removes a group. Its entry points stay, and have no group."""
        self._project._core.delete_group((group.uuid, group.name))
