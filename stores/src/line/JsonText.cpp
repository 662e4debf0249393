#include "line/JsonText.hpp"

#include <algorithm>
#include <bit>
#include <cstdint>
#include <cstring>

#include "fl/i18n/Ascii.hpp"
#include "fl/i18n/CodePoints.hpp"

namespace project::stores {

using fl::i18n::decodeUtf8;
using fl::i18n::isHighSurrogate;
using fl::i18n::isLowSurrogate;

namespace {

constexpr int endOfContent = -1;

/// True for a code unit that is written as one byte, without an escape.
bool isPlainAscii(unsigned unit) noexcept {
    return unit >= 0x20 && unit < 0x80 && unit != '"' && unit != '\\';
}

/// The character of a two-byte escape by its letter, or -1 if there is no such escape.
int unescaped(char letter) noexcept {
    switch (letter) {
    case '"':
        return '"';
    case '\\':
        return '\\';
    case '/':
        return '/';
    case 'b':
        return '\b';
    case 'f':
        return '\f';
    case 'n':
        return '\n';
    case 'r':
        return '\r';
    case 't':
        return '\t';
    default:
        return -1;
    }
}

int hexDigit(char c) noexcept {
    if (c >= '0' && c <= '9') {
        return c - '0';
    }
    if (c >= 'a' && c <= 'f') {
        return c - 'a' + 10;
    }
    return c >= 'A' && c <= 'F' ? c - 'A' + 10 : -1;
}

/// The code unit that four hexadecimal digits represent, or -1.
int fourDigits(std::string_view text, std::size_t from) noexcept {
    if (text.size() - from < 4) {
        return -1;
    }
    int unit = 0;
    for (std::size_t i = from; i < from + 4; ++i) {
        int const digit = hexDigit(text[i]);
        if (digit < 0) {
            return -1;
        }
        unit = unit * 16 + digit;
    }
    return unit;
}

/// Iterates over the code units of a well-formed content.
class CodeUnits {
public:
    explicit CodeUnits(std::string_view content) noexcept : content_(content) {}

    int next() noexcept {
        if (pending_ != 0) {
            int const unit = pending_;
            pending_ = 0;
            return unit;
        }
        if (at_ >= content_.size()) {
            return endOfContent;
        }
        auto const byte = static_cast<unsigned char>(content_[at_]);
        return byte == '\\' ? escape() : byte < 0x80 ? content_[at_++] : character();
    }

private:
    int escape() noexcept {
        char const letter = content_[at_ + 1];
        if (letter != 'u') {
            at_ += 2;
            return unescaped(letter);
        }
        int const unit = fourDigits(content_, at_ + 2);
        at_ += 6;
        return unit;
    }

    int character() noexcept {
        auto const [codePoint, length] = decodeUtf8(content_, at_);
        at_ += length;
        if (codePoint < fl::i18n::firstOfFourBytes) {
            return static_cast<int>(codePoint);
        }
        pending_ = fl::i18n::lowSurrogate(codePoint);
        return fl::i18n::highSurrogate(codePoint);
    }

    std::string_view content_;
    std::size_t at_ = 0;
    int pending_ = 0;
};

/// Checks the escape at a position of a content.
class EscapeCheck {
public:
    /// @return the length of the escape in bytes, or 0 if it is invalid.
    std::size_t length(std::string_view text, std::size_t at) noexcept {
        if (at + 1 >= text.size()) {
            return 0;
        }
        bool const isAfterHigh = at == endOfHigh_;
        if (text[at + 1] != 'u') {
            isCanonical_ = isCanonical_ && text[at + 1] != '/';
            return unescaped(text[at + 1]) < 0 ? 0 : 2;
        }
        int const unit = fourDigits(text, at + 2);
        if (unit < 0) {
            return 0;
        }
        noteUnit(static_cast<char32_t>(unit), text.substr(at + 2, 4), isAfterHigh);
        if (isHighSurrogate(static_cast<char32_t>(unit))) {
            endOfHigh_ = at + 6;
        }
        return 6;
    }

