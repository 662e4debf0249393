#include "exchange/ImportedItem.hpp"

#include <string_view>

namespace projectctl {

std::optional<Path> pathFromRoot(Path const& root, std::u16string const& text) {
    std::u16string_view rest = text;
    for (bool isLast = false; !isLast;) {
        std::size_t const slash = rest.find(u'/');
        isLast = slash == std::u16string_view::npos;
        std::u16string_view const element = rest.substr(0, slash);
        if (element.empty() || element == u"." || element == u"..") {
            return std::nullopt;
        }
        rest.remove_prefix(isLast ? rest.size() : slash + 1);
    }
    return root / Path(text);
}

} // namespace projectctl
