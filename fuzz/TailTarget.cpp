#include "SampleBody.hpp"
#include "Target.hpp"
#include "TextContents.hpp"

namespace {

using namespace project::fuzz;

/// The canonical form of a text without faults. Most inputs are refused at once and leave the sample as it
/// is.
std::string canonicalAfter(std::string const& text) {
    static std::string const ofSample = canonicalOf(*readText(sampleBody()));
    if (text == sampleBody()) {
        return ofSample;
    }
    auto const read = readText(text);
    require(read && read->faults().empty(), "a tail without faults is accepted");
    return canonicalOf(*read);
}

/// Any tail after a sound body: extending the text with one piece after the other gives the same content as
/// reading the whole. A piece is refused exactly if reading finds a fault in it, and then it changes nothing.
void run(std::string_view input) {
    std::string taken = sampleBody();
    std::string refused;
    auto extended = readText(taken);
    for (std::string const& piece : tailOf(input, taken)) {
        if (!extended->extend(piece)) {
            refused = piece;
            break;
        }
        taken += piece;
    }
    require(extended->hasSameBytes(taken), "an extended text has the bytes of the accepted pieces");
    require(canonicalOf(*extended) == canonicalAfter(taken), "extending gives the same content as reading");
    if (!refused.empty()) {
        auto const faulty = readText(taken + refused);
        require(faulty && !faulty->faults().empty(), "only a tail with faults is refused");
    }
}

Registration const registration("tail", run);

} // namespace
