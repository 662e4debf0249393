#include "cli/WrappedText.hpp"

#include <algorithm>

namespace projectctl {

void appendWrapped(std::string& out, std::string_view text, std::size_t column, std::size_t indent) {
    bool isAtBegin = true;
    while (!text.empty()) {
        auto const end = std::min(text.find(' '), text.size());
        auto const word = text.substr(0, end);
        text.remove_prefix(std::min(end + 1, text.size()));
        std::size_t const length = columnsOf(word);
        if (!isAtBegin && column + 1 + length > helpWidth) {
            out += '\n' + std::string(indent, ' ');
            column = indent;
        } else if (!isAtBegin) {
            out += ' ';
            ++column;
        }
        out += word;
        column += length;
        isAtBegin = false;
    }
    out += '\n';
}

std::size_t columnsOf(std::string_view text) {
    auto const continues = [](char byte) { return (static_cast<unsigned char>(byte) & 0xC0U) == 0x80; };
    return text.size() - static_cast<std::size_t>(std::ranges::count_if(text, continues));
}

} // namespace projectctl
