#pragma once

#include <csignal>

#include "project/metadata/FileChangeRequestListener.hpp"

namespace projectctl {

/// Lets a write that has begun come to its end: from the moment at which the store tells of it, Ctrl-C and
/// its like wait until this object goes. Before that moment they end the process at once, and nothing has
/// happened.
class WriteShield : public project::metadata::FileChangeRequestListener {
public:
    ~WriteShield() override;

    /// Holds the signals back from now on, for a write of which no listener is told.
    void raise();

    void fileRemovalRequested(project::metadata::MetadataManager& store,
                              project::metadata::Path const& metadataRoot,
                              std::vector<project::metadata::Path> const& files) override;
    void fileAdditionRequested(project::metadata::MetadataManager& store,
                               std::vector<project::metadata::Path> const& files) override;
    bool acceptsFileChangeRequests() override;

private:
    bool raised_ = false;
    sigset_t before_{};
};

} // namespace projectctl
