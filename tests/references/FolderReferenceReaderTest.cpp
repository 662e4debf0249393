#include "references/FolderReferenceReader.hpp"

#include <filesystem>

#include <gtest/gtest.h>

#include "support/TemporaryFolder.hpp"

namespace project::management {
namespace {

class FolderReferenceReaderTest : public testing::Test {
protected:
    /// Creates a link to itself, so that no path through it has a canonical form.
    void makeLoop(std::u16string const& name) {
        auto const loop = fl::filesystem::toSystem(folder.path(name));
        std::filesystem::create_symlink(loop, loop);
    }

    test::TemporaryFolder folder;
    Path const root = folder.folder(u"project");
    RelativeFolderReferenceReader relative{root};
    AbsoluteFolderReferenceReader absolute;
};

TEST_F(FolderReferenceReaderTest, eachReaderAcceptsItsOwnTypeOnly) {
    EXPECT_TRUE(relative.canRead(u"Relative"));
    EXPECT_FALSE(relative.canRead(u"Absolute"));
    EXPECT_TRUE(absolute.canRead(u"Absolute"));
    EXPECT_FALSE(absolute.canRead(u"Relative"));
}

TEST_F(FolderReferenceReaderTest, readersAcceptNoOtherText) {
    for (auto const* type :
         {u"", u"relative", u"RELATIVE", u"absolute", u"ABSOLUTE", u"Relative ", u"Absolut"}) {
        EXPECT_FALSE(relative.canRead(type)) << testing::PrintToString(std::u16string(type));
        EXPECT_FALSE(absolute.canRead(type)) << testing::PrintToString(std::u16string(type));
    }
}

TEST_F(FolderReferenceReaderTest, aReadReferenceHasTheTypeTheStoredPathAndTheUUID) {
    auto const a = relative.read(u"b/../a", u"x");
    EXPECT_EQ(a.getType(), u"Relative");
    EXPECT_EQ(a.getStoredPath(), u"b/../a");
    EXPECT_EQ(a.getUUID(), u"x");
    auto const b = absolute.read(u"/b/../a", u"y");
    EXPECT_EQ(b.getType(), u"Absolute");
    EXPECT_EQ(b.getStoredPath(), u"/b/../a");
    EXPECT_EQ(b.getUUID(), u"y");
}

TEST_F(FolderReferenceReaderTest, readingTwiceReturnsTheSameUUID) {
    EXPECT_EQ(relative.read(u"a", u"x").getUUID(), relative.read(u"a", u"x").getUUID());
    EXPECT_EQ(absolute.read(u"/a", u"x").getUUID(), absolute.read(u"/a", u"x").getUUID());
}

TEST_F(FolderReferenceReaderTest, aRelativeLocationIsCanonical) {
    auto const target = folder.folder(u"libraries/x");
    EXPECT_EQ(relative.read(u"../libraries/./y/../x", u"u").getLocation(), target);
}

TEST_F(FolderReferenceReaderTest, aRelativeLocationHasNoLinksInIt) {
    auto const target = folder.folder(u"libraries");
    std::filesystem::create_directory_symlink(fl::filesystem::toSystem(target),
                                              fl::filesystem::toSystem(root / u"link"));
    EXPECT_EQ(relative.read(u"link", u"u").getLocation(), target);
}

TEST_F(FolderReferenceReaderTest, theEmptyRelativePathIsTheCanonicalRoot) {
    EXPECT_EQ(relative.read(u"", u"u").getLocation(), root);
    EXPECT_EQ(RelativeFolderReferenceReader(root / u"../project/").read(u"", u"u").getLocation(), root);
}

TEST_F(FolderReferenceReaderTest, aDeletedFolderIsReadToo) {
    EXPECT_EQ(relative.read(u"../gone/x", u"u").getLocation(), folder.path(u"gone/x"));
    EXPECT_EQ(absolute.read(u"/gone/x", u"u").getLocation(), Path(u"/gone/x"));
}

TEST_F(FolderReferenceReaderTest, aRelativePathWithoutACanonicalFormIsAppendedToTheRoot) {
    makeLoop(u"loop");
    EXPECT_EQ(relative.read(u"../loop/../x", u"u").getLocation(), root / u"../loop/../x");
    EXPECT_EQ(relative.read(u"no \xD800 name", u"u").getLocation(), root / u"no \xD800 name");
}

TEST_F(FolderReferenceReaderTest, anAbsolutePathWithoutACanonicalFormIsReadToo) {
    makeLoop(u"loop");
    auto const endless = folder.path(u"loop/x");
    EXPECT_EQ(absolute.read(endless.native(), u"u").getLocation(), endless);
    EXPECT_EQ(absolute.read(u"/no \xD800 name", u"u").getLocation(), Path(u"/no \xD800 name"));
}

TEST_F(FolderReferenceReaderTest, anAbsoluteLocationIsTheStoredTextAndNotItsCanonicalForm) {
    auto const spelling = root / u"../libraries/";
    auto const created = absoluteFolderReference(spelling);
    auto const read = absolute.read(created.getStoredPath(), created.getUUID());
    EXPECT_EQ(read.getLocation(), spelling);
    EXPECT_EQ(created.getLocation(), folder.path(u"libraries"));
}

TEST_F(FolderReferenceReaderTest, theEmptyAbsolutePathIsTheEmptyPath) {
    EXPECT_EQ(absolute.read(u"", u"u").getLocation(), Path());
}

} // namespace
} // namespace project::management
