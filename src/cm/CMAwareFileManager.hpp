#pragma once

#include "cm/CMProjectFileEventHandler.hpp"
#include "project/decorators/FileManagerDecorator.hpp"

namespace project::management {

/// Notes the files that are to be added or removed before they are, since the store reports its own files
/// from within the change.
class CMAwareFileManager : public FileManagerDecorator {
public:
    /// @param inner borrowed, as is the handler; both must outlive this object.
    CMAwareFileManager(FileManager& inner, CMProjectFileEventHandler& handler);

    void add(std::vector<Path> const& files) override;
    std::vector<Path> remove(std::vector<Path> const& files) override;

private:
    CMProjectFileEventHandler& handler_;
};

} // namespace project::management
