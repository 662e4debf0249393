#include "renames/PersonalRenames.hpp"

#include <algorithm>
#include <map>
#include <optional>
#include <set>
#include <string>
#include <utility>

#include "git/GitCommand.hpp"
#include "git/RawChanges.hpp"
#include "output/Kind.hpp"
#include "output/NameForms.hpp"
#include "project/metadata/MetadataFunctions.hpp"

namespace projectctl {

namespace {

/// The renames that commits of the repository made.
class CommittedRenames {
public:
    CommittedRenames(Path const& root, int similarity)
        : root_(root), similarity_("-M" + std::to_string(similarity) + '%') {}

    /// The path that a file got in the last commit that deleted it; null if it got none. Searches the full
    /// history: the merged branch, too, if it renamed the file more than once.
    RawChange const* of(std::string const& file) {
        auto const commit = runGit(root_, {"--literal-pathspecs", "log", "-1", "--format=%H",
                                           "--diff-filter=D", "--no-renames", "--full-history", "--", file})
                                .output;
        if (commit.empty()) {
            return nullptr;
        }
        auto const& changes = changesIn(commit.substr(0, commit.find('\n')));
        auto const found = std::ranges::find_if(changes, [&file](RawChange const& change) {
            return change.status == 'R' && change.from == file;
        });
        return found == changes.end() ? nullptr : &*found;
    }

private:
    std::vector<RawChange> const& changesIn(std::string const& commit) {
        auto const [changes, isNew] = commits_.try_emplace(commit);
        if (isNew) {
            changes->second =
                readRawChanges(runGit(root_, {"diff-tree", "-r", "-z", "--raw", "--no-abbrev",
                                              "--no-commit-id", "--relative", "-l0", similarity_, commit})
                                   .output);
        }
        return changes->second;
    }

    Path const& root_;
    std::string similarity_;
    std::map<std::string, std::vector<RawChange>> commits_;
};

/// The file of the project that a file has become, after any number of renames.
std::optional<Rename> renameOf(Path const& hidden, OpenProject& project, CommittedRenames& commits) {
    Rename result{project::metadata::getRelativePath(project.root(), hidden),
                  {},
                  Kind::File,
                  Rename::Evidence::Content,
                  100};
    std::set<std::string> seen;
    for (auto file = bytesOf(result.from); seen.insert(file).second;) {
        auto const* const change = commits.of(file);
        if (change == nullptr) {
            return std::nullopt;
        }
        result.similarity = std::min(result.similarity, change->similarity);
        file = change->to;
        auto const path = project.root() / fl::filesystem::fromSystem(file);
        if (project.files().isFileInProject(path)) {
            result.to = textOf(file);
            result.evidence =
                result.similarity == 100 ? Rename::Evidence::Content : Rename::Evidence::Similarity;
            bool const isFree = project.personal().getFileManager().getLabelIDSets(path).empty();
            return isFree ? std::optional(std::move(result)) : std::nullopt;
        }
    }
    return std::nullopt;
}

} // namespace

std::vector<Rename> findPersonalRenames(OpenProject& project, int similarity) {
    std::vector<Rename> result;
    CommittedRenames commits(project.root(), similarity);
    for (auto const& hidden : project.personal().hiddenFiles()) {
        if (auto rename = renameOf(hidden, project, commits)) {
            result.push_back(*std::move(rename));
        }
    }
    return result;
}

} // namespace projectctl
