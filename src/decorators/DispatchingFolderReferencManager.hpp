#pragma once

#include <utility>
#include <vector>

#include "project/decorators/FolderReferenceManagerDecorator.hpp"

namespace project::management {

/// A list of folder references that calls a function after each change.
/// @tparam Dispatch a function object without arguments that raises the event of this list.
template <typename Dispatch>
class DispatchingFolderReferencManager : public FolderReferenceManagerDecorator {
public:
    /// @param inner borrowed; must outlive this object.
    DispatchingFolderReferencManager(FolderReferenceManager& inner, Dispatch dispatch)
        : FolderReferenceManagerDecorator(inner), dispatch_(std::move(dispatch)) {}

    void addReferences(std::vector<FolderReference> const& references) override {
        FolderReferenceManagerDecorator::addReferences(references);
        dispatch_();
    }

    void removeReferences(std::vector<FolderReference> const& references) override {
        FolderReferenceManagerDecorator::removeReferences(references);
        dispatch_();
    }

private:
    Dispatch dispatch_;
};

} // namespace project::management
