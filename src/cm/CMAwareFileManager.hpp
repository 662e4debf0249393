#pragma once

#include "cm/CMProjectFileEventHandler.hpp"
#include "project/decorators/FileManagerDecorator.hpp"

namespace project::management {

/// Notes files before they are added or removed, because the store notifies its listener during the change.
class CMAwareFileManager : public FileManagerDecorator {
public:
    /// @param inner borrowed, as the handler is; both must outlive this object.
    CMAwareFileManager(FileManager& inner, CMProjectFileEventHandler& handler);

    void add(std::vector<Path> const& files) override;
    std::vector<Path> remove(std::vector<Path> const& files) override;

private:
    CMProjectFileEventHandler& handler_;
};

} // namespace project::management
