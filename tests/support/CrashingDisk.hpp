#pragma once

#include <cstdint>
#include <functional>
#include <map>
#include <memory>
#include <optional>
#include <random>
#include <string>
#include <string_view>
#include <vector>

#include "project/stores/Disk.hpp"

namespace project::test {

/// Thrown at the call at which a process dies. Every later call of its disk throws it, too.
struct ProcessDied {};

/// A file system in memory that distinguishes synced from unsynced content.
///
/// It keeps the writes to each file since the file's last sync, and the names since the folder's last sync.
/// powerCut drops or tears any of them independently, so that every possible order of writing is covered. The
/// calls of disks on it are recorded. Any call can be made to fail or to be the last one of a process. The
/// rest of the interface is for other programs, such as git or an editor, which take no lock and whose
/// changes are durable at once.
class CrashingVolume {
public:
    enum class InjectedFault {
        None,
        Fails,        ///< this call fails, and has at most a part of its effect
        FailsForGood, ///< this call and all later ones fail
        Dies,         ///< the process dies before, in the middle of, or after this call
        DiesBefore,   ///< the same at one of these moments
        DiesAmid,     ///< the call has at most a part of its effect
        DiesAfter,
    };

    explicit CrashingVolume(unsigned seed = 1) : random_(seed) {}

    /// The calls so far, in order: "append project.jsonl", "exchange swapping project.jsonl", "sync".
    /// Generated names are replaced by their kind: temporary, swapping, displaced, damaged.
    std::vector<std::string> calls;

    /// Called before and after each call, to act as another program or to throw.
    std::function<void(std::string const& call)> beforeCall;
    std::function<void(std::string const& call)> afterCall;

    /// Called within append, after it found the file in the expected state.
    std::function<void()> amidAppend;

    /// Whether files can be exchanged, and whether they keep the times that a process sets.
    bool canExchange = true;
    bool keepsStamps = true;

    /// Whether names that differ only in case lead to the same file.
    bool foldsNames = false;

    /// The bytes that can be written before the disk is full.
    std::optional<std::uint64_t> room;

    /// Plans a fault for one call, after a number of others.
    void plan(InjectedFault fault, std::size_t callsBefore);

    /// Cancels the planned fault. @return true if it has not happened yet.
    bool cancelPlan();

    /// The first call with the planned fault; empty before.
    std::string const& faulted() const { return faulted_; }

    /// An independent volume in the same state, with other random choices and no lock.
    std::shared_ptr<CrashingVolume> copy(unsigned seed) const;

    std::size_t count(std::string const& call) const;

    /// Loses some or all of the unsynced content. Open disks must not be used afterwards.
    void powerCut();

    /// Advances the file system's clock, which does not advance by itself, so that writes share one tick.
    void advance(std::int64_t nanoseconds) { clock_ += nanoseconds; }

    void advanceBeyondTick() { advance(100'000'000); }

    bool hasFolder() const { return folder_ != nullptr; }

    std::vector<std::string> names() const;
    bool has(std::string const& name) const;
    std::string content(std::string const& name) const;

    /// The names with this beginning.
    std::vector<std::string> namesLike(std::string const& start) const;

    // Other programs.
    void makeFolder();

    void removeFolder() { putFolder(nullptr); }

    /// Replaces the store's folder by an empty one. @return a function that restores the old one.
    std::function<void()> moveFolderAway();
    void replaceFile(std::string const& name, std::string bytes); ///< by a new file
    void overwrite(std::string const& name, std::string bytes);   ///< in place
    void append(std::string const& name, std::string_view bytes);
    void touch(std::string const& name);
    void remove(std::string const& name);
    void putPipe(std::string const& name);

private:
    friend class CrashingDisk;

    struct Write {
        std::uint64_t offset;
        std::string bytes;
        bool isGivenUp = false; ///< a sync failed, and the system does not try again
    };

    struct File {
        std::uint64_t inode = 0;
        std::int64_t modified = 0;
        std::int64_t changed = 0;
        std::int64_t unstamped = 0; ///< the time without a stamp that was not synced
        bool isPipe = false;
        std::string bytes;
        std::string durable;
        std::vector<Write> unsynced;
    };

