#pragma once

#include <exception>
#include <string>
#include <string_view>

#include "texts/Message.hpp"

namespace projectctl {

/// Thrown when the reader of the output has closed it, as `head` does. The tool does not report this as an
/// error.
class OutputClosed {};

/// The tool's standard output, buffered.
///
/// The destructor discards the buffer. Callers flush at the end of their work, so that an output that
/// cannot be written is reported.
class Output {
public:
    explicit Output(int descriptor);

    /// True when the output is a terminal.
    bool isTerminal() const noexcept { return isTerminal_; }

    /// The buffer. Append to it, then call flushWhenLarge.
    std::string& text() noexcept { return text_; }

    /// Appends a name or path: as appendQuoted does on a terminal, otherwise its bytes.
    void name(std::u16string_view name);

    /// The same for a path that other data follows on its line: in its colour.
    void pathBesideData(std::u16string_view path);

    /// Writes the buffer when it is large enough to be worth a system call.
    void flushWhenLarge();

    /// Appends a line that confirms a change, on a terminal only. With --json it is kept for confirmation().
    void say(Message const& line);

    /// From now on, say() appends nothing, and no progress is shown.
    void beQuiet() noexcept { isQuiet_ = true; }

    bool isQuiet() const noexcept { return isQuiet_; }

    /// The command writes JSON: nothing else is appended, and messages on standard error are JSON too.
    void beginJson() noexcept { isJson_ = true; }

    bool isJson() const noexcept { return isJson_; }

    /// The most recent line of say() with --json, so that a command that writes nothing else can show it.
    std::string const& confirmation() const noexcept { return confirmation_; }

    /// Whether anything was appended since the start.
    bool hasContent() const noexcept { return hasWritten_ || !text_.empty(); }

    /// As long as it exists, say() appends nothing.
    class Silence {
    public:
        explicit Silence(Output& output) : output_(output) { output_.isSilent_ = true; }

        ~Silence() { output_.isSilent_ = false; }

        Silence(Silence const&) = delete;
        Silence& operator=(Silence const&) = delete;

    private:
        Output& output_;
    };

    /// Writes the buffer.
    /// @throws OutputClosed when the reader has closed it; Failure when it cannot be written, for instance to
    /// a
    ///         full disk.
    void flush();

private:
    int descriptor_;
    bool isTerminal_;
    bool isSilent_ = false;
    bool isQuiet_ = false;
    bool isJson_ = false;
    bool hasWritten_ = false;
    std::string text_;
    std::string confirmation_;
};

/// Standard output.
Output& output();

/// Writes "projectctl: " and the text to standard error, as one line: line feeds are escaped. With --json,
/// writes a JSON document of one line.
void printError(Message const& message) noexcept;

/// The same for the text of an error that does not end the command.
void printError(std::exception const& error) noexcept;

/// The same for the error that ends the command.
/// @param code the word for its exit code.
void printFailure(std::exception const& error, std::string_view code, int exitCode) noexcept;

/// The same with "warning: " in front of the text.
void printWarning(Message const& message) noexcept;

/// The same with "hint: " in front of the text.
void printHint(Message const& message) noexcept;

} // namespace projectctl
