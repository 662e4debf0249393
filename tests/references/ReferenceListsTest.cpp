#include <filesystem>

#include <gmock/gmock.h>

#include "project/references/FolderReference.hpp"
#include "references/FolderReferenceCustomization.hpp"
#include "references/FolderReferenceManagerBase.hpp"
#include "references/ReferenceLists.hpp"
#include "support/ErrorMatchers.hpp"
#include "support/RecordingMetadataManager.hpp"
#include "support/TemporaryFolder.hpp"

// The differences between the project path and the references to projects.

namespace project::management {
namespace {

using metadata::MetadataPath;
using test::address;
using testing::ElementsAre;
using testing::IsEmpty;

MetadataPath const PROJECT_PATH = address({{u"ProjectPath", u"Root"}});
MetadataPath const REFERENCES = address({{u"References", u"Root"}});

std::vector<Path> locationsOf(std::vector<FolderReference> const& references) {
    std::vector<Path> result;
    for (auto const& reference : references) {
        result.push_back(reference.getLocation());
    }
    return result;
}

class ReferenceListsTest : public testing::Test {
protected:
    std::vector<std::u16string> uuidsBelow(MetadataPath const& head) {
        std::vector<std::u16string> result;
        for (auto const& child : store->content().getChildNodes(head)) {
            EXPECT_EQ(child.getLeaf().getType(), u"Reference");
            result.push_back(child.getLeaf().getLocation());
        }
        return result;
    }

    void putAbsolute(MetadataPath const& head) {
        store->put(head.child({u"Reference", u"x"}), {{u"Ref", u"/elsewhere"}, {u"Type", u"Absolute"}});
    }