    using Names = std::map<std::string, std::shared_ptr<File>>;

    struct Folder {
        Names names;
        Names durable;
        std::map<std::string, std::vector<std::shared_ptr<File>>> unsynced; ///< the files of names since
        void const* lockedBy = nullptr;
    };

    /// Binds a name to a file, or removes it.
    void bind(Folder& folder, std::string const& name, std::shared_ptr<File> file) const;

    /// The position of a name, which may be in another case.
    Names::const_iterator find(Names const& names, std::string const& name) const;

    void putFolder(std::shared_ptr<Folder> folder);
    void makeFolderUnsynced();
    void syncRoot();
    void removeFolderUnsynced();
    static std::shared_ptr<Folder> copyOf(Folder const& folder);

    std::shared_ptr<File> makeFile(std::string bytes);
    std::shared_ptr<File> file(std::string const& name) const;
    void write(File& file, std::string_view bytes);
    static void apply(Write const& write, std::string& bytes);
    static void sync(File& file);
    bool stamp(File& file);
    void setTimes(File& file) const;
    InjectedFault nextFault(std::string const& call);
    std::size_t pick(std::size_t bound);
    void tear(File& file);
    static stores::FileIdentity identify(File const& file);

    std::mt19937 random_;
    std::int64_t clock_ = 1'000'000'000'000'000'000;
    std::int64_t stamps_ = 0;
    std::uint64_t inodes_ = 0;
    std::shared_ptr<Folder> folder_;                       ///< the folder at the path from the project's root
    std::shared_ptr<Folder> durableFolder_;                ///< the same at the last sync of the root
    std::vector<std::shared_ptr<Folder>> unsyncedFolders_; ///< and since
    InjectedFault planned_ = InjectedFault::None;
    std::size_t callsBefore_ = 0;
    std::string faulted_;
};

/// The disk of one process on a CrashingVolume.
class CrashingDisk : public stores::Disk {
public:
    explicit CrashingDisk(std::shared_ptr<CrashingVolume> volume) : volume_(std::move(volume)) {}

    ~CrashingDisk() override;

    std::string folder() const override { return "/project/.projectdata"; }

    bool openFolder() override;
    bool makeFolder() override;
    void removeFolder() noexcept override;
    bool isFolderInPlace() override;
    bool lock(std::chrono::milliseconds patience) override;
    void unlock() noexcept override;
    std::string lockHolder() override;
    std::optional<stores::FileIdentity> identifyByPath(std::string const& name) override;
    std::optional<stores::FileIdentity> identify(std::string const& name) override;
    std::optional<stores::FileContent> read(std::string const& name, std::uint64_t offset) override;
    std::optional<stores::WrittenFile> append(std::string const& name, stores::FileIdentity const& expected,
                                              std::string_view bytes) override;
    stores::WrittenFile create(std::string const& name, std::string_view bytes,
                               std::optional<std::string> const& like) override;
    void sync() override;
    bool exchange(std::string const& left, std::string const& right) override;
    void rename(std::string const& from, std::string const& to) override;
    bool renameToFree(std::string const& from, std::string const& to) override;
    bool remove(std::string const& name) override;
    void syncFolder() override;
    std::vector<std::string> list() override;
    std::int64_t now() override;
    void pause(std::chrono::milliseconds time) override;

private:
    using File = CrashingVolume::File;

    template <typename Effect, typename Part>
    auto call(std::string const& name, Effect effect, Part part);

    template <typename Effect>
    auto call(std::string const& name, Effect effect);

    [[noreturn]] void die();
    CrashingVolume::Names& names();
    std::shared_ptr<File> find(std::string const& name);
    void bind(std::string const& name, std::shared_ptr<File> file);
    bool isTaken(std::string const& name);
    bool isFailingForGood() const;
    std::optional<stores::FileIdentity> identifyIn(CrashingVolume::Folder* folder, std::string const& name);
    void writeWithinRoom(File& file, std::string_view bytes);

    std::shared_ptr<CrashingVolume> volume_;
    std::shared_ptr<CrashingVolume::Folder> folder_;
    std::shared_ptr<File> written_;
    bool isDead_ = false;
};

} // namespace project::test
