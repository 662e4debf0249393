#include "project/references/FolderReference.hpp"

#include <filesystem>

#include <gtest/gtest.h>

#include "references/FolderReferenceReader.hpp"
#include "support/TemporaryFolder.hpp"

namespace project::management {
namespace {

class FolderReferenceTest : public testing::Test {
protected:
    /// Creates a symbolic link below the temporary folder.
    Path link(std::u16string const& relative, Path const& target) {
        auto const link = folder.path(relative);
        std::filesystem::create_symlink(fl::filesystem::toSystem(target), fl::filesystem::toSystem(link));
        return link;
    }

    /// A path that has no canonical form.
    Path loop() { return link(u"loop", folder.path(u"loop")); }

    /// The location of a reference that is read in a project with this root.
    static Path readIn(Path const& root, FolderReference const& reference) {
        return RelativeFolderReferenceReader(root).read(reference.getStoredPath(), u"x").getLocation();
    }

    test::TemporaryFolder folder;
    Path const root = folder.folder(u"project");
};

TEST_F(FolderReferenceTest, hasTheConstructorsArguments) {
    FolderReference const reference(u"/p/a", u"Relative", u"a", u"x");
    EXPECT_EQ(reference.getLocation(), Path(u"/p/a"));
    EXPECT_EQ(reference.getType(), u"Relative");
    EXPECT_EQ(reference.getStoredPath(), u"a");
    EXPECT_EQ(reference.getUUID(), u"x");
}

TEST_F(FolderReferenceTest, withoutAUUIDItGetsANewOne) {
    FolderReference const reference(u"/p/a", u"Relative", u"a");
    EXPECT_EQ(reference.getUUID().size(), 36U);
    EXPECT_NE(reference.getUUID(), FolderReference(u"/p/a", u"Relative", u"a").getUUID());
}

TEST_F(FolderReferenceTest, aCopyIsTheSameReference) {
    auto const reference = relativeFolderReference(folder.folder(u"project/a"), root);
    auto copy = FolderReference(u"/other", u"Absolute", u"/other");
    copy = reference;
    EXPECT_EQ(copy.getUUID(), reference.getUUID());
    EXPECT_EQ(copy.getLocation(), reference.getLocation());
}

TEST_F(FolderReferenceTest, aFolderBelowTheRootIsStoredRelativeWithSlashes) {
    auto const target = folder.folder(u"project/a/b");
    auto const reference = relativeFolderReference(target, root);
    EXPECT_EQ(reference.getType(), u"Relative");
    EXPECT_EQ(reference.getStoredPath(), u"a/b");
    EXPECT_EQ(reference.getLocation(), target);
}

TEST_F(FolderReferenceTest, theLocationOfARelativeReferenceIsCanonical) {
    auto const target = folder.folder(u"project/a");
    folder.folder(u"project/b");
    link(u"project/link", target);
    auto const reference = relativeFolderReference(root / u"b/../link/", root);
    EXPECT_EQ(reference.getLocation(), target);
    EXPECT_EQ(reference.getStoredPath(), u"a");
}

TEST_F(FolderReferenceTest, theRootItselfIsStoredAsTheEmptyText) {
    auto const reference = relativeFolderReference(root, root);
    EXPECT_EQ(reference.getStoredPath(), u"");
    EXPECT_EQ(reference.getLocation(), root);
    EXPECT_EQ(readIn(root, reference), root);
}

TEST_F(FolderReferenceTest, aFolderOutsideTheRootIsAccepted) {
    auto const target = folder.folder(u"libraries/x");
    auto const reference = relativeFolderReference(target, root);
    EXPECT_EQ(reference.getStoredPath(), u"../libraries/x");
    EXPECT_EQ(readIn(root, reference), target);
}

TEST_F(FolderReferenceTest, aMissingFolderIsAccepted) {
    auto const reference = relativeFolderReference(root / u"later", root);
    EXPECT_EQ(reference.getStoredPath(), u"later");
    EXPECT_EQ(absoluteFolderReference(root / u"later").getLocation(), root / u"later");
}

TEST_F(FolderReferenceTest, aBackslashIsStoredAsASlash) {
    auto const reference = relativeFolderReference(folder.folder(u"project/a\\b"), root);
    EXPECT_EQ(reference.getStoredPath(), u"a/b");
    EXPECT_EQ(reference.getLocation(), root / u"a\\b");
}

TEST_F(FolderReferenceTest, aRootGivenThroughALinkLeadsBackToTheTarget) {
    // A link elsewhere, deeper than the folder that it leads to: counted from the link's own text, the
    // relative text would have other ".." parts.
    auto const target = folder.folder(u"libraries/x");
    folder.folder(u"links/deep");
    auto const linkedRoot = link(u"links/deep/project", root);
    auto const reference = relativeFolderReference(target, linkedRoot);
    EXPECT_EQ(reference.getStoredPath(), u"../libraries/x");
    EXPECT_EQ(readIn(linkedRoot, reference), target);
    EXPECT_EQ(readIn(root, reference), target);
}

TEST_F(FolderReferenceTest, aTargetGivenThroughALinkLeadsBackToTheFolderItself) {
    auto const target = folder.folder(u"libraries/x");
    auto const linkedTarget = link(u"project/x", target);
    auto const reference = relativeFolderReference(linkedTarget, root);
    EXPECT_EQ(reference.getStoredPath(), u"../libraries/x");
    EXPECT_EQ(readIn(root, reference), target);
}

TEST_F(FolderReferenceTest, aRootThatIsNotNormalisedLeadsBackToTheTarget) {
    auto const target = folder.folder(u"project/a");
    auto const reference = relativeFolderReference(target, root / u"b/../");
    EXPECT_EQ(reference.getStoredPath(), u"a");
}

TEST_F(FolderReferenceTest, anAbsoluteReferenceKeepsTheSpellingAndHasACanonicalLocation) {
    auto const target = folder.folder(u"libraries");
    auto const spelling = root / u"../libraries/";
    auto const reference = absoluteFolderReference(spelling);
    EXPECT_EQ(reference.getType(), u"Absolute");
    EXPECT_EQ(reference.getStoredPath(), spelling.native());
    EXPECT_EQ(reference.getLocation(), target);
}

TEST_F(FolderReferenceTest, anAbsoluteReferenceKeepsItsBackslashesAndItsLinks) {
    auto const target = folder.folder(u"a\\b");
    auto const linked = link(u"l\\ink", target);
    auto const reference = absoluteFolderReference(linked);
    EXPECT_EQ(reference.getStoredPath(), linked.native());
    EXPECT_EQ(reference.getLocation(), target);
}

TEST_F(FolderReferenceTest, twoReferencesToOneFolderHaveDifferentUUIDs) {
    EXPECT_NE(relativeFolderReference(root, root).getUUID(), relativeFolderReference(root, root).getUUID());
    EXPECT_NE(absoluteFolderReference(root).getUUID(), absoluteFolderReference(root).getUUID());
}

TEST_F(FolderReferenceTest, aPathWithoutACanonicalFormIsAnErrorWhenAReferenceIsCreated) {
    auto const endless = loop();
    EXPECT_THROW(relativeFolderReference(endless, root), std::filesystem::filesystem_error);
    EXPECT_THROW(relativeFolderReference(root, endless), std::filesystem::filesystem_error);
    EXPECT_THROW(absoluteFolderReference(endless), std::filesystem::filesystem_error);
}

} // namespace
} // namespace project::management
