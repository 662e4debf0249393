#include "rules/IgnoreRules.hpp"

#include "repository/FileContent.hpp"

namespace project::git {

namespace {

/// Trailing spaces do not belong to a line, except for one after a backslash.
std::string_view withoutEnd(std::string_view line) {
    if (line.ends_with('\r')) {
        line.remove_suffix(1);
    }
    std::size_t end = line.size();
    while (end > 0 && line[end - 1] == ' ') {
        --end;
    }
    std::size_t backslashes = 0;
    while (backslashes < end && line[end - 1 - backslashes] == '\\') {
        ++backslashes;
    }
    return line.substr(0, end < line.size() && backslashes % 2 == 1 ? end + 1 : end);
}

std::vector<IgnoreLine> readLines(std::string const& file, Links links) {
    auto const content = readFile(file, links);
    std::string_view text = content ? std::string_view(*content) : std::string_view();
    if (text.starts_with("\xEF\xBB\xBF")) {
        text.remove_prefix(3);
    }
    std::vector<IgnoreLine> result;
    while (!text.empty()) {
        std::size_t const end = std::min(text.find('\n'), text.size());
        if (auto read = IgnoreLine::read(text.substr(0, end))) {
            result.push_back(*std::move(read)); // NOLINT: their number is not known before
        }
        text.remove_prefix(std::min(end + 1, text.size()));
    }
    return result;
}

} // namespace

std::optional<IgnoreLine> IgnoreLine::read(std::string_view line) {
    std::string_view text = line.starts_with('#') ? std::string_view() : withoutEnd(line);
    bool const isNegative = text.starts_with('!');
    text.remove_prefix(isNegative ? 1 : 0);
    auto pattern = NamePattern::of(text);
    return pattern ? std::optional(IgnoreLine{*std::move(pattern), isNegative}) : std::nullopt;
}

IgnoreRules::IgnoreRules(Repository const& repository)
    : repository_(repository), isCaseIgnored_(repository.isSet("core.ignoreCase", false)) {
    std::string const configured = repository.configuredPath("core.excludesFile");
    general_.push_back(readLines(
        libgit().git_repository_commondir(repository.get()) + std::string("info/exclude"), Links::Followed));
    general_.push_back(
        readLines(configured.empty() ? repository.usersFile("ignore") : configured, Links::Followed));
}

bool IgnoreRules::isIgnored(TreePath const& path, bool isFolder) {
    std::string_view const whole = path;
    for (std::string folder = path; !folder.empty();) {
        folder = parentOf(folder);
        std::string_view const seen = folder.empty() ? whole : whole.substr(folder.size() + 1);
        if (auto const decision = decide(ofFolder(folder), seen, isFolder)) {
            return *decision;
        }
    }
    for (auto const& lines : general_) {
        if (auto const decision = decide(lines, whole, isFolder)) {
            return *decision;
        }
    }
    return false;
}

IgnoreRules::Lines const& IgnoreRules::ofFolder(TreePath const& folder) {
    auto const known = folders_.find(folder);
    if (known != folders_.end()) {
        return known->second;
    }
    std::string const file = folder.empty() ? ".gitignore" : folder + "/.gitignore";
    return folders_.try_emplace(folder, readLines(repository_.workTree().onDisk(file), Links::NotFollowed))
        .first->second;
}

/// The last line that matches decides.
std::optional<bool> IgnoreRules::decide(Lines const& lines, std::string_view path, bool isFolder) const {
    for (auto line = lines.rbegin(); line != lines.rend(); ++line) {
        if (line->pattern.isMatch(path, isFolder, isCaseIgnored_)) {
            return !line->isNegative;
        }
    }
    return std::nullopt;
}

} // namespace project::git
