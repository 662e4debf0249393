#include "rules/NamePattern.hpp"

#include <strings.h>

#include "rules/Wildcards.hpp"

namespace project::git {

std::optional<NamePattern> NamePattern::of(std::string_view text) {
    NamePattern result;
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

bool NamePattern::isMatch(std::string_view path, bool isFolder, bool isCaseIgnored) const {
    if (isForFolders_ && !isFolder) {
        return false;
    }
    std::string_view const compared = isPath_ ? path : path.substr(path.rfind('/') + 1);
    if (hasWildcards_) {
        return isWildcardMatch(text_, compared, {isPath_, isCaseIgnored});
    }
    return compared.size() == text_.size() &&
           (isCaseIgnored ? ::strncasecmp(compared.data(), text_.data(), text_.size()) == 0
                          : compared == text_);
}

} // namespace project::git
