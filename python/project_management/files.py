"""The files and folders of a project."""

from __future__ import annotations

import enum
import os
from collections.abc import Callable, Iterable, Iterator
from pathlib import Path
from typing import TYPE_CHECKING, Union

from . import _core
from .labels import FileLabels
from .queries import Condition, Layers

if TYPE_CHECKING:
    from .project import Project

__all__ = ["File", "FileKind", "Files", "Ignore", "PathArgument", "git_ignored"]

PathArgument = Union[str, bytes, "os.PathLike[str]", "os.PathLike[bytes]"]

#: Gets a folder and the names in it, and returns those to leave out, as the ignore of shutil.copytree.
Ignore = Callable[[str, list[str]], Iterable[str]]


class FileKind(enum.Enum):
    """What a file was when it was added. Everything that is not a folder counts as a file."""

    FILE = 0
    FOLDER = 1


class File(_core.FileBase):
    """A file or folder of a project.

    `str` is its path relative to the root, with "/". It is an os.PathLike with the absolute path, so that `open`
    and pathlib take it. Files are equal if their projects and paths are.
    """

    __slots__ = ()

    _project: Project

    @property
    def path(self) -> Path:
        """The absolute path."""
        return Path(os.fspath(self))

    @property
    def name(self) -> str:
        """The last element of the path."""
        return self._path.rpartition("/")[2]

    @property
    def kind(self) -> FileKind:
        """A file, or a folder if it was one when it was added."""
        if self._kind >= 0:
            return FileKind(self._kind)
        found = self._project._core.find(File, self._project, [([], [])], [self._path], None, None, False, False, 0)
        if not found or found[0]._path != self._path:
            raise _core.file_not_in_project(os.fspath(self))
        return found[0].kind

    @property
    def is_folder(self) -> bool:
        """True for a folder."""
        return self.kind is FileKind.FOLDER

    @property
    def labels(self) -> FileLabels:
        """The labels of the project on the file, with their data."""
        return FileLabels(self._project, self._path, is_personal=False)

    @property
    def personal_labels(self) -> FileLabels:
        """The personal labels on the file, which source control never gets."""
        return FileLabels(self._project, self._path, is_personal=True)

    def children(self) -> list[File]:
        """The files and folders of the project directly below a folder."""
        return [File(self._project, path) for path in self._project._core.children(self._path)]

    def __fspath__(self) -> str:
        return self._project._core.absolute(self._path)

    def __str__(self) -> str:
        return self._path

    def __repr__(self) -> str:
        return f"<File {self._path!r}>"

    def __eq__(self, other: object) -> bool:
        if not isinstance(other, File):
            return NotImplemented
        return self._path == other._path and self._project is other._project

    def __hash__(self) -> int:
        return hash(self._path)

    def __lt__(self, other: File) -> bool:
        return self._path.split("/") < other._path.split("/")


def git_ignored(folder: str, names: list[str]) -> set[str]:
    """The names in a folder that git ignores, for Files.add_tree and shutil.copytree. None outside a repository."""
    return _core.git_ignored(folder, names)


class Files:
    """The list of the files and folders of a project: a collection of File objects in the order of their paths.

    Paths are relative to the project's root, or absolute: `str`, `bytes` or os.PathLike.
    """

    def __init__(self, project: Project) -> None:
        self._project = project

    def __iter__(self) -> Iterator[File]:
        return iter(self.find())

    def __len__(self) -> int:
        return self._project._core.count_files()  # list() asks for it too, to know how long it will be

    def __contains__(self, path: object) -> bool:
        return isinstance(path, (str, bytes, os.PathLike)) and self._project._core.has_file(path)

    def __getitem__(self, path: PathArgument) -> File:
        """The file with this path. Raises FileNotInProject, which is a LookupError."""
        file = File(self._project, self._project._core.relative(path))
        if path not in self:
            raise _core.file_not_in_project(os.fspath(file))
        return file

    def add(self, *paths: PathArgument, anew: bool = False) -> int:
        """Adds files and folders, and the folders above them, as one step. Returns the number of new paths.

        The contents of a folder are not added; add_tree does that. Paths that are in the project stay as they
        are. With anew, they are added again, which removes their labels and those of the folders above them.
        """
        return self._project._core.add_files(paths, anew)

    def add_tree(self, folder: PathArgument = ".", *, ignore: Ignore | None = None) -> int:
        """Adds a folder with everything in it. Returns the number of new paths.

        `ignore` chooses the names to leave out, as in shutil.copytree: git_ignored, shutil.ignore_patterns, or a
        function of your own. The data of source control and of project stores are never added.
        """
        top = self._project._core.absolute(folder)
        found: list[str] = [] if top == self._project._core.root else [top]
        waiting = [top]
        while waiting:
            current = waiting.pop()
            entries = dict(_core.read_folder(current))
            left_out = set(ignore(current, list(entries))) if ignore and entries else set()
            for name, is_folder in entries.items():
                if name not in left_out:
                    found.append(f"{current}/{name}")
                    if is_folder:
                        waiting.append(found[-1])
        return self._project._core.add_files(found, False)

    def remove(self, *paths: PathArgument) -> list[File]:
        """Removes files and folders with everything below them from the project, not from the disk."""
        return [File(self._project, path) for path in self._project._core.remove_files(paths)]

    def find(self, condition: Condition | None = None, *, below: Iterable[PathArgument] = (),
             glob: str | None = None, kind: FileKind | None = None, entry_point: bool = False,
             unlabelled: bool = False, layers: Layers = Layers.BOTH) -> list[File]:
        """The files and folders that meet all conditions, in one state of the project, in the order of paths.

        `condition` concerns labels: `status == "Reviewed"`. `below` limits the search to paths and everything
        below them. `glob` is a pattern for the whole relative path, in which `**` stands for any folders.
        """
        alternatives = condition._lists() if condition is not None else [([], [])]
        return self._project._core.find(File, self._project, alternatives, below, glob,
                                        None if kind is None else kind.value, entry_point, unlabelled,
                                        layers.value)

    def glob(self, pattern: str) -> list[File]:
        """The files and folders whose relative path matches a pattern, such as "**/*.cpp"."""
        return self.find(glob=pattern)
