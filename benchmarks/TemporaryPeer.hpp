#pragma once

#include <filesystem>

#include "GeneratedTree.hpp"
#include "SqlitePeer.hpp"

namespace project::benchmarks {

/// An empty database beside the large tree. The destructor deletes it.
class TemporaryPeer {
public:
    TemporaryPeer() : file_(GeneratedTree::large().onDisk() / ".peer.db"), peer_(file_) {}

    ~TemporaryPeer() {
        for (auto const* suffix : {"", "-wal", "-shm"}) {
            std::filesystem::remove(file_.string() + suffix);
        }
    }

    TemporaryPeer(TemporaryPeer const&) = delete;
    TemporaryPeer& operator=(TemporaryPeer const&) = delete;

    SqlitePeer* operator->() { return &peer_; }

private:
    std::filesystem::path file_;
    SqlitePeer peer_;
};

} // namespace project::benchmarks
