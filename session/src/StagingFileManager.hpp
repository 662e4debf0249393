#pragma once

#include "DefinitionStager.hpp"
#include "project/decorators/FileManagerDecorator.hpp"

namespace project::session {

/// The file list, with the project's text staged after each change. What is written through
/// getFileMetadataManagerFor is staged with the next change.
class StagingFileManager : public management::FileManagerDecorator {
public:
    /// @param inner borrowed, as the stager is; both must outlive this object.
    StagingFileManager(management::FileManager& inner, DefinitionStager& stager);

    void add(std::vector<management::Path> const& files) override;
    std::vector<management::Path> remove(std::vector<management::Path> const& files) override;
    std::vector<management::FileLabel> addLabels(std::vector<management::Path> const& files,
                                                 std::vector<management::Label> const& labels) override;
    void removeLabels(std::vector<management::Path> const& files,
                      std::vector<management::Label> const& labels) override;
    void removeCategory(std::vector<management::Path> const& files,
                        management::CategoryIdentifier const& category) override;

private:
    DefinitionStager& stager_;
};

} // namespace project::session
