#include "exchange/CodeOwnersPattern.hpp"

#include <algorithm>
#include <cstddef>
#include <string>

#include "output/NameForms.hpp"

namespace projectctl {

namespace {

/// The text with a backslash in front of each bracket, which is special in a Glob.
std::string withoutRanges(std::string_view text) {
    std::string result;
    for (std::size_t at = 0; at < text.size(); ++at) {
        if (text[at] == '\\' && at + 1 < text.size()) {
            result += text[at++];
        } else if (text[at] == '[') {
            result += '\\';
        }
        result += text[at];
    }
    return result;
}

} // namespace

CodeOwnersPattern::CodeOwnersPattern(std::string_view text) {
    bool const isFromRoot = text.starts_with('/');
    text.remove_prefix(isFromRoot ? 1 : 0);
    bool const isOfFolders = text.ends_with('/');
    text.remove_suffix(isOfFolders ? 1 : 0);
    bool const isName = !isFromRoot && text.find('/') == std::string_view::npos;
    auto const pattern = textOf((isName ? "**/" : "") + withoutRanges(text));
    if (!isOfFolders) {
        globs_.emplace_back(pattern);
    }
    if (isName || isOfFolders || text.substr(text.rfind('/') + 1) != "*") {
        globs_.emplace_back(pattern + u"/**");
    }
}

bool CodeOwnersPattern::matches(std::u16string_view path) const {
    return std::ranges::any_of(globs_, [path](auto const& glob) { return glob.isMatch(path); });
}

} // namespace projectctl
