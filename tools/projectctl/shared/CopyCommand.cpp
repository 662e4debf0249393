#include <optional>
#include <string>
#include <utility>

#include "cli/TextArguments.hpp"
#include "fl/i18n/Utf8.hpp"
#include "output/Failure.hpp"
#include "output/Output.hpp"
#include "project/ProjectCommand.hpp"
#include "project/SharedRoles.hpp"
#include "project/stores/SharedLocation.hpp"
#include "project/stores/SharedServer.hpp"
#include "project/stores/StoreCopy.hpp"
#include "project/stores/StoreError.hpp"
#include "project/stores/SystemDisk.hpp"
#include "shared/Commands.hpp"

namespace projectctl {

namespace {

using project::session::SharedStore;
using project::stores::Disk;
using project::stores::FileChanges;
using project::stores::JournalBackend;
using project::stores::SharedLocation;
using project::stores::SharedServer;
using project::stores::StoreError;
using project::stores::TextBackend;

/// A new project on a server with a definition as its only entry. It is deleted again unless it is kept.
class CopyOnServer {
public:
    CopyOnServer(SharedStore const& store, std::u16string const& name, std::string const& text)
        : server_(project::stores::connectTo(store.kind, store.service)),
          location_{store.kind, store.service, project::stores::newSharedProjectId()} {
        server_->create({location_.project, fl::i18n::toUtf8(name), 0, store.reader, store.writer, true});
        try {
            fill(text);
        } catch (...) {
            remove();
            throw;
        }
    }

    ~CopyOnServer() {
        if (!isKept_) {
            remove();
        }
    }

    CopyOnServer(CopyOnServer const&) = delete;
    CopyOnServer& operator=(CopyOnServer const&) = delete;

    SharedLocation const& location() const noexcept { return location_; }

    void keep() noexcept { isKept_ = true; }

private:
    /// Stores the definition, and reads it again as any client does.
    void fill(std::string const& text) const {
        JournalBackend(server_->open(location_.project)).replace(text);
        if (JournalBackend(server_->open(location_.project)).text() != text) {
            throw Failure(Message("ServerReturnsOther"));
        }
    }

    void remove() const noexcept {
        try {
            server_->remove(location_.project);
        } catch (...) { // a project to which nothing leads stays on the server
        }
    }

    std::unique_ptr<SharedServer> server_;
    SharedLocation location_;
    bool isKept_ = false;
};

/// Copies the definition from the text to a server or from the server to a text, and lets the folder lead to
/// the copy.
class CopyCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& tool) override {
        auto* const app = tool.add_subcommand("copy");
        auto* const to = takeText(*app, "--to", target_);
        to->required();
        takeRoles(*app, *to, reader_, writer_);
        return app;
    }

    int run(OpenProject& project) override {
        bool const isToText = *target_ == "text";
        if (isToText == (project.log() == nullptr)) {
            throw Failure(Message(isToText ? "StoredInText" : "StoredOnServer"));
        }
        if (isToText && (reader_ || writer_)) {
            throw Failure(Message("TextHasNoRoles"));
        }
        project.shield().raise();
        isToText ? copyToText(project) : copyToServer(project);
        return 0;
    }

    bool canRunInBatch() const override { return false; }

private:
    static std::unique_ptr<Disk> diskOf(OpenProject const& project) {
        return project::stores::makeSystemDisk(project.root(), TextBackend::folderName);
    }

    /// The project stays on the server if the folder may lead to it.
    static FileChanges leadTo(CopyOnServer& copy, Disk& disk) {
        try {
            auto files = project::stores::replaceTextByLocation(disk, copy.location());
            copy.keep();
            return files;
        } catch (StoreError const& error) {
            if (error.kind() == StoreError::Kind::OutcomeUnknown) {
                copy.keep();
            }
            throw;
        }
    }

    /// The guard keeps other processes from changing the text, which would be lost.
    void copyToServer(OpenProject& project) const {
        auto const name = project.manager().getName();
        auto const guard = project.store().acquireWriteLock();
        auto const disk = diskOf(project);
        auto const text = project::stores::canonicalText(*disk);
        CopyOnServer copy(sharedStore(*target_, name, reader_, writer_), name, text);
        auto const files = leadTo(copy, *disk);
        project.stageReplaced(files);
        output().say(Message("CopiedToServer"));
    }

    static void copyToText(OpenProject& project) {
        auto const text = project.log()->text();
        auto const files = project::stores::replaceLocationByText(*diskOf(project), text);
        project.stageReplaced(files);
        output().say(Message("CopiedToText"));
    }

    std::optional<std::string> target_;
    std::optional<std::string> reader_;
    std::optional<std::string> writer_;
};

} // namespace

std::unique_ptr<Command> makeCopyCommand() {
    return std::make_unique<CopyCommand>();
}

} // namespace projectctl
