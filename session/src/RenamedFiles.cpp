#include "RenamedFiles.hpp"

#include <algorithm>
#include <functional>
#include <iterator>
#include <map>
#include <string>
#include <utility>

#include "DiskEntries.hpp"

namespace project::session {

namespace {

/// The files of one content, by name: those that are gone and those that are new.
struct EqualFiles {
    std::multimap<std::u16string, Path> gone;
    std::multimap<std::u16string, Path> added;
};

std::u16string fileNameOf(Path const& file) {
    auto const& path = file.native();
    return path.substr(path.rfind(u'/') + 1);
}

bool isEmptyFile(Path const& file) {
    auto const entry = diskEntry(file);
    return entry && entry->st_size == 0;
}

/// Pairs the only file of a name that is gone with the only new one, and what is left if it is one of each.
/// @param isByName whether the name alone decides.
void pair(EqualFiles files, bool isByName, std::vector<Move>& moves) {
    for (auto gone = files.gone.begin(); gone != files.gone.end();) {
        auto const& name = gone->first;
        auto const found = files.added.find(name);
        if (files.gone.count(name) == 1 && files.added.count(name) == 1) {
            moves.push_back({gone->second, found->second});
            files.added.erase(found);
            gone = files.gone.erase(gone);
        } else {
            ++gone;
        }
    }
    if (!isByName && files.gone.size() == 1 && files.added.size() == 1) {
        moves.push_back({files.gone.begin()->second, files.added.begin()->second});
    }
}

std::vector<Path> goneFilesOf(SyncPlan const& plan) {
    std::vector<Path> result;
    for (auto const& removed : plan.removed) {
        if (removed.file.kind == FileKind::File) {
            result.push_back(removed.file.path);
        }
    }
    return result;
}

} // namespace

std::vector<Move> renamedFiles(SyncPlan const& plan, git::GitAdapter& git) {
    std::vector<Move> result;
    auto const before = git.storedContents(goneFilesOf(plan));
    if (before.empty()) {
        return result;
    }
    std::vector<Path> added;
    std::ranges::transform(plan.added, std::back_inserter(added), &FoundFile::path);
    std::map<std::string, EqualFiles> byContent;
    for (auto const& [file, content] : before) {
        byContent[content].gone.emplace(fileNameOf(file), file);
    }
    for (auto const& [file, content] : git.contentsOnDisk(added)) {
        byContent[content].added.emplace(fileNameOf(file), file);
    }
    for (auto& [content, files] : byContent) {
        if (!files.added.empty()) {
            bool const isByName = isEmptyFile(files.added.begin()->second); // the content says nothing
            pair(std::move(files), isByName, result);
        }
    }
    std::ranges::sort(result, std::less<>(), &Move::from);
    return result;
}

} // namespace project::session
