#pragma once

#include <memory>
#include <string>
#include <vector>

#include "project/core/FileManager.hpp"

namespace project::management {

/// A file manager that forwards every operation to another one. Results, errors and locks are those of the
/// other one.
class PROJECT_MANAGEMENT_EXPORT FileManagerDecorator : public FileManager {
public:
    /// @param inner borrowed; must outlive this object.
    explicit FileManagerDecorator(FileManager& inner);
    ~FileManagerDecorator() override;

    Path getProjectRoot() override;
    std::unique_ptr<FileMetadataManager> getFileMetadataManagerFor(std::u16string const& scope) override;
    void add(std::vector<Path> const& files) override;
    bool isFileInProject(Path const& path) const override;
    std::vector<Path> remove(std::vector<Path> const& files) override;
    std::vector<Path> getChildProjectFiles(Path const& path) const override;
    std::vector<Path> getProjectFiles() const override;
    std::vector<FileLabel> addLabels(std::vector<Path> const& files,
                                     std::vector<Label> const& labels) override;
    void removeLabels(std::vector<Path> const& files, std::vector<Label> const& labels) override;
    std::vector<LabelIDSet> getLabelIDSets(Path const& path) override;
    std::vector<FileLabel> getLabels(Path const& path) override;
    void removeCategory(std::vector<Path> const& files, CategoryIdentifier const& category) override;

private:
    FileManager& inner_;
};

} // namespace project::management
