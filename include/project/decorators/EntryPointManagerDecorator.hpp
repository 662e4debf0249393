#pragma once

#include <memory>
#include <string>
#include <vector>

#include "project/core/EntryPointManager.hpp"

namespace project::management {

/// An entry point manager that forwards every operation to another one. Results, errors and locks are those
/// of the other one.
class PROJECT_MANAGEMENT_EXPORT EntryPointManagerDecorator : public EntryPointManager {
public:
    /// @param inner borrowed; must outlive this object.
    explicit EntryPointManagerDecorator(EntryPointManager& inner);
    ~EntryPointManagerDecorator() override;

    void setEntryPoint(EntryPoint& entryPoint) override;
    std::vector<std::unique_ptr<EntryPoint>> getEntryPoints() override;
    std::unique_ptr<EntryPoint> getEntryPoint(Path file) override;
    void removeEntryPoint(Path file) override;
    std::vector<std::unique_ptr<EntryPointGroup>> getEntryPointGroups() override;
    void deleteEntryPointGroup(EntryPointGroup const& group) override;
    void createEntryPointGroup(EntryPointGroup const& group) override;
    void renameEntryPointGroup(EntryPointGroup const& group, std::u16string const& newName) override;

private:
    EntryPointManager& inner_;
};

} // namespace project::management
