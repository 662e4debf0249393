#include "output/Colors.hpp"

#include <cstdlib>

#include <unistd.h>

namespace projectctl {

namespace {

std::string_view valueOf(char const* variable) {
    auto const* const value = std::getenv(variable);
    return value != nullptr ? value : "";
}

bool isColored(ColorUse use, int descriptor) {
    if (use != ColorUse::Auto) {
        return use == ColorUse::Always;
    }
    if (!valueOf("NO_COLOR").empty()) {
        return false;
    }
    auto const force = valueOf("CLICOLOR_FORCE");
    return (!force.empty() && force != "0") || (isatty(descriptor) == 1 && valueOf("TERM") != "dumb");
}

struct ColoredOutputs {
    explicit ColoredOutputs(ColorUse use)
        : output(isColored(use, STDOUT_FILENO)), errors(isColored(use, STDERR_FILENO)) {}

    bool output;
    bool errors;
};

ColoredOutputs& coloredOutputs() {
    static ColoredOutputs chosen(ColorUse::Auto);
    return chosen;
}

/// The sequence of the colour, which every terminal with colours knows.
std::string_view sequenceOf(Color color) {
    switch (color) {
    case Color::Heading:
        return "\033[1m";
    case Color::Fault:
        return "\033[1;31m";
    case Color::Warning:
        return "\033[33m";
    case Color::Note:
        return "\033[36m";
    case Color::New:
        return "\033[32m";
    case Color::Gone:
        return "\033[31m";
    case Color::FilePath:
        return "\033[35m";
    }
    return {};
}

constexpr std::string_view reset = "\033[m";

std::string withColor(Color color, std::string const& text) {
    return std::string(sequenceOf(color)) + text + std::string(reset);
}

} // namespace

void useColors(ColorUse use) {
    coloredOutputs() = ColoredOutputs(use);
}

std::string colored(Color color, std::string text) {
    return coloredOutputs().output ? withColor(color, text) : text;
}

std::string coloredError(Color color, std::string text) {
    return coloredOutputs().errors ? withColor(color, text) : text;
}

std::string_view beginOf(Color color) {
    return coloredOutputs().output ? sequenceOf(color) : std::string_view();
}

std::string_view endOfColor() {
    return coloredOutputs().output ? reset : std::string_view();
}

} // namespace projectctl
