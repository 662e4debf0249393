#pragma once

#include <memory>
#include <string>
#include <vector>

#include "project/session.hpp"
#include "project/stores/SharedServer.hpp"

namespace project::session {

/// A project that is being created on a server, with the file that leads to it. The destructor deletes both
/// unless the project is kept.
class NewSharedProject {
public:
    /// @throws stores::StoreError if the folder contains a project or the server refuses it.
    NewSharedProject(Path const& root, std::u16string const& name, SharedStore const& shared);
    ~NewSharedProject();
    NewSharedProject(NewSharedProject const&) = delete;
    NewSharedProject& operator=(NewSharedProject const&) = delete;

    /// The files that were created in the project's folder, for source control.
    std::vector<Path> const& files() const noexcept { return files_; }

    void keep() noexcept { isKept_ = true; }

private:
    void removeFiles() const noexcept;

    std::unique_ptr<stores::SharedServer> server_;
    std::string id_;
    Path folder_; ///< of the location
    std::vector<Path> files_;
    bool isKept_ = false;
};

} // namespace project::session
