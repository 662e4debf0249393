#pragma once

#include <optional>
#include <vector>

#include "project/core/FolderReferenceManager.hpp"

namespace project::management {

/// A list of folder references that forwards every operation to another one. Results, errors and locks are
/// those of the other one.
class PROJECT_MANAGEMENT_EXPORT FolderReferenceManagerDecorator : public FolderReferenceManager {
public:
    /// @param inner borrowed; must outlive this object.
    explicit FolderReferenceManagerDecorator(FolderReferenceManager& inner);
    ~FolderReferenceManagerDecorator() override;

    std::vector<FolderReference> getReferences() const override;
    void addReferences(std::vector<FolderReference> const& references) override;
    void removeReferences(std::vector<FolderReference> const& references) override;
    bool isReference(Path const& path) const override;
    std::optional<FolderReference> getRootReferenceFor(Path const& path) const override;

private:
    FolderReferenceManager& inner_;
};

} // namespace project::management
