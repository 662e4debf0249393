#pragma once

#include <cstddef>
#include <string>

namespace project::stores {

/// Something in a project's text that is not as it should be.
struct Fault {
    enum class Kind {
        Damage,    ///< a line or a batch that cannot be read; writes are refused until it is mended
        Conflict,  ///< markers that a merge left; writes are refused until it is resolved
        Irregular, ///< readable all the same, and put right by the next write: order, doubled addresses
        TornTail,  ///< what a writer that died left behind; it does not count, and the next write drops it
        Displaced, ///< a file beside the text that somebody else put where the store needed room
    };

    Kind kind;
    std::size_t line;    ///< counted from 1; 0 where no line is meant
    std::string problem; ///< a clause in UTF-8
};

} // namespace project::stores
