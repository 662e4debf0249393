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

/// The text of a project as it was read: a sorted body, a tail of batches laid over it, and what is wrong
/// with it. Works on bytes alone and knows nothing of disks; docs/store/format.md describes the format.
///
/// The order is checked in one pass at reading; nodes are made from lines when somebody asks for them.
/// children may be called from several threads as long as nothing else is.
class ProjectText {
public:
    /// The text of a store without nodes.
    static ProjectText empty();

    /// @param file how to name the file in errors.
    /// @return nothing when the text is incomplete: empty, or ending before the last line of its body.
    /// @throws StoreError when it is not a project's text at all or of a later format.
    static std::optional<ProjectText> read(std::string bytes, std::string const& file);

    ProjectText(ProjectText&&) noexcept;
    ProjectText& operator=(ProjectText&&) noexcept;
    ~ProjectText();

    /// What is stored directly below an address, sorted. One search of the lines, then the children.
    Children children(Address const& parent) const;

    /// Takes in bytes that were appended behind what was read, if they are whole batches that chain to it.
    /// @return what differs by them, sorted; nothing, and the text unchanged, when they are anything else.
    std::optional<std::vector<Difference>> extend(std::string_view added);

    /// The same for lines of which it is known what they change. @return false for anything else.
    bool append(std::string_view lines);

    /// The lines of a batch with its closing line, to be appended behind this text.
    /// @throws StoreError when an address or a node is deeper than what the text can hold.
    std::string tailFor(Batch const& batch) const;

    /// This text with a batch in it (perhaps an empty one), as a body without a tail. Damage is left out.
    /// @throws StoreError as tailFor does.
    ProjectText rewrittenWith(Batch const& batch) const;

    /// What differs from this text to the other, sorted.
    std::vector<Difference> differencesTo(ProjectText const& other) const;

    /// All the bytes that were read or would be written, body and tail, a torn tail included.
    std::size_t size() const noexcept;
    std::size_t bodySize() const noexcept;
    std::size_t tailSize() const noexcept;
    bool hasSameBytes(std::string_view bytes) const noexcept;
    std::string bytes() const;

    /// The body's bytes, which for a text without a tail is all of them.
    std::string const& body() const noexcept;

    /// True when nothing follows the body and the body is in canonical form, so that writing the text anew
    /// would give the same bytes.
    bool isTidy() const noexcept;

    bool hasTornTail() const noexcept;

    /// By line.
    std::vector<Fault> const& faults() const noexcept;

    /// The damaged lines and batches as they stand in the text, with their line ends.
    std::string damagedLines() const;

private:
    class State;

    explicit ProjectText(std::unique_ptr<State> state) noexcept;

    std::unique_ptr<State> state_;
};

} // namespace project::stores
