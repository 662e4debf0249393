#include "Target.hpp"
#include "TextContents.hpp"
#include "TextInput.hpp"

namespace {

using namespace project::fuzz;
using project::stores::ProjectText;

/// Any text: after a rewrite, the text in memory is the same as the one that a reader gets.
void run(std::string_view input) {
    auto const text = readText(textOf(input));
    if (!text) {
        return;
    }
    ProjectText const rewritten = text->rewrittenWith({});
    requireTidy(rewritten);
    require(canonicalOf(rewritten) == rewritten.body(), "a rewritten text has the content of its bytes");
    require(rewritten.rewrittenWith({}).body() == rewritten.body(), "the same content gives the same bytes");
    require(rewritten.differencesTo(*text).empty() && text->differencesTo(rewritten).empty(),
            "a rewrite changes no content");
}

Registration const registration("rewrite", run);

} // namespace
