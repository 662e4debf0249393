#pragma once

#include <memory>
#include <string>
#include <vector>

#include "WriteShield.hpp"
#include "fl/filesystem/Path.hpp"
#include "project/core/FileManager.hpp"
#include "project/core/ProjectManagerBase.hpp"
#include "project/stores/TextBackend.hpp"
#include "project/stores/TreeMetadataManager.hpp"

namespace projectctl {

using fl::filesystem::Path;

/// A project with its store, as one command uses it: opened, used, and gone with the process.
///
/// Commands go through the managers. Those that only look, and must be fast or must see what a manager would
/// stumble over, go to the store itself.
class OpenProject {
public:
    /// Opens the project in a folder. Nothing is read yet, and nothing is written.
    /// @param root canonical.
    explicit OpenProject(Path root);
    ~OpenProject();

    /// Opens the project that the working folder lies in.
    /// @throws Failure when there is none.
    static OpenProject ofWorkingFolder();

    OpenProject(OpenProject const&) = delete;
    OpenProject& operator=(OpenProject const&) = delete;

    Path const& root() const noexcept { return root_; }

    project::management::ProjectManager& manager() noexcept { return *manager_; }

    project::management::FileManager& files() { return manager_->getFileManager(); }

    project::metadata::MetadataManager& store() noexcept { return *store_; }

    /// What the store keeps its tree in. While a guard of the store is open, this may be loaded from.
    project::stores::TextBackend& text() noexcept { return *text_; }

    WriteShield& shield() noexcept { return *shield_; }

    /// The text's path on disk, for messages.
    std::string textFile() const;

    /// The path of another file in the store's folder, for messages. @param name in UTF-8.
    std::string storeFile(std::string const& name) const;

    /// Tells on standard error, in one line, if the text is damaged or has conflicts in it: what was listed
    /// may lack something then. To be called with no guard open.
    void warnOfDamage();

private:
    Path root_;
    std::shared_ptr<WriteShield> shield_; ///< before the store: it goes last, when all is written
    project::stores::TextBackend* text_;  ///< the store's
    std::shared_ptr<project::stores::TreeMetadataManager> store_;
    std::unique_ptr<project::management::ProjectManagerBase> manager_;
};

} // namespace projectctl
