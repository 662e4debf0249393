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
    std::string text;
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
    appendJsonString(result, textOf(message.text));
    return result + "}\n";
}

std::string beginOf(Notice const& message) {
    if (message.severity == "error") {
        return coloredError(Color::Fault, "projectctl:");
    }
    auto const* const mark = message.severity == "warning" ? "WarningMark" : "HintMark";
    return coloredError(Color::Warning, "projectctl: " + Message(mark).text() + ':');
}

std::string lineOf(Notice const& message) {
    return beginOf(message) + ' ' + withoutControls(message.text, false) + '\n';
}

void print(Notice const& message) {
    std::string const line = output().isJson() ? jsonOf(message) : lineOf(message);
    [[maybe_unused]] auto const written = write(STDERR_FILENO, line.data(), line.size());
}

/// @param makeNotice creates the message. Without memory for it, the exit code is the only report.
template <typename MakeNotice>
void printUnlessMemoryIsMissing(MakeNotice makeNotice) noexcept {
    try {
        print(makeNotice());
    } catch (...) {
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

void Output::say(Message const& line) {
    if (isJson_ && !isSilent_) {
        confirmation_ = line.text();
    } else if (isTerminal_ && !isSilent_ && !isQuiet_) {
        text_ += withoutControls(line.text(), false) + '\n';
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
            throw Failure(Message("OutputUnwritable", std::generic_category().message(errno)));
        }
    }
    text_.clear();
}

Output& output() {
    static Output standardOutput(STDOUT_FILENO);
    return standardOutput;
}

void printError(Message const& message) noexcept {
    printUnlessMemoryIsMissing([&message] { return Notice{"error", message.text()}; });
}

void printError(std::exception const& error) noexcept {
    printUnlessMemoryIsMissing([&error] { return Notice{"error", error.what()}; });
}

void printFailure(std::exception const& error, std::string_view code, int exitCode) noexcept {
    printUnlessMemoryIsMissing([&] { return Notice{"error", error.what(), code, exitCode}; });
}

void printWarning(Message const& message) noexcept {
    printUnlessMemoryIsMissing([&message] { return Notice{"warning", message.text()}; });
}

void printHint(Message const& message) noexcept {
    printUnlessMemoryIsMissing([&message] { return Notice{"hint", message.text()}; });
}

} // namespace projectctl
