#pragma once

#include "project/decorators/DispatchableProjectEventBroadcaster.hpp"
#include "project/decorators/FileManagerDecorator.hpp"

namespace project::management {

/// Raises an event after each change of the file list and of the labels on files.
///
/// removeCategory raises no event, and writes through getFileMetadataManagerFor are not seen here.
class EventBroadcastingFileManager : public FileManagerDecorator {
public:
    /// @param inner borrowed, as is the broadcaster; both must outlive this object.
    EventBroadcastingFileManager(FileManager& inner, DispatchableProjectEventBroadcaster& broadcaster);

    void add(std::vector<Path> const& files) override;
    std::vector<Path> remove(std::vector<Path> const& files) override;
    std::vector<FileLabel> addLabels(std::vector<Path> const& files,
                                     std::vector<Label> const& labels) override;
    void removeLabels(std::vector<Path> const& files, std::vector<Label> const& labels) override;

private:
    DispatchableProjectEventBroadcaster& broadcaster_;
};

} // namespace project::management
