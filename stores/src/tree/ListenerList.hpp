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

    /// The report that is made even when it names no file; the other is made only for files.
    enum class Always { Addition, Removal, None };

    class Report;

    void add(std::weak_ptr<Listener> listener);

    /// Those that are still there and accept reports, in the order in which they came.
    std::vector<std::shared_ptr<Listener>> accepting();

private:
    std::mutex mutex_;
    std::vector<std::weak_ptr<Listener>> listeners_;
};

/// Tells all listeners of the files of one write, and remembers what was told, to tell the reverse when the
/// write is undone.
class ListenerList::Report {
public:
    Report(ListenerList& listeners, metadata::MetadataManager& store, Path const& metadataRoot)
        : listeners_(listeners), store_(store), metadataRoot_(metadataRoot) {}

    /// What a listener throws goes on to the caller; listeners after it are not told.
    void tell(FileChanges files, Always always);

    /// Tells each listener that was told, the last first, that its files went or came back.
    void tellReverse() noexcept;

private:
    enum class Kind { Addition, Removal };

    void tell(Listener& listener, Kind kind, std::vector<Path> const& files);
    void tellAll(Kind kind, std::vector<Path> const& files);

    ListenerList& listeners_;
    metadata::MetadataManager& store_;
    Path const& metadataRoot_;
    std::vector<std::shared_ptr<Listener>> current_;
    FileChanges files_;
    std::vector<std::pair<std::shared_ptr<Listener>, Kind>> told_;
};

} // namespace project::stores
