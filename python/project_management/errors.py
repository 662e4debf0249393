"""The errors of the library as exceptions.

An exception of the catalog has the class of the library's message, and its arguments as attributes. Its text is in
the language of set_language.
"""

from __future__ import annotations

import enum
import errno
import os
from typing import ClassVar

from .messages import message

__all__ = [
    "Error", "ProjectException", "FileNotInProject", "FileIsMetadataError", "FileNotInProjectRoot",
    "FileDoesNotExistError", "SyncFolderUnsuitable", "SyncFolderMissing", "RootFolderNotRemoveable",
    "EntryPointGroupUUIDDefined", "EntryPointGroupNameDefined", "EntryPointTypeUndefined",
    "CanNotModifyReadOnlyCategory", "CanNotModifyReadOnlyLabel", "CategoryDoesNotExist",
    "CategoryDoesNotExistsByUUID", "CategoryExistsByName", "LabelExistsByName", "LabelDoesNotExistsByUUID",
    "LabelReadOnlyStateUndefined", "DuplicatePathEntryException", "DuplicateReferenceException", "StoreError",
    "NotAProject", "GitError", "MoveError", "LabelDataInvalid", "ProjectClosed",
]


class Error(Exception):
    """The base of all errors of the library."""

    def __init__(self, text: str) -> None:
        super().__init__(text)
        self.text = text

    def __str__(self) -> str:
        return self.text


class ProjectException(Error):
    """The base of all errors of the catalog: an operation is not possible with these arguments."""

    #: The names of the attributes with the message's arguments, in their order.
    argument_names: ClassVar[tuple[str, ...]] = ()

    #: Whether they are paths, which have the form of os.fsdecode.
    has_paths: ClassVar[bool] = False

    def __init__(self, text: str, *arguments: str) -> None:
        super().__init__(text)
        self.args = (text, *arguments)
        for name, value in zip(self.argument_names, arguments):
            setattr(self, name, value)


class _OfPath(ProjectException):
    argument_names = ("path",)
    has_paths = True

    #: The file or folder, absolute.
    path: str


class _OfUUID(ProjectException):
    argument_names = ("uuid",)
    uuid: str


class _OfName(ProjectException):
    argument_names = ("name",)
    name: str


class FileNotInProject(_OfPath, LookupError):
    """The file or folder is not in the project."""


class FileIsMetadataError(_OfPath, ValueError):
    """The path is inside the folder that contains the store's own files."""


class FileNotInProjectRoot(ProjectException, ValueError):
    """The path is outside the project's root."""

    argument_names = ("path", "project_root")
    has_paths = True
    path: str
    project_root: str


class FileDoesNotExistError(_OfPath, FileNotFoundError):
    """The path is below the project's root, but does not exist on disk."""

    def __init__(self, text: str, path: str) -> None:
        super().__init__(text, path)
        self.errno = errno.ENOENT
        self.strerror = os.strerror(errno.ENOENT)
        self.filename = path

    def __reduce__(self) -> tuple[type[FileDoesNotExistError], tuple[str, ...]]:
        return type(self), (self.text, self.path)  # that of OSError has the file name once more


class SyncFolderUnsuitable(_OfPath, ValueError):
    """The folder cannot have a rule that keeps it up to date."""


class SyncFolderMissing(_OfPath):
    """The folder of a rule is missing or empty, so that everything below it would be removed."""


class RootFolderNotRemoveable(_OfPath, ValueError):
    """The project's root cannot be removed from its own project."""


class EntryPointGroupUUIDDefined(_OfUUID, ValueError):
    """An entry point group with this UUID exists already."""


class EntryPointGroupNameDefined(_OfName, ValueError):
    """An entry point group with this name exists already."""


class EntryPointTypeUndefined(_OfName, ValueError):
    """The name is not that of an entry point type."""


class CanNotModifyReadOnlyCategory(ProjectException):
    """The category is read-only."""


class CanNotModifyReadOnlyLabel(ProjectException):
    """The label is read-only."""


class CategoryDoesNotExist(_OfName, LookupError):
    """The category does not exist."""


class CategoryDoesNotExistsByUUID(_OfUUID, LookupError):
    """A category with this UUID does not exist."""


class CategoryExistsByName(_OfName, ValueError):
    """A category with this name exists already."""


class LabelExistsByName(ProjectException, ValueError):
    """The category has a label with this name already."""

    argument_names = ("category", "name")
    category: str
    name: str


class LabelDoesNotExistsByUUID(_OfUUID, LookupError):
    """A label with this UUID does not exist."""


class LabelReadOnlyStateUndefined(_OfName, ValueError):
    """The name is not that of a label state."""


class DuplicatePathEntryException(_OfPath, ValueError):
    """The folder is on the project path already."""


class DuplicateReferenceException(_OfPath, ValueError):
    """The folder is referenced as a project already."""


class StoreError(Error):
    """An operation of the store failed: the disk, a damaged text, another process that holds the lock."""

    class Kind(enum.Enum):
        """The reason, as far as a caller can act on it."""

        REFUSED = 0
        BUSY = 1
        DAMAGED = 2
        CONFLICT = 3
        DISK_FAILED = 4
        UNREACHABLE = 5
        OUTCOME_UNKNOWN = 6

    def __init__(self, text: str, kind: int, file: str, line: int, problem: str, remedy: str) -> None:
        super().__init__(text)
        self.args = (text, kind, file, line, problem, remedy)
        self.kind = StoreError.Kind(kind)
        self.file = file
        #: Counted from 1; 0 if the error does not concern a line.
        self.line = line
        self.problem = problem
        self.remedy = remedy


class NotAProject(StoreError, LookupError):
    """The folder does not contain a project."""


class GitError(Error):
    """An operation of source control failed: the index is locked, or git itself has to do it."""

    class Kind(enum.Enum):
        """The reason, as far as a caller can act on it."""

        REFUSED = 0
        BUSY = 1
        FAILED = 2

    def __init__(self, text: str, kind: int, file: str, problem: str, remedy: str) -> None:
        super().__init__(text)
        self.args = (text, kind, file, problem, remedy)
        self.kind = GitError.Kind(kind)
        self.file = file
        self.problem = problem
        self.remedy = remedy


class MoveError(Error):
    """A move is not possible. Nothing has changed."""

    class Reason(enum.Enum):
        """Why it is not possible."""

        IS_ROOT = 0
        IS_MISSING = 1
        IS_NESTED = 2
        EXISTS = 3
        IS_IN_PROJECT = 4
        LEAVES_PROJECT = 5
        ENTERS_STORE = 6
        ENTERS_ITSELF = 7
        HAS_NO_FOLDER = 8
        IS_BEYOND_LINK = 9
        IS_OTHER_FILE_SYSTEM = 10
        DISK_FAILED = 11

    def __init__(self, text: str, reason: int, source: str, destination: str, problem: str) -> None:
        super().__init__(text)
        self.args = (text, reason, source, destination, problem)
        self.reason = MoveError.Reason(reason)
        self.source = source
        self.destination = destination
        self.problem = problem


class LabelDataInvalid(Error, ValueError):
    """The text is not data of the type that the label's category has."""

    def __init__(self, data: str, data_type: str, category: str) -> None:
        super().__init__(message("LabelDataInvalid", data, data_type, category))
        self.args = (data, data_type, category)
        self.data = data
        self.data_type = data_type
        #: The name of the category.
        self.category = category


class ProjectClosed(Error, ValueError):
    """The project is closed."""

    def __init__(self) -> None:
        super().__init__(message("ProjectClosed"))
        self.args = ()
