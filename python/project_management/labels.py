"""Categories, their labels, and the labels on files."""

from __future__ import annotations

import enum
from collections.abc import Iterable, Iterator, MutableMapping
from typing import TYPE_CHECKING, overload

from . import _core
from .errors import LabelDataInvalid
from .queries import Condition

if TYPE_CHECKING:
    from .files import PathArgument
    from .project import Project

__all__ = ["Categories", "Category", "FileLabels", "Label", "LabelState", "Labels"]

_CategoryValues = tuple[str, str, bool, bool, str]
_LabelValues = tuple[str, str, int]


class LabelState(enum.Enum):
    """Whether a label may be deleted."""

    READ_ONLY = 0
    WRITABLE = 1
    INHERITED = 2  #: as its category


class Label:
    """A label of a category, with the name that it had when it was read. Its UUID identifies it."""

    __slots__ = ("category", "_values")

    def __init__(self, category: Category, values: _LabelValues) -> None:
        #: The category of the label.
        self.category = category
        self._values = values

    @property
    def uuid(self) -> str:
        """The UUID, which is unique in the category."""
        return self._values[0]

    @property
    def name(self) -> str:
        """The name that users see."""
        return self._values[1]

    @property
    def state(self) -> LabelState:
        """Whether the label may be deleted."""
        return LabelState(self._values[2])

    def put_on(self, paths: Iterable[PathArgument], data: str | None = None) -> None:
        """Puts the label on files as one step, with data. Without data, files that have it keep theirs.

        Raises LabelDataInvalid if the data does not suit the data type of the category.
        """
        self.category._require_valid(data)
        self.category._project._core.add_label(self.category._is_personal, paths, self.category._values,
                                               self._values, data)

    def take_from(self, paths: Iterable[PathArgument]) -> None:
        """Takes the label off files, with its data, as one step."""
        self.category._project._core.remove_label(self.category._is_personal, paths, self.category._values,
                                                  self._values)

    def __eq__(self, other: object) -> bool:
        if not isinstance(other, Label):
            return NotImplemented
        return self.uuid == other.uuid and self.category.uuid == other.category.uuid

    def __hash__(self) -> int:
        return hash((self.uuid, self.category.uuid))

    def __str__(self) -> str:
        return self.name

    def __repr__(self) -> str:
        return f"<Label {self.category.name!r} {self.name!r}>"


class Category:
    """A category of labels, with the properties that it had when it was read. Its UUID identifies it.

    `category == "Reviewed"` and `category == label` are conditions for Files.find; so are `category != label`
    and `category.any`, which is any of its labels.
    """

    __slots__ = ("_project", "_is_personal", "_values")

    def __init__(self, project: Project, is_personal: bool, values: _CategoryValues) -> None:
        self._project = project
        self._is_personal = is_personal
        self._values = values

    @property
    def uuid(self) -> str:
        """The UUID of the category."""
        return self._values[0]

    @property
    def name(self) -> str:
        """The name that users see."""
        return self._values[1]

    @property
    def is_read_only(self) -> bool:
        """Whether the category must not be renamed or deleted."""
        return self._values[2]

    @property
    def is_single_valued(self) -> bool:
        """Whether a file can have at most one label of the category."""
        return self._values[3]

    @property
    def data_type(self) -> str:
        """The type of the data that its labels have on a file: "None", "String", "Logical" or another text."""
        return self._values[4]

    @property
    def is_personal(self) -> bool:
        """Whether the category belongs to the personal layer."""
        return self._is_personal

    @property
    def labels(self) -> Labels:
        """The labels of the category."""
        return Labels(self)

    @property
    def any(self) -> Condition:
        """The condition that a file has any label of the category."""
        return Condition._of(self.uuid)

    def rename(self, name: str) -> Category:
        """Stores another name. Returns the category with it."""
        self._project._core.rename_category(self._is_personal, self._values, name)
        uuid, _, read_only, single_valued, data_type = self._values
        return Category(self._project, self._is_personal, (uuid, name, read_only, single_valued, data_type))

    def delete(self) -> None:
        """Removes the category's labels from all files, and then the category."""
        self._project._core.delete_category(self._is_personal, self._values)

    def remove_from(self, paths: Iterable[PathArgument]) -> None:
        """Takes all labels of the category off files. The labels' data stays stored."""
        self._project._core.remove_category(self._is_personal, paths, self._values)

    def is_valid_data(self, data: str) -> bool:
        """Whether a text is data that a label of the category can have, as its data type says."""
        return _core.is_valid_data(self.data_type, data)

    def _require_valid(self, data: str | None) -> None:
        if data and not self.is_valid_data(data):
            raise LabelDataInvalid(data, self.data_type, self.name)

    @overload
    def __eq__(self, other: str | Label) -> Condition: ...  # type: ignore[misc]

    @overload
    def __eq__(self, other: object) -> bool: ...

    def __eq__(self, other: object) -> Condition | bool:
        if isinstance(other, str):
            other = self.labels[other]
        if isinstance(other, Label):
            return Condition._of(self.uuid, other.uuid)
        if isinstance(other, Category):
            return self.uuid == other.uuid and self._is_personal == other._is_personal
        return NotImplemented

    @overload
    def __ne__(self, other: str | Label) -> Condition: ...  # type: ignore[misc]

    @overload
    def __ne__(self, other: object) -> bool: ...

    def __ne__(self, other: object) -> Condition | bool:
        equal = self.__eq__(other)
        if isinstance(equal, Condition):
            return ~equal
        return equal if equal is NotImplemented else not equal

    def __hash__(self) -> int:
        return hash(self.uuid)

    def __str__(self) -> str:
        return self.name

    def __repr__(self) -> str:
        return f"<Category {self.name!r}>"


