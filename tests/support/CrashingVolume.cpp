#include <algorithm>
#include <cctype>
#include <utility>

#include "support/CrashingDisk.hpp"

namespace project::test {

using stores::FileIdentity;

void CrashingVolume::plan(InjectedFault fault, std::size_t callsBefore) {
    planned_ = fault;
    callsBefore_ = callsBefore;
    faulted_.clear();
}

bool CrashingVolume::cancelPlan() {
    return std::exchange(planned_, InjectedFault::None) != InjectedFault::None;
}

CrashingVolume::InjectedFault CrashingVolume::nextFault(std::string const& call) {
    if (planned_ == InjectedFault::None || callsBefore_ > 0) {
        callsBefore_ -= callsBefore_ > 0 ? 1 : 0;
        return InjectedFault::None;
    }
    if (faulted_.empty()) {
        faulted_ = call;
    }
    if (planned_ == InjectedFault::FailsForGood) {
        return planned_;
    }
    auto const fault = std::exchange(planned_, InjectedFault::None);
    return fault != InjectedFault::Dies ? fault
           : pick(1) == 0               ? InjectedFault::DiesAmid
                                        : InjectedFault::DiesAfter;
}

std::size_t CrashingVolume::count(std::string const& call) const {
    return static_cast<std::size_t>(std::count(calls.begin(), calls.end(), call));
}

std::size_t CrashingVolume::pick(std::size_t bound) {
    return std::uniform_int_distribution<std::size_t>(0, bound)(random_);
}

void CrashingVolume::powerCut() {
    unsyncedFolders_.push_back(durableFolder_);
    putFolder(unsyncedFolders_[pick(unsyncedFolders_.size() - 1)]);
    if (!folder_) {
        return;
    }
    Names left = folder_->durable;
    for (auto const& [name, files] : folder_->unsynced) {
        auto const picked = pick(files.size());
        if (picked == files.size()) {
            continue; // as it was at the last sync
        }
        left.erase(name);
        if (files[picked]) {
            left.emplace(name, files[picked]);
        }
    }
    for (auto const& [name, file] : left) {
        tear(*file);
    }
    auto after = std::make_shared<Folder>();
    after->names = left;
    after->durable = std::move(left);
    putFolder(std::move(after)); // all locks are released
}

/// Keeps any of the unsynced writes, and a part of the last one kept: its beginning, or its whole length with
/// zeros for lost data.
void CrashingVolume::tear(File& file) {
    auto bytes = file.durable;
    for (auto write : file.unsynced) {
        if (pick(1) == 0) {
            continue;
        }
        auto const kept = pick(write.bytes.size());
        if (pick(1) == 0) {
            write.bytes.resize(kept);
        } else {
            std::fill(write.bytes.begin() + static_cast<std::ptrdiff_t>(kept), write.bytes.end(), '\0');
        }
        apply(write, bytes);
    }
    file.bytes = bytes;
    file.durable = std::move(bytes);
    file.unsynced.clear();
    file.modified = pick(1) == 0 ? file.modified : file.unstamped;
}

void CrashingVolume::apply(Write const& write, std::string& bytes) {
    bytes.resize(std::max<std::size_t>(bytes.size(), write.offset + write.bytes.size()), '\0');
    bytes.replace(write.offset, write.bytes.size(), write.bytes);
}

void CrashingVolume::bind(Folder& folder, std::string const& name, std::shared_ptr<File> file) const {
    auto const there = find(folder.names, name);
    auto const entry = there != folder.names.end() ? there->first : name; // which keeps its case
    folder.unsynced[entry].push_back(file);
    folder.names.erase(entry);
    if (file) {
        folder.names.emplace(entry, std::move(file));
    }
}

CrashingVolume::Names::const_iterator CrashingVolume::find(Names const& names,
                                                           std::string const& name) const {
    if (!foldsNames) {
        return names.find(name);
    }
    return std::find_if(names.begin(), names.end(), [&name](auto const& entry) {
        return std::equal(name.begin(), name.end(), entry.first.begin(), entry.first.end(),
                          [](char left, char right) { return std::tolower(left) == std::tolower(right); });
    });
}

std::shared_ptr<CrashingVolume> CrashingVolume::copy(unsigned seed) const {
    auto result = std::make_shared<CrashingVolume>(*this);
    result->random_.seed(seed);
    result->calls.clear();
    result->folder_ = folder_ ? copyOf(*folder_) : nullptr;
    result->durableFolder_ = durableFolder_ && durableFolder_ != folder_ ? copyOf(*durableFolder_) : nullptr;
    result->unsyncedFolders_.clear();
    if (durableFolder_ == folder_) {
        result->durableFolder_ = result->folder_;
    }
    for (auto const& folder : unsyncedFolders_) {
        result->unsyncedFolders_.push_back(folder == folder_ ? result->folder_
                                           : folder          ? copyOf(*folder)
                                                             : nullptr);
    }
    return result;
}

/// Also copies the files: one copy of each file, whatever the number of its names.
std::shared_ptr<CrashingVolume::Folder> CrashingVolume::copyOf(Folder const& folder) {
    std::map<File const*, std::shared_ptr<File>> copies;
    auto const copied = [&copies](std::shared_ptr<File> const& file) {
        auto& result = copies[file.get()];
        if (file && !result) {
            result = std::make_shared<File>(*file);
        }
        return result;
    };
    auto result = std::make_shared<Folder>();
    for (auto const& [name, file] : folder.names) {
        result->names.emplace(name, copied(file));
    }
    for (auto const& [name, file] : folder.durable) {
        result->durable.emplace(name, copied(file));
    }
    for (auto const& [name, files] : folder.unsynced) {
        for (auto const& file : files) {
            result->unsynced[name].push_back(copied(file));
        }
    }
    return result;
}

std::vector<std::string> CrashingVolume::names() const {
    return namesLike("");
}

std::vector<std::string> CrashingVolume::namesLike(std::string const& start) const {
    std::vector<std::string> result;
    for (auto const& [name, file] : folder_ ? folder_->names : Names()) {
        if (name.starts_with(start)) {
            result.push_back(name);
        }
    }
    return result;
}

bool CrashingVolume::has(std::string const& name) const {
    return file(name) != nullptr;
}

std::string CrashingVolume::content(std::string const& name) const {
    auto const found = file(name);
    return found ? found->bytes : "nothing is there";
}

void CrashingVolume::makeFolder() {
    putFolder(std::make_shared<Folder>());
}

std::function<void()> CrashingVolume::moveFolderAway() {
    auto old = folder_;
    makeFolder();
    return [this, old] { putFolder(old); };
}

void CrashingVolume::putFolder(std::shared_ptr<Folder> folder) {
    folder_ = std::move(folder);
    syncRoot();
}

void CrashingVolume::makeFolderUnsynced() {
    folder_ = std::make_shared<Folder>();
    unsyncedFolders_.push_back(folder_);
}

void CrashingVolume::removeFolderUnsynced() {
    folder_.reset();
    unsyncedFolders_.push_back(nullptr);
}

void CrashingVolume::syncRoot() {
    durableFolder_ = folder_;
    unsyncedFolders_.clear();
}

void CrashingVolume::replaceFile(std::string const& name, std::string bytes) {
    auto const fresh = makeFile(std::move(bytes));
    fresh->durable = fresh->bytes;
    folder_->names[name] = fresh;
    folder_->durable[name] = fresh;
    folder_->unsynced.erase(name);
}

void CrashingVolume::overwrite(std::string const& name, std::string bytes) {
    auto const found = file(name);
    found->durable = bytes;
    found->bytes = std::move(bytes);
    found->unsynced.clear();
    setTimes(*found);
}

void CrashingVolume::append(std::string const& name, std::string_view bytes) {
    overwrite(name, file(name)->bytes + std::string(bytes));
}

void CrashingVolume::touch(std::string const& name) {
    setTimes(*file(name));
}

void CrashingVolume::remove(std::string const& name) {
    folder_->names.erase(name);
    folder_->durable.erase(name);
    folder_->unsynced.erase(name);
}

void CrashingVolume::putPipe(std::string const& name) {
    replaceFile(name, "");
    file(name)->isPipe = true;
}

std::shared_ptr<CrashingVolume::File> CrashingVolume::makeFile(std::string bytes) {
    auto made = std::make_shared<File>();
    made->inode = ++inodes_;
    made->bytes = std::move(bytes);
    setTimes(*made);
    return made;
}

std::shared_ptr<CrashingVolume::File> CrashingVolume::file(std::string const& name) const {
    if (!folder_) {
        return nullptr;
    }
    auto const found = find(folder_->names, name);
    return found == folder_->names.end() ? nullptr : found->second;
}

void CrashingVolume::write(File& file, std::string_view bytes) {
    file.unsynced.push_back({file.bytes.size(), std::string(bytes), false});
    file.bytes += bytes;
    setTimes(file);
}

void CrashingVolume::sync(File& file) {
    file.unstamped = file.modified; // syncing a new length also syncs the times
    std::erase_if(file.unsynced, [&file](Write const& write) {
        if (!write.isGivenUp) {
            apply(write, file.durable);
        }
        return !write.isGivenUp;
    });
}

/// Sets a file's time between two ticks of the clock.
bool CrashingVolume::stamp(File& file) {
    if (keepsStamps) {
        file.modified = clock_ + ++stamps_;
    }
    return keepsStamps;
}

void CrashingVolume::setTimes(File& file) const {
    file.modified = clock_;
    file.changed = clock_;
    file.unstamped = clock_;
}

FileIdentity CrashingVolume::identify(File const& file) {
    return {1, file.inode, file.bytes.size(), file.modified, file.changed, !file.isPipe};
}

} // namespace project::test
