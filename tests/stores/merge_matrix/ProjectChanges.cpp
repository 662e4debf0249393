#include "stores/merge_matrix/ProjectChanges.hpp"

#include <utility>

#include "project/core/EntryPointManager.hpp"
#include "project/core/FileManager.hpp"
#include "project/core/FolderReferenceManager.hpp"
#include "project/core/LabelManager.hpp"
#include "project/core/ProjectPathManager.hpp"
#include "project/core/ProjectReferenceManager.hpp"
#include "project/entrypoints/EntryPoint.hpp"
#include "project/files/FileLabel.hpp"
#include "project/labels/Label.hpp"
#include "project/references/FolderReference.hpp"

namespace project::test {

using namespace management;

namespace {

CategoryDefinition kind() {
    return {u"Kind", u"c-kind"};
}

CategoryDefinition phase() {
    return CategoryDefinition(u"Phase", u"c-phase").setIsSingleValued(true);
}

Label sourceLabel() {
    return {kind(), LabelDefinition(u"Source", u"l-source")};
}

Label testLabel() {
    return {kind(), LabelDefinition(u"Test", u"l-test")};
}

Label draftLabel() {
    return {phase(), LabelDefinition(u"Draft", u"l-draft")};
}

Label finalLabel() {
    return {phase(), LabelDefinition(u"Final", u"l-final")};
}

EntryPointGroupDefinition group(std::u16string const& name) {
    return {name, u"g-" + name};
}

/// A reference to a folder in the project's root.
FolderReference reference(TemporaryFolder const& folder, std::u16string const& name) {
    auto const generated = relativeFolderReference(folder.path(name), folder.root());
    return {generated.getLocation(), generated.getType(), generated.getStoredPath(), u"r-" + name};
}

Action adding(std::u16string const& path) {
    return [path](ProjectManager& project, TemporaryFolder const& folder) {
        project.getFileManager().add({folder.path(path)});
    };
}

Action removing(std::u16string const& path) {
    return [path](ProjectManager& project, TemporaryFolder const& folder) {
        project.getFileManager().remove({folder.path(path)});
    };
}

Action labelling(std::u16string const& path, Label const& label) {
    return [path, label](ProjectManager& project, TemporaryFolder const& folder) {
        project.getFileManager().addLabels({folder.path(path)}, {label});
    };
}

Action unlabelling(std::u16string const& path, Label const& label) {
    return [path, label](ProjectManager& project, TemporaryFolder const& folder) {
        project.getFileManager().removeLabels({folder.path(path)}, {label});
    };
}

/// Changes through one of the managers.
template <typename Manager, typename Call>
Action with(Manager& (ProjectManager::*manager)(), Call const& call) {
    return [manager, call](ProjectManager& project, TemporaryFolder const&) { call((project.*manager)()); };
}

template <typename Edit>
Action editingEntryPoint(Edit const& edit) {
    return [edit](ProjectManager& project, TemporaryFolder const& folder) {
        EntryPointDefinition entryPoint(
            *project.getEntryPointManager().getEntryPoint(folder.path(u"main.cpp")));
        edit(entryPoint);
        project.getEntryPointManager().setEntryPoint(entryPoint);
    };
}

std::vector<NamedChange> fileChanges() {
    return {{"add new.txt", adding(u"new.txt")},
            {"add src/new.cpp", adding(u"src/new.cpp")},
            {"add extra/x.txt", adding(u"extra/x.txt")},
            {"remove src/one.cpp", removing(u"src/one.cpp")},
            {"remove src", removing(u"src")},
            {"remove doc/guide.md", removing(u"doc/guide.md")},
            {"label src/one.cpp Test", labelling(u"src/one.cpp", testLabel())},
            {"label other.cpp Test", labelling(u"other.cpp", testLabel())},
            {"take Source off src/one.cpp", unlabelling(u"src/one.cpp", sourceLabel())},
            {"label src/two.cpp Final", labelling(u"src/two.cpp", finalLabel())},
            {"label src Source", labelling(u"src", sourceLabel())}};
}

std::vector<NamedChange> labelChanges() {
    auto const labels = &ProjectManager::getLabelManager;
    return {
        {"create category Color",
         with(labels, [](LabelManager& it) { it.createCategory(CategoryDefinition(u"Color", u"c-color")); })},
        {"rename category Kind to Sort",
         with(labels, [](LabelManager& it) { it.renameCategory(kind(), u"Sort"); })},
        {"rename category Kind to Art",
         with(labels, [](LabelManager& it) { it.renameCategory(kind(), u"Art"); })},
        {"delete category Kind", with(labels, [](LabelManager& it) { it.deleteCategory(kind()); })},
        {"create label Docs",
         with(labels, [](LabelManager& it) { it.createLabel(kind(), LabelDefinition(u"Docs", u"l-docs")); })},
        {"delete label Source",
         with(labels, [](LabelManager& it) { it.deleteLabel(kind(), sourceLabel().getLabelIdentifier()); })}};
}

std::vector<NamedChange> entryPointChanges() {
    auto const entryPoints = &ProjectManager::getEntryPointManager;
    return {{"set entry point src/two.cpp",
             [](ProjectManager& project, TemporaryFolder const& folder) {
                 EntryPointDefinition entryPoint(folder.path(u"src/two.cpp"));
                 entryPoint.setUUID(u"e-two").setName(u"Two");
                 project.getEntryPointManager().setEntryPoint(entryPoint);
             }},
            {"rename entry point main.cpp", editingEntryPoint([](auto& it) { it.setName(u"Start"); })},
            {"extend entry point main.cpp",
             editingEntryPoint([](auto& it) { it.setExtensionData(u"icon", u"gear"); })},
            {"move entry point main.cpp to tests", editingEntryPoint([](auto& it) {
                 auto tests = group(u"tests");
                 it.setGroup(tests);
             })},
            {"remove entry point main.cpp",
             [](ProjectManager& project, TemporaryFolder const& folder) {
                 project.getEntryPointManager().removeEntryPoint(folder.path(u"main.cpp"));
             }},
            {"create group demos",
             with(entryPoints, [](EntryPointManager& it) { it.createEntryPointGroup(group(u"demos")); })},
            {"rename group tools",
             with(entryPoints,
                  [](EntryPointManager& it) { it.renameEntryPointGroup(group(u"tools"), u"Implements"); })},
            {"delete group tools",
             with(entryPoints, [](EntryPointManager& it) { it.deleteEntryPointGroup(group(u"tools")); })}};
}

std::vector<NamedChange> otherChanges() {
    return {
        {"add path lib2",
         [](ProjectManager& project, TemporaryFolder const& folder) {
             project.getProjectPathManager().getFolderReferenceManager().addReferences(
                 {reference(folder, u"lib2")});
         }},
        {"remove path lib",
         [](ProjectManager& project, TemporaryFolder const& folder) {
             project.getProjectPathManager().getFolderReferenceManager().removeReferences(
                 {reference(folder, u"lib")});
         }},
        {"add reference lib",
         [](ProjectManager& project, TemporaryFolder const& folder) {
             project.getProjectReferenceManager().getFolderReferenceManager().addReferences(
                 {reference(folder, u"lib")});
         }},
        {"add reference lib2",
         [](ProjectManager& project, TemporaryFolder const& folder) {
             project.getProjectReferenceManager().getFolderReferenceManager().addReferences(
                 {reference(folder, u"lib2")});
         }},
        {"name it Station",
         [](ProjectManager& project, TemporaryFolder const&) { project.setName(u"Station"); }},
        {"name it Works", [](ProjectManager& project, TemporaryFolder const&) { project.setName(u"Works"); }},
        {"describe it",
         [](ProjectManager& project, TemporaryFolder const&) { project.setDescription(u"All of it"); }}};
}

} // namespace

void makeCommonProject(ProjectManager& project, TemporaryFolder const& folder) {
    project.create(u"Pumps");
    project.setDescription(u"Nothing yet");
    auto& files = project.getFileManager();
    for (auto const* const name :
         {u"main.cpp", u"other.cpp", u"src/one.cpp", u"src/two.cpp", u"src/sub/deep.cpp", u"doc/guide.md"}) {
        files.add({folder.path(name)});
    }
    for (auto const& label : {sourceLabel(), testLabel(), draftLabel(), finalLabel()}) {
        auto const category = label.getCategory();
        if (label.getUUID() == u"l-source" || label.getUUID() == u"l-draft") {
            project.getLabelManager().createCategory(category);
        }
        project.getLabelManager().createLabel(category, label.getLabelIdentifier());
    }
    files.addLabels({folder.path(u"src/one.cpp")}, {sourceLabel()});
    files.addLabels({folder.path(u"src/two.cpp")}, {draftLabel()});
    auto& entryPoints = project.getEntryPointManager();
    auto tools = group(u"tools");
    entryPoints.createEntryPointGroup(tools);
    entryPoints.createEntryPointGroup(group(u"tests"));
    EntryPointDefinition entryPoint(folder.path(u"main.cpp"));
    entryPoint.setUUID(u"e-main").setName(u"Main").setGroup(tools);
    entryPoints.setEntryPoint(entryPoint);
    project.getProjectPathManager().getFolderReferenceManager().addReferences({reference(folder, u"lib")});
}

std::vector<NamedChange> const& projectChanges() {
    static std::vector<NamedChange> const all = [] {
        std::vector<NamedChange> changes;
        for (auto const& some : {fileChanges(), labelChanges(), entryPointChanges(), otherChanges()}) {
            changes.insert(changes.end(), some.begin(), some.end());
        }
        return changes;
    }();
    return all;
}

} // namespace project::test
