#pragma once

#include <chrono>
#include <string>
#include <string_view>

#include <termios.h>

namespace project_panel {

enum class Key { None, Up, Down, Left, Right, Enter, Quit };

struct Size {
    int rows;
    int columns;
};

/// The terminal of this process while a panel is shown on it: keys arrive one by one, and the earlier content
/// of the screen returns at the end. There is one at a time.
class Terminal {
public:
    /// @throws std::system_error if the standard input or output is not a terminal.
    Terminal();
    ~Terminal();
    Terminal(Terminal const&) = delete;
    Terminal& operator=(Terminal const&) = delete;

    Size size() const noexcept;

    /// Waits for a key.
    /// @return Key::None if none was pressed in time, or the size of the terminal has changed; Key::Quit also
    ///         if the terminal was closed, or the process was asked to end.
    Key awaitKey(std::chrono::milliseconds time);

    /// Writes a text, with its escape sequences.
    void write(std::string_view text);

private:
    Key takeKey();

    termios before_{};
    std::string pressed_; ///< bytes that are not taken yet
};

/// Returns a text in at most so many columns: the rest is left out, and characters that would move the cursor
/// or change the terminal become question marks. Names of files may contain any of these.
std::string printable(std::u16string_view text, int columns);

} // namespace project_panel
