#pragma once

#include <csignal>

#include "project/metadata/FileChangeRequestListener.hpp"

namespace projectctl {

/// Lets a write finish: from the moment when the store notifies its listeners, Ctrl-C and similar signals are
/// blocked until this object is destroyed. Before that moment they end the process at once, and nothing was
/// written.
class WriteShield : public project::metadata::FileChangeRequestListener {
public:
    ~WriteShield() override;

    /// Blocks the signals from now on, for a write that does not notify listeners.
    void raise();

    void fileRemovalRequested(project::metadata::MetadataManager& store,
                              project::metadata::Path const& metadataRoot,
                              std::vector<project::metadata::Path> const& files) override;
    void fileAdditionRequested(project::metadata::MetadataManager& store,
                               std::vector<project::metadata::Path> const& files) override;
    bool acceptsFileChangeRequests() override;

private:
    bool isRaised_ = false;
    sigset_t before_{};
};

} // namespace projectctl
