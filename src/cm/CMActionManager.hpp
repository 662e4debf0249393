#pragma once

#include <functional>
#include <vector>

#include "cmlink/CMAdapter.hpp"
#include "fl/filesystem/Path.hpp"

namespace project::management {

using fl::filesystem::Path;

/// Has a source-control adapter do what files that came into a project or left it call for, by their states.
///
/// An adapter sees two queries for each operation, also of an empty list: one ahead, and the one whose answer
/// is acted on. All that is to be done goes to it in one call. What it throws goes on to the caller, and
/// nothing further is done.
class CMActionManager {
public:
    /// @param adapter borrowed; must outlive this object.
    explicit CMActionManager(cmlink::CMAdapter& adapter);

    /// Places files that are not yet under source control there, with the folders between them and the root.
    /// @param root the project's root folder; not changed.
    void add(std::vector<Path> const& files, Path& root);

    /// Takes files out of source control that are in it. Their folders stay, also when they are left empty.
    void remove(std::vector<Path> const& files);

private:
    using Filter = std::function<bool(cmlink::LocalStatus)>;
    using Action = std::function<void(std::vector<Path> const&)>;

    /// Asks for the states of the files, and does something with all those that pass the filter, unless there
    /// are none. A file without a state passes no filter.
    void actOnFilesWithStatus(std::vector<Path> const& files, Filter const& filter, Action const& action);

    cmlink::CMAdapter& adapter_;
};

} // namespace project::management
