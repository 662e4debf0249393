#include "renames/FindRenames.hpp"

#include <algorithm>
#include <functional>
#include <iterator>
#include <map>
#include <set>
#include <string_view>
#include <utility>

#include "cli/Settings.hpp"
#include "git/GitIgnore.hpp"
#include "output/NameForms.hpp"
#include "project/FileList.hpp"
#include "project/metadata/MetadataFunctions.hpp"
#include "renames/DiskNames.hpp"
#include "renames/GitContents.hpp"
#include "renames/Pairing.hpp"
#include "renames/PersonalRenames.hpp"

namespace projectctl {

namespace {

using Paths = std::vector<std::u16string>;

/// The files of the project, and those of them that are not on disk.
struct Listed {
    std::set<std::u16string> all;
    Paths goneFiles;
    Paths goneFolders; ///< a folder before its contents
};

Listed listedIn(OpenProject& project) {
    Listed result;
    FileList const list(project);
    list.visit(project.root(), [&](FileList::File const& file) {
        result.all.insert(file.path);
        if (!project::metadata::exists(project.root() / Path(file.path))) {
            (file.kind == Kind::Folder ? result.goneFolders : result.goneFiles).push_back(file.path);
        }
    });
    return result;
}

std::string bytesOf(std::u16string const& path) {
    std::string result;
    appendBytes(result, path);
    return result;
}

/// The search in a repository.
class GitSearch {
public:
    GitSearch(OpenProject& project, Listed const& listed, int similarity)
        : project_(project), listed_(listed), similarity_(similarity), git_(project.root()) {}

    Renames run() {
        readAdded();
        readGone();
        auto paired = pairByContent(idsOf(before_), idsOf(after_));
        result_ = std::move(paired.renames);
        if (similarity_ < 100) {
            addSimilar(contentsOf(paired.gone, before_), contentsOf(paired.added, after_));
        }
        addByName();
        return std::move(result_);
    }

private:
    void readAdded() {
        std::vector<std::string> added;
        for (auto names : {git_.tracked(), git_.untracked()}) {
            std::ranges::copy_if(names, std::back_inserter(added), [this](std::string const& name) {
                return !listed_.all.contains(textOf(name)) && !isInStore(name) &&
                       isFileOnDisk(project_.root() / fl::filesystem::fromSystem(name));
            });
        }
        staged_ = git_.staged(added);
        for (auto& name : added) {
            if (auto const found = staged_.find(name); found != staged_.end()) {
                after_.emplace(std::move(name), found->second);
            }
        }
    }

    static bool isInStore(std::string const& name) {
        return name.starts_with(bytesOf(project::stores::TextBackend::folderName) + '/');
    }

    void readGone() {
        auto const commit = git_.lastCommitOf(project_.log() == nullptr
                                                  ? bytesOf(project::stores::TextBackend::folderName) + '/' +
                                                        bytesOf(project::stores::TextBackend::textName)
                                                  : std::string("."));
        auto const committed = commit ? git_.of(*commit) : GitContents();
        std::vector<std::string> unknown;
        for (auto const& path : listed_.goneFiles) {
            auto name = bytesOf(path);
            if (!take(name, committed) && !take(name, staged_)) {
                unknown.push_back(std::move(name));
            }
        }
        if (!unknown.empty() && commit && !after_.empty()) {
            auto const deleted = git_.deleted(unknown);
            std::erase_if(unknown, [&](std::string const& name) { return take(name, deleted); });
        }
        std::ranges::transform(unknown, std::back_inserter(unknown_), textOf);
    }

    bool take(std::string const& name, GitContents const& contents) {
        auto const found = contents.find(name);
        if (found != contents.end()) {
            before_.insert_or_assign(name, found->second);
        }
        return found != contents.end();
    }

    std::vector<FileContentId> idsOf(GitContents const& contents) const {
        std::vector<FileContentId> result;
        for (auto const& [name, content] : contents) {
            result.push_back({textOf(name), content.id, content.id == git_.emptyId()});
        }
        return result;
    }

