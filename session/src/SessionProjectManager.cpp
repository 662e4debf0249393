#include "SessionProjectManager.hpp"

#include <utility>

#include "project/files/FileLabel.hpp"

namespace project::session {

using management::CategoryIdentifier;
using management::EntryPoint;
using management::EntryPointGroup;
using management::FileLabel;
using management::FolderReference;
using management::Label;
using management::LabelIdentifier;
using management::Path;

void SessionFileManager::add(std::vector<Path> const& files) {
    executor_.execute([&] { FileManagerDecorator::add(files); }, {.added = files});
}

std::vector<Path> SessionFileManager::remove(std::vector<Path> const& files) {
    return executor_.execute(
        [&] {
            auto removed = FileManagerDecorator::remove(files);
            executor_.changePersonal([&] { return !personal_.containedIn(files).empty(); },
                                     [&] { personal_.remove(files); });
            return removed;
        },
        {.removed = files});
}

std::vector<FileLabel> SessionFileManager::addLabels(std::vector<Path> const& files,
                                                     std::vector<Label> const& labels) {
    return executor_.execute([&] { return FileManagerDecorator::addLabels(files, labels); });
}

void SessionFileManager::removeLabels(std::vector<Path> const& files, std::vector<Label> const& labels) {
    executor_.execute([&] { FileManagerDecorator::removeLabels(files, labels); });
}

void SessionFileManager::removeCategory(std::vector<Path> const& files, CategoryIdentifier const& category) {
    executor_.execute([&] { FileManagerDecorator::removeCategory(files, category); });
}

void SessionLabelManager::createCategory(CategoryIdentifier const& category) {
    executor_.execute([&] { LabelManagerDecorator::createCategory(category); });
}

void SessionLabelManager::deleteCategory(CategoryIdentifier const& category) {
    executor_.execute([&] { LabelManagerDecorator::deleteCategory(category); });
}

void SessionLabelManager::renameCategory(CategoryIdentifier const& category, std::u16string const& newName) {
    executor_.execute([&] { LabelManagerDecorator::renameCategory(category, newName); });
}

void SessionLabelManager::createLabel(CategoryIdentifier const& category, LabelIdentifier const& label) {
    executor_.execute([&] { LabelManagerDecorator::createLabel(category, label); });
}

void SessionLabelManager::deleteLabel(CategoryIdentifier const& category, LabelIdentifier const& label) {
    executor_.execute([&] { LabelManagerDecorator::deleteLabel(category, label); });
}

void SessionEntryPointManager::setEntryPoint(EntryPoint& entryPoint) {
    executor_.execute([&] { EntryPointManagerDecorator::setEntryPoint(entryPoint); });
}

void SessionEntryPointManager::removeEntryPoint(Path file) {
    executor_.execute([&] { EntryPointManagerDecorator::removeEntryPoint(std::move(file)); });
}

void SessionEntryPointManager::deleteEntryPointGroup(EntryPointGroup const& group) {
    executor_.execute([&] { EntryPointManagerDecorator::deleteEntryPointGroup(group); });
}

void SessionEntryPointManager::createEntryPointGroup(EntryPointGroup const& group) {
    executor_.execute([&] { EntryPointManagerDecorator::createEntryPointGroup(group); });
}

void SessionEntryPointManager::renameEntryPointGroup(EntryPointGroup const& group,
                                                     std::u16string const& newName) {
    executor_.execute([&] { EntryPointManagerDecorator::renameEntryPointGroup(group, newName); });
}

void SessionFolderReferenceManager::addReferences(std::vector<FolderReference> const& references) {
    executor_.execute([&] { FolderReferenceManagerDecorator::addReferences(references); });
}

void SessionFolderReferenceManager::removeReferences(std::vector<FolderReference> const& references) {
    executor_.execute([&] { FolderReferenceManagerDecorator::removeReferences(references); });
}

SessionProjectManager::SessionProjectManager(std::unique_ptr<management::ProjectManager> inner,
                                             ChangeExecutor& executor, PersonalStore& personal)
    : ProjectManagerDecorator(std::move(inner)),
      executor_(executor),
      files_(ProjectManagerDecorator::getFileManager(), executor, personal),
      labels_(ProjectManagerDecorator::getLabelManager(), executor),
      entryPoints_(ProjectManagerDecorator::getEntryPointManager(), executor),
      projectPath_(ProjectManagerDecorator::getProjectPathManager(), executor),
      references_(ProjectManagerDecorator::getProjectReferenceManager(), executor) {
}

void SessionProjectManager::setName(std::u16string const& name) {
    executor_.execute([&] { ProjectManagerDecorator::setName(name); });
}

void SessionProjectManager::setDescription(std::u16string const& description) {
    executor_.execute([&] { ProjectManagerDecorator::setDescription(description); });
}

void SessionProjectManager::create(std::u16string const& name) {
    executor_.execute([&] { ProjectManagerDecorator::create(name); });
}

} // namespace project::session
