#pragma once

#include <string>
#include <vector>

#include "project/core/LabelManager.hpp"

namespace project::management {

/// A label manager that forwards every operation to another one. Results, errors and locks are those of the
/// other one.
class PROJECT_MANAGEMENT_EXPORT LabelManagerDecorator : public LabelManager {
public:
    /// @param inner borrowed; must outlive this object.
    explicit LabelManagerDecorator(LabelManager& inner);
    ~LabelManagerDecorator() override;

    void createCategory(CategoryIdentifier const& category) override;
    CategoryIdentifier getCategoryByUUID(std::u16string const& uuid) override;
    void deleteCategory(CategoryIdentifier const& category) override;
    void renameCategory(CategoryIdentifier const& category, std::u16string const& newName) override;
    std::vector<CategoryIdentifier> getAllCategories() override;
    void createLabel(CategoryIdentifier const& category, LabelIdentifier const& label) override;
    std::vector<LabelIdentifier> getLabels(CategoryIdentifier const& category) override;
    LabelIdentifier getLabelByUUID(CategoryIdentifier const& category, std::u16string uuid) override;
    void deleteLabel(CategoryIdentifier const& category, LabelIdentifier const& label) override;

private:
    LabelManager& inner_;
};

} // namespace project::management
