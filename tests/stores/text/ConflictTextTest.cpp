#include "text/ProjectText.hpp"

#include "support/ProjectTextSamples.hpp"
#include "text/TextLines.hpp"

namespace project::stores {

namespace {

using namespace samples;

std::string const first = std::string(firstLine) + "\n";
std::string const last = std::string(endLine) + "\n";

TEST(ConflictText, linesOfBothSidesCountAndThoseOfTheBaseDoNot) {
    std::string const bytes = bodyOf({
        R"("a")",
        "<<<<<<< ours",
        R"({"file":"b","keys":{"k":"1","l":"1"}})",
        R"("c")",
        "||||||| base",
        R"("base")",
        "=======",
        R"({"file":"b","keys":{"k":"2"}})",
        R"("d")",
        ">>>>>>> theirs",
        R"("e")",
    });
    ProjectText const text = readWhole(bytes);
    EXPECT_EQ(described(text.faults()), "Conflict 3");
    EXPECT_EQ(contentOf(text), (Content{{fileAddress(u"a"), "Info()"},
                                        {fileAddress(u"b"), "Info(k=2;l=1;)"},
                                        {fileAddress(u"c"), "Info()"},
                                        {fileAddress(u"d"), "Info()"},
                                        {fileAddress(u"e"), "Info()"}}));
    EXPECT_FALSE(text.isTidy());
    EXPECT_TRUE(text.hasSameBytes(bytes));
    EXPECT_EQ(text.damagedLines(), "");
    EXPECT_EQ(text.rewrittenWith({}).body(),
              bodyOf({R"("a")", R"({"file":"b","keys":{"k":"2","l":"1"}})", R"("c")", R"("d")", R"("e")"}));
}

TEST(ConflictText, everyConflictIsReportedAndSoIsAStrayMarker) {
    ProjectText const text = readWhole(bodyOf({
        "<<<<<<< ours",
        "=======",
        R"("a")",
        ">>>>>>> theirs",
        "<<<<<<<",
        R"("b")",
        "=======",
        ">>>>>>>",
        R"("c")",
        "=======",
        R"("d")",
    }));
    EXPECT_EQ(described(text.faults()), "Conflict 2, Conflict 6, Conflict 11");
    EXPECT_EQ(contentOf(text).size(), 4U);
}

TEST(ConflictText, damageBetweenMarkersIsReportedOnce) {
    ProjectText const text =
        readWhole(bodyOf({"wrong", "<<<<<<< ours", "worse", "=======", ">>>>>>> theirs"}));
    EXPECT_EQ(described(text.faults()), "Damage 2, Conflict 3, Damage 4");
    EXPECT_EQ(text.damagedLines(), "wrong\nworse\n");
}

TEST(ConflictText, tailsOfBothSidesCount) {
    std::string const body = bodyOf({R"("a")", R"("b")"});
    std::string const ours = readWhole(body).tailFor({set(fileAddress(u"c")), set(fileAddress(u"x"))});
    std::string const theirs = readWhole(body).tailFor({set(fileAddress(u"d")), set(fileAddress(u"x"))});
    ProjectText const text =
        readWhole(body + "<<<<<<< ours\n" + ours + "=======\n" + theirs + ">>>>>>> theirs\n");
    EXPECT_EQ(described(text.faults()), "Conflict 5");
    EXPECT_EQ(text.rewrittenWith({}).body(), bodyOf({R"("a")", R"("b")", R"("c")", R"("d")", R"("x")"}));
}

TEST(ConflictText, aTornTailOfASideIsReported) {
    std::string const conflict = "<<<<<<< ours\n\"a\"\n=======\n\"b\"\n>>>>>>> theirs\n";

    ProjectText const torn = readWhole(first + conflict + last + "\"half");

    EXPECT_EQ(described(torn.faults()), "Conflict 2, TornTail 8");
    EXPECT_EQ(described(readWhole(first + conflict + last).faults()), "Conflict 2");
}

TEST(ConflictText, inTheTailOfASideLaterLinesWin) {
    std::string const body = bodyOf({R"({"file":"a","keys":{"k":"1"}})"});
    std::string const tail =
        readWhole(body).tailFor({set(fileAddress(u"a"), makeNode(u"Info", {{u"l", u"2"}}))});
    ProjectText const text = readWhole(body + tail + "<<<<<<< ours\n=======\n>>>>>>> theirs\n");
    EXPECT_EQ(described(text.faults()), "Conflict 6");
    EXPECT_EQ(contentOf(text).at(fileAddress(u"a")), "Info(l=2;)");
}

TEST(ConflictText, aBatchWhoseLinesBothSidesShareIsStillValid) {
    std::string const body = bodyOf({R"("a")"});
    std::string const ours = readWhole(body).tailFor({set(fileAddress(u"b")), set(fileAddress(u"c"))});
    std::string const theirs = readWhole(body).tailFor({set(fileAddress(u"b")), set(fileAddress(u"d"))});
    std::size_t const shared = std::string("\"b\"\n").size();
    ProjectText const text =
        readWhole(body + ours.substr(0, shared) + "<<<<<<< ours\n" + ours.substr(shared) + "=======\n" +
                  theirs.substr(shared) + ">>>>>>> theirs\n");
    EXPECT_EQ(described(text.faults()), "Conflict 5");
    EXPECT_EQ(text.rewrittenWith({}).body(), bodyOf({R"("a")", R"("b")", R"("c")", R"("d")"}));
}

TEST(ConflictText, aConflictMayExtendBeyondTheBody) {
    std::string const one = bodyOf({R"("a")", R"("b")"});
    std::string const two = bodyOf({R"("a")", R"("c")"});
    std::string const common = first + "\"a\"\n";
    std::string const tail = readWhole(two).tailFor({remove(fileAddress(u"a"))});
    ProjectText const text = readWhole(common + "<<<<<<< ours\n" + one.substr(common.size()) + "=======\n" +
                                       two.substr(common.size()) + tail + ">>>>>>> theirs\n");
    EXPECT_EQ(described(text.faults()), "Conflict 3");
    EXPECT_EQ(text.rewrittenWith({}).body(), bodyOf({R"("a")", R"("b")", R"("c")"}));
}

TEST(ConflictText, aTextThatIsBeingWrittenIsIncomplete) {
    std::string const whole = first + "<<<<<<< ours\n\"a\"\n=======\n\"b\"\n>>>>>>> theirs\n" + last;
    for (std::size_t length = 0; length + 1 < whole.size(); ++length) {
        EXPECT_FALSE(ProjectText::read(whole.substr(0, length), "f").has_value()) << length;
    }
    EXPECT_TRUE(ProjectText::read(whole, "f").has_value());
}

TEST(ConflictText, eachSideMayHaveItsOwnFirstLine) {
    ProjectText const text = readWhole("<<<<<<< ours\n" + bodyOf({R"("a")"}) + "=======\n" +
                                       bodyOf({R"("b")"}) + ">>>>>>> theirs\n");
    EXPECT_EQ(described(text.faults()), "Conflict 1");
    EXPECT_EQ(contentOf(text).size(), 2U);
}

TEST(ConflictText, nothingIsAcceptedAfterAConflict) {
    std::string const bytes = bodyOf({"<<<<<<< ours", R"("a")", "=======", ">>>>>>> theirs"});
    ProjectText text = readWhole(bytes);
    EXPECT_FALSE(text.extend(text.tailFor({set(fileAddress(u"b"))})).has_value());
}

} // namespace

} // namespace project::stores
