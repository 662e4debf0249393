#include "SampleBody.hpp"
#include "Target.hpp"
#include "TextContents.hpp"
#include "line/LineParser.hpp"
#include "text/TextLines.hpp"

namespace {

using namespace project::fuzz;
using project::stores::Batch;
using project::stores::LineWalk;
using project::stores::ProjectText;

/// The changes that the lines of an input describe; other lines are skipped.
Batch changesOf(std::string_view input) {
    Batch changes;
    LineWalk walk(input, 0, 1);
    while (walk.next()) {
        if (auto parsed = project::stores::parseLine(walk.line().text); parsed.change) {
            changes.push_back(*std::move(parsed.change));
        }
    }
    return changes;
}

/// Any batch, after the batch of another part or after none: appending it and rewriting the text with it give
/// the same content, for the writer and for a reader.
void run(std::string_view input) {
    static ProjectText const sample = *readText(sampleBody());
    auto const parts = partsOf(input);
    bool const isSecond = parts[0].size() < input.size();
    std::string const first = isSecond ? sample.tailFor(changesOf(parts[0])) : std::string();
    std::string const bytes = sampleBody() + first;
    auto extended = readText(bytes);
    Batch const changes = changesOf(isSecond ? parts[1] : parts[0]);
    std::string const before = extended->rewrittenWith({}).body();
    std::string const after = extended->rewrittenWith(changes).body();
    std::string const lines = extended->tailFor(changes);

    auto const read = readText(bytes + lines);
    require(read && read->faults().empty(), "a written batch has no faults");
    require(canonicalOf(*read) == after, "a batch has the same effect appended and rewritten");
    auto const differences = extended->extend(lines);
    require(differences.has_value(), "a written batch is accepted");
    require(canonicalOf(*extended) == after, "a batch has the same effect on the text that was open");
    require(differences->empty() == (after == before), "a batch differs if the content does");
    require(extended->differencesTo(*read).empty(), "the text that was open equals the one that is read");
}

Registration const registration("batch", run);

} // namespace
