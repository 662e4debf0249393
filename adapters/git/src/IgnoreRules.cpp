#include "IgnoreRules.hpp"

#include <strings.h>

#include "FileContent.hpp"
#include "Wildcards.hpp"

namespace project::git {

namespace {

/// Spaces at the end don't count, but for one behind a backslash.
std::string_view withoutEnd(std::string_view line) {
    if (line.ends_with('\r')) {
        line.remove_suffix(1);
    }
    auto end = line.size();
    while (end > 0 && line[end - 1] == ' ') {
        --end;
    }
    std::size_t backslashes = 0;
    while (backslashes < end && line[end - 1 - backslashes] == '\\') {
        ++backslashes;
    }
    return line.substr(0, end < line.size() && backslashes % 2 == 1 ? end + 1 : end);
}

/// The file that git reads when none is configured: "ignore" beside the user's configuration.
std::string usualExcludesFile() {
    git_buf folder = GIT_BUF_INIT;
    std::string result;
    if (git_libgit2_opts(GIT_OPT_GET_SEARCH_PATH, GIT_CONFIG_LEVEL_XDG, &folder) == 0 && folder.size > 0) {
        result = std::string(folder.ptr, folder.size) + "/ignore";
    }
    git_buf_dispose(&folder);
    return result;
}

std::vector<IgnorePattern> readPatterns(std::string const& file) {
    auto const content = readFile(file);
    std::string_view text = content ? std::string_view(*content) : std::string_view();
    if (text.starts_with("\xEF\xBB\xBF")) {
        text.remove_prefix(3);
    }
    std::vector<IgnorePattern> result;
    while (!text.empty()) {
        auto const end = std::min(text.find('\n'), text.size());
        if (auto pattern = IgnorePattern::read(text.substr(0, end))) {
            result.push_back(*std::move(pattern)); // NOLINT: their number shows only now
        }
        text.remove_prefix(std::min(end + 1, text.size()));
    }
    return result;
}

} // namespace

std::optional<IgnorePattern> IgnorePattern::read(std::string_view line) {
    IgnorePattern result;
    auto text = line.starts_with('#') ? std::string_view() : withoutEnd(line);
    if (text.starts_with('!')) {
        result.isNegative_ = true;
        text.remove_prefix(1);
    }
    if (text.ends_with('/')) {
        result.isForFolders_ = true;
        text.remove_suffix(1);
    }
    result.isPath_ = text.find('/') != std::string_view::npos;
    if (text.starts_with('/')) {
        text.remove_prefix(1);
    }
    if (text.empty()) {
        return std::nullopt;
    }
    result.hasWildcards_ = text.find_first_of("*?[\\") != std::string_view::npos;
    result.text_ = text;
    return result;
}

bool IgnorePattern::matches(std::string_view path, bool isFolder, bool ignoresCase) const {
    if (isForFolders_ && !isFolder) {
        return false;
    }
    auto const compared = isPath_ ? path : path.substr(path.rfind('/') + 1);
    if (hasWildcards_) {
        return matchesWildcards(text_, compared, {isPath_, ignoresCase});
    }
    return compared.size() == text_.size() &&
           (ignoresCase ? ::strncasecmp(compared.data(), text_.data(), text_.size()) == 0
                        : compared == text_);
}

IgnoreRules::IgnoreRules(Repository const& repository)
    : repository_(repository), ignoresCase_(repository.isSet("core.ignoreCase", false)) {
    auto const configured = repository.configuredPath("core.excludesFile");
    general_.push_back(
        readPatterns(git_repository_commondir(repository.get()) + std::string("info/exclude")));
    general_.push_back(readPatterns(configured.empty() ? usualExcludesFile() : configured));
}

bool IgnoreRules::ignore(TreePath const& path, bool isFolder) {
    std::string_view const whole = path;
    for (auto folder = path; !folder.empty();) {
        folder = parentOf(folder);
        auto const seen = folder.empty() ? whole : whole.substr(folder.size() + 1);
        if (auto const decision = decide(ofFolder(folder), seen, isFolder)) {
            return *decision;
        }
    }
    for (auto const& patterns : general_) {
        if (auto const decision = decide(patterns, whole, isFolder)) {
            return *decision;
        }
    }
    return false;
}

IgnoreRules::Patterns const& IgnoreRules::ofFolder(TreePath const& folder) {
    auto const known = folders_.find(folder);
    if (known != folders_.end()) {
        return known->second;
    }
    auto const file = folder.empty() ? ".gitignore" : folder + "/.gitignore";
    return folders_.try_emplace(folder, readPatterns(repository_.workTree().onDisk(file))).first->second;
}

/// The last line that matches counts.
std::optional<bool> IgnoreRules::decide(Patterns const& patterns, std::string_view path,
                                        bool isFolder) const {
    for (auto pattern = patterns.rbegin(); pattern != patterns.rend(); ++pattern) {
        if (pattern->matches(path, isFolder, ignoresCase_)) {
            return !pattern->isNegative();
        }
    }
    return std::nullopt;
}

} // namespace project::git