    static GitContents contentsOf(std::vector<FileContentId> const& files, GitContents const& all) {
        GitContents result;
        for (auto const& file : files) {
            result.insert(*all.find(bytesOf(file.path)));
        }
        return result;
    }

    void addSimilar(GitContents gone, GitContents added) {
        auto const found = git_.similar(gone, added, similarity_);
        GitContents sources;
        GitContents targets;
        for (auto const& rename : found) {
            sources.insert(gone.extract(rename.from));
            targets.insert(added.extract(rename.to));
        }
        // Files that are left over may be as similar to one of a pair as the other one of it.
        std::map<std::string, std::set<std::string>> rivalSources;
        std::map<std::string, std::set<std::string>> rivalTargets;
        for (auto const& rival : git_.similar(gone, targets, similarity_)) {
            noteRival(rivalSources, found, rival, rival.to, &GitRename::to, rival.from);
        }
        for (auto const& rival : git_.similar(sources, added, similarity_)) {
            noteRival(rivalTargets, found, rival, rival.from, &GitRename::from, rival.to);
        }
        for (auto const& rename : found) {
            bool const isClear = !rivalSources.contains(rename.to) && !rivalTargets.contains(rename.from);
            if (isClear) {
                result_.pairs.push_back({textOf(rename.from), textOf(rename.to), Kind::File,
                                         Rename::Evidence::Similarity, rename.similarity});
            } else {
                addAmbiguous(rename, rivalSources[rename.to], rivalTargets[rename.from]);
            }
        }
        sortByPath(result_.pairs);
    }

    static void noteRival(std::map<std::string, std::set<std::string>>& rivals,
                          std::vector<GitRename> const& found, GitRename const& rival,
                          std::string const& disputed, std::string GitRename::*end,
                          std::string const& other) {
        auto const pair = std::ranges::find(found, disputed, end);
        if (pair != found.end() && rival.similarity >= pair->similarity) {
            rivals[disputed].insert(other);
        }
    }

    void addAmbiguous(GitRename const& rename, std::set<std::string> sources, std::set<std::string> targets) {
        sources.insert(rename.from);
        targets.insert(rename.to);
        AmbiguousRename ambiguous;
        std::ranges::transform(sources, std::back_inserter(ambiguous.from), textOf);
        std::ranges::transform(targets, std::back_inserter(ambiguous.to), textOf);
        result_.ambiguous.push_back(std::move(ambiguous));
    }

    /// Pairs the files whose earlier content is unknown with those that nothing else was paired with.
    void addByName() {
        if (unknown_.empty()) {
            return;
        }
        std::set<std::u16string> taken;
        for (auto const& pair : result_.pairs) {
            taken.insert(pair.to);
        }
        Paths rest;
        for (auto const& [name, content] : after_) {
            if (auto path = textOf(name); !taken.contains(path)) {
                rest.push_back(std::move(path));
            }
        }
        auto guessed = pairByName(unknown_, rest);
        std::ranges::move(guessed.pairs, std::back_inserter(result_.pairs));
        std::ranges::move(guessed.ambiguous, std::back_inserter(result_.ambiguous));
        sortByPath(result_.pairs);
    }

    OpenProject& project_;
    Listed const& listed_;
    int similarity_;
    GitContentQuery git_;
    GitContents staged_;
    GitContents before_; ///< of the files that are gone
    GitContents after_;  ///< of the files that are not in the project
    Paths unknown_;      ///< files that are gone, without an earlier content
    Renames result_;
};

} // namespace

Renames findRenames(OpenProject& project, int similarity) {
    bool const usesGit = settings().sourceControl && isInGitRepository(project.root());
    auto const personal = usesGit ? findPersonalRenames(project, similarity) : std::vector<Rename>();
    auto const listed = listedIn(project);
    if (listed.goneFiles.empty() && listed.goneFolders.empty()) {
        return {{}, {}, personal};
    }
    auto result = usesGit ? GitSearch(project, listed, similarity).run()
                          : pairByName(listed.goneFiles, filesOnDisk(project.root(), listed.all));
    result.personal = personal;
    pairFolders(result, listed.goneFolders,
                [&listed](std::u16string const& path) { return listed.all.contains(path); });
    return result;
}

} // namespace projectctl
