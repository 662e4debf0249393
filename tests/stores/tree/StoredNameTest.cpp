#include "tree/StoredName.hpp"

#include <vector>

#include <gtest/gtest.h>

namespace project::stores {
namespace {

/// A name in its stored form.
class Stored {
public:
    explicit Stored(std::u16string_view text) : isWide_(NewName(text).isWide()) {
        NewName const name(text);
        bytes_.resize(name.size());
        name.copyTo(bytes_.data());
    }

    StoredName view() const { return {bytes_, isWide_}; }

private:
    std::string bytes_;
    bool isWide_;
};

std::vector<std::u16string> names() {
    std::vector<std::u16string> names{
        u"",   u"a",       u"ab",          u"b",     u"a\u00FF",       u"\u00FF", u"\u0100",
        u"a/", u"a\u4E00", {u'a', 0xD800}, {0xDC00}, {0xD83D, 0xDE00}, {u'a', 0}};
    names.emplace_back(300, u'a');
    names.push_back(std::u16string(300, u'a') + u'\u0100');
    names.push_back(std::u16string(128, u'a'));
    names.push_back(std::u16string(129, u'b'));
    return names;
}

TEST(StoredName, namesOfAnyCodeUnitsAreStoredAsTheyAre) {
    for (auto const& name : names()) {
        EXPECT_EQ(Stored(name).view().text(), name);
    }
}

TEST(StoredName, takesOneByteForEachUnitUnlessOneIsAboveAByte) {
    EXPECT_EQ(NewName(u"na\u00EFve").size(), 5U);
    EXPECT_EQ(NewName(u"na\u0131ve").size(), 10U);
}

TEST(StoredName, isComparedByCodeUnitsWhateverItsForm) {
    for (auto const& left : names()) {
        for (auto const& right : names()) {
            Stored const stored(right);
            NameKey const key(left);
            EXPECT_EQ(key.compareWith(stored.view()), left <=> right);
            EXPECT_EQ(key.isEqual(stored.view()), left == right);
        }
    }
}

TEST(StoredName, aDifferenceIsFoundAtEachPlace) {
    std::u16string const name = u"a name of a length";
    Stored const stored(name);
    EXPECT_TRUE(NameKey(name).isEqual(stored.view()));
    for (std::size_t place = 0; place < name.size(); ++place) {
        auto other = name;
        other[place] = static_cast<char16_t>(name[place] + 0x100); // the same as a byte
        EXPECT_FALSE(NameKey(other).isEqual(stored.view())) << place;
    }
}

} // namespace
} // namespace project::stores