    test::TemporaryFolder folder;
    Path const root = folder.folder(u"project");
    std::shared_ptr<test::RecordingMetadataManager> store =
        std::make_shared<test::RecordingMetadataManager>();
    ProjectPathManagerBase pathManager{store, root};
    ProjectReferenceManagerBase referenceManager{store, root};
    FolderReferenceManager& path = pathManager.getFolderReferenceManager();
    FolderReferenceManager& references = referenceManager.getFolderReferenceManager();
};

TEST_F(ReferenceListsTest, constructionDoesNotAccessTheStore) {
    EXPECT_THAT(store->calls(), IsEmpty());
}

TEST_F(ReferenceListsTest, theListIsTheSameObjectAtEachCall) {
    EXPECT_EQ(&pathManager.getFolderReferenceManager(), &path);
    EXPECT_EQ(&referenceManager.getFolderReferenceManager(), &references);
}

TEST_F(ReferenceListsTest, eachListIsStoredAtItsOwnAddress) {
    auto const onPath = relativeFolderReference(root / u"a", root);
    auto const referenced = relativeFolderReference(root / u"b", root);
    path.addReferences({onPath});
    references.addReferences({referenced});
    EXPECT_THAT(uuidsBelow(PROJECT_PATH), ElementsAre(onPath.getUUID()));
    EXPECT_THAT(uuidsBelow(REFERENCES), ElementsAre(referenced.getUUID()));
}

TEST_F(ReferenceListsTest, aFolderMayBeInBothLists) {
    auto const target = root / u"a";
    path.addReferences({relativeFolderReference(target, root)});
    references.addReferences({relativeFolderReference(target, root)});
    EXPECT_TRUE(path.isReference(target));
    EXPECT_TRUE(references.isReference(target));
}

TEST_F(ReferenceListsTest, eachListReportsADuplicateByItsOwnError) {
    auto const target = root / u"a";
    path.addReferences({relativeFolderReference(target, root)});
    references.addReferences({absoluteFolderReference(target)});
    store->clear();
    EXPECT_RAISES(DuplicatePathEntryException, (target),
                  path.addReferences({relativeFolderReference(target, root)}));
    EXPECT_RAISES(DuplicateReferenceException, (target),
                  references.addReferences({relativeFolderReference(target, root)}));
    EXPECT_THAT(store->writes(), IsEmpty());
}

TEST_F(ReferenceListsTest, theReferencesContainBothTypes) {
    auto const elsewhere = folder.folder(u"elsewhere");
    references.addReferences(
        {relativeFolderReference(root / u"a", root), absoluteFolderReference(elsewhere)});
    EXPECT_THAT(locationsOf(references.getReferences()),
                testing::UnorderedElementsAre(root / u"a", elsewhere));
}

TEST_F(ReferenceListsTest, anAbsoluteReferenceThatWasWrittenByHandIsReadFromTheReferencesAlone) {
    putAbsolute(PROJECT_PATH);
    putAbsolute(REFERENCES);
    EXPECT_THAT(path.getReferences(), IsEmpty());
    EXPECT_THAT(locationsOf(references.getReferences()), ElementsAre(Path(u"/elsewhere")));
}

TEST_F(ReferenceListsTest, theProjectPathStoresAbsoluteReferencesAndNeverListsThem) {
    auto const first = absoluteFolderReference(root / u"a");
    auto const second = absoluteFolderReference(root / u"a");
    path.addReferences({first});
    path.addReferences({second}); // not a duplicate, because the first one is not listed
    EXPECT_THAT(path.getReferences(), IsEmpty());
    EXPECT_THAT(uuidsBelow(PROJECT_PATH), testing::UnorderedElementsAre(first.getUUID(), second.getUUID()));

    path.removeReferences({first});
    EXPECT_THAT(uuidsBelow(PROJECT_PATH), ElementsAre(second.getUUID()));
}

TEST_F(ReferenceListsTest, anAbsoluteReferenceThroughALinkIsNotADuplicateOfItselfOnceRead) {
    // The location of a read reference is the stored text, that of a new reference is the folder itself.
    auto const target = folder.folder(u"elsewhere");
    auto const linked = folder.path(u"link");
    std::filesystem::create_symlink(fl::filesystem::toSystem(target), fl::filesystem::toSystem(linked));
    references.addReferences({absoluteFolderReference(linked)});
    EXPECT_TRUE(references.isReference(linked));
    EXPECT_FALSE(references.isReference(target));
    references.addReferences({absoluteFolderReference(linked)});
    EXPECT_EQ(references.getReferences().size(), 2U);
}

TEST_F(ReferenceListsTest, aProjectThatIsCopiedAsAWholeResolvesRelativeReferencesAgainstItsNewRoot) {
    folder.folder(u"work/project/a");
    folder.folder(u"work/libraries");
    auto const oldRoot = folder.path(u"work/project");
    ProjectPathManagerBase oldPath(store, oldRoot);
    ProjectReferenceManagerBase oldReferences(store, oldRoot);
    oldPath.getFolderReferenceManager().addReferences({relativeFolderReference(oldRoot / u"a", oldRoot)});
    oldReferences.getFolderReferenceManager().addReferences(
        {relativeFolderReference(folder.path(u"work/libraries"), oldRoot), absoluteFolderReference(oldRoot)});

    std::filesystem::copy(fl::filesystem::toSystem(folder.path(u"work")),
                          fl::filesystem::toSystem(folder.path(u"copy")),
                          std::filesystem::copy_options::recursive);
    auto const newRoot = folder.path(u"copy/project");
    ProjectPathManagerBase newPath(store, newRoot);
    ProjectReferenceManagerBase newReferences(store, newRoot);

    EXPECT_THAT(locationsOf(newPath.getFolderReferenceManager().getReferences()),
                ElementsAre(newRoot / u"a"));
    EXPECT_THAT(locationsOf(newReferences.getFolderReferenceManager().getReferences()),
                testing::UnorderedElementsAre(folder.path(u"copy/libraries"), oldRoot));
}

TEST(ReferenceCustomizations, acceptEveryReference) {
    FolderReference const reference(Path(), u"", u"", u"");
    EXPECT_NO_THROW(ProjectPathFolderReferenceCustomization(u"/p").validateReference(reference));
    EXPECT_NO_THROW(ProjectFolderReferenceCustomization(u"/p").validateReference(reference));
}

TEST(ReferenceCustomizations, readRelativeReferencesFirst) {
    ProjectFolderReferenceCustomization const customization(u"/p");
    ASSERT_EQ(customization.getReaders().size(), 2U);
    EXPECT_TRUE(customization.getReaders().at(0)->canRead(u"Relative"));
    EXPECT_TRUE(customization.getReaders().at(1)->canRead(u"Absolute"));

    ProjectPathFolderReferenceCustomization const pathCustomization(u"/p");
    ASSERT_EQ(pathCustomization.getReaders().size(), 1U);
    EXPECT_TRUE(pathCustomization.getReaders().at(0)->canRead(u"Relative"));
}

} // namespace
} // namespace project::management
