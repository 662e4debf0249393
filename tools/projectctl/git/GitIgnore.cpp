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

/// So that a name that begins with a colon is not taken for one of git's patterns.
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
    auto const name = names.substr(0, names.find('\0'));
    names.remove_prefix(name.empty() ? names.size() : name.size() + 1);
    return name;
}

/// @param accepted the highest exit code that is no failure.
std::string askGit(Path const& root, std::vector<std::string> const& arguments, std::string_view input,
                   int accepted) {
    try {
        auto result = runGit(root, arguments, input);
        if (result.exitCode < 0 || result.exitCode > accepted) {
            auto const line = result.errors.substr(0, result.errors.find('\n'));
            throw Failure("git cannot tell what it ignores: " + (line.empty() ? "it failed" : line));
        }
        return std::move(result.output);
    } catch (std::system_error const& error) {
        if (error.code() == std::errc::no_such_file_or_directory) {
            throw Failure("--gitignore asks git, which is not installed");
        }
        throw Failure("git cannot be asked what it ignores: " + std::string(error.what()));
    }
}

/// The files that match a pattern of things to ignore and are tracked all the same.
std::unordered_set<std::string> trackedAllTheSame(Path const& root) {
    auto const output =
        askGit(root, {"ls-files", "-z", "--cached", "--ignored", "--exclude-standard"}, {}, 0);
    std::unordered_set<std::string> result;
    for (std::string_view names = output; !names.empty();) {
        result.emplace(takeName(names));
    }
    return result;
}

} // namespace

std::vector<Path> withoutIgnoredByGit(Path const& root, std::vector<Path> paths) {
    auto const names = namesFor(root, paths);
    // Without the index: with it, git goes through the whole index for each name that it is asked about.
    auto const matching = askGit(root, {"check-ignore", "-z", "--stdin", "--no-index"}, names, 1);
    if (matching.empty()) {
        return paths;
    }
    auto const tracked = trackedAllTheSame(root);
    std::vector<Path> result;
    std::string_view asked = names;
    std::string_view answered = matching; // in the order asked
    for (auto& path : paths) {
        auto const name = takeName(asked);
        auto next = answered;
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
