#include "Terminal.hpp"

#include <array>
#include <cerrno>
#include <csignal>
#include <cwchar>
#include <system_error>
#include <utility>

#include <poll.h>
#include <sys/ioctl.h>
#include <unistd.h>

#include <fl/i18n/CodePoints.hpp>

namespace project_panel {

namespace {

char const* const enterScreen = "\x1b[?1049h\x1b[?25l"; ///< another screen, without a cursor
char const* const leaveScreen = "\x1b[?25h\x1b[?1049l";

constexpr char controlC = 3; // arrives as a key, because the terminal sends no signal for it

volatile std::sig_atomic_t isEndRequested = 0;

extern "C" void requestEnd(int /*signal*/) {
    isEndRequested = 1;
}

extern "C" void noteSize(int /*signal*/) {
    // The signal interrupts the wait for a key. The panel is then drawn in the new size.
}

/// Lets a signal call a function, and interrupt calls that wait.
void handle(int signal, void (*function)(int)) {
    struct sigaction action = {};
    action.sa_handler = function;
    sigaction(signal, &action, nullptr);
}

termios settingsOf(int file) {
    termios settings{};
    if (tcgetattr(file, &settings) != 0) {
        throw std::system_error(errno, std::generic_category(), "the panel needs a terminal");
    }
    return settings;
}

} // namespace

Terminal::Terminal() : before_(settingsOf(STDIN_FILENO)) {
    settingsOf(STDOUT_FILENO);
    handle(SIGWINCH, noteSize);
    handle(SIGTERM, requestEnd);
    handle(SIGHUP, requestEnd);
    termios keyByKey = before_;
    keyByKey.c_lflag &= ~static_cast<tcflag_t>(ICANON | ECHO | ISIG);
    tcsetattr(STDIN_FILENO, TCSANOW, &keyByKey);
    write(enterScreen);
}

Terminal::~Terminal() {
    write(leaveScreen);
    tcsetattr(STDIN_FILENO, TCSANOW, &before_);
}

Size Terminal::size() const noexcept {
    winsize found{};
    if (ioctl(STDOUT_FILENO, TIOCGWINSZ, &found) != 0 || found.ws_row == 0 || found.ws_col == 0) {
        return {24, 80};
    }
    return {found.ws_row, found.ws_col};
}

Key Terminal::awaitKey(std::chrono::milliseconds time) {
    if (auto const key = takeKey(); key != Key::None) {
        return key;
    }
    pollfd input{STDIN_FILENO, POLLIN, 0};
    int const ready = poll(&input, 1, static_cast<int>(time.count()));
    if (isEndRequested != 0) {
        return Key::Quit;
    }
    if (ready <= 0) { // no key in time, or a signal
        return Key::None;
    }
    std::array<char, 64> bytes{};
    auto const count = read(STDIN_FILENO, bytes.data(), bytes.size());
    if (count <= 0) {
        return Key::Quit;
    }
    pressed_.append(bytes.data(), static_cast<std::size_t>(count));
    return takeKey();
}

/// Takes the first known key off the bytes that were read. Others are skipped.
Key Terminal::takeKey() {
    static constexpr std::array<std::pair<std::string_view, Key>, 12> keys = {{{"\x1b[A", Key::Up},
                                                                               {"\x1b[B", Key::Down},
                                                                               {"\x1b[C", Key::Right},
                                                                               {"\x1b[D", Key::Left},
                                                                               {"\x1bOA", Key::Up},
                                                                               {"\x1bOB", Key::Down},
                                                                               {"\x1bOC", Key::Right},
                                                                               {"\x1bOD", Key::Left},
                                                                               {"\r", Key::Enter},
                                                                               {"\n", Key::Enter},
                                                                               {"q", Key::Quit},
                                                                               {{&controlC, 1}, Key::Quit}}};
    while (!pressed_.empty()) {
        bool isIncomplete = false;
        for (auto const& [bytes, key] : keys) {
            if (pressed_.starts_with(bytes)) {
                pressed_.erase(0, bytes.size());
                return key;
            }
            isIncomplete = isIncomplete || bytes.starts_with(pressed_);
        }
        if (isIncomplete) {
            break; // the rest of the sequence arrives with the next read
        }
        pressed_.erase(0, 1);
    }
    return Key::None;
}

void Terminal::write(std::string_view text) {
    while (!text.empty()) {
        auto const count = ::write(STDOUT_FILENO, text.data(), text.size());
        if (count < 0 && errno != EINTR) {
            return; // the terminal was closed, which the next read notices
        }
        text.remove_prefix(count < 0 ? 0 : static_cast<std::size_t>(count));
    }
}

std::string printable(std::u16string_view text, int columns) {
    std::string shown;
    while (!text.empty()) {
        auto codePoint = fl::i18n::takeCodePoint(text);
        int width = fl::i18n::isSurrogate(codePoint) ? -1 : wcwidth(static_cast<wchar_t>(codePoint));
        if (width < 0) {
            codePoint = U'?';
            width = 1;
        }
        columns -= width;
        if (columns < 0) {
            break;
        }
        fl::i18n::appendUtf8(shown, codePoint);
    }
    return shown;
}

} // namespace project_panel
