#include "line/LineAddress.hpp"

#include <rapidcheck/gtest.h>

#include "support/TextGenerators.hpp"

namespace project::stores {

namespace {

using samples::addressOf;
using samples::fileAddress;

bool comesBefore(Address const& left, Address const& right) {
    return compare(AddressText(left).view(), AddressText(right).view()) < 0;
}

TEST(LineAddress, filesAreWrittenAsPathsAndMarkersWithATrailingSlash) {
    EXPECT_EQ(AddressText(fileAddress(u"a/b.c")).view().text, "a/b.c");
    Address const marker = fileAddress(u"a").child({u"DIR_SIGNIFIER", u"1"});
    EXPECT_EQ(AddressText(marker).view().text, "a/");
    EXPECT_EQ(AddressText(marker).view().form, LineAddress::Form::Names);
}

TEST(LineAddress, everythingElseIsAListOfSteps) {
    Address const others[] = {
        addressOf({u"Files", u"Root"}),
        addressOf({u"Files", u"Other", u"File", u"a"}),
        addressOf({u"Files", u"Root", u"DIR_SIGNIFIER", u"1"}),
        fileAddress(u"a").child({u"LabelData", u"Data"}),
        fileAddress(u"a").child({u"DIR_SIGNIFIER", u"2"}),
        fileAddress(u"a").child({u"DIR_SIGNIFIER", u"1"}).child({u"File", u"b"}),
        addressOf({u"Files", u"Root", u"File", u""}),
        addressOf({u"Files", u"Root", u"File", u"a/b"}),
        Address::root(),
    };
    for (Address const& address : others) {
        AddressText const text(address);
        EXPECT_EQ(text.view().form, LineAddress::Form::Steps) << text.view().text;
        EXPECT_FALSE(isWrittenAsPath(text.view())) << text.view().text;
        EXPECT_EQ(toAddress(text.view()), address) << text.view().text;
    }
}

TEST(LineAddress, aFolderSortsBeforeItsContentsAndTheseBeforeLongerNames) {
    Address const sorted[] = {
        fileAddress(u"a"),
        fileAddress(u"a").child({u"DIR_SIGNIFIER", u"1"}),
        fileAddress(u"a/b"),
        fileAddress(u"a").child({u"LabelData", u"Data"}),
        fileAddress(u"a\x01"),
        fileAddress(u"a b"),
        fileAddress(u"a.b"),
        fileAddress(u"\xD83D"),
        fileAddress(u"\xD83D\xDE00"),
        fileAddress(u"\xE000"),
    };
    for (std::size_t i = 1; i < std::size(sorted); ++i) {
        EXPECT_TRUE(comesBefore(sorted[i - 1], sorted[i])) << i;
        EXPECT_FALSE(comesBefore(sorted[i], sorted[i - 1])) << i;
    }
}

RC_GTEST_PROP(LineAddress, anyAddressIsReadBackUnchanged, (Address const& address)) {
    RC_ASSERT(toAddress(AddressText(address).view()) == address);
}

RC_GTEST_PROP(LineAddress, writtenAddressesHaveTheOrderOfTheAddresses, ()) {
    std::vector<Address> const addresses = *samples::fewOf(20, samples::anyAddress());
    for (Address const& left : addresses) {
        for (Address const& right : addresses) {
            auto const order = compare(AddressText(left).view(), AddressText(right).view());
            RC_ASSERT(order == compare(left, right));
            RC_ASSERT(isWithin(AddressText(left).view(), AddressText(right).view()) == left.isWithin(right));
        }
    }
}

RC_GTEST_PROP(LineAddress, addressesBelowAnAddressAreWrittenWithinIt,
              (Address const& upper, Address const& other)) {
    Address lower = upper;
    for (metadata::PathElement const& step : other.getPath()) {
        RC_ASSERT(isWithin(AddressText(lower).view(), AddressText(upper).view()));
        lower = lower.child(step);
    }
}

RC_GTEST_PROP(LineAddress, everyPrefixOfAWrittenAddressIsTheAddressAbove, (Address const& address)) {
    AddressText const text(address);
    LineSteps steps(text.view());
    for (std::size_t depth = 1; depth <= address.depth(); ++depth) {
        RC_ASSERT(steps.next());
        Address above = address;
        while (above.depth() > depth) {
            above = above.parent();
        }
        RC_ASSERT(toAddress(steps.prefix()) == above);
    }
    RC_ASSERT(!steps.next());
}

} // namespace

} // namespace project::stores
