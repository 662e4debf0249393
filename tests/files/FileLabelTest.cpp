#include "project/files/FileLabel.hpp"

namespace project::management {
namespace {

CategoryDefinition const color(u"Color", u"c-color");
LabelDefinition const red(u"Red", u"l-red");

TEST(FileLabel, isALabelOnAFileWithData) {
    FileLabel const label(color, red, u"/project/a", u"dark");
    EXPECT_EQ(label.getFile(), Path(u"/project/a"));
    EXPECT_EQ(label.getData(), u"dark");
    EXPECT_EQ(label.getCategory().getUUID(), u"c-color");
    EXPECT_EQ(label.getLabelIdentifier(), red);
}

TEST(FileLabel, hasEmptyDataUnlessGiven) {
    EXPECT_EQ(FileLabel(color, red, u"/project/a").getData(), u"");
}

TEST(FileLabel, isIdentifiedByTheUUIDOfItsLabel) {
    FileLabel const label(color, red, u"/project/a", u"dark");
    Unique const& unique = label;
    EXPECT_EQ(unique.getUUID(), u"l-red");
}

TEST(FileLabel, isCopiedWithItsFileAndData) {
    FileLabel copy(CategoryDefinition(u"Other"), LabelDefinition(u"Other"), u"/other");
    copy = FileLabel(color, red, u"/project/a", u"dark");
    EXPECT_EQ(copy.getFile(), Path(u"/project/a"));
    EXPECT_EQ(copy.getData(), u"dark");
    EXPECT_EQ(copy.getUUID(), u"l-red");
}

} // namespace
} // namespace project::management
