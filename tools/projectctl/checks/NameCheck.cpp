#include "checks/NameCheck.hpp"

#include "output/NameForms.hpp"

namespace projectctl {

void checkName(CheckedFile const& subject, ShownPaths& shown, Findings& findings) {
    auto const path = subject.path;
    std::size_t const backslash = path.rfind(u'\\');
    std::size_t const separator = path.rfind(u'/');
    if (backslash != std::u16string_view::npos &&
        (separator == std::u16string_view::npos || separator < backslash)) {
        findings.push_back(Finding::note(code::nameBackslash,
                                         inQuotes(shown.of(path)) +
                                             " has a backslash in its name: entry points of it or of files "
                                             "below it, and references to it, cannot be found again")
                               .at(subject.address())
                               .about(path));
    }
}

} // namespace projectctl
