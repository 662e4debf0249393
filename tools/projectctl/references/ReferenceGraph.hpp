#pragma once

#include <cstddef>
#include <map>
#include <string>
#include <vector>

#include "fl/filesystem/Path.hpp"

namespace projectctl {

using fl::filesystem::Path;

/// Which projects reference which, from one project on. Every project that is reached is opened and read
/// once.
class ReferenceGraph {
public:
    enum class State {
        Project,
        NoFolder,   ///< the folder is not there
        NoProject,  ///< the folder is there and holds no project
        Unreadable, ///< there is a project, and it cannot be read
    };

    struct Reference {
        std::size_t to;      ///< index of a node
        std::u16string text; ///< the path that is kept
        std::u16string type; ///< "Relative" or "Absolute"
        bool closesCycle;    ///< it leads back to a project on the way here
    };

    struct Node {
        Path folder; ///< canonical
        State state;
        std::u16string name;               ///< of a project that could be read
        std::string problem;               ///< why it cannot be read
        std::vector<Reference> references; ///< by location
    };

    /// @param root of the project to begin with, canonical.
    explicit ReferenceGraph(Path const& root);

    /// The first one is where it begins.
    std::vector<Node> const& nodes() const noexcept { return nodes_; }

    /// For each reference that closes a cycle, the projects on the cycle in the order of their references.
    std::vector<std::vector<std::size_t>> const& cycles() const noexcept { return cycles_; }

    /// Whether all that is referenced can be read and no project references itself, by whatever way.
    bool isSound() const;

private:
    enum class Progress { Unread, OnTheWay, Done };

    struct Step {
        std::size_t node;
        std::size_t next; ///< the reference to follow next
    };

    std::size_t indexOf(Path const& folder);
    void enter(std::size_t index);
    void follow(std::size_t from, std::size_t reference);

    std::vector<Node> nodes_;
    std::vector<Progress> progress_; ///< of each node
    std::map<Path, std::size_t> indices_;
    std::vector<Step> way_; ///< from where it begins to where we are
    std::vector<std::vector<std::size_t>> cycles_;
};

} // namespace projectctl
