#include "checks/NameCheck.hpp"

#include "output/NameForms.hpp"

namespace projectctl {

void checkName(CheckedFile const& subject, ShownPaths& shown, Findings& findings) {
    auto const path = subject.path;
    std::size_t const backslash = path.rfind(u'\\');
    std::size_t const separator = path.rfind(u'/');
    if (backslash != std::u16string_view::npos &&
        (separator == std::u16string_view::npos || separator < backslash)) {
        findings.push_back(Finding::note(code::nameBackslash, Message("NameBackslash", shown.of(path)))
                               .at(subject.address())
                               .about(path));
    }
}

} // namespace projectctl
