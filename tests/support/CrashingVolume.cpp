#include <algorithm>
#include <utility>

#include "support/CrashingDisk.hpp"

namespace project::test {

using stores::FileIdentity;

void CrashingVolume::plan(Trouble trouble, std::size_t callsBefore) {
    planned_ = trouble;
    callsBefore_ = callsBefore;
}

bool CrashingVolume::cancelPlan() {
    return std::exchange(planned_, Trouble::None) != Trouble::None;
}

CrashingVolume::Trouble CrashingVolume::nextTrouble() {
    if (planned_ == Trouble::None || callsBefore_ > 0) {
        callsBefore_ -= callsBefore_ > 0 ? 1 : 0;
        return Trouble::None;
    }
    return planned_ == Trouble::FailsForGood ? planned_ : std::exchange(planned_, Trouble::None);
}

std::size_t CrashingVolume::count(std::string const& call) const {
    return static_cast<std::size_t>(std::count(calls.begin(), calls.end(), call));
}

std::size_t CrashingVolume::pick(std::size_t bound) {
    return std::uniform_int_distribution<std::size_t>(0, bound)(random_);
}

void CrashingVolume::powerCut() {
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
    folder_ = std::move(after); // nobody holds a lock any more
}

/// Leaves of the writes that were not synced any or none, and of the last of those that are left a part: the
/// beginning, or the whole length with zeros where the data did not come.
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
}

void CrashingVolume::apply(Write const& write, std::string& bytes) {
    bytes.resize(std::max<std::size_t>(bytes.size(), write.offset + write.bytes.size()), '\0');
    bytes.replace(write.offset, write.bytes.size(), write.bytes);
}

void CrashingVolume::bind(Folder& folder, std::string const& name, std::shared_ptr<File> file) {
    folder.unsynced[name].push_back(file);
    folder.names.erase(name);
    if (file) {
        folder.names.emplace(name, std::move(file));
    }
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
    folder_ = std::make_shared<Folder>();
}

std::function<void()> CrashingVolume::moveFolderAway() {
    return [this, old = std::exchange(folder_, std::make_shared<Folder>())] { folder_ = old; };
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
    auto const found = folder_->names.find(name);
    return found == folder_->names.end() ? nullptr : found->second;
}

void CrashingVolume::write(File& file, std::string_view bytes) {
    file.unsynced.push_back({file.bytes.size(), std::string(bytes), false});
    file.bytes += bytes;
    setTimes(file);
}

void CrashingVolume::sync(File& file) {
    std::erase_if(file.unsynced, [&file](Write const& write) {
        if (!write.isGivenUp) {
            apply(write, file.durable);
        }
        return !write.isGivenUp;
    });
}

/// Gives a file a time between two ticks of the clock.
bool CrashingVolume::stamp(File& file) {
    if (keepsStamps) {
        file.modified = clock_ + ++stamps_;
    }
    return keepsStamps;
}

void CrashingVolume::setTimes(File& file) const {
    file.modified = clock_;
    file.changed = clock_;
}

FileIdentity CrashingVolume::identify(File const& file) {
    return {1, file.inode, file.bytes.size(), file.modified, file.changed, !file.isPipe};
}

} // namespace project::test
