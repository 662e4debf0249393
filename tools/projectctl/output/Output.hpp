#pragma once

#include <string>
#include <string_view>

namespace projectctl {

/// The reader of the output has gone, as `head` does when it has seen enough. No error to anybody.
class OutputClosed {};

/// The tool's standard output, written in large pieces.
///
/// What is still held when the object goes is lost: whoever finishes a piece of work calls flush, so that an
/// output that cannot be written is an error and not a silence.
class Output {
public:
    explicit Output(int descriptor);

    /// True when a person is looking at it.
    bool isTerminal() const noexcept { return isTerminal_; }

    /// What is still held; append to it, then call settle.
    std::string& text() noexcept { return text_; }

    /// Appends a name or path: its bytes in a pipe, and on a terminal with what could be taken for another
    /// name quoted.
    void name(std::u16string_view name);

    /// Writes when enough has come together to be worth a system call.
    void settle();

    /// Appends a line that tells a person what was done; nothing in a pipe, where nobody asks.
    void say(std::string_view line);

    /// Writes all that is held.
    /// @throws OutputClosed when nobody reads it any more; Failure when it cannot be written, for instance
    ///         to a full disk.
    void flush();

private:
    int descriptor_;
    bool isTerminal_;
    std::string text_;
};

/// Standard output.
Output& output();

/// Writes "projectctl: " and the text to standard error, as one line whatever the text holds.
void printError(std::string_view text) noexcept;

} // namespace projectctl
