"""Opening projects."""

from __future__ import annotations

import enum
import os
from collections.abc import Mapping
from dataclasses import dataclass
from pathlib import Path
from types import TracebackType
from typing import Any

from . import _core
from .entry_points import EntryPoints
from .errors import NotAProject, StoreError
from .events import Connection, Events
from .files import File, Files, PathArgument
from .labels import Categories
from .moves import Move, RecoveredMoves
from .references import ProjectGraph, References, graph_of
from .renames import RenamesFound
from .scopes import Scopes
from .sync import SyncPlan, SyncRules

__all__ = ["HistoryLoss", "Personal", "Project", "Snapshot", "SourceControl", "Transaction", "create_shared",
           "is_project", "open"]


class SourceControl(enum.Enum):
    """How a project treats the git repository that contains it."""

    EACH_CHANGE = 0  #: each change is staged
    WHEN_ASKED = 1  #: only Project.stage stages the project's text
    OFF = 2


@dataclass(frozen=True)
class HistoryLoss:
    """Entries of a shared project that the server does not have any more."""

    class Kind(enum.Enum):
        """Why they are gone."""

        CLEANED = 0
        RESET = 1

    kind: Kind
    seen: int
    found: int


class Transaction:
    """Several changes as one step: a context manager.

    At the end of the block, the changes are committed; if the block raises, they are rolled back. A transaction in
    another one is nested in it. It belongs to its thread, and other threads and processes wait for the project.
    """

    def __init__(self, project: Project) -> None:
        self._project = project
        self._core: _core.OpenTransaction | None = None

    def __enter__(self) -> Transaction:
        if self._core is not None:
            raise RuntimeError("the transaction has begun already")
        self._core = self._project._core.begin()
        return self

    def __exit__(self, kind: type[BaseException] | None, error: BaseException | None,
                 traceback: TracebackType | None) -> None:
        assert self._core is not None
        try:
            if kind is None:
                self._core.commit()
        finally:
            self._core.end()
            self._core = None


class Snapshot:
    """One state of the project as long as the block runs: a context manager. Its thread cannot change it."""

    def __init__(self, project: Project) -> None:
        self._project = project
        self._guards: list[_core.ReadGuard] = []

    def __enter__(self) -> Project:
        self._guards.append(self._project._core.read())
        return self._project

    def __exit__(self, *_: object) -> None:
        self._guards.pop().end()


class Personal:
    """The personal layer: categories and labels of the person who works in the folder."""

    def __init__(self, project: Project) -> None:
        self._project = project

    @property
    def categories(self) -> Categories:
        """The personal categories."""
        return Categories(self._project, is_personal=True)

    @property
    def events(self) -> Events:
        """The events of the personal layer."""
        return Events(self._project, is_personal=True)

    def hidden_files(self) -> list[str]:
        """The files with personal labels that are not in the project now."""
        return self._project._core.hidden_files()

    def remove_hidden(self) -> list[str]:
        """Deletes the personal labels of these files. Returns the files."""
        return self._project._core.remove_hidden()

    def follow_hidden(self, moves: Mapping[PathArgument, PathArgument]) -> list[Move]:
        """Lets hidden personal labels follow files that somebody else has moved: old paths to new ones.

        A move is left out if its old path is not hidden, or its new path is not in the project or has personal
        labels of its own. Returns the moves that were followed.
        """
        return [Move(*pair) for pair in self._project._core.follow_hidden(list(moves.items()))]


