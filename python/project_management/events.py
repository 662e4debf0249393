"""The events of a project, and watching it with asyncio."""

from __future__ import annotations

import asyncio
import os
import types
import weakref
from collections.abc import AsyncIterator, Callable
from concurrent.futures import ThreadPoolExecutor
from dataclasses import dataclass
from typing import TYPE_CHECKING, Any, Generic, TypeVar, Union

from . import _core
from .files import File, PathArgument
from .labels import Category, Label

if TYPE_CHECKING:
    from .project import Project

__all__ = ["Change", "Connection", "Event", "Events", "watch"]

Function = TypeVar("Function", bound=Callable[..., object])


def _reference(function: Function) -> Callable[[], Function | None]:
    """A weak reference to a bound method, a strong one to any other function."""
    if isinstance(function, types.MethodType):
        return weakref.WeakMethod(function)
    return lambda: function


class Connection(Generic[Function]):
    """The connection of a function to an event. It lasts until disconnect, also without this object.

    As a context manager, it disconnects at the end of the block.
    """

    def __init__(self, event: Event[Function], function: Function) -> None:
        self._event = event
        self._function = _reference(function)
        weak = weakref.ref(self)

        def call(*values: Any) -> None:
            connection = weak()
            if connection is not None:
                connection._call(*values)

        # The C++ side has no strong reference but to `call`: the collector of garbage sees all others.
        self._core = event._project._core.connect(event._is_personal, event.name, call)
        event._project._connections.add(self)

    def _call(self, *values: Any) -> None:
        function = self._function()
        if function is None:
            self.disconnect()
        elif self._core.is_connected:
            function(*self._event._arguments(*values))

    @property
    def is_connected(self) -> bool:
        """False after disconnect, or when the object of a bound method is gone, or the project is closed."""
        return self._core.is_connected and self._function() is not None

    def disconnect(self) -> None:
        """Ends the connection. A function that another thread is about to call may run once more."""
        self._core.disconnect()
        self._event._project._connections.discard(self)

    def __enter__(self) -> Connection[Function]:
        return self

    def __exit__(self, *_: object) -> None:
        self.disconnect()


class Event(Generic[Function]):
    """A kind of event, to which functions connect.

    Functions are called in the order in which they were connected, on the thread that made the change or called
    refresh. An exception propagates to the caller there, and the remaining functions are not called. A bound
    method is held weakly: its connection does not keep the object.
    """

    def __init__(self, project: Project, name: str, is_personal: bool) -> None:
        self._project = project
        self._is_personal = is_personal
        self.name = name

    def connect(self, function: Function) -> Connection[Function]:
        """Connects a function until the connection is ended."""
        return Connection(self, function)

    def connected(self, function: Function) -> Connection[Function]:
        """The same for a `with` block, at whose end the connection ends."""
        return Connection(self, function)

    def _arguments(self, *values: Any) -> tuple[Any, ...]:
        if not values:
            return ()
        first = values[0]
        if isinstance(first, list):
            project = self._project
            return ([File(project, project._core.relative(path)) for path in first],)
        category = Category(self._project, self._is_personal, first)
        return (Label(category, values[1]),) if len(values) > 1 else (category,)


FilesFunction = Callable[[list[File]], object]
LabelFunction = Callable[[Label], object]
CategoryFunction = Callable[[Category], object]
PlainFunction = Callable[[], object]


class Events:
    """The events of a project, or of its personal layer."""

    def __init__(self, project: Project, is_personal: bool = False) -> None:
        self._project = project
        #: Files were added or removed. The function gets a list of File.
        self.files_changed: Event[FilesFunction] = Event(project, "files_changed", is_personal)
        #: Labels were put on files or taken off them. The function gets a list of File.
        self.file_labels_changed: Event[FilesFunction] = Event(project, "file_labels_changed", is_personal)
        #: A label was created or deleted. The function gets the Label.
        self.label_modified: Event[LabelFunction] = Event(project, "label_modified", is_personal)
        #: A category was created, or created again with other flags. The function gets the Category.
        self.category_added: Event[CategoryFunction] = Event(project, "category_added", is_personal)
        self.category_deleted: Event[CategoryFunction] = Event(project, "category_deleted", is_personal)
        #: The function gets the Category with the old name.
        self.category_renamed: Event[CategoryFunction] = Event(project, "category_renamed", is_personal)
        #: Entry points or their groups changed. The function gets no argument, as those of the following.
        self.entry_points_changed: Event[PlainFunction] = Event(project, "entry_points_changed", is_personal)
        self.name_changed: Event[PlainFunction] = Event(project, "name_changed", is_personal)
        self.path_changed: Event[PlainFunction] = Event(project, "path_changed", is_personal)
        self.references_changed: Event[PlainFunction] = Event(project, "references_changed", is_personal)
        #: Changes that have no event of their own. An application may raise it for its own data.
        self.metadata_changed: Event[PlainFunction] = Event(project, "metadata_changed", is_personal)

    def raise_metadata_changed(self) -> None:
        """Raises metadata_changed, for an application that has changed its own data."""
        self._project._core.raise_metadata_changed()

    def _all(self) -> list[Event[Any]]:
        return [each for each in vars(self).values() if isinstance(each, Event)]


@dataclass(frozen=True)
class Change:
    """A change of a project that watch reports: the name of the event, with its files, category or label."""

    event: str
    files: tuple[File, ...] = ()
    category: Category | None = None
    label: Label | None = None

    @classmethod
    def _of(cls, event: str, subject: list[File] | Category | Label | None) -> Change:
        if isinstance(subject, Label):
            return cls(event, category=subject.category, label=subject)
        if isinstance(subject, Category):
            return cls(event, category=subject)
        return cls(event, tuple(subject or ()))


async def watch(project: Union[Project, PathArgument], *, interval: float = 0.5) -> AsyncIterator[Change]:
    """Reports the changes that other programs make to a project, as they are found.

    Checks for changes at this interval, in seconds, on a thread of its own, so that the event loop never waits
    for the disk. Reports also the changes that this program makes to the project, if it passes an open Project.
    A project that watch has opened itself is closed when the iteration ends.
    """
    from .project import Project, SourceControl, open as open_project

    loop = asyncio.get_running_loop()
    with ThreadPoolExecutor(1, "project_management.watch") as thread:
        opened: Project | None = None
        connections: list[Connection[Any]] = []
        changes: list[Change] = []
        try:
            if isinstance(project, Project):
                watched = project
            else:
                folder = os.fspath(project)
                watched = opened = await loop.run_in_executor(
                    thread, lambda: open_project(folder, source_control=SourceControl.OFF))
            for event in watched.events._all():
                connections.append(event.connect(
                    lambda subject=None, name=event.name: changes.append(Change._of(name, subject))))
            while True:
                await loop.run_in_executor(thread, watched.refresh)
                while changes:
                    yield changes.pop(0)
                await asyncio.sleep(interval)
        finally:
            for connection in connections:
                connection.disconnect()
            if opened is not None:
                opened.close()
