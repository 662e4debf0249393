#include "index/IndexWriter.hpp"

#include "repository/DiskEntry.hpp"

namespace project::git {

namespace {

constexpr auto unwritable = "the index cannot be written";

} // namespace

IndexWriter::IndexWriter(Repository& repository, IndexLock const& lock)
    : repository_(repository), lock_(lock), comparison_(repository) {
    git_index* created = nullptr;
    require(git_index_open(&created, lock.newIndex().c_str()), lock.newIndex(), unwritable);
    result_.reset(created);
    require(git_index_set_version(created, git_index_version(repository.index())), lock.newIndex(),
            unwritable);
}

void IndexWriter::write(IndexChanges const& changes) {
    auto* const old = repository_.index();
    auto staged = changes.staged.begin();
    auto const addStagedBefore = [&](char const* path) {
        for (; staged != changes.staged.end() && (path == nullptr || staged->first < path); ++staged) {
            auto entry = staged->second;
            entry.path = staged->first.c_str();
            add(entry);
        }
    };
    for (std::size_t position = 0; position < git_index_entrycount(old); ++position) {
        auto const& entry = *git_index_get_byindex(old, position);
        addStagedBefore(entry.path);
        if (!changes.isDropped(entry.path)) {
            keep(entry);
        }
    }
    addStagedBefore(nullptr);
    require(git_index_write(result_.get()), lock_.newIndex(), unwritable);
    lock_.replaceIndex();
}

/// An entry that is as young as the old index is older than the new one. If its file has changed, a size of 0
/// marks that the file has to be read.
void IndexWriter::keep(git_index_entry const& entry) {
    auto kept = entry;
    if (comparison_.canHideChanges(entry)) {
        auto const onDisk = diskEntryAt(repository_.workTree().onDisk(entry.path));
        if (onDisk && isFileOrLink(*onDisk) && comparison_.isModified(entry, *onDisk)) {
            kept.file_size = 0;
        }
    }
    add(kept);
}

void IndexWriter::add(git_index_entry const& entry) {
    require(git_index_add(result_.get(), &entry), repository_.workTree().onDisk(entry.path),
            "the index cannot contain the file");
}

} // namespace project::git
