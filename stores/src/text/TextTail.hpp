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

/// No line of a batch is shorter than this: a name of one character in quotes, and the line's end.
constexpr std::size_t shortestLine = 4;

/// One valid batch of a tail.
struct TailBatch {
    Batch changes;
    bool isChained; ///< it was written on top of the text that precedes it
    std::string sum;
};

/// The content of the lines after a body.
struct TailReading {
    std::vector<TailBatch> batches;
    std::vector<Fault> faults;
    std::map<std::size_t, std::string> damage; ///< damaged lines with their ends, by number
    std::string nextAfter;                     ///< the `after` of the next batch
    bool isTorn = false;
};

/// Reads batches. A batch consists of its lines and a closing line with their number, the checksum that
/// precedes the batch (`after`), and the batch's own checksum.
/// @param after the checksum that precedes the lines: that of the body, or of the last batch before them.
TailReading readTail(std::vector<TextLine> const& lines, std::string after);

/// Applies the batches of a tail to the content that precedes it. Batches that do not chain are joined with
/// it.
void applyTail(TextContent& content, TailReading const& tail);

/// The lines of a batch, including its closing line. Empty if they have more bytes than permitted.
/// @param after the checksum that precedes the batch.
/// @throws StoreError if an address or a node of the batch is too deep for the text.
std::string writeBatch(Batch const& batch, std::string_view after, std::size_t most);

/// The checksum in the closing line with which some lines end; empty if they do not end with one.
std::string_view closingSum(std::string_view lines);

} // namespace project::stores
