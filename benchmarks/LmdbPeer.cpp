#include "LmdbPeer.hpp"

#include <stdexcept>
#include <string>
#include <utility>

#include <lmdb.h>

namespace project::benchmarks {

namespace {

constexpr std::size_t largestFile = std::size_t(4) << 30U;

void require(int code) {
    if (code != MDB_SUCCESS) {
        throw std::runtime_error(std::string("LMDB: ") + mdb_strerror(code));
    }
}

MDB_val valueOf(std::string const& text) {
    return {text.size(), const_cast<char*>(text.data())}; // LMDB does not write to it
}

/// A transaction that is rolled back unless it is committed.
class LmdbTransaction {
public:
    LmdbTransaction(MDB_env* environment, unsigned flags) {
        require(mdb_txn_begin(environment, nullptr, flags, &transaction_));
    }

    ~LmdbTransaction() { mdb_txn_abort(transaction_); }

    LmdbTransaction(LmdbTransaction const&) = delete;
    LmdbTransaction& operator=(LmdbTransaction const&) = delete;

    MDB_txn* get() const { return transaction_; }

    void commit() { require(mdb_txn_commit(std::exchange(transaction_, nullptr))); }

private:
    MDB_txn* transaction_ = nullptr;
};

} // namespace

LmdbPeer::LmdbPeer(std::filesystem::path const& folder) {
    std::filesystem::create_directories(folder);
    require(mdb_env_create(&environment_));
    require(mdb_env_set_mapsize(environment_, largestFile));
    require(mdb_env_open(environment_, folder.c_str(), 0, 0644));
    LmdbTransaction transaction(environment_, 0);
    require(mdb_dbi_open(transaction.get(), nullptr, 0, &keys_));
    transaction.commit();
}

LmdbPeer::~LmdbPeer() {
    mdb_env_close(environment_);
}

void LmdbPeer::insert(std::vector<std::string> const& paths) {
    LmdbTransaction transaction(environment_, 0);
    for (auto const& path : paths) {
        MDB_val key = valueOf(path);
        MDB_val value{};
        require(mdb_put(transaction.get(), keys_, &key, &value, 0));
    }
    transaction.commit();
}

bool LmdbPeer::contains(std::string const& path) {
    LmdbTransaction const transaction(environment_, MDB_RDONLY);
    MDB_val key = valueOf(path);
    MDB_val value;
    return mdb_get(transaction.get(), keys_, &key, &value) == MDB_SUCCESS;
}

std::size_t LmdbPeer::list() {
    LmdbTransaction const transaction(environment_, MDB_RDONLY);
    MDB_cursor* cursor = nullptr;
    require(mdb_cursor_open(transaction.get(), keys_, &cursor));
    std::vector<std::string> paths;
    MDB_val key;
    MDB_val value;
    while (mdb_cursor_get(cursor, &key, &value, MDB_NEXT) == MDB_SUCCESS) {
        paths.emplace_back(static_cast<char const*>(key.mv_data), key.mv_size);
    }
    mdb_cursor_close(cursor);
    return paths.size();
}

} // namespace project::benchmarks
