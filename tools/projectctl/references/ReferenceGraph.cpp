#include "references/ReferenceGraph.hpp"

#include <algorithm>
#include <exception>
#include <functional>

#include "project/OpenProject.hpp"
#include "project/ProjectFolder.hpp"
#include "project/metadata/MetadataFunctions.hpp"
#include "project/references/FolderReference.hpp"
#include "references/ReferenceLists.hpp"

namespace projectctl {

using project::management::FolderReference;

namespace {

ReferenceGraph::State stateOf(Path const& folder) {
    if (findProjectIn(folder) != ProjectTrace::None) {
        return ReferenceGraph::State::Project;
    }
    return project::metadata::is_directory(folder) ? ReferenceGraph::State::NoProject
                                                   : ReferenceGraph::State::NoFolder;
}

} // namespace

ReferenceGraph::ReferenceGraph(Path const& root) {
    enter(indexOf(root));
    while (!currentPath_.empty()) { // not recursively: other people decide how long a path is
        auto& here = currentPath_.back();
        if (here.next < nodes_[here.node].references.size()) {
            follow(here.node, here.next++);
        } else {
            progress_[here.node] = Progress::Done;
            currentPath_.pop_back();
        }
    }
}

bool ReferenceGraph::isSound() const {
    return cycles_.empty() &&
           std::ranges::all_of(nodes_, [](Node const& node) { return node.state == State::Project; });
}

std::size_t ReferenceGraph::indexOf(Path const& folder) {
    auto const [found, isNew] = indices_.try_emplace(folder, nodes_.size());
    if (isNew) {
        nodes_.push_back({folder, stateOf(folder), {}, {}, {}});
        progress_.push_back(Progress::Unread);
    }
    return found->second;
}

void ReferenceGraph::enter(std::size_t index) {
    progress_[index] = Progress::OnCurrentPath;
    currentPath_.push_back({index, 0});
    if (nodes_[index].state != State::Project) {
        return;
    }
    try {
        OpenProject project(nodes_[index].folder);
        nodes_[index].name = project.manager().getName();
        auto references = projectReferences().manager(project).getReferences();
        std::ranges::stable_sort(references, std::less<>(), &FolderReference::getLocation);
        for (auto const& reference : references) {
            std::size_t const to = indexOf(followed(reference.getLocation()));
            nodes_[index].references.push_back({to, reference.getStoredPath(), reference.getType(), false});
        }
    } catch (std::exception const& error) {
        nodes_[index].state = State::Unreadable;
        nodes_[index].problem = error.what();
    }
}

void ReferenceGraph::follow(std::size_t from, std::size_t reference) {
    auto& followed = nodes_[from].references[reference];
    if (progress_[followed.to] == Progress::Unread) {
        enter(followed.to);
    } else if (progress_[followed.to] == Progress::OnCurrentPath) {
        followed.closesCycle = true;
        auto& cycle = cycles_.emplace_back();
        for (auto step = std::ranges::find(currentPath_, followed.to, &Step::node);
             step != currentPath_.end(); ++step) {
            cycle.push_back(step->node);
        }
    }
}

} // namespace projectctl
