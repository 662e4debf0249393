#pragma once

#include <filesystem>
#include <string>
#include <vector>

struct MDB_env;

namespace project::benchmarks {

/// An LMDB environment with a key for each path. It is configured not to lose a commit, which is the default.
class LmdbPeer {
public:
    /// @param folder created if necessary.
    explicit LmdbPeer(std::filesystem::path const& folder);
    ~LmdbPeer();
    LmdbPeer(LmdbPeer const&) = delete;
    LmdbPeer& operator=(LmdbPeer const&) = delete;

    /// Inserts all keys in one transaction.
    void insert(std::vector<std::string> const& paths);

    /// Looks for a key in a transaction of its own, which shows the newest state.
    bool contains(std::string const& path);

    /// Reads all keys. @return their number.
    std::size_t list();

private:
    MDB_env* environment_ = nullptr;
    unsigned keys_ = 0;
};

} // namespace project::benchmarks
