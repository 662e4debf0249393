#include "git/GitIgnore.hpp"

#include <cstddef>
#include <string>
#include <string_view>
#include <system_error>
#include <unordered_set>
#include <utility>

#include "git/GitCommand.hpp"
#include "output/Failure.hpp"
#include "output/NameForms.hpp"
#include "project/metadata/MetadataFunctions.hpp"

namespace projectctl {

namespace {

/// Prevents git from reading a name that begins with a colon as a pattern.
constexpr std::string_view here = "./";

std::string namesFor(Path const& root, std::vector<Path> const& paths) {
    std::string names;
    for (auto const& path : paths) {
        names += here;
        appendBytes(names, project::metadata::getRelativePath(root, path));
        names += '\0';
    }
    return names;
}

std::string_view takeName(std::string_view& names) {
    std::string_view const name = names.substr(0, names.find('\0'));
    names.remove_prefix(name.empty() ? names.size() : name.size() + 1);
    return name;
}

/// @param accepted the highest exit code that is not a failure.
std::string askGit(Path const& root, std::vector<std::string> const& arguments, std::string_view input,
                   int accepted) {
    try {
        auto result = runGit(root, arguments, input);
        if (result.exitCode < 0 || result.exitCode > accepted) {
            std::string const line = result.errors.substr(0, result.errors.find('\n'));
            throw Failure(Message("GitIgnoredFails", line.empty() ? Message("UnknownError").text() : line));
        }
        return std::move(result.output);
    } catch (std::system_error const& error) {
        if (error.code() == std::errc::no_such_file_or_directory) {
            throw Failure(Message("GitMissing"));
        }
        throw Failure(Message("GitIgnoredFails", error.what()));
    }
}

/// The tracked files that match an ignore pattern.
std::unordered_set<std::string> trackedDespitePattern(Path const& root) {
    std::string const output =
        askGit(root, {"ls-files", "-z", "--cached", "--ignored", "--exclude-standard"}, {}, 0);
    std::unordered_set<std::string> result;
    for (std::string_view names = output; !names.empty();) {
        result.emplace(takeName(names));
    }
    return result;
}

} // namespace

bool isInGitRepository(Path const& folder) {
    try {
        return runGit(folder, {"rev-parse", "--is-inside-work-tree"}).output == "true\n";
    } catch (std::system_error const&) {
        return false;
    }
}

std::vector<Path> withoutIgnoredByGit(Path const& root, std::vector<Path> paths) {
    std::string const names = namesFor(root, paths);
    // --no-index, because git would otherwise search the whole index for each name.
    std::string const matching = askGit(root, {"check-ignore", "-z", "--stdin", "--no-index"}, names, 1);
    if (matching.empty()) {
        return paths;
    }
    auto const tracked = trackedDespitePattern(root);
    std::vector<Path> result;
    std::string_view asked = names;
    std::string_view answered = matching; // in the order asked
    for (auto& path : paths) {
        std::string_view const name = takeName(asked);
        std::string_view next = answered;
        bool const matches = !answered.empty() && takeName(next) == name;
        if (matches) {
            answered = next;
        }
        if (!matches || tracked.contains(std::string(name.substr(here.size())))) {
            result.push_back(std::move(path));
        }
    }
    return result;
}

} // namespace projectctl
