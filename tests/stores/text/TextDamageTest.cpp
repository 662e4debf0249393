// Texts of which a part is missing or altered.
#include "text/ProjectText.hpp"

#include <algorithm>
#include <optional>

#include "line/LineParser.hpp"
#include "project/stores/StoreError.hpp"
#include "support/ProjectTextSamples.hpp"
#include "text/TextLines.hpp"

namespace project::stores {

namespace {

using namespace samples;

/// A text with lines of every kind.
ProjectText mixedText() {
    return ProjectText::empty().rewrittenWith(
        {set(addressOf({u"Info", u"ProjectData"}), makeNode(u"", {{u"Name", u"A \"name\""}})),
         make(addressOf({u"References", u"Root"})), set(fileAddress(u"a")), set(fileAddress(u"a/b.c")),
         set(fileAddress(u"a").child({u"DIR_SIGNIFIER", u"1"})),
         set(fileAddress(u"a/\u05D0\xD83D\xDE00\xD83D\n"), makeNode(u"Info", {{u"k", u"\x01v"}})),
         set(fileAddress(u"z"),
             makeNode(u"Info", {}, {{u"Category", {{u"UUID", u"1"}}, {{u"Label", {}, {}}}}}))});
}

struct Tailed {
    std::string bytes;
    std::vector<std::size_t> sizes; ///< of the text after each number of batches
    std::vector<Content> states;
};

Tailed tailedText() {
    Tailed tailed;
    ProjectText text = mixedText();
    tailed.bytes = text.body();
    Batch const batches[] = {
        {set(fileAddress(u"n")), remove(fileAddress(u"a"))},
        {set(fileAddress(u"a/\xDE00")), set(fileAddress(u"z"), makeNode(u"", {{u"k", u"w"}}))},
        {remove(addressOf({u"Info", u"ProjectData"})), make(fileAddress(u"m"))},
    };
    tailed.sizes.push_back(tailed.bytes.size());
    tailed.states.push_back(contentOf(text));
    for (Batch const& batch : batches) {
        std::string const added = text.tailFor(batch);
        EXPECT_TRUE(text.extend(added).has_value());
        tailed.bytes += added;
        tailed.sizes.push_back(tailed.bytes.size());
        tailed.states.push_back(contentOf(text));
    }
    return tailed;
}

TEST(TextDamage, everyBeginningOfATextIsIncompleteOrAStateAfterWholeBatches) {
    Tailed const tailed = tailedText();
    for (std::size_t length = 0; length <= tailed.bytes.size(); ++length) {
        auto const text = ProjectText::read(tailed.bytes.substr(0, length), "f");
        // A last line counts without its line end.
        auto const whole = std::upper_bound(tailed.sizes.begin(), tailed.sizes.end(), length + 1);
        ASSERT_EQ(text.has_value(), whole != tailed.sizes.begin()) << length;
        if (text) {
            auto const batches = static_cast<std::size_t>(whole - tailed.sizes.begin()) - 1;
            ASSERT_EQ(contentOf(*text), tailed.states[batches]) << length;
            bool const clean = length == tailed.sizes[batches];
            ASSERT_EQ(text->faults().empty(), clean) << length;
            ASSERT_EQ(described(text->faults()).starts_with("TornTail "), length > tailed.sizes[batches])
                << length;
        }
    }
}

/// Bytes that differ from a byte in one bit, and those with a meaning in JSON.
std::vector<char> replacementsFor(char byte) {
    std::vector<char> others{'"', '\\', '\n', '\r', ' ', ',', '/', '{', '}', '\0', '<', '='};
    for (int bit = 0; bit < 8; ++bit) {
        others.push_back(static_cast<char>(byte ^ (1 << bit)));
    }
    std::erase(others, byte);
    return others;
}

/// Reads arbitrary bytes. @return nothing if they are refused or incomplete.
std::optional<ProjectText> tryRead(std::string bytes) {
    try {
        return ProjectText::read(std::move(bytes), "f");
    } catch (StoreError const&) {
        return std::nullopt;
    }
}

/// The line that contains a byte.
std::string_view lineAt(std::string_view text, std::size_t at) {
    std::size_t const begin = at == 0 ? 0 : text.rfind('\n', at - 1) + 1;
    return text.substr(begin, text.find('\n', at) - begin);
}

TEST(TextDamage, everyAlteredByteOfATextWithATailIsDetected) {
    Tailed const tailed = tailedText();
    for (std::size_t at = 0; at < tailed.bytes.size(); ++at) {
        for (char const other : replacementsFor(tailed.bytes[at])) {
            std::string altered = tailed.bytes;
            altered[at] = other;
            auto const text = tryRead(altered);
            ASSERT_TRUE(!text || !text->faults().empty() || contentOf(*text) == tailed.states.back())
                << "byte " << at << " became " << static_cast<int>(other);
        }
    }
}

TEST(TextDamage, anAlteredByteOfABodyIsDetectedOrChangesOnlyItsLine) {
    std::string const bytes = mixedText().body();
    Content const before = contentOf(readWhole(bytes));
    std::size_t unseen = 0;
    for (std::size_t at = 0; at < bytes.size(); ++at) {
        for (char const other : replacementsFor(bytes[at])) {
            std::string altered = bytes;
            altered[at] = other;
            auto const text = tryRead(altered);
            if (!text || !text->faults().empty() || contentOf(*text) == before) {
                continue;
            }
            ++unseen;
            ParsedLine const was = parseBodyLine(lineAt(bytes, at));
            ParsedLine const is = parseBodyLine(lineAt(altered, at));
            ASSERT_TRUE(was.change && is.change) << at;
            for (Address const& address : addressesOf(text->differencesTo(readWhole(bytes)))) {
                ASSERT_TRUE(address == was.change->address || address == is.change->address) << at;
            }
        }
    }
    EXPECT_GT(unseen, 0U) << "a body has no checksum; this test shows the cost of that";
}

TEST(TextDamage, everyOneOfManyDamagedLinesIsReported) {
    std::string bytes = std::string(firstLine) + "\n";
    for (int i = 0; i < 20'000; ++i) {
        bytes += "damaged\n";
    }
    ProjectText const text = readWhole(bytes + std::string(endLine) + "\n");
    EXPECT_EQ(text.faults().size(), 20'000U);
    EXPECT_EQ(text.damagedLines().size(), 20'000U * 8);
}

} // namespace

} // namespace project::stores
