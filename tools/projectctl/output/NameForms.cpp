#include "output/NameForms.hpp"

#include <algorithm>
#include <cstddef>
#include <cstdint>

#include "fl/filesystem/SystemName.hpp"
#include "fl/i18n/Utf8.hpp"

namespace projectctl {

namespace {

constexpr char digits[] = "0123456789abcdef";

bool isContinuation(std::string_view bytes, std::size_t index) {
    return index < bytes.size() && (static_cast<unsigned char>(bytes[index]) & 0xC0U) == 0x80U;
}

/// How many bytes at an index make a character of UTF-8; 0 when they make none.
std::size_t characterLength(std::string_view bytes, std::size_t index) {
    auto const first = static_cast<unsigned char>(bytes[index]);
    if (first < 0x80) {
        return 1;
    }
    std::size_t const length = first >= 0xF0 ? 4 : first >= 0xE0 ? 3 : 2;
    if (first < 0xC2 || first > 0xF4) {
        return 0;
    }
    for (std::size_t next = 1; next < length; ++next) {
        if (!isContinuation(bytes, index + next)) {
            return 0;
        }
    }
    auto const second = static_cast<unsigned char>(bytes[index + 1]);
    bool const overlong = (first == 0xE0 && second < 0xA0) || (first == 0xF0 && second < 0x90);
    bool const surrogate = first == 0xED && second >= 0xA0;
    bool const beyond = first == 0xF4 && second >= 0x90;
    return overlong || surrogate || beyond ? 0 : length;
}

/// True for the control characters of ASCII and, in UTF-8, for U+0080 to U+009F, which terminals obey too.
bool isControl(std::string_view bytes, std::size_t index) {
    auto const first = static_cast<unsigned char>(bytes[index]);
    return first < 0x20 || first == 0x7F ||
           (first == 0xC2 && index + 1 < bytes.size() && static_cast<unsigned char>(bytes[index + 1]) < 0xA0);
}

void appendEscaped(std::string& out, char byte) {
    static constexpr std::string_view named = "\a\b\t\n\v\f\r";
    if (auto const found = named.find(byte); found != std::string_view::npos) {
        out += '\\';
        out += "abtnvfr"[found];
        return;
    }
    auto const value = static_cast<unsigned char>(byte);
    out += '\\';
    out += digits[value >> 6U];
    out += digits[(value >> 3U) & 7U];
    out += digits[value & 7U];
}

bool needsQuotes(std::string_view bytes) {
    for (std::size_t index = 0; index < bytes.size();) {
        auto const length = characterLength(bytes, index);
        if (length == 0 || isControl(bytes, index) || bytes[index] == '"' || bytes[index] == '\\') {
            return true;
        }
        index += length;
    }
    return false;
}

bool isHighSurrogate(char16_t unit) {
    return unit >= 0xD800 && unit < 0xDC00;
}

bool isLowSurrogate(char16_t unit) {
    return unit >= 0xDC00 && unit < 0xE000;
}

void appendUnitEscape(std::string& out, char16_t unit) {
    out += "\\u";
    for (unsigned shift = 16; shift > 0;) {
        shift -= 4;
        out += digits[(static_cast<unsigned>(unit) >> shift) & 15U];
    }
}

/// Appends a character beyond ASCII as UTF-8.
void appendCharacter(std::string& out, std::uint32_t character) {
    if (character < 0x800) {
        out += static_cast<char>(0xC0U | (character >> 6U));
    } else {
        if (character < 0x10000) {
            out += static_cast<char>(0xE0U | (character >> 12U));
        } else {
            out += static_cast<char>(0xF0U | (character >> 18U));
            out += static_cast<char>(0x80U | ((character >> 12U) & 0x3FU));
        }
        out += static_cast<char>(0x80U | ((character >> 6U) & 0x3FU));
    }
    out += static_cast<char>(0x80U | (character & 0x3FU));
}

void appendJsonAscii(std::string& out, char unit) {
    if (unit == '"' || unit == '\\') {
        out += '\\';
        out += unit;
    } else if (unit == '\n') {
        out += "\\n";
    } else if (unit == '\t') {
        out += "\\t";
    } else if (unit < ' ' || unit == '\x7F') {
        appendUnitEscape(out, static_cast<char16_t>(unit));
    } else {
        out += unit;
    }
}

} // namespace

void appendBytes(std::string& out, std::u16string_view name) {
    auto const before = out.size();
    out.resize(before + name.size());
    auto* to = out.data() + before;
    bool isAscii = true;
    for (auto const unit : name) { // one pass without a way out of it, which is what a million names are for
        isAscii = isAscii && unit != 0 && unit < 0x80;
        *to++ = static_cast<char>(unit);
    }
    if (isAscii) {
        return;
    }
    out.resize(before);
    fl::filesystem::SystemName const onDisk{fl::filesystem::Path(std::u16string(name))};
    out += onDisk.get() != nullptr ? std::string(onDisk.get()) : fl::i18n::toUtf8(name);
}

std::u16string textOf(std::string const& argument) {
    return fl::filesystem::fromSystem(argument).native();
}

void appendQuoted(std::string& out, std::string_view bytes) {
    if (!needsQuotes(bytes)) {
        out += bytes;
        return;
    }
    out += '"';
    for (std::size_t index = 0; index < bytes.size();) {
        auto const length = std::max<std::size_t>(characterLength(bytes, index), 1);
        bool const escaped = isControl(bytes, index) || characterLength(bytes, index) == 0;
        for (auto const byte : bytes.substr(index, length)) {
            if (escaped) {
                appendEscaped(out, byte);
            } else {
                out += byte == '"' || byte == '\\' ? std::string("\\") + byte : std::string(1, byte);
            }
        }
        index += length;
    }
    out += '"';
}

void appendJsonString(std::string& out, std::u16string_view text) {
    out += '"';
    for (std::size_t index = 0; index < text.size(); ++index) {
        auto const unit = text[index];
        if (unit < 0x80) {
            appendJsonAscii(out, static_cast<char>(unit));
        } else if (isHighSurrogate(unit) && index + 1 < text.size() && isLowSurrogate(text[index + 1])) {
            ++index;
            appendCharacter(out, 0x10000U + ((unit - 0xD800U) << 10U) + (text[index] - 0xDC00U));
        } else if (isHighSurrogate(unit) || isLowSurrogate(unit) || unit < 0xA0) {
            appendUnitEscape(out, unit);
        } else {
            appendCharacter(out, unit);
        }
    }
    out += '"';
}

std::string inQuotes(std::u16string_view text) {
    return '"' + fl::i18n::toUtf8(text) + '"';
}

std::string shown(fl::filesystem::Path const& path) {
    return fl::i18n::toUtf8(path.native());
}

std::string withoutControls(std::string_view text, bool lineBreaks) {
    std::string result;
    for (std::size_t index = 0; index < text.size();) {
        auto const length = std::max<std::size_t>(characterLength(text, index), 1);
        bool const stays = text[index] == '\t' || (lineBreaks && text[index] == '\n');
        for (auto const byte : text.substr(index, length)) {
            if (isControl(text, index) && !stays) {
                appendEscaped(result, byte);
            } else {
                result += byte;
            }
        }
        index += length;
    }
    return result;
}

} // namespace projectctl
