#pragma once

#include <cstddef>
#include <cstdint>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "project/git/SimilarContent.hpp"

namespace project::git {

/// Measures how similar contents are, as git does: by the bytes of the pieces that both have, of the bytes of
/// the larger one. A piece is a line or, in a longer line, 64 bytes; in a text, the carriage return at the
/// end of a line does not count.
///
/// The earlier contents are kept by their pieces, so that comparing a later one costs the number of earlier
/// contents that have a piece in common with it.
class SimilarContents {
public:
    /// Adds an earlier content. The first has position 0.
    void addBefore(std::string_view content);

    /// Compares a later content with the earlier ones. Empty contents are similar to nothing.
    /// @param after its position.
    /// @param similarity the least one, in percent.
    void compare(std::size_t after, std::string_view content, int similarity,
                 std::vector<SimilarContent>& found);

private:
    struct Occurrence {
        std::size_t before;
        std::uint64_t bytes;
    };

    std::unordered_map<std::uint64_t, std::vector<Occurrence>> pieces_; ///< by their hash
    std::vector<std::uint64_t> sizes_;                                  ///< of the earlier contents
    std::vector<std::uint64_t> common_; ///< bytes, of the earlier contents; 0 between two comparisons
};

} // namespace project::git
