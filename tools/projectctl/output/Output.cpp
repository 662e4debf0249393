#include "output/Output.hpp"

#include <cerrno>
#include <cstddef>
#include <system_error>

#include <unistd.h>

#include "output/Colors.hpp"
#include "output/Failure.hpp"
#include "output/JsonFormat.hpp"
#include "output/NameForms.hpp"
#include "output/Progress.hpp"

namespace projectctl {

namespace {

constexpr std::size_t bufferSize = std::size_t(64) * 1024;

/// A message on standard error.
struct Notice {
    std::string_view severity; ///< "error", "warning" or "hint"
    std::string_view text;
    std::string_view code = {}; ///< empty unless the message ends the command
    int exitCode = 0;
};

std::string jsonOf(Notice const& message) {
    std::string result = "{\"format\": \"" + std::string(json::message.name) +
                         "\", \"version\": " + std::to_string(json::message.version) + ", \"severity\": \"" +
                         std::string(message.severity) + '"';
    if (!message.code.empty()) {
        result += ", \"code\": \"" + std::string(message.code) +
                  "\", \"exitCode\": " + std::to_string(message.exitCode);
    }
    result += ", \"text\": ";
    appendJsonString(result, textOf(std::string(message.text)));
    return result + "}\n";
}

std::string lineOf(Notice const& message) {
    auto const mark = message.severity == "error" ? std::string() : std::string(message.severity) + ": ";
    return "projectctl: " + withoutControls(mark + std::string(message.text), false) + '\n';
}

void print(Notice const& message) noexcept {
    try {
        std::string const line = output().isJson() ? jsonOf(message) : lineOf(message);
        [[maybe_unused]] auto const written = write(STDERR_FILENO, line.data(), line.size());
    } catch (...) {
        // Without memory for the line, the exit code is the only report.
        return;
    }
}

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
    if (isJson_ && !isSilent_) {
        confirmation_ = line;
    } else if (isTerminal_ && !isSilent_ && !isQuiet_) {
        text_ += withoutControls(line, false) + '\n';
    }
}

void Output::flush() {
    std::string_view rest = text_;
    if (isTerminal_ && !rest.empty()) {
        Progress::endShown();
    }
    hasWritten_ = hasWritten_ || !rest.empty();
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

void printError(std::string_view text) noexcept {
    print({"error", text});
}

void printWarning(std::string_view text) noexcept {
    print({"warning", text});
}

void printHint(std::string_view text) noexcept {
    print({"hint", text});
}

void printFailure(std::string_view text, std::string_view code, int exitCode) noexcept {
    print({"error", text, code, exitCode});
}

} // namespace projectctl
