#pragma once

#include <memory>

#include "project/session.hpp"
#include "project/stores/JournalBackend.hpp"
#include "project/stores/SharedLocation.hpp"
#include "project/stores/TextBackend.hpp"
#include "project/stores/TreeMetadataManager.hpp"

namespace project::session {

/// The store of a session, and the backend behind it: the text in the project's folder, or the log of a
/// server if the folder says that the project is stored there.
class SessionStore {
public:
    /// @throws stores::StoreError if the folder names a server whose library is not installed.
    SessionStore(Path const& root, Options const& options);

    std::shared_ptr<stores::TreeMetadataManager> const& tree() const noexcept { return tree_; }

    /// Null if the project is shared.
    stores::TextBackend* text() const noexcept { return text_; }

    /// Null if the project is not shared.
    stores::JournalBackend* log() const noexcept { return log_; }

    /// The file in the project's folder that leads to the definition: the text, or the location of the
    /// server.
    Path const& file() const noexcept { return file_; }

private:
    std::unique_ptr<stores::Backend> makeText(Path const& root, Options const& options);
    std::unique_ptr<stores::Backend> makeLog(Path const& root, stores::SharedLocation const& location,
                                             Options const& options);
    std::unique_ptr<stores::Backend> makeBackend(Path const& root, Options const& options);

    stores::TextBackend* text_ = nullptr;   ///< owned by the tree
    stores::JournalBackend* log_ = nullptr; ///< owned by the tree
    Path file_;
    std::shared_ptr<stores::TreeMetadataManager> tree_;
};

} // namespace project::session
