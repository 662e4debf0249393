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

/// Thrown where a process dies. The disk that it used fails every later call in the same way.
struct ProcessDied {};

/// A file system in memory that knows what of it would outlive a power cut: what was synced.
///
/// It keeps, for each file, the writes since its last sync, and for the folder the names since its last sync.
/// powerCut drops any of them, each by itself, so that what is left is what any order of writing can leave,
/// and tears the writes. Calls of disks on it are recorded and can be made to fail or to be the last thing
/// that a process does. The rest of the interface is for the stranger: git, an editor, or another program
/// that takes no lock, whose changes are durable at once.
class CrashingVolume {
public:
    enum class Trouble {
        None,
        Fails,        ///< this call fails, and what it was to do is done in part at most
        FailsForGood, ///< this call and all later ones fail
        Dies,         ///< the process dies before, in the middle of, or after this call
        DiesBefore,   ///< the same at one of these moments
        DiesAmid,     ///< what the call was to do is done in part at most
        DiesAfter,
    };

    explicit CrashingVolume(unsigned seed = 1) : random_(seed) {}

    /// Which calls were made, in order: "append project.jsonl", "exchange swapping project.jsonl", "sync".
    /// Names that are made up are told by their kind: temporary, swapping, displaced, damaged.
    std::vector<std::string> calls;

    /// Called before and after each call, to act as a stranger or to throw.
    std::function<void(std::string const& call)> beforeCall;
    std::function<void(std::string const& call)> afterCall;

    /// Called within append, after it has found the file in the state expected.
    std::function<void()> amidAppend;

    /// Whether files can be exchanged, and whether they keep the times they are given.
    bool canExchange = true;
    bool keepsStamps = true;

    /// Whether names that differ in capitals alone lead to the same file.
    bool foldsNames = false;

    /// Bytes that can still be written before the disk is full.
    std::optional<std::uint64_t> room;

    /// Brings trouble to the call that comes after so many others.
    void plan(Trouble trouble, std::size_t callsBefore);

    /// Forgets what was planned. @return true when it has not happened yet.
    bool cancelPlan();

    /// The first call that what was planned last has come to; empty before.
    std::string const& troubled() const { return troubled_; }

    /// A volume in the same state that goes its own way from here, by other random choices. Nobody holds a
    /// lock on it.
    std::shared_ptr<CrashingVolume> copy(unsigned seed) const;

    std::size_t count(std::string const& call) const;

    /// Loses what was not synced, some of it or all. Disks that were open must not be used any more.
    void powerCut();

    /// Lets the file system's clock go on. It stands still otherwise, so that writes share one tick.
    void advance(std::int64_t nanoseconds) { clock_ += nanoseconds; }

    void advanceBeyondTick() { advance(100'000'000); }

    bool hasFolder() const { return folder_ != nullptr; }

    std::vector<std::string> names() const;
    bool has(std::string const& name) const;
    std::string content(std::string const& name) const;

    /// The names that start so.
    std::vector<std::string> namesLike(std::string const& start) const;

    // The stranger.
    void makeFolder();

    void removeFolder() { putFolder(nullptr); }

    /// Puts an empty folder in the place of the store's. @return what brings the old one back.
    std::function<void()> moveFolderAway();
    void replaceFile(std::string const& name, std::string bytes); ///< by a new file of that name
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
        bool isGivenUp = false; ///< a sync failed, after which the system doesn't try again
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
        std::map<std::string, std::vector<std::shared_ptr<File>>> unsynced; ///< what names have led to since
        void const* lockedBy = nullptr;
    };

    /// Lets a name lead to a file, or to nothing.
    void bind(Folder& folder, std::string const& name, std::shared_ptr<File> file) const;

    /// Where a name stands among others, which may be in other capitals.
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
    Trouble nextTrouble(std::string const& call);
    std::size_t pick(std::size_t bound);
    void tear(File& file);
    static stores::FileIdentity identify(File const& file);

    std::mt19937 random_;
    std::int64_t clock_ = 1'000'000'000'000'000'000;
    std::int64_t stamps_ = 0;
    std::uint64_t inodes_ = 0;
    std::shared_ptr<Folder> folder_;                       ///< what the path from the project's root leads to
    std::shared_ptr<Folder> durableFolder_;                ///< the same at the last sync of the root
    std::vector<std::shared_ptr<Folder>> unsyncedFolders_; ///< and since
    Trouble planned_ = Trouble::None;
    std::size_t callsBefore_ = 0;
    std::string troubled_;
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
