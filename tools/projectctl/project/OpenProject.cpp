#include "project/OpenProject.hpp"

#include <utility>

#include "cli/Settings.hpp"
#include "cli/WorkingFolder.hpp"
#include "output/Failure.hpp"
#include "output/NameForms.hpp"
#include "output/Output.hpp"
#include "project/MeantPath.hpp"
#include "project/ProjectFolder.hpp"
#include "project/metadata/Messages.hpp"
#include "project/metadata/ProjectException.hpp"
#include "project/stores/TreeMetadataManager.hpp"

namespace projectctl {

using project::session::SourceControl;
using project::stores::Fault;
using project::stores::HistoryLoss;
using project::stores::TextBackend;
using ZEPHRA::project::management::FileNotInProject;

namespace {

/// A command reads a shared project once, unless it takes long.
constexpr auto freshness = std::chrono::seconds(10);

/// A command stages the text once, at its end.
project::session::Options sessionOptions() {
    auto const sourceControl = settings().sourceControl ? SourceControl::WhenAsked : SourceControl::Off;
    return {sourceControl, true, freshness};
}

} // namespace

OpenProject::OpenProject(Path const& root) : OpenProject(Session::open(root, sessionOptions())) {
}

OpenProject OpenProject::create(Path const& root, std::u16string const& name) {
    return OpenProject(Session::create(root, name, sessionOptions()));
}

OpenProject OpenProject::createShared(Path const& root, std::u16string const& name,
                                      project::session::SharedStore const& shared) {
    return OpenProject(Session::createShared(root, name, shared, sessionOptions()));
}

OpenProject::OpenProject(Session session)
    : shield_(std::make_shared<WriteShield>()), session_(std::move(session)) {
    session_.project().subscribe(shield_);
    access_.personalStore().subscribe(shield_);
}

OpenProject::~OpenProject() = default;

OpenProject OpenProject::ofWorkingFolder() {
    return OpenProject(findProjectRoot(workingFolder()));
}

std::string OpenProject::definition() {
    return log() == nullptr ? shown(TextBackend::textPath(root())) : log()->journal().name();
}

std::string OpenProject::storeFile(std::string const& name) const {
    return shown(root() / TextBackend::folderName) + '/' + name;
}

void OpenProject::requireInProject(Path const& path) {
    if (files().isFileInProject(path)) {
        return;
    }
    if (auto const meant = meantPath(*this, path)) {
        throw Failure(Message("PathMeant", path, *meant));
    }
    project::exception::raise(FileNotInProject(path.native()));
}

std::vector<Fault> const& OpenProject::faults() {
    if (log() != nullptr) {
        faults_ = log()->faults(); // of what was read: no other client writes in a transaction
    } else if (openTransactions_ == 0) {
        faults_ = text().check();
    }
    return faults_;
}

void OpenProject::stageReturnedLater(std::vector<Path> const& files) {
    returned_.insert(returned_.end(), files.begin(), files.end());
}

void OpenProject::stage() {
    if (!returned_.empty()) {
        stageReturned();
    }
    session_.stage();
}

void OpenProject::stageReturned() {
    auto const guard = access_.guardForSourceControl();
    std::erase_if(returned_, [this](Path const& file) { return !files().isFileInProject(file); });
    access_.stageReturned(std::exchange(returned_, {}));
}

void OpenProject::showHint() const {
    if (hint_) {
        printHint(*hint_);
    }
}

void OpenProject::reportRecoveredMoves() {
    using project::session::RecoveredMoves;
    auto const recovered = session_.takeRecoveredMoves();
    if (!recovered) {
        return;
    }
    bool const isCompleted = recovered->outcome == RecoveredMoves::Outcome::Completed;
    auto const& first = recovered->moves.front();
    printError(Message(isCompleted ? "MoveCompleted" : "MoveRolledBack", recovered->moves.size(), first.from,
                       first.to));
    for (auto const& move : recovered->left) {
        printWarning(Message("MoveLeft", move.from, move.to));
    }
}

void OpenProject::warnOfUnfinishedMove() {
    if (session_.hasUnfinishedMove()) {
        printWarning(Message("MoveUnfinished"));
    }
}

void OpenProject::warnOfReset() {
    auto const loss = log() == nullptr ? std::nullopt : log()->historyLoss();
    if (loss && loss->kind == HistoryLoss::Kind::Reset) {
        printWarning(Message("ServerReset", std::to_string(loss->seen), std::to_string(loss->found)));
    }
}

void OpenProject::warnOfDamage() {
    if (openTransactions_ == 0) {
        warnOfFaults();
    }
}

void OpenProject::warnOfDamageInLog() {
    if (log() != nullptr) {
        warnOfFaults();
    }
}

void OpenProject::warnOfFaults() {
    std::size_t count = 0;
    std::string first;
    for (auto const& fault : faults()) {
        if (fault.kind == Fault::Kind::Damage || fault.kind == Fault::Kind::Conflict) {
            if (count++ == 0) {
                first = definition() + (fault.line > 0 ? ':' + std::to_string(fault.line) : "") + ": " +
                        fault.problem;
            }
        }
    }
    if (count > 0) {
        printWarning(count > 1 ? Message("TextFaults", first, count - 1) : Message("TextFault", first));
    }
}

} // namespace projectctl
