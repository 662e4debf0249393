#include "report/FileMeasures.hpp"

#include <algorithm>
#include <cerrno>
#include <cstddef>
#include <string_view>

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include "files/DiskFolder.hpp"
#include "fl/filesystem/SystemName.hpp"

namespace projectctl {

namespace {

constexpr std::size_t examinedForText = 8000; // bytes, as git does

/// Counts the lines of the bytes of one file.
class LineCount {
public:
    void add(std::string_view bytes) {
        isText_ = isText_ &&
                  (position_ > 0 || bytes.substr(0, examinedForText).find('\0') == std::string_view::npos);
        lines_ += static_cast<std::uint64_t>(std::ranges::count(bytes, '\n'));
        endsWithLine_ = bytes.back() == '\n';
        position_ += bytes.size();
    }

    bool isText() const noexcept { return isText_; }

    std::uint64_t lines() const noexcept { return isText_ ? lines_ + (endsWithLine_ ? 0 : 1) : 0; }

private:
    bool isText_ = true;
    bool endsWithLine_ = true;
    std::size_t position_ = 0;
    std::uint64_t lines_ = 0;
};

/// Measures files one after the other.
class FileRuler {
public:
    FileMeasure measure(Path const& path) {
        FileMeasure result;
        fl::filesystem::SystemName const name(path);

        struct stat state {};

        if (name.get() == nullptr || lstat(name.get(), &state) != 0 || !S_ISREG(state.st_mode)) {
            return result;
        }
        result.size = static_cast<std::uint64_t>(state.st_size);
        int const descriptor = open(name.get(), O_RDONLY | O_NOFOLLOW | O_NONBLOCK | O_NOCTTY | O_CLOEXEC);
        if (descriptor >= 0) {
            result.lines = countLines(descriptor, result.size);
            close(descriptor);
        }
        return result;
    }

private:
    /// Reads at most as many bytes as the file had before: some special files never end.
    std::uint64_t countLines(int descriptor, std::uint64_t size) {
        LineCount count;
        while (size > 0 && count.isText()) {
            auto const got = read(descriptor, piece_.data(), piece_.size());
            if (got < 0 && errno == EINTR) {
                continue;
            }
            if (got <= 0) {
                break;
            }
            auto const length = std::min<std::uint64_t>(static_cast<std::uint64_t>(got), size);
            count.add(std::string_view(piece_.data(), length));
            size -= length;
        }
        return count.lines();
    }

    std::vector<char> piece_ = std::vector<char>(std::size_t{256} * 1024);
};

/// The folders above the current entry, from the root.
class FoldersAbove {
public:
    /// Moves on to the next entry. @return whether all folders above it are folders on disk themselves, and
    /// no name leads elsewhere.
    bool moveTo(Definition::Entry const& entry, Path const& root) {
        while (!folders_.empty() && !isBelow(entry.path, folders_.back().path)) {
            folders_.pop_back();
        }
        auto const name = entry.path.substr(folders_.empty() ? 0 : folders_.back().path.size() + 1);
        bool const isReal = (folders_.empty() || folders_.back().isReal) && isNameInFolder(name);
        if (entry.kind == Kind::Folder) {
            folders_.push_back({entry.path, isReal && isFolderItself(root / Path(entry.path))});
        }
        return isReal;
    }

private:
    struct Folder {
        std::u16string_view path;
        bool isReal;
    };

    static bool isBelow(std::u16string_view path, std::u16string_view folder) {
        return path.size() > folder.size() && path[folder.size()] == u'/' && path.starts_with(folder);
    }

    static bool isNameInFolder(std::u16string_view name) {
        return !name.empty() && name != u"." && name != u".." && name.find(u'/') == std::u16string_view::npos;
    }

    std::vector<Folder> folders_;
};

} // namespace

std::vector<FileMeasure> measureFiles(Path const& root, std::vector<Definition::Entry> const& entries,
                                      Progress& progress) {
    std::vector<FileMeasure> result;
    result.reserve(entries.size());
    FoldersAbove folders;
    FileRuler ruler;
    for (auto const& entry : entries) {
        bool const isReachable = folders.moveTo(entry, root);
        result.push_back(isReachable && entry.kind == Kind::File ? ruler.measure(root / Path(entry.path))
                                                                 : FileMeasure());
        progress.reach(result.size());
    }
    return result;
}

} // namespace projectctl
