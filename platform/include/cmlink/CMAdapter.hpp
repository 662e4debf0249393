#pragma once

#include <map>
#include <vector>

#include "PlatformExport.hpp"
#include "cmlink/FileState.hpp"
#include "fl/filesystem/Path.hpp"

namespace cmlink {

using fl::filesystem::Path;

/// A source-control system that is kept in step with the files of a project.
///
/// All paths are absolute. Each operation gets all its files in one list, so that an adapter can process them
/// in one pass. An exception thrown by an adapter rolls the change back and propagates to the caller that
/// made it.
class PROJECT_PLATFORM_EXPORT CMAdapter {
public:
    virtual ~CMAdapter();

    /// Places these files and folders under source control. The contents of a folder are not added.
    virtual void addToSourceControl(std::vector<Path> const& files) = 0;

    /// Removes these files and folders, with everything below them, from source control. The files on disk
    /// stay.
    virtual void removeFromSourceControl(std::vector<Path> const& files) = 0;

    /// Returns the states of the files. A file whose state the adapter does not know is absent.
    virtual std::map<Path, FileState> getFileStates(std::vector<Path> const& files) = 0;
};

} // namespace cmlink
