#pragma once

#include <memory>
#include <string>

#include "project/core/ProjectManager.hpp"
#include "project/metadata/MetadataManager.hpp"

namespace project::management {

using metadata::Path;

/// The project manager over a metadata store. Other project managers wrap it; this one alone accesses the
/// store.
///
/// The constructor reads and writes nothing. Call create for a new project. The name and the description are
/// two nodes, so that a write of one does not affect the other.
class PROJECT_MANAGEMENT_EXPORT ProjectManagerBase : public ProjectManager {
public:
    /// Key of the project's name.
    static std::u16string const NAME_FIELD;
    /// Key of the project's description; the only key in lower case.
    static std::u16string const DESCRIPTION_FIELD;
    /// Location of the only step of the name's address.
    static std::u16string const ROOT_METADATA;
    /// Location of the first step of the description's address.
    static std::u16string const ROOT_EXTENSTION;
    /// Type of the second step of the description's address.
    static std::u16string const TYPE_EXTENSTION;
    /// Location of the second step of the description's address.
    static std::u16string const INFORMATION;

    /// @param projectRoot the project's root folder, absolute and canonical.
    /// @param metadataManager the project's store, which the managers of this project share.
    ProjectManagerBase(Path projectRoot, std::shared_ptr<metadata::MetadataManager> metadataManager);
    ~ProjectManagerBase() override;
    ProjectManagerBase(ProjectManagerBase const&) = delete;
    ProjectManagerBase& operator=(ProjectManagerBase const&) = delete;

    EntryPointManager& getEntryPointManager() override;
    FileManager& getFileManager() override;
    LabelManager& getLabelManager() override;
    ProjectReferenceManager& getProjectReferenceManager() override;
    ProjectPathManager& getProjectPathManager() override;
    void setName(std::u16string const& name) override;
    std::u16string getName() const override;
    std::u16string getDescription() const override;
    void setDescription(std::u16string const& description) override;
    void subscribe(std::weak_ptr<metadata::FileChangeRequestListener> listener) override;
    void create(std::u16string const& name) override;

    /// Returns the address of the name, which is the same in every project.
    static metadata::MetadataPath getRootNodePath();

    /// Returns the address of the description, which is the same in every project.
    static metadata::MetadataPath getDescriptionNodePath();

private:
    std::u16string read(metadata::MetadataPath const& path, std::u16string const& key) const;
    void write(metadata::MetadataPath const& path, std::u16string const& key, std::u16string const& value);

    std::shared_ptr<metadata::MetadataManager> metadataManager_;
    Path projectRoot_;
    // Destroyed in reverse order: the later managers use the earlier ones.
    std::unique_ptr<FileManager> fileManager_;
    std::unique_ptr<LabelManager> labelManager_;
    std::unique_ptr<EntryPointManager> entryPointManager_;
    std::unique_ptr<ProjectReferenceManager> projectReferenceManager_;
    std::unique_ptr<ProjectPathManager> projectPathManager_;
};

} // namespace project::management
