#include <algorithm>

#include "Target.hpp"
#include "TextContents.hpp"
#include "TextInput.hpp"

namespace {

using namespace project::fuzz;
using project::stores::Fault;

/// Any text: its content is written in one form, and reading that form gives the same content.
void run(std::string_view input) {
    std::string const bytes = textOf(input);
    auto const text = readText(bytes);
    if (!text) {
        return;
    }
    require(text->hasSameBytes(bytes), "a text keeps the bytes that were read");
    bool const isDamaged = std::ranges::any_of(
        text->faults(), [](Fault const& fault) { return fault.kind == Fault::Kind::Damage; });
    require(text->damagedLines().empty() != isDamaged, "damaged lines are kept");

    std::string const canonical = canonicalOf(*text);
    require(text->isTidy() == (canonical == bytes), "a text is tidy if it is canonical");
    require(text->rewrittenWith({}).body() == canonical, "a text is written in its canonical form");
    if (!text->isTidy()) { // else the same bytes would be read again
        auto const again = readText(canonical);
        require(again.has_value(), "a written text can be read");
        requireTidy(*again);
        require(canonicalOf(*again) == canonical, "a written text has the content that was read");
    }
}

Registration const registration("text", run);

} // namespace
