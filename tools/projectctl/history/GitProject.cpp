#include "history/GitProject.hpp"

#include <fstream>
#include <iterator>
#include <optional>
#include <string_view>
#include <system_error>

#include "cli/WorkingFolder.hpp"
#include "git/GitCommand.hpp"
#include "git/TextInRepository.hpp"
#include "output/Failure.hpp"
#include "output/NameForms.hpp"
#include "project/ProjectFolder.hpp"
#include "project/stores/TextBackend.hpp"

namespace projectctl {

namespace {

std::string firstLineOf(std::string const& text) {
    return text.substr(0, text.find('\n'));
}

} // namespace

GitProject::GitProject(char const* sharedMessage) : root_(findProjectRoot(workingFolder())) {
    if (isShared(root_)) {
        throw Failure(Message(sharedMessage));
    }
    try {
        auto const prefix = runGit(root_, {"rev-parse", "--show-prefix"});
        if (prefix.exitCode != 0) {
            throw Failure(Message("HistoryWithoutGit", root_));
        }
        prefix_ = firstLineOf(prefix.output);
    } catch (std::system_error const&) {
        throw Failure(Message("HistoryWithoutGit", root_));
    }
}

std::string GitProject::textInRepository() const {
    return prefix_ + textBelowRoot;
}

std::map<std::u16string, std::u16string> GitProject::renamesIn(std::vector<RawChange> const& changes) const {
    std::map<std::u16string, std::u16string> result;
    for (auto const& change : changes) {
        bool const isInProject = change.from.starts_with(prefix_) && change.to.starts_with(prefix_);
        if (change.status == 'R' && isInProject) {
            result.emplace(textOf(change.from.substr(prefix_.size())),
                           textOf(change.to.substr(prefix_.size())));
        }
    }
    return result;
}

std::string GitProject::commit(std::string const& revision) const {
    auto const found = runGit(root_, {"rev-parse", "-q", "--verify", revision + "^{commit}"});
    if (found.exitCode != 0 || revision.starts_with('-')) {
        throw Failure(Message("CommitUnknown", revision));
    }
    return firstLineOf(found.output);
}

std::string GitProject::textIn(std::string const& commit) const {
    return runGit(root_, {"cat-file", "blob", commit + ':' + textInRepository()}).output;
}

std::string GitProject::textOnDisk() const {
    std::string name;
    appendBytes(name, project::stores::TextBackend::textPath(root_).native());
    std::ifstream file(name, std::ios::binary);
    std::string content{std::istreambuf_iterator<char>(file), {}};
    if (!file) {
        throw Failure(Message("FileUnreadable", name));
    }
    return content;
}

} // namespace projectctl
