#pragma once

#include <cstddef>

namespace project::git {

/// Two contents that are similar: the positions of an earlier one and of a later one in their lists.
struct SimilarContent {
    std::size_t before; ///< the position of the earlier one
    std::size_t after;  ///< the position of the later one
    int hundredths;     ///< their similarity in hundredths of a percent

    friend bool operator==(SimilarContent const&, SimilarContent const&) = default;
};

} // namespace project::git
