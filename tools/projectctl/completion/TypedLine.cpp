#include "completion/TypedLine.hpp"

#include <algorithm>
#include <cctype>
#include <cstddef>
#include <utility>

namespace projectctl {

namespace {

using Quote = TypedLine::Quote;

constexpr std::string_view separators = " \t\n";

/// The letters after a backslash that mean a control character, and these characters.
constexpr std::string_view controlLetters = "abefnrtv";
constexpr std::string_view controls = "\a\b\x1B\f\n\r\t\v";

/// The bytes that bash needs a backslash for between double quotes.
constexpr std::string_view specialInDoubleQuotes = "\"\\$`";

class TypedLineReader {
public:
    TypedLineReader(std::string_view text, Shell shell) : rest_(text), shell_(shell) {}

    TypedLine read() {
        line_.words.emplace_back();
        while (!rest_.empty()) {
            if (separators.find(rest_.front()) != std::string_view::npos) {
                endWord();
            } else {
                readPart();
            }
        }
        return std::move(line_);
    }

private:
    void endWord() {
        rest_.remove_prefix(1);
        if (isInWord_) {
            line_.words.emplace_back();
            isInWord_ = false;
        }
    }

    void readPart() {
        isInWord_ = true;
        if (shell_ == Shell::Bash && rest_.starts_with("$'")) {
            rest_.remove_prefix(2);
            readQuoted('\'', Quote::Single, "", true);
            return;
        }
        char const byte = take();
        if (byte == '\'') {
            readQuoted(byte, Quote::Single, shell_ == Shell::Fish ? "'\\" : "", false);
        } else if (byte == '"') {
            readQuoted(byte, Quote::Double, shell_ == Shell::Fish ? "\"\\$\n" : "\"\\$`\n", false);
        } else if (byte == '\\') {
            readEscape(shell_ == Shell::Fish);
        } else {
            word() += byte;
        }
    }

    /// @param escapable the bytes that a backslash quotes here.
    void readQuoted(char end, Quote quote, std::string_view escapable, bool hasControls) {
        while (!rest_.empty()) {
            char const byte = take();
            if (byte == end) {
                return;
            }
            bool const isEscape = byte == '\\' && !rest_.empty() &&
                                  (hasControls || escapable.find(rest_.front()) != std::string_view::npos);
            if (isEscape) {
                readEscape(hasControls);
            } else {
                word() += byte;
            }
        }
        line_.quote = quote;
    }

    /// The byte or the control character that is written after a backslash.
    void readEscape(bool hasControls) {
        if (rest_.empty()) {
            return; // the byte is not typed yet
        }
        if (hasControls && rest_.front() >= '0' && rest_.front() <= '7') {
            word() += takeNumber(3, 8);
            return;
        }
        char const byte = take();
        std::size_t const control = controlLetters.find(byte);
        if (hasControls && control != std::string_view::npos) {
            word() += controls[control];
        } else if (hasControls && (byte == 'x' || byte == 'X')) {
            word() += takeNumber(2, 16);
        } else if (byte != '\n') {
            word() += byte;
        }
    }

    char takeNumber(std::size_t digits, int base) {
        std::string const text(rest_.substr(0, digits));
        std::size_t length = 0;
        bool const isNumber = !text.empty() && std::isxdigit(static_cast<unsigned char>(text.front())) != 0;
        int const value = isNumber ? std::stoi(text, &length, base) : 0;
        rest_.remove_prefix(length);
        return static_cast<char>(value);
    }

    char take() {
        char const byte = rest_.front();
        rest_.remove_prefix(1);
        return byte;
    }

    std::string& word() { return line_.words.back(); }

    std::string_view rest_;
    Shell shell_;
    bool isInWord_ = false;
    TypedLine line_;
};

bool isAssignment(std::string const& word) {
    std::size_t const equals = word.find('=');
    return equals != std::string::npos && equals > 0 &&
           std::all_of(
               word.begin(), word.begin() + static_cast<std::ptrdiff_t>(equals),
               [](unsigned char byte) { return byte == '_' || (byte < 0x80 && std::isalnum(byte) != 0); });
}

bool isPlainForBash(char byte) {
    constexpr std::string_view plain = "_./,@%+-:=";
    auto const code = static_cast<unsigned char>(byte);
    return code >= 0x80 || std::isalnum(code) != 0 || plain.find(byte) != std::string_view::npos;
}

} // namespace

TypedLine readTypedLine(std::string_view text, Shell shell) {
    return TypedLineReader(text, shell).read();
}

std::vector<std::string> argumentsOf(TypedLine const& line) {
    auto const program = std::ranges::find_if_not(line.words, isAssignment);
    return program == line.words.end() ? std::vector<std::string>()
                                       : std::vector(program + 1, line.words.end());
}

std::string quotedForBash(std::string_view text, Quote open) {
    std::string result;
    for (char const byte : text) {
        if (open == Quote::Single) {
            result += byte == '\'' ? "'\\''" : std::string(1, byte);
        } else if (open == Quote::Double) {
            result +=
                std::string(specialInDoubleQuotes.find(byte) != std::string_view::npos ? 1 : 0, '\\') + byte;
        } else if (byte == '\n') {
            result += "'\n'"; // a backslash would remove the line end
        } else {
            result += std::string(isPlainForBash(byte) ? 0 : 1, '\\') + byte;
        }
    }
    return result;
}

} // namespace projectctl
