#include "output/NameForms.hpp"

#include <algorithm>
#include <cstddef>

#include "fl/filesystem/SystemName.hpp"
#include "fl/i18n/Ascii.hpp"
#include "fl/i18n/CodePoints.hpp"
#include "fl/i18n/JsonString.hpp"
#include "fl/i18n/Utf8.hpp"

namespace projectctl {

namespace {

constexpr char digits[] = "0123456789abcdef";

/// The length in bytes of the UTF-8 character at an index; 0 when it is not valid.
std::size_t characterLength(std::string_view bytes, std::size_t index) {
    return fl::i18n::decodeUtf8(bytes, index).length;
}

/// True for the control characters of ASCII and for U+0080 to U+009F in UTF-8, which terminals also
/// interpret.
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
        std::size_t const length = characterLength(bytes, index);
        if (length == 0 || isControl(bytes, index) || bytes[index] == '"' || bytes[index] == '\\') {
            return true;
        }
        index += length;
    }
    return false;
}

} // namespace

void appendBytes(std::string& out, std::u16string_view name) {
    std::size_t const before = out.size();
    out.resize(before + name.size());
    if (fl::i18n::narrowAscii(name, out.data() + before)) {
        return;
    }
    out.resize(before);
    fl::filesystem::SystemName const onDisk{fl::filesystem::Path(std::u16string(name))};
    out += onDisk.get() != nullptr ? std::string(onDisk.get()) : fl::i18n::toUtf8(name);
}

std::string bytesOf(std::u16string_view name) {
    std::string result;
    appendBytes(result, name);
    return result;
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
        std::size_t const length = std::max<std::size_t>(characterLength(bytes, index), 1);
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

std::string quotedName(std::u16string_view name) {
    std::string bytes;
    appendBytes(bytes, name);
    std::string result;
    appendQuoted(result, bytes);
    return result;
}

void appendJsonString(std::string& out, std::u16string_view text) {
    fl::i18n::appendJsonString(out, text, fl::i18n::JsonEscapes::Controls);
}

std::string inQuotes(std::u16string_view text) {
    return '"' + fl::i18n::toUtf8(text) + '"';
}

std::string shown(fl::filesystem::Path const& path) {
    return fl::i18n::toUtf8(path.native());
}

std::string quotedForShell(std::string_view bytes) {
    std::string result = "'";
    for (char const byte : bytes) {
        result += byte == '\'' ? "'\\''" : std::string(1, byte);
    }
    return result + '\'';
}

std::string withoutControls(std::string_view text, bool lineBreaks) {
    std::string result;
    for (std::size_t index = 0; index < text.size();) {
        std::size_t const length = std::max<std::size_t>(characterLength(text, index), 1);
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
