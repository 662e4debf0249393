#include "completion/PathCandidates.hpp"

#include <cstddef>
#include <set>
#include <string>
#include <string_view>

#include "cli/PathArguments.hpp"
#include "files/DiskFolder.hpp"
#include "output/Kind.hpp"
#include "output/NameForms.hpp"
#include "project/FileList.hpp"
#include "project/metadata/MetadataFunctions.hpp"

namespace projectctl {

namespace {

/// The folder part of a typed path, up to its last slash.
std::string folderPart(std::string const& typed) {
    return typed.substr(0, typed.rfind('/') + 1);
}

Path typedFolder(std::string const& typed) {
    std::string const folder = folderPart(typed);
    return absolutePath(folder.empty() ? "." : folder);
}

void addPath(Candidates& candidates, std::u16string_view name, Kind kind) {
    std::string path = folderPart(candidates.typed());
    path += path.empty() && name.starts_with(u'-') ? "./" : ""; // so that it is not an option
    appendBytes(path, name);
    bool const isFolder = kind == Kind::Folder;
    candidates.add(path + (isFolder ? "/" : ""),
                   Message(isFolder ? "CompletesFolder" : "CompletesFile").text());
}

/// The entries of the project in the typed folder.
FileList::Level typedLevel(Candidates const& candidates, OpenProject& project, FileList const& list) {
    auto const folder = typedFolder(candidates.typed());
    bool const isInRoot = folder == project.root() || project::metadata::isParent(folder, project.root());
    return isInRoot ? list.level(list.addressOf(folder)) : FileList::Level();
}

} // namespace

void addProjectPaths(Candidates& candidates, OpenProject& project) {
    FileList const list(project);
    auto const level = typedLevel(candidates, project, list);
    for (auto const& entry : level.files) {
        if (entry.node) {
            addPath(candidates, level.nameOf(entry), entry.hasChildren ? Kind::Folder : Kind::File);
        }
    }
}

void addNewPaths(Candidates& candidates, OpenProject& project) {
    FileList const list(project);
    auto const level = typedLevel(candidates, project, list);
    std::set<std::u16string_view> known;
    for (auto const& entry : level.files) {
        if (entry.node) {
            known.insert(level.nameOf(entry));
        }
    }
    for (auto const& entry : readDiskFolder(typedFolder(candidates.typed()))) {
        if (entry.kind == Kind::Folder || !known.contains(entry.name)) {
            addPath(candidates, entry.name, entry.kind);
        }
    }
}

void addDiskPaths(Candidates& candidates, DiskPaths which) {
    std::string const& typed = candidates.typed();
    bool const showsHidden = typed.substr(folderPart(typed).size()).starts_with('.');
    for (auto const& entry : readDiskFolder(typedFolder(typed))) {
        bool const isWanted = which == DiskPaths::All || entry.kind == Kind::Folder;
        if (isWanted && (showsHidden || !entry.name.starts_with(u'.'))) {
            addPath(candidates, entry.name, entry.kind);
        }
    }
}

} // namespace projectctl
