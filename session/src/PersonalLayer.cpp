#include "PersonalLayer.hpp"

#include <algorithm>
#include <set>
#include <utility>

#include "project/files/FileLabel.hpp"
#include "project/files/LabelIDSet.hpp"
#include "project/metadata/Messages.hpp"
#include "project/metadata/MetadataFunctions.hpp"
#include "project/metadata/ProjectException.hpp"

namespace project::session {

using management::CategoryIdentifier;
using management::FileLabel;
using management::Label;
using management::LabelIdentifier;
using management::LabelIDSet;
using ZEPHRA::project::management::FileNotInProject;

Personal::~Personal() = default;

void PersonalExecutor::execute(std::function<void()> const& operation) {
    std::vector<Event> events;
    {
        auto const guard = project_.acquireReadLock();
        if (executor_.isInStep()) { // of this thread: others would hold the write guard
            executor_.execute([&] {
                executor_.joinPersonal();
                operation();
            });
            return;
        }
        events = runAlone(operation);
    }
    dispatch(events, *executor_.personalObservers());
}

std::vector<Event> PersonalExecutor::runAlone(std::function<void()> const& operation) {
    constexpr std::size_t outermost = 1;
    auto const guard = personal_.tree()->acquireWriteLock();
    auto& steps = personal_.steps();
    steps.join(outermost);
    try {
        operation();
    } catch (...) {
        steps.rollBack(outermost);
        throw;
    }
    steps.commit(outermost);
    return steps.raised().take();
}

PersonalFileManager::PersonalFileManager(management::FileManager& project,
                                         stores::TreeMetadataManager& projectStore, PersonalStore& personal,
                                         PersonalExecutor& executor)
    : FileManagerDecorator(project), projectStore_(projectStore), personal_(personal), executor_(executor) {
}

bool PersonalFileManager::canHaveLabels(Path const& file) const {
    return isFileInProject(file) && file != personal_.root();
}

void PersonalFileManager::requireLabellable(std::vector<Path> const& files) const {
    for (auto const& file : files) {
        if (!canHaveLabels(file)) {
            exception::raise(FileNotInProject(file.native()));
        }
    }
}

std::vector<FileLabel> PersonalFileManager::addLabels(std::vector<Path> const& files,
                                                      std::vector<Label> const& labels) {
    std::vector<FileLabel> displaced;
    executor_.execute([&] {
        auto inProject = files;
        std::erase_if(inProject, [this](Path const& file) { return !isFileInProject(file); });
        requireLabellable(inProject);
        personal_.add(inProject);
        displaced = this->labels().addLabels(inProject, labels);
    });
    return displaced;
}

void PersonalFileManager::removeLabels(std::vector<Path> const& files, std::vector<Label> const& labels) {
    changeLabelled(files, [&](auto const& labelled) { this->labels().removeLabels(labelled, labels); });
}

void PersonalFileManager::removeCategory(std::vector<Path> const& files, CategoryIdentifier const& category) {
    changeLabelled(files, [&](auto const& labelled) { labels().removeCategory(labelled, category); });
}

void PersonalFileManager::changeLabelled(
    std::vector<Path> const& files, std::function<void(std::vector<Path> const& labelled)> const& operation) {
    executor_.execute([&] {
        requireLabellable(files);
        if (auto const labelled = personal_.containedIn(files); !labelled.empty()) {
            operation(labelled);
            personal_.removeUnlabelled(labelled);
        }
    });
}

std::vector<LabelIDSet> PersonalFileManager::getLabelIDSets(Path const& path) {
    auto const guard = projectStore_.acquireReadLock();
    auto const personalGuard = personal_.tree()->acquireReadLock();
    requireLabellable({path});
    return personal_.contains(path) ? labels().getLabelIDSets(path) : std::vector<LabelIDSet>();
}

std::vector<FileLabel> PersonalFileManager::getLabels(Path const& path) {
    auto const guard = projectStore_.acquireReadLock();
    auto const personalGuard = personal_.tree()->acquireReadLock();
    requireLabellable({path});
    return personal_.contains(path) ? labels().getLabels(path) : std::vector<FileLabel>();
}

PersonalLabelManager::PersonalLabelManager(PersonalStore& personal, PersonalExecutor& executor)
    : LabelManagerDecorator(personal.managers().getLabelManager()), personal_(personal), executor_(executor) {
}

void PersonalLabelManager::createCategory(CategoryIdentifier const& category) {
    executor_.execute([&] { LabelManagerDecorator::createCategory(category); });
}

void PersonalLabelManager::deleteCategory(CategoryIdentifier const& category) {
    executor_.execute([&] {
        LabelManagerDecorator::deleteCategory(category);
        personal_.removeUnlabelled(personal_.files());
    });
}

void PersonalLabelManager::renameCategory(CategoryIdentifier const& category, std::u16string const& newName) {
    executor_.execute([&] { LabelManagerDecorator::renameCategory(category, newName); });
}

void PersonalLabelManager::createLabel(CategoryIdentifier const& category, LabelIdentifier const& label) {
    executor_.execute([&] { LabelManagerDecorator::createLabel(category, label); });
}

void PersonalLabelManager::deleteLabel(CategoryIdentifier const& category, LabelIdentifier const& label) {
    executor_.execute([&] {
        LabelManagerDecorator::deleteLabel(category, label);
        personal_.removeUnlabelled(personal_.files());
    });
}

PersonalLayer::PersonalLayer(management::ProjectManager& project,
                             std::shared_ptr<stores::TreeMetadataManager> const& projectStore,
                             PersonalStore& personal, ChangeExecutor& executor)
    : projectStore_(*projectStore),
      personal_(personal),
      observers_(executor.personalObservers()),
      executor_(projectStore_, personal, executor),
      files_(project.getFileManager(), projectStore_, personal, executor_),
      labels_(personal, executor_),
      ofOthers_(personal.tree(), personal.root(), FileEvents::LabelsOnly) {
}

std::vector<Path> PersonalLayer::hiddenFiles() {
    auto const guard = projectStore_.acquireReadLock();
    auto result = personal_.labelledFiles();
    std::erase_if(result, [this](Path const& file) { return files_.isFileInProject(file); });
    return result;
}

std::vector<Path> PersonalLayer::removeHidden() {
    std::vector<Path> hidden;
    executor_.execute([&] {
        hidden = hiddenFiles();
        personal_.remove(hidden);
    });
    return hidden;
}

std::vector<Move> PersonalLayer::followHidden(std::vector<Move> const& moves) {
    std::vector<Move> followed;
    executor_.execute([&] {
        auto const hidden = hiddenFiles();
        stores::PathMoves paths;
        std::set<Path> targets;
        for (auto const& move : moves) {
            bool const isPossible = std::ranges::find(hidden, move.from) != hidden.end() &&
                                    files_.isFileInProject(move.to) && !personal_.contains(move.to);
            if (isPossible && targets.insert(move.to).second) {
                paths.add(metadata::getRelativePath(personal_.root(), move.from),
                          metadata::getRelativePath(personal_.root(), move.to), true);
                followed.push_back(move);
            }
        }
        if (!followed.empty()) {
            personal_.move(paths);
            personal_.steps().raised().input()->dispatchMetadataChange();
        }
    });
    return followed;
}

bool PersonalLayer::refresh() {
    return ofOthers_.dispatch(*observers_);
}

} // namespace project::session
