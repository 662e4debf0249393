#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <map>
#include <memory>
#include <string>
#include <string_view>

namespace project::stores {

/// The types of the elements of a tree, each stored once. An entry of the tree stores an index.
///
/// index adds types and must not run at the same time as itself. A thread may read the type of an index at
/// any time after it has received the index from the thread that added it: types never move.
class TypeTable {
public:
    using Index = std::uint32_t;

    /// The index of a type, which is added if it is new.
    /// @throws std::length_error if there are more types than entries have room for.
    Index index(std::u16string_view type);

    std::u16string const& operator[](Index index) const noexcept;

private:
    static constexpr std::size_t segmentCount = 27; ///< of which the segment i has room for 2^i types

    std::array<std::unique_ptr<std::u16string[]>, segmentCount> segments_;
    std::map<std::u16string_view, Index> indexes_;
    Index last_ = 0; ///< the last one that index returned: siblings mostly have the same type
};

} // namespace project::stores
