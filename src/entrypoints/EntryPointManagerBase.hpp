#pragma once

#include <map>
#include <memory>
#include <string>
#include <vector>

#include "project/core/EntryPointManager.hpp"
#include "project/core/FileManager.hpp"
#include "project/entrypoints/EntryPoint.hpp"
#include "project/metadata/MetadataManager.hpp"

namespace project::management {

/// The entry points and their groups over a metadata store. It keeps nothing in memory and has no index: the
/// search for the entry point of a file reads one node after the other.
///
/// An entry point is stored under its UUID, with its file as a key. The file list does not refer to entry
/// points, so an entry point can exist whose file is not in the project. It stays stored and is left out of
/// every result.
class EntryPointManagerBase : public EntryPointManager {
public:
    /// @param fileManager must outlive this object.
    EntryPointManagerBase(std::shared_ptr<metadata::MetadataManager> metadataManager,
                          FileManager* fileManager, Path projectRoot);

    void setEntryPoint(EntryPoint& entryPoint) override;
    std::vector<std::unique_ptr<EntryPoint>> getEntryPoints() override;
    std::unique_ptr<EntryPoint> getEntryPoint(Path file) override;
    void removeEntryPoint(Path file) override;

    // The group operations are defined in EntryPointManagerGroups.cpp.
    std::vector<std::unique_ptr<EntryPointGroup>> getEntryPointGroups() override;
    void deleteEntryPointGroup(EntryPointGroup const& group) override;
    void createEntryPointGroup(EntryPointGroup const& group) override;
    void renameEntryPointGroup(EntryPointGroup const& group, std::u16string const& newName) override;

private:
    using MetadataPath = metadata::MetadataPath;
    using GroupMap = std::map<std::u16string, std::unique_ptr<EntryPointGroup>>;

    void requireInProject(Path const& file) const;
    std::u16string storedFile(Path const& file) const;
    std::vector<MetadataPath> getEntryPointNodes() const;
    std::u16string findUUIDForFile(Path const& file) const;
    std::u16string uuidToWrite(EntryPoint const& entryPoint) const;
    std::unique_ptr<EntryPoint> readEntryPoint(MetadataPath const& path, GroupMap const& groups) const;
    void writeEntryPoint(EntryPoint const& entryPoint);

    GroupMap getGroupMap();
    bool hasGroup(std::u16string const& uuid, std::u16string const& name);
    void checkNewGroup(EntryPointGroup const& group);
    void writeGroup(EntryPointGroup const& group);
    void write(MetadataPath const& path, std::shared_ptr<metadata::MetadataNode> node);

    std::shared_ptr<metadata::MetadataManager> metadataManager_;
    FileManager* fileManager_;
    Path projectRoot_;
};

} // namespace project::management
