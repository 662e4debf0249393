#!/usr/bin/python3 -IS
"""Doxygen reads the headers through this. It puts the names of each header into a group of the reference, and leaves out
the copies, moves and comparisons that the compiler generates and that no comment describes: their meaning is that of the
language.

    reference_filter.py HEADER
"""
import re
import sys
from fnmatch import fnmatch
from pathlib import Path

# The group of a header: that of the first pattern that its path ends with. groups.dox describes the groups.
GROUPS = [
    ("project/session.hpp session/Transaction.hpp session/ToolAccess.hpp core/ProjectManager.hpp "
     "core/ProjectManagerBase.hpp core/Unique.hpp", "session"),
    ("core/FileManager.hpp files/FileMetadataManager.hpp project/session/*.hpp", "files"),
    ("core/LabelManager.hpp labels/*.hpp files/*.hpp", "labels"),
    ("core/EntryPointManager.hpp entrypoints/*.hpp", "entrypoints"),
    ("core/ProjectPathManager.hpp", "path"),
    ("core/ProjectReferenceManager.hpp core/FolderReferenceManager.hpp references/*.hpp", "references"),
    ("decorators/*.hpp", "events"),
    ("metadata/Messages.hpp metadata/ProjectException.hpp stores/StoreError.hpp git/GitError.hpp stores/Fault.hpp",
     "errors"),
    ("cmlink/ReentrantReadWriteLock.hpp", "platform"),
    ("cmlink/*.hpp git/*.hpp cm/*.hpp", "adapters"),
    ("project/metadata/*.hpp", "tree"),
    ("stores/Journal*.hpp stores/FileJournalCache.hpp stores/Shared*.hpp stores/HistoryLoss.hpp stores/StoreCopy.hpp "
     "postgresql/*.hpp", "shared"),
    ("stores/TextMerge.hpp stores/MergeConflict.hpp stores/DefinitionChange.hpp stores/PathMoves.hpp", "merging"),
    ("project/stores/*.hpp", "stores"),
    ("fl/*/*.hpp foundation/*/*/*.hpp computils/*/*.hpp resource_core/*.hpp", "platform"),
]

OWN = r"[A-Za-z_]+"
GENERATED = re.compile("|".join([
    r"^.*operator(==|!=|<)\(.*= default;.*$",
    rf"^ *{OWN}\({OWN} const&( other)?\)( noexcept)? = default;$",
    rf"^ *{OWN}& operator=\({OWN}( const)?&&?( other)?\)( noexcept)?( = default)?;$",
    rf"^ *{OWN}\({OWN}&&( other)?\)( noexcept)?( = default)?;$",
    rf"^ *(virtual )?~{OWN}\(\)( noexcept)?( override)?( = default)?;$",
]))


def group_of(header):
    """The group of a header, or None."""
    return next((group for patterns, group in GROUPS if any(fnmatch(header, f"*/{end}") for end in patterns.split())),
                None)


def without_generated(lines):
    """The lines without what the compiler generates. A described operation stays: its comment would describe the next one."""
    return [line if not GENERATED.match(line) or before.lstrip().startswith("///") else ""
            for before, line in zip(["", *lines], lines)]


def filtered(header, text):
    """The text that Doxygen gets. Each line keeps its number."""
    text = "\n".join(without_generated(text.split("\n")))
    group = group_of(header)
    if not group:
        return text
    text = re.sub(r"^(namespace [\w:]+ \{)$", rf"\1 /** @addtogroup {group} */ /** @{{ */", text, flags=re.MULTILINE)
    return re.sub(r"^(\} // namespace)", r"/** @} */ \1", text, flags=re.MULTILINE)


if __name__ == "__main__":
    sys.stdout.write(filtered(sys.argv[1], Path(sys.argv[1]).read_text()))
