#pragma once

#include <map>
#include <vector>

#include "PlatformExport.hpp"
#include "cmlink/FileState.hpp"
#include "fl/filesystem/Path.hpp"

namespace cmlink {

using fl::filesystem::Path;

/// A source-control system, as the layer that keeps it in step with a project's files sees it.
///
/// All paths are absolute. Each operation takes all that there is to do as one list, so that an adapter can
/// do it in one pass. What an adapter throws goes on to whoever caused the change, and undoes it.
class PROJECT_PLATFORM_EXPORT CMAdapter {
public:
    virtual ~CMAdapter();

    /// Places these files and folders under source control: of a folder nothing but what is named.
    virtual void addToSourceControl(std::vector<Path> const& files) = 0;

    /// Takes these files and folders, with all below them, out of source control. The disk is left alone.
    virtual void removeFromSourceControl(std::vector<Path> const& files) = 0;

    /// The state of each file that the adapter knows; one that it has no state for is absent.
    virtual std::map<Path, FileState> getFileStates(std::vector<Path> const& files) = 0;
};

} // namespace cmlink
