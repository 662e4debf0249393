#pragma once

#include <memory>

#include "cmlink/CMAdapter.hpp"
#include "project/decorators/ProjectManagerDecorator.hpp"

namespace project::management {

/// Wraps a project so that source control follows it: what is added through it is placed under source
/// control together with its folders and the files that the store writes for it, and what is removed is taken
/// out.
///
/// The adapter is called from within the store's write, once for each report of the store, on the thread that
/// writes and under the store's write lock. It gets what the store reports together with what add and remove
/// of the file manager were given since the last report of that kind; so what an operation was given that the
/// project then refused goes to the adapter with the next write, whichever that is. What the adapter throws
/// goes on to the store, which may undo the write; those files are not given to the adapter again.
///
/// Calls of add and remove on one project must not overlap.
class PROJECT_MANAGEMENT_EXPORT CMAwareProjectManager : public ProjectManagerDecorator {
public:
    /// Subscribes to the store's reports; otherwise neither store nor adapter is touched.
    /// @param inner the project to wrap, which goes with this object; not null.
    /// @param adapter borrowed; must outlive this object.
    CMAwareProjectManager(std::unique_ptr<ProjectManager> inner, cmlink::CMAdapter& adapter);
    ~CMAwareProjectManager() override;
};

} // namespace project::management
