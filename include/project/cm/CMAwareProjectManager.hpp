#pragma once

#include <memory>

#include "cmlink/CMAdapter.hpp"
#include "project/cm/NotedFiles.hpp"
#include "project/decorators/ProjectManagerDecorator.hpp"

namespace project::management {

class InternalCMAwareProjectManager;

/// Wraps a project so that source control follows it. Files that are added through it are put under source
/// control, together with their folders and the files that the store creates for them. Files that are
/// removed are removed from source control.
///
/// The adapter is called during the store's write, once for each notification of the store, on the writing
/// thread and under the store's write lock. It gets the store's files together with the files that were
/// passed to the file manager's add or remove since the last notification of that kind. Files of an
/// operation that the project refused therefore reach the adapter with the next write, whichever that is.
/// An exception of the adapter propagates to the store, which may roll the write back; these files are not
/// passed to the adapter again.
///
/// If several threads use the project, hold the store's write guard around each add and remove, because a
/// write of another thread would pass the files to the adapter too early. A session does this itself.
///
/// Deliberately two-level: the wrapped project is an InternalCMAwareProjectManager, which has all the
/// state, so that this public class stays the same when the state changes.
class PROJECT_MANAGEMENT_EXPORT CMAwareProjectManager : public ProjectManagerDecorator {
public:
    /// Subscribes to the store's reports; does not use the store or the adapter otherwise.
    /// @param inner the project to wrap, owned by this object; not null.
    /// @param adapter borrowed; must outlive this object.
    CMAwareProjectManager(std::unique_ptr<ProjectManager> inner, cmlink::CMAdapter& adapter);
    ~CMAwareProjectManager() override;

    /// Replaces the files that wait for the next notification of the store. For a caller that collects
    /// several operations into one write and knows which of their files are added or removed in the end.
    /// Call it under the store's write guard.
    /// @return the files that have waited until now.
    NotedFiles exchangeNotedFiles(NotedFiles files);

private:
    /// Takes ownership.
    explicit CMAwareProjectManager(InternalCMAwareProjectManager* inner);

    InternalCMAwareProjectManager& inner_; ///< owned by the base class
};

} // namespace project::management
