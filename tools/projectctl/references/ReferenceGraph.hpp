#pragma once

#include <cstddef>
#include <map>
#include <string>
#include <vector>

#include "fl/filesystem/Path.hpp"

namespace projectctl {

using fl::filesystem::Path;

/// The graph of references between projects, beginning with one project. Every project that is reached is
/// opened and read once.
class ReferenceGraph {
public:
    enum class State {
        Project,
        NoFolder,   ///< the folder does not exist
        NoProject,  ///< the folder exists but does not contain a project
        Unreadable, ///< the folder contains a project that cannot be read
    };

    struct Reference {
        std::size_t to;      ///< index of a node
        std::u16string text; ///< the stored path
        std::u16string type; ///< "Relative" or "Absolute"
        bool closesCycle;    ///< it leads back to a project on the current path
    };

    struct Node {
        Path folder; ///< canonical
        State state;
        std::u16string name;               ///< empty unless the project could be read
        std::string problem;               ///< the reason if it cannot be read
        std::vector<Reference> references; ///< by location
    };

    /// @param root of the first project, canonical.
    explicit ReferenceGraph(Path const& root);

    /// All projects that are reached; the first project is the first element.
    std::vector<Node> const& nodes() const noexcept { return nodes_; }

    /// For each reference that closes a cycle, the projects on the cycle, in the order of their references.
    std::vector<std::vector<std::size_t>> const& cycles() const noexcept { return cycles_; }

    /// Whether all referenced projects can be read and none references itself, directly or indirectly.
    bool isSound() const;

private:
    enum class Progress { Unread, OnCurrentPath, Done };

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
    std::vector<Step> currentPath_; ///< from the first project to the one that is being followed
    std::vector<std::vector<std::size_t>> cycles_;
};

} // namespace projectctl
