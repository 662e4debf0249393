#include "tree/ListenerList.hpp"

#include <algorithm>

namespace project::stores {

void ListenerList::add(std::weak_ptr<Listener> listener) {
    std::lock_guard const guard(mutex_);
    std::erase_if(listeners_, [](auto const& known) { return known.expired(); });
    listeners_.push_back(std::move(listener));
}

std::vector<std::shared_ptr<ListenerList::Listener>> ListenerList::accepting() {
    std::vector<std::shared_ptr<Listener>> result;
    {
        std::lock_guard const guard(mutex_);
        for (auto const& weak : listeners_) {
            if (auto listener = weak.lock()) {
                result.push_back(std::move(listener));
            }
        }
    }
    // Without the mutex, so that a listener may subscribe another one during the call.
    std::erase_if(result, [](auto const& listener) { return !listener->acceptsFileChangeRequests(); });
    return result;
}

void ListenerList::Notification::notify(FileChanges files, Always always) {
    current_ = listeners_.accepting();
    files_ = std::move(files);
    auto const additions = [&] {
        if (always.addition || !files_.added.empty()) {
            notifyAll(Kind::Addition, files_.added);
        }
    };
    if (!always.removal) {
        additions();
    }
    if (always.removal || !files_.removed.empty()) {
        notifyAll(Kind::Removal, files_.removed);
    }
    if (always.removal) {
        additions();
    }
}

void ListenerList::Notification::notifyAll(Kind kind, std::vector<Path> const& files) {
    for (auto const& listener : current_) {
        notify(*listener, kind, files);
        notified_.emplace_back(listener, kind);
    }
}

void ListenerList::Notification::notify(Listener& listener, Kind kind, std::vector<Path> const& files) {
    if (kind == Kind::Addition) {
        listener.fileAdditionRequested(store_, files);
    } else {
        listener.fileRemovalRequested(store_, metadataRoot_, files);
    }
}

void ListenerList::Notification::notifyOfReverse() noexcept {
    for (auto entry = notified_.rbegin(); entry != notified_.rend(); ++entry) {
        bool const wasAddition = entry->second == Kind::Addition;
        auto const& files = wasAddition ? files_.added : files_.removed;
        if (files.empty()) {
            continue;
        }
        try {
            notify(*entry->first, wasAddition ? Kind::Removal : Kind::Addition, files);
        } catch (...) {
            // The caller must get the error of the write, not this one.
            continue;
        }
    }
}

} // namespace project::stores
