#pragma once

#include <cstddef>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "project/stores/Change.hpp"
#include "project/stores/Fault.hpp"

namespace project::stores {

/// The text of a project as it was read: a sorted body, a tail of batches, and the faults. Works on bytes and
/// does not access the disk; docs/store/format.md describes the format.
///
/// Reading checks the order of the lines in one pass. Nodes are created from lines on request. Several
/// threads may call children at the same time, but no other operation.
class ProjectText {
public:
    /// The text of a store without nodes.
    static ProjectText empty();

    /// @param file the name of the file in errors.
    /// @return nothing if the text is incomplete: empty, or without the last line of its body.
    /// @throws StoreError if the file is not a project's text, or if it has a later format.
    static std::optional<ProjectText> read(std::string bytes, std::string const& file);

    ProjectText(ProjectText&&) noexcept;
    ProjectText& operator=(ProjectText&&) noexcept;
    ~ProjectText();

    /// Passes on the children of an address, sorted. Searches the lines once.
    void children(Address const& parent, ChildSink& children) const;

    /// The same as a list.
    Children children(Address const& parent) const;

    /// Applies bytes that were appended to this text, if they are complete batches that chain to it.
    /// @return the differences, sorted; nothing, with the text unchanged, if the bytes are anything else.
    std::optional<std::vector<Difference>> extend(std::string_view added);

    /// The same without differences, for a batch of this process. @return false if the text is unchanged.
    bool append(std::string_view lines);

    /// The checksum to which the next batch chains: that of the last batch, or of the lines of the body. The
    /// first call for a body takes time proportional to it.
    std::string const& sum() const;

    /// The lines of a batch, including its closing line, to be appended to this text. Empty if they have more
    /// bytes than permitted.
    /// @throws StoreError if an address or a node is too deep for the text.
    std::string tailFor(Batch const& batch, std::size_t most = std::string::npos) const;

    /// This text with a batch (possibly an empty one), as a body without a tail. Damaged lines are omitted.
    /// @throws StoreError as tailFor does.
    ProjectText rewrittenWith(Batch const& batch) const;

    /// The differences from this text to the other one, sorted.
    std::vector<Difference> differencesTo(ProjectText const& other) const;

    /// The bytes that were read or would be written: body and tail, including a torn tail.
    std::size_t size() const noexcept;
    std::size_t bodySize() const noexcept;
    std::size_t tailSize() const noexcept;
    bool hasSameBytes(std::string_view bytes) const noexcept;
    std::string bytes() const;

    /// The bytes of the body; for a text without a tail, these are all bytes.
    std::string const& body() const noexcept;

    /// True if the body is canonical and nothing follows it: rewriting the text would give the same bytes.
    bool isTidy() const noexcept;

    /// The numbers of the lines that describe some addresses, counted from 1: of each the last one, or the
    /// first one below it if it has no line of its own, or 0. Reads all lines.
    std::vector<std::size_t> linesOf(std::vector<Address> const& addresses) const;

    /// By line.
    std::vector<Fault> const& faults() const noexcept;
    bool hasFault(Fault::Kind kind) const noexcept;

    /// The bytes of the damaged lines and batches, with their line ends.
    std::string damagedLines() const;

private:
    class State;

    explicit ProjectText(std::unique_ptr<State> state) noexcept;

    std::unique_ptr<State> state_;
};

} // namespace project::stores
