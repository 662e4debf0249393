#pragma once

#include <cstddef>
#include <optional>
#include <string>
#include <vector>

#include "journal/ProjectLock.hpp"
#include "journal/ServerSession.hpp"
#include "project/stores/Journal.hpp"

namespace project::postgresql {

/// Appends one entry to the log of a project. The connection may be lost at any moment: the entry is then
/// sent again with the same id, after the process on the server that received it before has ended.
class EntryAppender {
public:
    EntryAppender(ServerSession& session, ProjectLock& lock, std::string const& project,
                  stores::NewJournalEntry const& entry);

    /// See Journal::append.
    stores::Journal::Appended append();

private:
    stores::Journal::Appended attempt();
    std::size_t insert();
    std::optional<stores::Journal::Appended> outcome();
    void passBarrier();

    ServerSession& session_;
    ProjectLock& lock_;
    std::string const& project_;
    stores::NewJournalEntry const& entry_;
    std::string version_;
    std::vector<std::string> pieces_; ///< of a body
    Deadline deadline_;
    bool isUncertain_ = false; ///< the entry was sent, and may be stored
};

} // namespace project::postgresql
