#include "output/Output.hpp"

#include <cerrno>
#include <cstddef>
#include <system_error>

#include <unistd.h>

#include "output/Colors.hpp"
#include "output/Failure.hpp"
#include "output/NameForms.hpp"
#include "output/Progress.hpp"

namespace projectctl {

namespace {

constexpr std::size_t bufferSize = std::size_t(64) * 1024;

} // namespace

Output::Output(int descriptor) : descriptor_(descriptor), isTerminal_(isatty(descriptor) == 1) {
}

void Output::name(std::u16string_view name) {
    if (isTerminal_) {
        std::string bytes;
        appendBytes(bytes, name);
        appendQuoted(text_, bytes);
    } else {
        appendBytes(text_, name);
    }
}

void Output::pathBesideData(std::u16string_view path) {
    text_ += beginOf(Color::FilePath);
    name(path);
    text_ += endOfColor();
}

void Output::flushWhenLarge() {
    if (text_.size() >= bufferSize) {
        flush();
    }
}

void Output::say(std::string_view line) {
    if (isTerminal_ && !isSilent_ && !isQuiet_) {
        text_ += withoutControls(line, false) + '\n';
    }
}

void Output::flush() {
    std::string_view rest = text_;
    if (isTerminal_ && !rest.empty()) {
        Progress::endShown();
    }
    while (!rest.empty()) {
        auto const written = write(descriptor_, rest.data(), rest.size());
        if (written >= 0) {
            rest.remove_prefix(static_cast<std::size_t>(written));
        } else if (errno == EPIPE) {
            throw OutputClosed();
        } else if (errno != EINTR) {
            throw Failure("the output cannot be written: " + std::generic_category().message(errno));
        }
    }
    text_.clear();
}

Output& output() {
    static Output standardOutput(STDOUT_FILENO);
    return standardOutput;
}

void printHint(std::string const& text) noexcept {
    printError("hint: " + text);
}

void printError(std::string_view text) noexcept {
    try {
        std::string const line = "projectctl: " + withoutControls(text, false) + '\n';
        [[maybe_unused]] auto const written = write(STDERR_FILENO, line.data(), line.size());
    } catch (...) {
        // Without memory for the line, the exit code is the only report.
        return;
    }
}

} // namespace projectctl
