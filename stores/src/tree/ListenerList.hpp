#pragma once

#include <memory>
#include <mutex>
#include <utility>
#include <vector>

#include "project/metadata/FileChangeRequestListener.hpp"
#include "project/metadata/MetadataManager.hpp"
#include "project/stores/Change.hpp"

namespace project::stores {

/// The listeners of a store, held weakly. Adding is safe from any thread.
class ListenerList {
public:
    using Listener = metadata::FileChangeRequestListener;

    /// The notifications that are sent even without files. The others are sent only if there are files.
    struct Always {
        bool addition = false;
        bool removal = false;
    };

    class Notification;

    void add(std::weak_ptr<Listener> listener);

    /// The listeners that still exist and accept notifications, in the order in which they were added.
    std::vector<std::shared_ptr<Listener>> accepting();

private:
    std::mutex mutex_;
    std::vector<std::weak_ptr<Listener>> listeners_;
};

/// Notifies all listeners of the files of one write. If the write is rolled back, notifies them of the
/// reverse.
class ListenerList::Notification {
public:
    Notification(ListenerList& listeners, metadata::MetadataManager& store, Path const& metadataRoot)
        : listeners_(listeners), store_(store), metadataRoot_(metadataRoot) {}

    /// Removals precede additions if the notification of removals is sent in any case.
    ///
    /// An exception of a listener propagates to the caller; the listeners after it are not notified.
    void notify(FileChanges files, Always always);

    /// Notifies each listener that was notified, the last one first, that its files were deleted or restored.
    void notifyOfReverse() noexcept;

private:
    enum class Kind { Addition, Removal };

    void notify(Listener& listener, Kind kind, std::vector<Path> const& files);
    void notifyAll(Kind kind, std::vector<Path> const& files);

    ListenerList& listeners_;
    metadata::MetadataManager& store_;
    Path const& metadataRoot_;
    std::vector<std::shared_ptr<Listener>> current_;
    FileChanges files_;
    std::vector<std::pair<std::shared_ptr<Listener>, Kind>> notified_;
};

} // namespace project::stores
