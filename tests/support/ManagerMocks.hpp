#pragma once

#include <memory>
#include <optional>
#include <string>
#include <vector>

#include <gmock/gmock.h>

#include "project/core/EntryPointManager.hpp"
#include "project/core/FileManager.hpp"
#include "project/core/FolderReferenceManager.hpp"
#include "project/core/LabelManager.hpp"
#include "project/core/ProjectManager.hpp"
#include "project/core/ProjectPathManager.hpp"
#include "project/core/ProjectReferenceManager.hpp"
#include "project/entrypoints/EntryPoint.hpp"
#include "project/files/FileLabel.hpp"
#include "project/files/FileMetadataManager.hpp"
#include "project/files/LabelIDSet.hpp"
#include "project/references/FolderReference.hpp"

// Mocks of every manager interface, for the calls that a decorator makes to the object that it wraps.

namespace project::test {

class MockProjectManager : public management::ProjectManager {
public:
    MOCK_METHOD(management::EntryPointManager&, getEntryPointManager, (), (override));
    MOCK_METHOD(management::FileManager&, getFileManager, (), (override));
    MOCK_METHOD(management::LabelManager&, getLabelManager, (), (override));
    MOCK_METHOD(management::ProjectReferenceManager&, getProjectReferenceManager, (), (override));
    MOCK_METHOD(management::ProjectPathManager&, getProjectPathManager, (), (override));
    MOCK_METHOD(void, setName, (std::u16string const&), (override));
    MOCK_METHOD(std::u16string, getName, (), (const, override));
    MOCK_METHOD(std::u16string, getDescription, (), (const, override));
    MOCK_METHOD(void, setDescription, (std::u16string const&), (override));
    MOCK_METHOD(void, subscribe, (std::weak_ptr<metadata::FileChangeRequestListener>), (override));
    MOCK_METHOD(void, create, (std::u16string const&), (override));
};

class MockFileManager : public management::FileManager {
public:
    using Path = management::Path;
    using Paths = std::vector<Path>;
    using FileLabels = std::vector<management::FileLabel>;
    using Labels = std::vector<management::Label>;

    MOCK_METHOD(Path, getProjectRoot, (), (override));
    MOCK_METHOD(std::unique_ptr<management::FileMetadataManager>, getFileMetadataManagerFor,
                (std::u16string const&), (override));
    MOCK_METHOD(void, add, (Paths const&), (override));
    MOCK_METHOD(bool, isFileInProject, (Path const&), (const, override));
    MOCK_METHOD(Paths, remove, (Paths const&), (override));
    MOCK_METHOD(Paths, getChildProjectFiles, (Path const&), (const, override));
    MOCK_METHOD(Paths, getProjectFiles, (), (const, override));
    MOCK_METHOD(FileLabels, addLabels, (Paths const&, Labels const&), (override));
    MOCK_METHOD(void, removeLabels, (Paths const&, Labels const&), (override));
    MOCK_METHOD(std::vector<management::LabelIDSet>, getLabelIDSets, (Path const&), (override));
    MOCK_METHOD(FileLabels, getLabels, (Path const&), (override));
    MOCK_METHOD(void, removeCategory, (Paths const&, management::CategoryIdentifier const&), (override));
};

class MockLabelManager : public management::LabelManager {
public:
    using CategoryIdentifier = management::CategoryIdentifier;
    using LabelIdentifier = management::LabelIdentifier;

    MOCK_METHOD(void, createCategory, (CategoryIdentifier const&), (override));
    MOCK_METHOD(CategoryIdentifier, getCategoryByUUID, (std::u16string const&), (override));
    MOCK_METHOD(void, deleteCategory, (CategoryIdentifier const&), (override));
    MOCK_METHOD(void, renameCategory, (CategoryIdentifier const&, std::u16string const&), (override));
    MOCK_METHOD(std::vector<CategoryIdentifier>, getAllCategories, (), (override));
    MOCK_METHOD(void, createLabel, (CategoryIdentifier const&, LabelIdentifier const&), (override));
    MOCK_METHOD(std::vector<LabelIdentifier>, getLabels, (CategoryIdentifier const&), (override));
    MOCK_METHOD(LabelIdentifier, getLabelByUUID, (CategoryIdentifier const&, std::u16string), (override));
    MOCK_METHOD(void, deleteLabel, (CategoryIdentifier const&, LabelIdentifier const&), (override));
};

class MockEntryPointManager : public management::EntryPointManager {
public:
    using EntryPoint = management::EntryPoint;
    using EntryPointGroup = management::EntryPointGroup;
    using Path = management::Path;

    MOCK_METHOD(void, setEntryPoint, (EntryPoint&), (override));
    MOCK_METHOD(std::vector<std::unique_ptr<EntryPoint>>, getEntryPoints, (), (override));
    MOCK_METHOD(std::unique_ptr<EntryPoint>, getEntryPoint, (Path), (override));
    MOCK_METHOD(void, removeEntryPoint, (Path), (override));
    MOCK_METHOD(std::vector<std::unique_ptr<EntryPointGroup>>, getEntryPointGroups, (), (override));
    MOCK_METHOD(void, deleteEntryPointGroup, (EntryPointGroup const&), (override));
    MOCK_METHOD(void, createEntryPointGroup, (EntryPointGroup const&), (override));
    MOCK_METHOD(void, renameEntryPointGroup, (EntryPointGroup const&, std::u16string const&), (override));
};

class MockFolderReferenceManager : public management::FolderReferenceManager {
public:
    using FolderReference = management::FolderReference;
    using Path = management::Path;

    MOCK_METHOD(std::vector<FolderReference>, getReferences, (), (const, override));
    MOCK_METHOD(void, addReferences, (std::vector<FolderReference> const&), (override));
    MOCK_METHOD(void, removeReferences, (std::vector<FolderReference> const&), (override));
    MOCK_METHOD(bool, isReference, (Path const&), (const, override));
    MOCK_METHOD(std::optional<FolderReference>, getRootReferenceFor, (Path const&), (const, override));
};

class MockProjectPathManager : public management::ProjectPathManager {
public:
    MOCK_METHOD(management::FolderReferenceManager&, getFolderReferenceManager, (), (override));
};

class MockProjectReferenceManager : public management::ProjectReferenceManager {
public:
    MOCK_METHOD(management::FolderReferenceManager&, getFolderReferenceManager, (), (override));
};

} // namespace project::test
