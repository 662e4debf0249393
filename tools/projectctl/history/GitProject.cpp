#include "history/GitProject.hpp"

#include <algorithm>
#include <charconv>
#include <cstddef>
#include <fstream>
#include <iterator>
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
    auto found = at(root_);
    if (!found) {
        throw Failure(Message("HistoryWithoutGit", root_));
    }
    prefix_ = std::move(found->prefix_);
}

std::optional<GitProject> GitProject::at(Path const& root) {
    try {
        auto const prefix = runGit(root, {"rev-parse", "--show-prefix"});
        return prefix.exitCode == 0 ? std::optional(GitProject(root, firstLineOf(prefix.output)))
                                    : std::nullopt;
    } catch (std::system_error const&) { // git is not installed
        return std::nullopt;
    }
}

std::string GitProject::textInRepository() const {
    return prefix_ + textBelowRoot;
}

std::map<std::u16string, std::u16string> GitProject::renamesIn(std::vector<RawChange> const& changes) const {
    std::map<std::u16string, std::u16string> result;
    for (auto const& change : changes) {
        auto const from = pathFromRoot(change.from);
        auto const to = pathFromRoot(change.to);
        if (change.status == 'R' && from && to) {
            result.emplace(*from, *to);
        }
    }
    return result;
}

std::optional<std::u16string> GitProject::pathFromRoot(std::string_view path) const {
    return path.starts_with(prefix_) ? std::optional(textOf(std::string(path.substr(prefix_.size()))))
                                     : std::nullopt;
}

std::string GitProject::commit(std::string const& revision) const {
    auto found = findCommit(revision);
    if (!found) {
        throw Failure(Message("CommitUnknown", revision));
    }
    return *std::move(found);
}

std::optional<std::string> GitProject::findCommit(std::string const& revision) const {
    auto const found = runGit(root_, {"rev-parse", "-q", "--verify", revision + "^{commit}"});
    bool const isFound = found.exitCode == 0 && !revision.starts_with('-');
    return isFound ? std::optional(firstLineOf(found.output)) : std::nullopt;
}

/// `git diff` and not `git diff-index`, which regards files as changed that were only touched.
std::vector<RawChange> GitProject::changedFiles(std::string const& earlier,
                                                std::optional<std::string> const& later) const {
    std::vector<std::string> command{"diff",
                                     "-z",
                                     "--raw",
                                     "--no-abbrev",
                                     "--no-ext-diff",
                                     "--no-color",
                                     "--no-relative",
                                     "--ignore-submodules",
                                     "-M",
                                     "-l7000",
                                     earlier};
    if (later) {
        command.push_back(*later);
    }
    command.emplace_back("--");
    return readRawChanges(runGit(root_, command).output);
}

std::map<std::u16string, std::uint64_t> GitProject::fileSizes(std::string const& commit) const {
    std::map<std::u16string, std::uint64_t> result;
    auto const files = runGit(root_, {"ls-tree", "-r", "-l", "-z", commit, "--", "."}).output;
    for (std::size_t begin = 0; begin < files.size();) { // "<mode> <type> <id> <size>\t<path>"
        auto const end = std::min(files.find('\0', begin), files.size());
        auto const tab = std::min(files.find('\t', begin), end);
        auto const space = files.rfind(' ', tab);
        std::uint64_t size = 0; // "-" for a submodule
        std::from_chars(files.data() + space + 1, files.data() + tab, size);
        result.emplace(textOf(files.substr(tab + 1, end - tab - 1)), size);
        begin = end + 1;
    }
    return result;
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
