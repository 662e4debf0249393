#include "merge/MergedStates.hpp"

#include <filesystem>
#include <fstream>
#include <sstream>
#include <string_view>
#include <utility>
#include <vector>

#include <unistd.h>

#include "git/CommitLog.hpp"
#include "git/GitCommand.hpp"

namespace projectctl {

namespace {

using fl::filesystem::Path;
using project::stores::ThreeWay;

std::vector<std::string> splitLines(std::string const& text) {
    std::vector<std::string> result;
    std::istringstream stream(text);
    for (std::string line; std::getline(stream, line);) {
        result.push_back(line);
    }
    return result;
}

/// The commits that `git merge` names to the programs that it runs.
std::vector<std::string> branchesInEnvironment() {
    constexpr std::string_view prefix = "GITHEAD_";
    std::vector<std::string> result;
    for (auto const* const* variable = environ; *variable != nullptr; ++variable) {
        std::string_view const text = *variable;
        if (text.starts_with(prefix)) {
            auto const id = text.substr(prefix.size());
            result.emplace_back(id.substr(0, id.find('=')));
        }
    }
    return result;
}

/// The files in which git notes the commits of an unfinished operation.
class OperationFiles {
public:
    explicit OperationFiles(Path const& folder) {
        auto const answer = splitLines(runGit(folder, {"rev-parse", "--absolute-git-dir"}).output);
        folder_ = answer.empty() ? std::string() : answer.front();
    }

    std::vector<std::string> mergeHeads() const { return linesIn("MERGE_HEAD"); }

    /// The commits whose changes git applies. Not all of them exist.
    std::vector<std::string> changes() const {
        std::vector<std::string> result;
        for (auto const* name :
             {"REBASE_HEAD", "CHERRY_PICK_HEAD", "REVERT_HEAD", "MERGE_AUTOSTASH", "rebase-merge/autostash",
              "rebase-apply/autostash", "rebase-apply/original-commit"}) {
            auto const lines = linesIn(name);
            result.insert(result.end(), lines.begin(), lines.end());
        }
        if (auto const done = linesIn("rebase-merge/done"); !done.empty()) {
            addCommitOf(done.back(), result);
        }
        if (auto const todo = linesIn("sequencer/todo"); !todo.empty()) {
            addCommitOf(todo.front(), result);
        }
        return result;
    }

private:
    std::vector<std::string> linesIn(char const* name) const {
        std::ifstream file(std::filesystem::path(folder_) / name);
        std::ostringstream content;
        content << file.rdbuf();
        return splitLines(content.str());
    }

    /// Of an instruction like "pick 1a2b3c the subject".
    static void addCommitOf(std::string const& instruction, std::vector<std::string>& commits) {
        std::istringstream words(instruction);
        std::string verb;
        std::string commit;
        words >> verb >> commit;
        if (commit.find_first_not_of("0123456789abcdef") == std::string::npos && !commit.empty()) {
            commits.push_back(commit);
        }
    }

    std::string folder_;
};

class StateSearch {
public:
    StateSearch(Path const& folder, std::string const& file, ThreeWay<std::string> const& versions)
        : folder_(folder), file_(file), versions_(versions) {}

    std::optional<MergedStates> run() const {
        auto const ours = findOurs();
        if (!ours) {
            return std::nullopt;
        }
        OperationFiles const files(folder_);
        auto branches = branchesInEnvironment();
        auto const heads = files.mergeHeads();
        branches.insert(branches.end(), heads.begin(), heads.end());
        for (auto const& theirs : branches) {
            if (auto base = baseOf(theirs)) {
                return MergedStates{{*std::move(base), *ours, theirs}, true};
            }
        }
        auto change = findChange(files.changes(), {"--no-walk", "--glob=refs/stas[h]"});
        if (!change) {
            change = findChange({}, {"--all", "--reflog", "HEAD"});
        }
        return change ? std::optional(MergedStates{{change->first, *ours, change->second}, false})
                      : std::nullopt;
    }

private:
    /// The state into which git merges: the current commit, or for a stash the index.
    std::optional<std::string> findOurs() const {
        if (versionIn("HEAD") == versions_.ours) {
            return "HEAD";
        }
        auto const tree = versionIn("") == versions_.ours ? runGit(folder_, {"write-tree"}) : ProcessResult{};
        auto const lines = splitLines(tree.output);
        return tree.exitCode == 0 && !lines.empty() ? std::optional(lines.front()) : std::nullopt;
    }

    std::string versionIn(std::string const& state) const {
        auto const lines =
            splitLines(runGit(folder_, {"rev-parse", "-q", "--verify", state + ':' + file_}).output);
        return lines.empty() ? std::string() : lines.front();
    }

    /// The common version of two branches, if they have the versions of the file. If there are several, git
    /// has merged them, and the file has a version that none of them has.
    std::optional<std::string> baseOf(std::string const& theirs) const {
        if (versionIn(theirs) != versions_.theirs) {
            return std::nullopt;
        }
        auto const bases = splitLines(runGit(folder_, {"merge-base", "--all", "HEAD", theirs}).output);
        bool const isBase = bases.size() > 1 || (bases.size() == 1 && versionIn(bases[0]) == versions_.base);
        return isBase ? std::optional(bases.front()) : std::nullopt;
    }

    /// A commit that changed the file from the common version to theirs, with its parent; or, for a revert,
    /// one that changed it back.
    /// A commit that changed the file from the common version to theirs, with its parent; or, for a revert,
    /// one that changed it back.
    std::optional<std::pair<std::string, std::string>> findChange(std::vector<std::string> const& commits,
                                                                  std::vector<std::string> options) const {
        options.insert(options.end(), {"--ignore-missing", "--no-renames"});
        options.insert(options.end(), commits.begin(), commits.end());
        options.insert(options.end(), {"--", ":(top,literal)" + file_});
        for (auto const& commit : readCommitLog(folder_, options)) {
            for (auto const& change : commit.changes) {
                if (change.before == versions_.base && change.after == versions_.theirs) {
                    return std::pair(commit.parent, commit.id);
                }
                if (change.after == versions_.base && change.before == versions_.theirs) {
                    return std::pair(commit.id, commit.parent);
                }
            }
        }
        return std::nullopt;
    }

    Path const& folder_;
    std::string const& file_;
    ThreeWay<std::string> const& versions_;
};

} // namespace

std::optional<MergedStates> findMergedStates(Path const& folder, std::string const& file,
                                             ThreeWay<std::string> const& versions) {
    return StateSearch(folder, file, versions).run();
}

} // namespace projectctl