    bool isCanonical() const noexcept { return isCanonical_; }

private:
    /// Canonical are only escapes of control characters without a short escape and of lone surrogates. Two
    /// escapes that form a pair represent a character that UTF-8 can encode.
    void noteUnit(char32_t unit, std::string_view digits, bool isAfterHigh) noexcept {
        bool const isControl = unit < 0x20 && fl::i18n::jsonEscapeLetter(unit) == 0;
        bool const isLone = isHighSurrogate(unit) || (isLowSurrogate(unit) && !isAfterHigh);
        bool const hasUpperCase =
            std::any_of(digits.begin(), digits.end(), [](char c) { return c >= 'A' && c <= 'F'; });
        isCanonical_ = isCanonical_ && (isControl || isLone) && !hasUpperCase;
    }

    bool isCanonical_ = true;
    std::size_t endOfHigh_ = std::string_view::npos;
};

} // namespace

std::u16string decodeJsonContent(std::string_view content) {
    std::u16string text;
    decodeJsonContent(content, text);
    return text;
}

void decodeJsonContent(std::string_view content, std::u16string& text) {
    text.resize(content.size());
    if (content.find('\\') == content.npos && fl::i18n::widenAscii(content, text.data())) {
        return;
    }
    text.clear();
    CodeUnits units(content);
    for (int unit = units.next(); unit != endOfContent; unit = units.next()) {
        text += static_cast<char16_t>(unit);
    }
}

std::size_t firstDifference(std::string_view left, std::string_view right) noexcept {
    std::size_t const shorter = std::min(left.size(), right.size());
    std::size_t i = 0;
    for (; i + sizeof(std::uint64_t) <= shorter; i += sizeof(std::uint64_t)) {
        std::uint64_t l = 0;
        std::uint64_t r = 0;
        std::memcpy(&l, left.data() + i, sizeof l);
        std::memcpy(&r, right.data() + i, sizeof r);
        if (l != r) {
            auto const bits = std::endian::native == std::endian::little ? std::countr_zero(l ^ r)
                                                                         : std::countl_zero(l ^ r);
            return i + static_cast<std::size_t>(bits / 8);
        }
    }
    while (i < shorter && left[i] == right[i]) {
        ++i;
    }
    return i;
}

std::strong_ordering compareJsonContents(std::string_view left, std::string_view right) noexcept {
    std::size_t const at = firstDifference(left, right);
    if (at == left.size() || at == right.size()) {
        return left.size() <=> right.size();
    }
    if (isUnescapedAt(left, at) && isUnescapedAt(right, at)) {
        return codeUnitRank(static_cast<unsigned char>(left[at])) <=>
               codeUnitRank(static_cast<unsigned char>(right[at]));
    }
    CodeUnits leftUnits(left);
    CodeUnits rightUnits(right);
    while (true) {
        int const l = leftUnits.next();
        int const r = rightUnits.next();
        if (l != r || l == endOfContent) {
            return l <=> r;
        }
    }
}

JsonContentScan scanJsonContent(std::string_view text, std::size_t from) noexcept {
    EscapeCheck escapes;
    std::size_t at = from;
    while (at < text.size()) {
        auto const byte = static_cast<unsigned char>(text[at]);
        if (isPlainAscii(byte)) {
            ++at;
        } else if (byte == '"') {
            return {at, escapes.isCanonical(), nullptr};
        } else if (byte < 0x20) {
            return {at, false, "StringWithControl"};
        } else if (byte == '\\') {
            std::size_t const length = escapes.length(text, at);
            if (length == 0) {
                return {at, false, "StringWithWrongEscape"};
            }
            at += length;
        } else {
            std::size_t const length = decodeUtf8(text, at).length;
            if (length == 0) {
                return {at, false, "StringNotUtf8"};
            }
            at += length;
        }
    }
    return {at, false, "StringOpen"};
}

} // namespace project::stores
