#include "Target.hpp"
#include "TextContents.hpp"
#include "text/TextLines.hpp"

namespace {

using namespace project::fuzz;

/// Any text: what can be read of it says the same once it is written anew, and is then in its one form. An
/// input that has no first line is taken for the lines of a body.
void run(std::string_view input) {
    bool const whole = input.starts_with(R"({"format)");
    std::string const bytes = whole ? std::string(input) : framed(input);
    if (auto const text = readText(bytes)) {
        checkText(*text, bytes);
    }
}

Registration const registration("text", run);

} // namespace
