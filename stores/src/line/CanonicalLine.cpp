#include "line/CanonicalLine.hpp"

#include <array>
#include <bit>
#include <cstddef>
#include <cstdint>
#include <cstring>

#include "line/JsonText.hpp"
#include "line/NodeLine.hpp"

namespace project::stores {

namespace {

constexpr std::string_view pathOpening = R"({"file":")";
constexpr std::string_view stepsOpening = R"({"at":[)";
constexpr ConstantContent plainNodeTypeContent{plainNodeType};

constexpr std::size_t longestSurelyShallowPath = deepestAddress;

constexpr std::size_t blockLength = 16;
using Block = signed char __attribute__((vector_size(blockLength)));

Block blockAt(char const* bytes) noexcept {
    Block result;
    std::memcpy(&result, bytes, sizeof result);
    return result;
}

/// Whether a plain path ends at a byte, for one byte or for each byte of a block: at a quote, a backslash, a
/// control character, a byte that is not ASCII (it is negative), or an empty name.
/// @param before the byte before it.
template <typename Bytes>
auto isPathEnd(Bytes bytes, Bytes before) noexcept {
    return (bytes < 0x20) | (bytes == '"') | (bytes == '\\') | ((bytes == '/') & (before == '/'));
}

/// The first byte of a block at which a plain path ends, or blockLength.
/// @param bytes not at the beginning of the text.
std::size_t pathEndInBlock(char const* bytes) noexcept {
    Block const ends = isPathEnd(blockAt(bytes), blockAt(bytes - 1)); // the bytes at an end have all bits set
    auto const halves = std::bit_cast<std::array<std::uint64_t, 2>>(ends);
    constexpr std::size_t halfLength = blockLength / 2;
    auto const firstByte = [](std::uint64_t half) {
        bool const isLittle = std::endian::native == std::endian::little;
        return static_cast<std::size_t>(isLittle ? std::countr_zero(half) : std::countl_zero(half)) / 8;
    };
    return halves[0] != 0 ? firstByte(halves[0]) : halfLength + firstByte(halves[1]);
}

/// Reads a line in the one form and order in which it is written.
class Scanner {
public:
    explicit Scanner(std::string_view line) noexcept : line_(line) {}

    std::optional<LineAddress> path() noexcept {
        std::string_view content;
        if (!string(content) || !isPathContent(content)) {
            return std::nullopt;
        }
        return LineAddress{LineAddress::Form::Names, content};
    }

    std::optional<LineAddress> object() noexcept {
        std::optional<LineAddress> const address = line_.starts_with(pathOpening) ? file() : steps();
        std::size_t const afterAddress = at_;
        bool const isComplete =
            address && (pass(R"(,"node":false)") || body(plainNodeTypeContent, 0)) && pass("}") && isAtEnd();
        bool const isPlain = afterAddress + 1 == at_;
        if (!isComplete || (isPlain && address->form == LineAddress::Form::Names)) {
            return std::nullopt;
        }
        return address;
    }

    bool isAtEnd() const noexcept { return at_ == line_.size(); }

private:
    bool pass(std::string_view expected) noexcept {
        if (line_.substr(at_, expected.size()) != expected) {
            return false;
        }
        at_ += expected.size();
        return true;
    }

    bool string(std::string_view& content) noexcept {
        if (!pass("\"")) {
            return false;
        }
        JsonContentScan const scan = scanJsonContent(line_, at_);
        if (scan.problem != nullptr || !scan.isCanonical) {
            return false;
        }
        content = line_.substr(at_, scan.end - at_);
        at_ = scan.end + 1;
        return true;
    }

    std::optional<LineAddress> file() noexcept {
        at_ = pathOpening.size() - 1;
        return path();
    }

    std::optional<LineAddress> steps() noexcept {
        if (!pass(stepsOpening)) {
            return std::nullopt;
        }
        std::size_t depth = 0;
        std::string_view content;
        do {
            if (!string(content) || !pass(",") || !string(content) || ++depth > deepestAddress) {
                return std::nullopt;
            }
        } while (pass(","));
        LineAddress const address{LineAddress::Form::Steps, line_.substr(stepsOpening.size())};
        if (!pass("]") || isWrittenAsPath(address)) {
            return std::nullopt;
        }
        return address;
    }

    /// Type, keys and children, all optional. @param omittedType the type that must not be written.
    bool body(std::string_view omittedType, std::size_t nesting) noexcept {
        std::string_view type;
        if (pass(R"(,"type":)") && (!string(type) || type == omittedType)) {
            return false;
        }
        return keysAndChildren(nesting);
    }

    bool keysAndChildren(std::size_t nesting) noexcept {
        if (pass(R"(,"keys":)") && !keys()) {
            return false;
        }
        return !pass(R"(,"children":)") || children(nesting + 1);
    }

    bool keys() noexcept {
        std::string_view previous;
        std::string_view key;
        std::string_view value;
        for (bool isFirst = true; isFirst || pass(","); isFirst = false) {
            if (isFirst && !pass("{")) {
                return false;
            }
            if (!string(key) || !pass(":") || !string(value) ||
                (!isFirst && std::is_gteq(compareJsonContents(previous, key)))) {
                return false;
            }
            previous = key;
        }
        return pass("}");
    }

    bool children(std::size_t nesting) noexcept {
        if (nesting > deepestNesting || !pass("[")) {
            return false;
        }
        do {
            std::string_view type;
            if (!pass(R"({"type":)") || !string(type) || !keysAndChildren(nesting) || !pass("}")) {
                return false;
            }
        } while (pass(","));
        return pass("]");
    }

    std::string_view line_;
    std::size_t at_ = 0;
};

} // namespace

std::optional<LineAddress> canonicalAddress(std::string_view line) noexcept {
    Scanner scanner(line);
    if (!line.starts_with('"')) {
        return scanner.object();
    }
    std::optional<LineAddress> const path = scanner.path();
    return scanner.isAtEnd() ? path : std::nullopt;
}

LineAddress addressOfCanonical(std::string_view line) noexcept {
    if (line.front() == '"') {
        return {LineAddress::Form::Names, line.substr(1, line.size() - 2)};
    }
    if (line.starts_with(stepsOpening)) {
        return {LineAddress::Form::Steps, line.substr(stepsOpening.size())};
    }
    std::size_t end = pathOpening.size();
    while (line[end] != '"') {
        end += line[end] == '\\' ? 2 : 1;
    }
    return {LineAddress::Form::Names, line.substr(pathOpening.size(), end - pathOpening.size())};
}

std::size_t plainPathLength(std::string_view text) noexcept {
    if (!text.starts_with('"') || text.starts_with("\"/")) {
        return 0;
    }
    std::size_t at = 1;
    while (at + blockLength <= text.size()) {
        std::size_t const end = pathEndInBlock(text.data() + at);
        at += end;
        if (end < blockLength) {
            break;
        }
    }
    while (at < text.size() && // the last bytes of the text
           !isPathEnd(static_cast<signed char>(text[at]), static_cast<signed char>(text[at - 1]))) {
        ++at;
    }
    bool const isComplete = at < text.size() && text[at] == '"';
    return isComplete && at - 1 <= longestSurelyShallowPath ? at - 1 : 0;
}

} // namespace project::stores
