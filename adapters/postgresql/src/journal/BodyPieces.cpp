#include "journal/BodyPieces.hpp"

#include <algorithm>
#include <new>
#include <utility>

#include <zstd.h>

namespace project::postgresql {

namespace {

/// The text in one piece. Compressed, even random bytes stay below 1 MiB.
constexpr std::size_t textOfPiece = 1'000'000;
static_assert(ZSTD_COMPRESSBOUND(textOfPiece) <= (std::size_t{1} << 20));

constexpr int compressionLevel = 3; ///< zstd's own default

} // namespace

std::vector<std::string> cutBody(std::string_view body) {
    std::vector<std::string> pieces;
    do {
        auto const text = body.substr(0, textOfPiece);
        body.remove_prefix(text.size());
        std::string piece(ZSTD_compressBound(text.size()), '\0');
        auto const length =
            ZSTD_compress(piece.data(), piece.size(), text.data(), text.size(), compressionLevel);
        if (ZSTD_isError(length) != 0) {
            throw std::bad_alloc(); // it cannot fail otherwise, since the piece has room
        }
        piece.resize(length);
        piece.shrink_to_fit();
        pieces.push_back(std::move(piece));
    } while (!body.empty());
    return pieces;
}

bool appendPiece(std::string& body, std::string_view piece) {
    auto const length = ZSTD_getFrameContentSize(piece.data(), piece.size());
    if (length > textOfPiece) { // also the values for an error
        return false;
    }
    auto const before = body.size();
    body.resize(before + length);
    return ZSTD_decompress(body.data() + before, length, piece.data(), piece.size()) == length;
}

} // namespace project::postgresql
