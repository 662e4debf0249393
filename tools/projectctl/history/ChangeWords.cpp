#include "history/ChangeWords.hpp"

#include <array>
#include <cstddef>

namespace projectctl {

using project::stores::DefinitionChange;

std::u16string_view wordFor(DefinitionChange::Subject subject) {
    constexpr std::array<std::u16string_view, 12> words{
        u"name",  u"description", u"file",  u"fileLabel",   u"fileData",  u"category",
        u"label", u"entryPoint",  u"group", u"projectPath", u"reference", u"other"};
    return words.at(static_cast<std::size_t>(subject));
}

std::u16string_view wordFor(DefinitionChange::Kind kind) {
    constexpr std::array<std::u16string_view, 4> words{u"added", u"removed", u"renamed", u"changed"};
    return words.at(static_cast<std::size_t>(kind));
}

} // namespace projectctl
