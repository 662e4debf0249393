#pragma once

#include <cstddef>
#include <map>
#include <string>
#include <string_view>
#include <vector>

#include "project/stores/Change.hpp"
#include "project/stores/Fault.hpp"
#include "text/TextContent.hpp"
#include "text/TextLines.hpp"

namespace project::stores {

/// One batch of a tail that is right in itself.
struct TailBatch {
    Batch changes;
    bool chains; ///< it was written on top of what stands before it
    std::string sum;
};

/// What the lines behind a body say.
struct TailReading {
    std::vector<TailBatch> batches;
    std::vector<Fault> faults;
    std::map<std::size_t, std::string> damage; ///< damaged lines with their ends, by number
    std::string anchor;                        ///< the sum that the next batch has to name
    bool torn = false;
};

/// Reads batches: each is its lines and then a closing line, which tells how many they are, which sum was
/// the last one before them, and the sum over all of that.
/// @param anchor the sum of the body.
TailReading readTail(std::vector<TextLine> const& lines, std::string anchor);

/// Applies the batches of a tail to what stands before it; those that do not chain are joined with it.
void takeIn(TextContent& content, TailReading const& tail);

/// The lines of a batch with its closing line.
/// @throws StoreError when a change is deeper than what the text can hold.
std::string writeBatch(Batch const& batch, std::string_view anchor);

} // namespace project::stores
