#pragma once

#include <functional>
#include <string>
#include <vector>

#include "git/CommitLog.hpp"
#include "history/GitProject.hpp"

namespace projectctl {

/// Commits that changed a project's text while it had one path in the repository, the youngest first.
struct TextLog {
    std::vector<LoggedCommit> commits;
    std::string text; ///< the path from the top of the repository
};

/// Passes on the commits that changed the text of a project: those in which it has its path, then those
/// before its project was moved in the repository, and so on. Each has all changes of its commit, with
/// renames.
/// @param options further options of `git log`.
/// @param receive returns whether to go on.
void visitTextLog(GitProject const& project, std::vector<std::string> const& options,
                  std::function<bool(TextLog const& part)> const& receive);

/// The change of the text among the changes of a commit; null if there is none.
RawChange const* changeOfText(LoggedCommit const& commit, std::string const& text);

} // namespace projectctl
