#include "support/CrashingDisk.hpp"

#include <utility>

#include "project/stores/StoreError.hpp"

namespace project::test {

using stores::FileContent;
using stores::FileIdentity;
using stores::StoreError;
using stores::WrittenFile;
using InjectedFault = CrashingVolume::InjectedFault;

namespace {

std::string kindOf(std::string const& name) {
    if (name.ends_with(".swap.tmp")) {
        return "swapping";
    }
    if (name.ends_with(".tmp")) {
        return "temporary";
    }
    return name.starts_with("displaced-") ? "displaced" : name.starts_with("damaged-") ? "damaged" : name;
}

} // namespace

CrashingDisk::~CrashingDisk() {
    unlock();
}

/// @param part the partial effect of a call that fails or at which the process dies. Its argument says
/// whether the process continues.
template <typename Effect, typename Part>
auto CrashingDisk::call(std::string const& name, Effect effect, Part part) {
    if (isDead_) {
        throw ProcessDied();
    }
    volume_->calls.push_back(name);
    if (volume_->beforeCall) {
        volume_->beforeCall(name);
    }
    auto const fault = volume_->nextFault(name);
    if (fault == InjectedFault::Fails || fault == InjectedFault::FailsForGood) {
        part(true);
        throw StoreError(StoreError::Kind::DiskFailed, folder(), 0, "the disk fails at \"" + name + "\"", "");
    }
    if (fault == InjectedFault::DiesBefore) {
        die();
    }
    if (fault == InjectedFault::DiesAmid) {
        part(false);
        die();
    }
    auto const result = effect();
    if (fault == InjectedFault::DiesAfter) {
        die();
    }
    if (volume_->afterCall) {
        volume_->afterCall(name);
    }
    return result;
}

template <typename Effect>
auto CrashingDisk::call(std::string const& name, Effect effect) {
    return call(name, effect, [](bool) {});
}

void CrashingDisk::die() {
    unlock();
    isDead_ = true;
    throw ProcessDied();
}

CrashingVolume::Names& CrashingDisk::names() {
    if (!folder_) {
        throw StoreError(StoreError::Kind::DiskFailed, folder(), 0, "is not open", "");
    }
    return folder_->names;
}

void CrashingDisk::bind(std::string const& name, std::shared_ptr<File> file) {
    volume_->bind(*folder_, name, std::move(file));
}

bool CrashingDisk::isTaken(std::string const& name) {
    return volume_->find(names(), name) != names().end();
}

bool CrashingDisk::isFailingForGood() const {
    return volume_->planned_ == InjectedFault::FailsForGood;
}

std::shared_ptr<CrashingDisk::File> CrashingDisk::find(std::string const& name) {
    auto const found = volume_->find(names(), name);
    if (found == names().end()) {
        throw StoreError(StoreError::Kind::DiskFailed, name, 0, "does not exist", "");
    }
    return found->second;
}

bool CrashingDisk::openFolder() {
    return call("openFolder", [this] {
        if (volume_->folder_ && volume_->folder_ != folder_) {
            unlock();
            folder_ = volume_->folder_;
        }
        return volume_->folder_ != nullptr;
    });
}

bool CrashingDisk::makeFolder() {
    auto const make = [this] {
        bool const isMade = !volume_->folder_;
        if (isMade) {
            volume_->makeFolderUnsynced();
        }
        volume_->syncRoot();
        if (folder_ != volume_->folder_) {
            unlock();
        }
        folder_ = volume_->folder_;
        return isMade;
    };
    return call("makeFolder", make, [this](bool continues) {
        // After a permanent fault it cannot be removed again.
        if (!volume_->folder_ && (!continues || isFailingForGood())) {
            volume_->makeFolderUnsynced();
        }
    });
}

void CrashingDisk::removeFolder() noexcept {
    try {
        call("removeFolder", [this] {
            if (folder_ && folder_ == volume_->folder_ && folder_->names.empty()) {
                volume_->removeFolderUnsynced();
            }
            return true;
        });
    } catch (...) {
        // the folder stays, or the process has died
    }
    unlock();
    folder_.reset();
}

bool CrashingDisk::isFolderInPlace() {
    return call("isFolderInPlace", [this] { return folder_ && folder_ == volume_->folder_; });
}

bool CrashingDisk::lock(std::chrono::milliseconds patience) {
    return call("lock", [this, patience] {
        names();
        if (folder_->lockedBy != nullptr && folder_->lockedBy != this) {
            volume_->advance(std::chrono::nanoseconds(patience).count());
            return false;
        }
        folder_->lockedBy = this;
        return true;
    });
}

void CrashingDisk::unlock() noexcept {
    if (folder_ && folder_->lockedBy == this) {
        folder_->lockedBy = nullptr;
    }
}

std::string CrashingDisk::lockHolder() {
    return call("lockHolder", [] { return std::string("process 4711 (another)"); });
}

std::optional<FileIdentity> CrashingDisk::identifyIn(CrashingVolume::Folder* where, std::string const& name) {
    if (where == nullptr) {
        return std::nullopt;
    }
    auto const found = volume_->find(where->names, name);
    if (found == where->names.end()) {
        return std::nullopt;
    }
    return CrashingVolume::identify(*found->second);
}

std::optional<FileIdentity> CrashingDisk::identifyByPath(std::string const& name) {
    return call("identifyByPath " + kindOf(name), [&] { return identifyIn(volume_->folder_.get(), name); });
}

std::optional<FileIdentity> CrashingDisk::identify(std::string const& name) {
    return call("identify " + kindOf(name), [&] {
        names();
        return identifyIn(folder_.get(), name);
    });
}

std::optional<FileContent> CrashingDisk::read(std::string const& name, std::uint64_t offset) {
    return call("read " + kindOf(name), [&]() -> std::optional<FileContent> {
        names();
        auto const identity = identifyIn(folder_.get(), name);
        if (!identity) {
            return std::nullopt;
        }
        if (!identity->isRegular) {
            throw StoreError(StoreError::Kind::Damaged, name, 0, "is not a regular file", "");
        }
        auto const& bytes = find(name)->bytes;
        return FileContent{offset < bytes.size() ? bytes.substr(offset) : std::string(), *identity};
    });
}

/// Writes as much as fits, and fails if that is not everything.
void CrashingDisk::writeWithinRoom(File& file, std::string_view bytes) {
    auto const& room = volume_->room;
    if (room && *room < bytes.size()) {
        volume_->write(file, bytes.substr(0, *room));
        volume_->room = 0;
        throw StoreError(StoreError::Kind::DiskFailed, folder(), 0, "No space left on device",
                         "Make room on the disk and try again.");
    }
    if (room) {
        volume_->room = *room - bytes.size();
    }
    volume_->write(file, bytes);
}

std::optional<WrittenFile> CrashingDisk::append(std::string const& name, FileIdentity const& expected,
                                                std::string_view bytes) {
    auto const write = [&]() -> std::optional<WrittenFile> {
        if (identifyIn(folder_.get(), name) != expected) {
            return std::nullopt;
        }
        written_ = find(name);
        if (volume_->amidAppend) {
            volume_->amidAppend();
        }
        writeWithinRoom(*written_, bytes);
        bool const isStamped = volume_->stamp(*written_);
        return WrittenFile{CrashingVolume::identify(*written_), isStamped};
    };
    return call("append " + kindOf(name), write, [&](bool) {
        if (identifyIn(folder_.get(), name) == expected) {
            volume_->write(*find(name), bytes.substr(0, volume_->pick(bytes.size() - 1)));
        }
    });
}

WrittenFile CrashingDisk::create(std::string const& name, std::string_view bytes,
                                 std::optional<std::string> const& like) {
    auto const make = [&] {
        written_ = volume_->makeFile("");
        if (isTaken(name)) {
            throw StoreError(StoreError::Kind::DiskFailed, name, 0, "exists already", "");
        }
        bind(name, written_);
        try {
            writeWithinRoom(*written_, bytes);
        } catch (StoreError const&) {
            bind(name, nullptr);
            throw;
        }
        bool const isStamped = volume_->stamp(*written_);
        return WrittenFile{CrashingVolume::identify(*written_), isStamped};
    };
    return call("create " + kindOf(name) + (like ? " like " + *like : ""), make, [&](bool continues) {
        // After a permanent fault the partial file cannot be removed.
        if (!continues || isFailingForGood()) {
            auto const half = volume_->makeFile("");
            volume_->write(*half, bytes.substr(0, volume_->pick(bytes.size())));
            bind(name, half);
        }
    });
}

void CrashingDisk::sync() {
    call(
        "sync",
        [this] {
            volume_->sync(*written_);
            return true;
        },
        [this](bool continues) {
            for (auto& write : written_->unsynced) {
                write.isGivenUp = continues;
            }
        });
}

bool CrashingDisk::exchange(std::string const& left, std::string const& right) {
    return call("exchange " + kindOf(left) + " " + kindOf(right), [&] {
        if (!volume_->canExchange) {
            return false;
        }
        auto const first = find(left);
        auto const second = find(right);
        first->changed = second->changed = volume_->clock_;
        bind(left, second);
        bind(right, first);
        return true;
    });
}

void CrashingDisk::rename(std::string const& from, std::string const& to) {
    call("rename " + kindOf(from) + " " + kindOf(to), [&] {
        auto const moved = find(from);
        moved->changed = volume_->clock_;
        bind(from, nullptr);
        bind(to, moved);
        return true;
    });
}

bool CrashingDisk::renameToFree(std::string const& from, std::string const& to) {
    return call("renameToFree " + kindOf(from) + " " + kindOf(to), [&] {
        auto const moved = find(from);
        if (isTaken(to)) {
            return false;
        }
        moved->changed = volume_->clock_;
        bind(from, nullptr);
        bind(to, moved);
        return true;
    });
}

bool CrashingDisk::remove(std::string const& name) {
    return call("remove " + kindOf(name), [&] {
        bool const isThere = isTaken(name);
        if (isThere) {
            bind(name, nullptr);
        }
        return isThere;
    });
}

void CrashingDisk::syncFolder() {
    call("syncFolder", [this] {
        folder_->durable = names();
        folder_->unsynced.clear();
        return true;
    });
}

std::vector<std::string> CrashingDisk::list() {
    return call("list", [this] {
        std::vector<std::string> result;
        for (auto const& [name, file] : names()) {
            result.push_back(name);
        }
        return result;
    });
}

std::int64_t CrashingDisk::now() {
    return volume_->clock_;
}

void CrashingDisk::pause(std::chrono::milliseconds time) {
    volume_->calls.emplace_back("pause");
    if (volume_->beforeCall) {
        volume_->beforeCall("pause");
    }
    volume_->advance(std::chrono::nanoseconds(time).count());
}

} // namespace project::test
