#pragma once

#include <memory>
#include <string>
#include <vector>

#include "project/WriteShield.hpp"
#include "project/session.hpp"
#include "project/session/ToolAccess.hpp"
#include "project/stores/TextBackend.hpp"

namespace projectctl {

using fl::filesystem::Path;

/// A project with its store, as one command uses it: opened, used, and gone with the process.
///
/// Commands go through the managers. Those that only look, and must be fast or must see what a manager would
/// stumble over, go to the store itself.
class OpenProject {
public:
    /// Opens the project in a folder. Nothing is read yet, and nothing is written.
    explicit OpenProject(Path const& root);
    ~OpenProject();

    /// Makes a project in a folder.
    /// @throws StoreError when there is one already.
    static OpenProject make(Path const& root, std::u16string const& name);

    /// Opens the project that the working folder lies in.
    /// @throws Failure when there is none.
    static OpenProject ofWorkingFolder();

    OpenProject(OpenProject const&) = delete;
    OpenProject& operator=(OpenProject const&) = delete;

    Path const& root() const noexcept { return session_.root(); }

    project::management::ProjectManager& manager() noexcept { return session_.project(); }

    project::management::FileManager& files() { return manager().getFileManager(); }

    /// @throws FileNotInProject
    void requireInProject(Path const& path);

    project::metadata::MetadataManager& store() noexcept { return session_.store(); }

    /// What the store keeps its tree in. While a guard of the store is open, this may be loaded from.
    project::stores::TextBackend& text() noexcept { return access_.text(); }

    WriteShield& shield() noexcept { return *shield_; }

    /// The text's path on disk, for messages.
    std::string textFile() const;

    /// The path of another file in the store's folder, for messages. @param name in UTF-8.
    std::string storeFile(std::string const& name) const;

    /// Tells on standard error, in one line, if the text is damaged or has conflicts in it: what was listed
    /// may lack something then. To be called with no guard open.
    void warnOfDamage();

    /// Takes in what others have changed, and dispatches the events that tell of it.
    void refresh() { session_.refresh(); }

    project::management::ProjectEventBroadcaster& events() noexcept { return *session_.events(); }

    /// Stages the project's text in git, if it was written and git tracks it. To be called with no guard
    /// open.
    void stage() { session_.stage(); }

    /// Stages those of some files that were just added whose removal git has staged.
    void stageReturned(std::vector<Path> const& files) { access_.stageReturned(files); }

    /// Has stage count what was changed through text().
    void stageLater() noexcept { access_.markTextForStaging(); }

    /// What git tracks below some folders and the project does not have. @param folders absolute.
    std::vector<Path> trackedOutsideProject(std::vector<Path> const& folders) {
        return access_.trackedOutsideProject(folders);
    }

private:
    using Session = project::session::Session;

    explicit OpenProject(Session session);

    std::shared_ptr<WriteShield> shield_; ///< before the session: it goes last, when all is written
    Session session_;
    project::session::ToolAccess access_{session_};
};

} // namespace projectctl