class Labels:
    """The labels of a category, by name."""

    def __init__(self, category: Category) -> None:
        self._category = category

    def __iter__(self) -> Iterator[Label]:
        core = self._category._project._core
        for values in core.labels(self._category._is_personal, self._category._values):
            yield Label(self._category, values)

    def __len__(self) -> int:
        return sum(1 for _ in self)

    def __contains__(self, name: object) -> bool:
        return any(label.name == name or label == name for label in self)

    def __getitem__(self, name: str) -> Label:
        """The label with this name. Raises KeyError if there is none."""
        for label in self:
            if label.name == name:
                return label
        raise KeyError(name)

    def create(self, name: str, *, uuid: str = "", state: LabelState = LabelState.INHERITED) -> Label:
        """Creates a label. Raises LabelExistsByName if the category has one with this name."""
        core = self._category._project._core
        return Label(self._category, core.create_label(self._category._is_personal, self._category._values, name,
                                                       uuid, state.value))

    def delete(self, label: Label | str) -> None:
        """Removes a label from all files, and then the label itself."""
        chosen = self[label] if isinstance(label, str) else label
        core = self._category._project._core
        core.delete_label(self._category._is_personal, self._category._values, chosen._values)


class Categories:
    """The categories of a project, or of the personal layer, by name."""

    def __init__(self, project: Project, is_personal: bool = False) -> None:
        self._project = project
        self._is_personal = is_personal

    def __iter__(self) -> Iterator[Category]:
        for values in self._project._core.categories(self._is_personal):
            yield Category(self._project, self._is_personal, values)

    def __len__(self) -> int:
        return sum(1 for _ in self)

    def __contains__(self, name: object) -> bool:
        return any(category.name == name for category in self)

    def __getitem__(self, name: str) -> Category:
        """The category with this name. Raises KeyError if there is none."""
        for category in self:
            if category.name == name:
                return category
        raise KeyError(name)

    def create(self, name: str, *, single_valued: bool = False, read_only: bool = False, data_type: str = "None",
               uuid: str = "") -> Category:
        """Creates a category. With the UUID of one that exists, replaces it, and keeps its labels."""
        return Category(self._project, self._is_personal,
                        self._project._core.create_category(self._is_personal, name, uuid, read_only,
                                                            single_valued, data_type))


class FileLabels(MutableMapping[Label, str]):
    """The labels on a file: a mapping from each label to its data, which is "" for a label without data."""

    def __init__(self, project: Project, path: str, *, is_personal: bool) -> None:
        self._project = project
        self._path = path
        self._is_personal = is_personal

    def _items(self) -> dict[Label, str]:
        return {Label(Category(self._project, self._is_personal, category), label): data
                for category, label, data in self._project._core.labels_of_file(self._is_personal, self._path)}

    def __iter__(self) -> Iterator[Label]:
        return iter(self._items())

    def __len__(self) -> int:
        return len(self._items())

    def __getitem__(self, label: Label) -> str:
        return self._items()[label]

    def __setitem__(self, label: Label, data: str) -> None:
        self.add(label, data)

    def __delitem__(self, label: Label) -> None:
        if label not in self:
            raise KeyError(label)
        self.discard(label)

    def add(self, label: Label, data: str | None = None) -> None:
        """Puts a label on the file, with data. It replaces another one of a single-valued category."""
        self._require_own(label)
        label.put_on([self._path], data)

    def discard(self, label: Label) -> None:
        """Takes a label off the file, if it has it."""
        self._require_own(label)
        label.take_from([self._path])

    def _require_own(self, label: Label) -> None:
        if label.category._is_personal != self._is_personal:
            raise ValueError(f"{label!r} belongs to the other layer: use labels or personal_labels")

    def __repr__(self) -> str:
        return f"<FileLabels of {self._path!r}: {', '.join(map(str, self))}>"
