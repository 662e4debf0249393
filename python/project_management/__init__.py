"""Manages the definition of an engineering project: its files, their labels, entry points and references.

    import project_management as pm

    with pm.open("engine", create_as="Engine controller") as p:
        p.files.add("src/main.cpp")

The guide, docs/guide/python.md, shows each subject by example.
"""

from . import errors, languages
from .entry_points import EntryPoint, EntryPointGroup, EntryPointGroups, EntryPoints
from .errors import *
from .events import Change, Connection, Event, Events, watch
from .files import File, FileKind, Files, Ignore, git_ignored
from .labels import Categories, Category, FileLabels, Label, LabelState, Labels
from .languages import language, set_language
from .moves import Move, RecoveredMoves
from .project import (HistoryLoss, Personal, Project, Snapshot, SourceControl, Transaction, create_shared,
                      is_project, open)
from .queries import Condition, Layers
from .references import Edge, FolderReference, Node, ProjectGraph, References
from .renames import AmbiguousRename, Rename, RenamesFound
from .scopes import MetadataNode, Scope, Scopes
from .sync import RemovedFile, SyncPlan, SyncRule, SyncRules
from .texts import DefinitionChange, Merge, MergeConflict, Side, ValueChange, changes_between, merge

__all__ = [
    "AmbiguousRename", "Categories", "Category", "Change", "Condition", "Connection", "DefinitionChange",
    "Edge", "EntryPoint", "EntryPointGroup", "EntryPointGroups", "EntryPoints", "Event", "Events", "File",
    "FileKind", "FileLabels", "Files", "FolderReference", "HistoryLoss", "Ignore", "Label", "LabelState",
    "Labels", "Layers", "Merge", "MergeConflict", "MetadataNode", "Move", "Node", "Personal", "Project",
    "ProjectGraph", "RecoveredMoves", "References", "RemovedFile", "Rename", "RenamesFound", "Scope", "Scopes",
    "Side", "Snapshot", "SourceControl", "SyncPlan", "SyncRule", "SyncRules", "Transaction", "ValueChange",
    "changes_between", "create_shared", "git_ignored", "is_project", "language", "merge", "open",
    "set_language", "watch",
]
__all__ += errors.__all__
