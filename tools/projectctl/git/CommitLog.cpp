#include "git/CommitLog.hpp"

#include <algorithm>
#include <cstddef>
#include <utility>

#include "git/GitCommand.hpp"
#include "output/Failure.hpp"

namespace projectctl {

namespace {

constexpr char firstByte = '\1'; // before each commit; a change begins with a colon

std::string takeField(std::string_view& log) {
    auto const end = std::min(log.find('\0'), log.size());
    std::string result(log.substr(0, end));
    log.remove_prefix(std::min(end + 1, log.size()));
    return result;
}

std::vector<std::string> wordsOf(std::string const& text) {
    std::vector<std::string> result;
    for (std::size_t from = 0; from < text.size();) {
        auto const end = std::min(text.find(' ', from), text.size());
        result.push_back(text.substr(from, end - from));
        from = end + 1;
    }
    return result;
}

LoggedCommit takeCommit(std::string_view& log) {
    LoggedCommit commit;
    commit.id = takeField(log);
    commit.parents = wordsOf(takeField(log));
    commit.author = takeField(log);
    commit.time = takeField(log);
    commit.subject = takeField(log);
    log.remove_prefix(log.starts_with('\n') ? 1 : 0);
    commit.changes = takeRawChanges(log);
    return commit;
}

} // namespace

std::vector<LoggedCommit> commitsIn(std::string_view log) {
    std::vector<LoggedCommit> result;
    std::size_t sameCommit = 0; // the number of entries of this commit so far
    while (log.starts_with(firstByte)) {
        log.remove_prefix(1);
        auto commit = takeCommit(log);
        sameCommit = !result.empty() && result.back().id == commit.id ? sameCommit + 1 : 0;
        if (sameCommit < commit.parents.size()) {
            commit.parent = commit.parents[sameCommit];
        }
        result.push_back(std::move(commit));
    }
    return result;
}

std::vector<LoggedCommit> readCommitLog(fl::filesystem::Path const& folder,
                                        std::vector<std::string> const& options) {
    std::vector<std::string> command{"log",
                                     "-m",
                                     "--raw",
                                     "-z",
                                     "--no-abbrev",
                                     "--no-color",
                                     "--root",
                                     "--no-show-signature",
                                     "--encoding=UTF-8",
                                     "--format=%x01%H%x00%P%x00%an%x00%aI%x00%s"};
    command.insert(command.end(), options.begin(), options.end());
    auto const log = runGit(folder, command);
    if (log.exitCode != 0) {
        throw Failure(Message("GitFailed", log.errors.substr(0, log.errors.find('\n'))));
    }
    return commitsIn(log.output);
}

} // namespace projectctl