class Project:
    """An open project. Several threads may use it. As a context manager, it is closed at the end of the block."""

    def __init__(self, core: _core.OpenProject) -> None:
        self._core = core
        self._connections: set[Connection[Any]] = set()
        #: The files and folders.
        self.files = Files(self)
        #: The categories of labels.
        self.categories = Categories(self)
        #: The entry points by file.
        self.entry_points = EntryPoints(self)
        #: The project path: a list of folders of this project.
        self.path = References(self, is_path=True)
        #: The references to other projects.
        self.references = References(self, is_path=False)
        #: Data of applications, one node for each file.
        self.scopes = Scopes(self)
        #: The events that report changes.
        self.events = Events(self)
        #: The personal layer.
        self.personal = Personal(self)
        #: The rules of folders that keep themselves up to date.
        self.sync_rules = SyncRules(self)

    @property
    def root(self) -> Path:
        """The project's top folder, in canonical form."""
        return Path(self._core.root)

    @property
    def name(self) -> str:
        """The project's name."""
        return self._core.name()

    @name.setter
    def name(self, name: str) -> None:
        self._core.set_name(name)

    @property
    def description(self) -> str:
        """The project's description."""
        return self._core.description()

    @description.setter
    def description(self, text: str) -> None:
        self._core.set_description(text)

    @property
    def is_shared(self) -> bool:
        """Whether a server stores the project."""
        return self._core.is_shared()

    @property
    def is_closed(self) -> bool:
        """Whether close was called."""
        return self._core.is_closed

    @property
    def graph(self) -> ProjectGraph:
        """The projects that this one refers to, directly or through others."""
        return graph_of(self)

    def transaction(self) -> Transaction:
        """Several changes as one step: `with p.transaction(): ...`."""
        return Transaction(self)

    def snapshot(self) -> Snapshot:
        """One state of the project for several questions: `with p.snapshot(): ...`."""
        return Snapshot(self)

    def refresh(self) -> bool:
        """Reports the changes of other programs as events. Returns True if there were any."""
        return self._core.refresh()

    def wait(self, seconds: float) -> bool:
        """Waits until other programs change the project, and reports that as refresh does.

        Returns False if the time has run out, or another thread has called wake.
        """
        return self._core.watch(seconds)

    def wake(self) -> None:
        """Lets wait return."""
        self._core.wake()

    def stage(self) -> None:
        """Stages the project's text in git, if it was written since it was last staged."""
        self._core.stage()

    def move(self, *sources: PathArgument, to: PathArgument) -> list[Move]:
        """Moves files and folders on disk, in the definition and in git, as one step.

        `to` is the new path, or a folder to move them into. Raises MoveError if that is not possible.
        """
        return [Move(*pair) for pair in self._core.move(sources, to)]

    def adopt(self, moves: Mapping[PathArgument, PathArgument]) -> None:
        """Lets the definition follow moves on disk that another program has made: old paths to new ones."""
        self._core.adopt(list(moves.items()))

    def find_renames(self, *, similarity: int = 50, uses_git: bool = True) -> RenamesFound:
        """Pairs the files that are missing on disk with files that are not in the project, for adopt. Changes nothing.

        In a repository, the contents decide: equal ones, and similar ones from this percentage on. Without git,
        the names do, and each pair is a guess. Raises ValueError if the similarity is not from 1 to 100.
        """
        return RenamesFound._of(self._core.find_renames(similarity, uses_git))

    def take_recovered_moves(self) -> RecoveredMoves | None:
        """The end of a move that another process did not finish. Each is returned once."""
        content = self._core.take_recovered_moves()
        if content is None:
            return None
        outcome, moves, left = content
        return RecoveredMoves(RecoveredMoves.Outcome(outcome), tuple(Move(*pair) for pair in moves),
                              tuple(Move(*pair) for pair in left))

    @property
    def has_unfinished_move(self) -> bool:
        """Whether the next change completes or rolls back a move of a process that died."""
        return self._core.has_unfinished_move()

    def plan_sync(self) -> SyncPlan:
        """What sync would change."""
        return SyncPlan._of(self._core.plan_sync(File, self))

    def sync(self, *, removes_missing_folders: bool = False, follows_renames: bool = True,
             similarity: int = 50) -> SyncPlan:
        """Adds the new files of folders with rules, and removes those that are gone. Returns what it changed.

        Files that git shows to be renamed keep their labels and entry points, from this similarity of their
        contents on, in percent. Raises ValueError if that is not from 1 to 100, and SyncFolderMissing if the folder
        of a rule is missing or empty, unless removes_missing_folders allows that.
        """
        return SyncPlan._of(self._core.sync(File, self, removes_missing_folders, follows_renames, similarity))

    def take_history_loss(self) -> HistoryLoss | None:
        """For a shared project: a loss of history that was found since the last call."""
        content = self._core.take_history_loss()
        return None if content is None else HistoryLoss(HistoryLoss.Kind(content[0]), content[1], content[2])

    def close(self) -> None:
        """Closes the project. Calls that are running in other threads, or that called this function, complete.

        All other operations raise ProjectClosed from now on. A project that is closed already stays closed.
        """
        for connection in list(self._connections):
            connection.disconnect()
        self._core.close()

    def __enter__(self) -> Project:
        return self

    def __exit__(self, *_: object) -> None:
        self.close()

    def __repr__(self) -> str:
        return f"<Project {os.fspath(self.root)!r}{' (closed)' if self.is_closed else ''}>"


def open(root: PathArgument, *, create_as: str | None = None,
         source_control: SourceControl = SourceControl.EACH_CHANGE, honours_environment: bool = False,
         freshness: float = 0.0, reads_last_state: bool = False) -> Project:
    """Opens the project in a folder.

    :param create_as: the name of a project that is created if there is none. Without it, NotAProject is raised then.
    :param source_control: how git follows changes.
    :param honours_environment: whether the variables of git's environment apply, such as GIT_DIR.
    :param freshness: for a shared project, how many seconds old the last check for changes may be.
    :param reads_last_state: for a shared project, whether reading continues while the server is unreachable.
    """
    try:
        return Project(_core.open(root, create_as, source_control.value, honours_environment, freshness,
                                  reads_last_state))
    except StoreError as error:
        if create_as is None and not _core.is_project(root):
            raise NotAProject(*error.args) from None
        raise


def create_shared(root: PathArgument, name: str, *, service: str, reader: str, writer: str,
                  kind: str = "postgresql", source_control: SourceControl = SourceControl.EACH_CHANGE,
                  honours_environment: bool = False, freshness: float = 0.0,
                  reads_last_state: bool = False) -> Project:
    """Creates a project that a team shares, on a server."""
    return Project(_core.create_shared(root, name, service, reader, writer, kind, source_control.value,
                                       honours_environment, freshness, reads_last_state))


def is_project(root: PathArgument) -> bool:
    """Whether a folder contains a project."""
    return _core.is_project(root)
