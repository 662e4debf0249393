#include "checks/NameCheck.hpp"

#include "output/NameForms.hpp"

namespace projectctl {

void checkName(std::u16string_view path, ShownPaths& shown, Findings& findings) {
    std::size_t const backslash = path.rfind(u'\\');
    std::size_t const separator = path.rfind(u'/');
    if (backslash != std::u16string_view::npos &&
        (separator == std::u16string_view::npos || separator < backslash)) {
        findings.push_back(Finding::note(inQuotes(shown.of(path)) +
                                         " has a backslash in its name: entry points of it or of files "
                                         "below it, and references to it, cannot be found again"));
    }
}

} // namespace projectctl
