#include "history/TextLog.hpp"

#include <algorithm>

namespace projectctl {

void visitTextLog(GitProject const& project, std::vector<std::string> const& options,
                  std::function<bool(TextLog const& part)> const& receive) {
    TextLog part{{}, project.textInRepository()};
    for (std::string from = "HEAD"; !from.empty();) {
        std::vector<std::string> command{"-M", "--full-diff"};
        command.insert(command.end(), options.begin(), options.end());
        command.insert(command.end(), {from, "--", ":(top,literal)" + part.text});
        part.commits = readCommitLog(project.root(), command);
        if (!receive(part)) {
            return;
        }
        auto const* const first =
            part.commits.empty() ? nullptr : changeOfText(part.commits.back(), part.text);
        bool const isMoved = first != nullptr && first->status == 'R';
        from = isMoved ? part.commits.back().parent : "";
        part.text = isMoved ? first->from : "";
    }
}

RawChange const* changeOfText(LoggedCommit const& commit, std::string const& text) {
    auto const found = std::ranges::find(commit.changes, text, &RawChange::to);
    return found == commit.changes.end() ? nullptr : &*found;
}

} // namespace projectctl
