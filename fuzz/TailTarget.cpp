#include "TailLines.hpp"
#include "Target.hpp"
#include "TextContents.hpp"
#include "line/LineParser.hpp"
#include "text/TextLines.hpp"

namespace {

using namespace project::fuzz;
using project::stores::Batch;
using project::stores::LineWalk;
using project::stores::ProjectText;

constexpr std::string_view bodyLines = R"("a"
"a/"
"a/b"
{"file":"a/c","children":[{"type":"Category","keys":{"UUID":"1"},"children":[{"type":"Label","keys":{"UUID":"2"}}]}]}
"b"
{"at":["Info","ProjectData"],"keys":{"Name":"x"}}
{"at":["References","Root"],"node":false}
)";

/// The changes of a piece that was taken in, which ends with its closing line.
Batch changesOf(std::string_view piece) {
    Batch changes;
    LineWalk walk(piece, 0, 1);
    while (walk.next()) {
        if (auto const parsed = project::stores::parseLine(walk.line().text); parsed.change) {
            changes.push_back(*parsed.change);
        }
    }
    return changes;
}

/// A piece was taken in: that must be what a batch of its changes gives, in whatever way it is written.
void checkTakenIn(ProjectText const& before, ProjectText const& after, std::string const& all,
                  std::string_view piece) {
    Contents const contents = contentsOf(after);
    Batch const changes = changesOf(piece);
    require(after.hasSameBytes(all), "what was taken in stands behind the text");
    require(contentsOf(before.rewrittenWith(changes)) == contents,
            "a batch gives the same taken in and rewritten");
    auto const written = readText(all.substr(0, all.size() - piece.size()) + before.tailFor(changes));
    require(written && written->faults().empty(), "a batch that is written is right");
    require(contentsOf(*written) == contents, "a batch says the same once it is written");
    require(after.differencesTo(before).empty() == (contents == contentsOf(before)),
            "texts differ if they say something else");
}

void checkWhole(std::string_view input) {
    std::string whole = framed(bodyLines);
    std::vector<std::string> const pieces = tailOf(input, whole);
    for (std::string const& piece : pieces) {
        whole += piece;
    }
    auto const text = readText(whole);
    require(text.has_value(), "a text with a whole body can be read");
    checkText(*text, whole);
}

/// A sound body and any tail: taken in piece by piece it gives what it gives when it is read at once, or is
/// refused where reading it finds a fault, and then nothing of it counts.
void run(std::string_view input) {
    std::string all = framed(bodyLines);
    auto extended = readText(all);
    auto before = readText(all);
    for (std::string const& piece : tailOf(input, all)) {
        all += piece;
        auto const read = readText(all);
        require(read.has_value(), "a text with a whole body can be read");
        bool const taken = extended->extend(piece).has_value();
        require(taken == read->faults().empty(), "what has no faults is taken in, and nothing else");
        if (!taken) {
            require(contentsOf(*extended) == contentsOf(*before), "what is refused changes nothing");
            break;
        }
        require(contentsOf(*read) == contentsOf(*extended), "reading at once gives what was taken in");
        checkTakenIn(*before, *extended, all, piece);
        before = readText(all);
    }
    checkWhole(input);
}

Registration const registration("tail", run);

} // namespace
