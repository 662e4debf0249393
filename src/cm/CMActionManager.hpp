#pragma once

#include <functional>
#include <vector>

#include "cmlink/CMAdapter.hpp"
#include "fl/filesystem/Path.hpp"

namespace project::management {

using fl::filesystem::Path;

/// Lets a source-control adapter add or remove files that were added to or removed from a project,
/// depending on their states.
///
/// The adapter gets two queries for each operation, even for an empty list. Only the answer to the second
/// one counts. All files to add or remove are passed in one call. An exception of the adapter propagates to
/// the caller and ends the operation.
class CMActionManager {
public:
    /// @param adapter borrowed; must outlive this object.
    explicit CMActionManager(cmlink::CMAdapter& adapter);

    /// Adds the files that are not yet under source control, with the folders between them and the root.
    /// @param root the project's root folder; not changed.
    void add(std::vector<Path> const& files, Path& root);

    /// Removes the files that are under source control from it. Their folders stay, even if they are now
    /// empty.
    void remove(std::vector<Path> const& files);

private:
    using Filter = std::function<bool(cmlink::LocalStatus)>;
    using Action = std::function<void(std::vector<Path> const&)>;

    /// Queries the states of the files and runs the action on those that pass the filter, if there are any.
    /// A file without a state passes no filter.
    void actOnFilesWithStatus(std::vector<Path> const& files, Filter const& filter, Action const& action);

    cmlink::CMAdapter& adapter_;
};

} // namespace project::management
