#pragma once

#include <cstddef>
#include <string>

namespace project::stores {

/// A deviation from the canonical form that was found in a project's text, or beside it.
struct Fault {
    /// The kind of deviation.
    enum class Kind {
        Damage,    ///< a line or a batch is unreadable; writes are refused until it is repaired
        Conflict,  ///< conflict markers; writes are refused until the conflict is resolved
        Irregular, ///< readable but not canonical, for example unsorted; the next rewrite corrects it
        TornTail,  ///< the torn write of a writer that died; it is ignored, and the next batch drops it
        Displaced, ///< a file beside the text that another program created and the store set aside
    };

    Kind kind;           ///< the kind of deviation
    std::size_t line;    ///< counted from 1; 0 if the fault has no line
    std::string problem; ///< a clause in UTF-8, in the language of fl::i18n::MessageCatalog
};

} // namespace project::stores
