#include "changes/UndoHint.hpp"

#include <optional>
#include <string>
#include <system_error>
#include <vector>

#include <unistd.h>

#include "cli/Settings.hpp"
#include "git/GitCommand.hpp"
#include "output/NameForms.hpp"
#include "output/Output.hpp"

namespace projectctl {

namespace {

/// With fewer changed files, the opposite command is easily typed.
constexpr std::size_t manyFiles = 10;

constexpr char const* textInProject = ".projectdata/project.jsonl";

bool succeeds(Path const& root, std::vector<std::string> const& arguments) {
    auto command = arguments;
    command.insert(command.begin(), "--no-optional-locks"); // this process may hold the lock of git's index
    return runGit(root, command).exitCode == 0;
}

bool isTextAsInLastCommit(Path const& root) {
    return succeeds(root, {"ls-files", "--error-unmatch", "--", textInProject}) &&
           succeeds(root, {"diff", "--quiet", "HEAD", "--", textInProject});
}

bool isIndexAsInLastCommit(Path const& root) {
    return succeeds(root, {"diff", "--quiet", "--cached"});
}

/// A call of git in the root, which works in every folder; empty if the root's name cannot be typed.
std::optional<std::string> gitIn(Path const& root) {
    std::string name;
    appendBytes(name, root.native());
    auto const quoted = quotedForShell(name);
    return withoutControls(quoted, false) == quoted ? std::optional("git -C " + quoted) : std::nullopt;
}

std::optional<std::string> undoCommand(Path const& root, bool isFileListChanged) {
    auto const git = gitIn(root);
    if (!git || !isTextAsInLastCommit(root)) {
        return std::nullopt;
    }
    if (!isFileListChanged) {
        return *git + " restore --staged --worktree " + textInProject;
    }
    return isIndexAsInLastCommit(root)
               ? std::optional(*git + " restore --staged :/ && " + *git + " restore " + textInProject)
               : std::nullopt;
}

} // namespace

bool wantsUndoHint(OpenProject& project) {
    return isatty(STDERR_FILENO) == 1 && !output().isQuiet() && settings().sourceControl &&
           project.log() == nullptr;
}

void noteUndoHint(OpenProject& project) {
    auto const& changed = project.changedFiles();
    if (changed.total() < manyFiles || project.isInNestedTransaction() || !wantsUndoHint(project)) {
        return;
    }
    try {
        if (auto const command = undoCommand(project.root(), changed.listed > 0)) {
            project.setHint(Message("UndoHint", changed.total(), *command));
        }
    } catch (std::system_error const&) {
        return; // without git
    }
}

} // namespace projectctl
