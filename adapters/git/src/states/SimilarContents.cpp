#include "states/SimilarContents.hpp"

#include <algorithm>

namespace project::git {

namespace {

using Pieces = std::unordered_map<std::uint64_t, std::uint64_t>; // the bytes, by the hash

constexpr std::size_t lengthOfPiece = 64;
constexpr std::size_t lengthOfGuess = 8000; ///< git looks for a zero byte in as many bytes

bool isText(std::string_view content) {
    return content.substr(0, lengthOfGuess).find('\0') == std::string_view::npos;
}

/// FNV-1a
class Hash {
public:
    void add(char byte) noexcept { value_ = (value_ ^ static_cast<unsigned char>(byte)) * 0x100000001B3ULL; }

    std::uint64_t value() const noexcept { return value_; }

private:
    std::uint64_t value_ = 0xCBF29CE484222325ULL;
};

Pieces piecesOf(std::string_view content) {
    Pieces result;
    bool const ignoresReturns = isText(content);
    Hash hash;
    std::size_t length = 0;
    for (std::size_t position = 0; position < content.size(); ++position) {
        char const byte = content[position];
        bool const isIgnored =
            ignoresReturns && byte == '\r' && position + 1 < content.size() && content[position + 1] == '\n';
        if (isIgnored) {
            continue;
        }
        hash.add(byte);
        ++length;
        if (length == lengthOfPiece || byte == '\n') {
            result[hash.value()] += length;
            hash = Hash();
            length = 0;
        }
    }
    if (length > 0) {
        result[hash.value()] += length;
    }
    return result;
}

} // namespace

void SimilarContents::addBefore(std::string_view content) {
    auto const before = sizes_.size();
    for (auto const& [hash, bytes] : piecesOf(content)) {
        pieces_[hash].push_back({before, bytes});
    }
    sizes_.push_back(content.size());
    common_.push_back(0);
}

void SimilarContents::compare(std::size_t after, std::string_view content, int similarity,
                              std::vector<SimilarContent>& found) {
    std::vector<std::size_t> touched;
    for (auto const& [hash, bytes] : piecesOf(content)) {
        auto const known = pieces_.find(hash);
        if (known == pieces_.end()) {
            continue;
        }
        for (auto const& occurrence : known->second) {
            if (common_[occurrence.before] == 0) {
                touched.push_back(occurrence.before);
            }
            common_[occurrence.before] += std::min(bytes, occurrence.bytes);
        }
    }
    std::ranges::sort(touched);
    for (auto const before : touched) {
        auto const larger = std::max<std::uint64_t>(sizes_[before], content.size());
        auto const hundredths = static_cast<int>(common_[before] * 10000 / larger);
        if (hundredths >= similarity * 100) {
            found.push_back({before, after, hundredths});
        }
        common_[before] = 0;
    }
}

} // namespace project::git
