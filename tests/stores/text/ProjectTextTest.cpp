#include "text/ProjectText.hpp"

#include "project/stores/StoreError.hpp"
#include "support/ProjectTextSamples.hpp"
#include "text/TextLines.hpp"

namespace project::stores {

namespace {

using namespace samples;

std::string const first = std::string(firstLine) + "\n";
std::string const last = std::string(endLine) + "\n";

/// The line that an error names, and 0 when there is no error.
std::size_t lineOfError(std::string const& bytes) {
    try {
        ProjectText::read(bytes, "some/file");
    } catch (StoreError const& error) {
        EXPECT_EQ(error.file(), "some/file");
        EXPECT_FALSE(error.remedy().empty());
        return error.line();
    }
    return 0;
}

/// The earlier and the later node of each difference.
std::vector<std::string> statesOf(std::vector<Difference> const& differences) {
    auto const stateOf = [](Node const& node) { return node ? described(*node) : std::string("nothing"); };
    std::vector<std::string> result;
    for (auto const& difference : differences) {
        result.push_back(stateOf(difference.before) + " -> " + stateOf(difference.after));
    }
    return result;
}

Change const someFile = set(fileAddress(u"a"));

TEST(ProjectText, theEmptyTextHasOnlyItsFirstAndLastLine) {
    ProjectText const text = ProjectText::empty();
    EXPECT_EQ(text.body(), first + last);
    EXPECT_TRUE(contentOf(text).empty());
    EXPECT_TRUE(text.isTidy());
    EXPECT_TRUE(readWhole(text.body()).isTidy());
}

TEST(ProjectText, aTextWithoutItsLastLineIsIncomplete) {
    std::string const whole = bodyOf({R"("a")", R"({"file":"b","keys":{"k":"v"}})"});
    for (std::size_t length = 0; length + 1 < whole.size(); ++length) {
        EXPECT_FALSE(ProjectText::read(whole.substr(0, length), "f").has_value()) << length;
    }
    EXPECT_TRUE(ProjectText::read(whole, "f").has_value());
}

TEST(ProjectText, aLastLineWithoutLineEndIsCompleteButIrregular) {
    std::string const whole = bodyOf({R"("a")"});
    ProjectText const text = readWhole(whole.substr(0, whole.size() - 1));
    EXPECT_EQ(described(text.faults()), "Irregular 3");
    EXPECT_EQ(contentOf(text), contentOf(readWhole(whole)));
    EXPECT_FALSE(text.isTidy());
    EXPECT_EQ(text.rewrittenWith({}).body(), whole);
}

TEST(ProjectText, bytesOtherThanAProjectsTextAreRefused) {
    char const* const others[] = {"hello\n",
                                  "\n",
                                  "hello",
                                  "{}\n",
                                  "\0\0\0",
                                  "{\"format\":\"other\",\"version\":1}\n",
                                  "{\"format\":\"project-definition\",\"version\":0}\n",
                                  "{\"format\":\"project-definition\",\"version\":1,\"more\":1}\n",
                                  "{\"format\":\"project-definition\",\"version\":-1}\n",
                                  "{\"format\":\"project-definition\"}\n",
                                  "{\"version\":1,\"format\":\"project-definition\"}\n"};
    for (char const* const bytes : others) {
        EXPECT_EQ(lineOfError(*bytes == 0 ? std::string(3, '\0') : bytes), 1U) << bytes;
    }
    EXPECT_THROW(ProjectText::read("hello", "f"), StoreError);
}

TEST(ProjectText, aLaterVersionAsksForANewerProgram) {
    try {
        ProjectText::read("{\"format\":\"project-definition\",\"version\":2,\"more\":[]}\n\"?\"\n", "f");
        FAIL() << "a later version was read";
    } catch (StoreError const& error) {
        EXPECT_EQ(error.kind(), StoreError::Kind::Refused);
        EXPECT_EQ(error.line(), 1U);
        EXPECT_THAT(error.problem(), testing::HasSubstr("version 2"));
        EXPECT_THAT(error.remedy(), testing::HasSubstr("newer version of the program"));
    }
}

TEST(ProjectText, childrenAreSortedAndSayWhetherTheyHaveChildren) {
    ProjectText const text = readWhole(bodyOf({
        R"({"at":["Categories","Root","Category","1"],"keys":{"Name":"n"}})",
        R"("a")",
        R"("a/")",
        R"("a/b/c")",
        R"({"file":"a/made","node":false})",
        R"({"at":["Files","Root","File","a","LabelData","Data"]})",
        R"("a.c")",
    }));
    ASSERT_TRUE(text.isTidy());
    Children const top = text.children(Address::root());
    ASSERT_EQ(top.size(), 2U);
    EXPECT_EQ(top[0].element, metadata::PathElement(u"Categories", u"Root"));
    EXPECT_EQ(top[0].node, nullptr);
    EXPECT_FALSE(top[0].isCreated);
    EXPECT_TRUE(top[0].hasChildren);

    Children const below = text.children(fileAddress(u"a"));
    ASSERT_EQ(below.size(), 4U);
    EXPECT_EQ(below[0].element, metadata::PathElement(u"DIR_SIGNIFIER", u"1"));
    EXPECT_EQ(below[0].node, plainNode());
    EXPECT_FALSE(below[0].hasChildren);
    EXPECT_EQ(below[1].element, metadata::PathElement(u"File", u"b"));
    EXPECT_EQ(below[1].node, nullptr);
    EXPECT_TRUE(below[1].hasChildren);
    EXPECT_EQ(below[2].element, metadata::PathElement(u"File", u"made"));
    EXPECT_TRUE(below[2].isCreated);
    EXPECT_EQ(below[3].element, metadata::PathElement(u"LabelData", u"Data"));
    EXPECT_EQ(described(below[3].node), "Info()");

    EXPECT_TRUE(text.children(fileAddress(u"a.c")).empty());
    EXPECT_TRUE(text.children(fileAddress(u"none/of/these")).empty());
}

TEST(ProjectText, plainNodesAreOneSharedNode) {
    ProjectText const text = readWhole(bodyOf({R"("a")", R"("b")"}));
    Children const children = text.children(addressOf({u"Files", u"Root"}));
    EXPECT_EQ(children[0].node, plainNode());
    EXPECT_EQ(children[1].node, plainNode());
}

TEST(ProjectText, carriageReturnsAreToleratedAndRemovedByTheNextWrite) {
    std::string const plain = bodyOf({R"("a")", R"({"file":"b","keys":{"k":"v"}})"});
    std::string carriage = plain;
    for (std::size_t at = 0; (at = carriage.find('\n', at)) != carriage.npos; at += 2) {
        carriage.insert(at, 1, '\r');
    }
    ProjectText const text = readWhole(carriage);
    EXPECT_EQ(described(text.faults()), "");
    EXPECT_FALSE(text.isTidy());
    EXPECT_EQ(contentOf(text), contentOf(readWhole(plain)));
    EXPECT_EQ(text.rewrittenWith({}).body(), plain);
    EXPECT_EQ(text.body(), carriage);
}

TEST(ProjectText, linesOfOtherProgramsAreNeitherFaultsNorTidy) {
    ProjectText const text = readWhole(bodyOf({R"({ "file": "a", "type": "Info" })", R"("b")"}));
    EXPECT_EQ(described(text.faults()), "");
    EXPECT_FALSE(text.isTidy());
    EXPECT_EQ(text.rewrittenWith({}).body(), bodyOf({R"("a")", R"("b")"}));
}

TEST(ProjectText, aDamagedLineIsReportedAndTheRestIsRead) {
    std::string const bytes = bodyOf({R"("a")", R"("b" and more)", R"("c")", R"({"remove":"c"})"});
    ProjectText const text = readWhole(bytes);
    EXPECT_EQ(described(text.faults()), "Damage 3, Damage 5");
    EXPECT_FALSE(text.faults()[0].problem.empty());
    EXPECT_EQ(text.damagedLines(), "\"b\" and more\n{\"remove\":\"c\"}\n");
    EXPECT_FALSE(text.isTidy());
    EXPECT_EQ(text.body(), bytes);
    EXPECT_EQ(text.rewrittenWith({}).body(), bodyOf({R"("a")", R"("c")"}));
    EXPECT_EQ(text.rewrittenWith({}).damagedLines(), "");
}

TEST(ProjectText, linesOutOfOrderAreRead) {
    ProjectText const text = readWhole(bodyOf({R"("b")", R"("z")", R"("a")", R"("c")", R"("zz")"}));
    EXPECT_EQ(described(text.faults()), "Irregular 4, Irregular 5");
    EXPECT_EQ(text.rewrittenWith({}).body(), bodyOf({R"("a")", R"("b")", R"("c")", R"("z")", R"("zz")"}));
}

TEST(ProjectText, emptyLinesAreIrregular) {
    ProjectText const text = readWhole(bodyOf({R"("a")", "", R"("b")"}));
    EXPECT_EQ(described(text.faults()), "Irregular 3");
    EXPECT_EQ(text.rewrittenWith({}).body(), bodyOf({R"("a")", R"("b")"}));
}

TEST(ProjectText, linesForOneAddressAreJoinedInTheirOrder) {
    ProjectText const text = readWhole(bodyOf({
        R"({"file":"a","keys":{"k":"1","l":"1"}})",
        R"({"file":"a","keys":{"k":"2"}})",
        R"("b")",
        R"({"file":"a","keys":{"k":"3","m":"3"}})",
        R"({"file":"b","node":false})",
    }));
    EXPECT_EQ(described(text.faults()), "Irregular 3, Irregular 5, Irregular 6");
    EXPECT_EQ(contentOf(text),
              (Content{{fileAddress(u"a"), "Info(k=3;l=1;m=3;)"}, {fileAddress(u"b"), "Info()"}}));
}

TEST(ProjectText, aLineOfAnotherProgramIsSortedAmongTheOthers) {
    ProjectText const text = readWhole(bodyOf({
        R"("a")",
        R"({ "file":"c", "keys":{"k":"1"} })",
        R"({"file":"c","keys":{"l":"2"}})",
        R"("b")",
    }));
    EXPECT_EQ(described(text.faults()), "Irregular 4, Irregular 5");
    EXPECT_EQ(text.rewrittenWith({}).body(),
              bodyOf({R"("a")", R"("b")", R"({"file":"c","keys":{"k":"1","l":"2"}})"}));
}

TEST(ProjectText, rewritingSortsLines) {
    ProjectText const text = readWhole(bodyOf({R"("a")", R"("c")", R"("d/e")"}));
    ProjectText const written =
        text.rewrittenWith({set(fileAddress(u"b")), set(fileAddress(u"c"), makeNode(u"", {})),
                            remove(fileAddress(u"d")), make(fileAddress(u"e"))});
    EXPECT_EQ(written.body(),
              bodyOf({R"("a")", R"("b")", R"({"file":"c","type":""})", R"({"file":"e","node":false})"}));
    EXPECT_TRUE(written.isTidy());
    EXPECT_EQ(contentOf(written), contentOf(readWhole(written.body())));
}

TEST(ProjectText, stepsOfABatchAreAppliedInOrder) {
    ProjectText const text = readWhole(bodyOf({R"("a/b")", R"("a/c")"}));
    Address const folder = fileAddress(u"a");
    EXPECT_EQ(text.rewrittenWith({remove(folder), set(fileAddress(u"a/d"))}).body(), bodyOf({R"("a/d")"}));
    EXPECT_EQ(text.rewrittenWith({set(fileAddress(u"a/d")), remove(folder)}).body(), bodyOf({}));
    EXPECT_EQ(text.rewrittenWith({remove(folder), set(folder)}).body(), bodyOf({R"("a")"}));
}

TEST(ProjectText, aCreatedAddressStaysUntilItIsRemovedOrGetsANode) {
    Address const head = addressOf({u"References", u"Root"});
    Address const below = head.child({u"Reference", u"1"});
    ProjectText text = ProjectText::empty().rewrittenWith({make(head), set(below)});
    EXPECT_EQ(contentOf(text.rewrittenWith({remove(below)})), (Content{{head, "created"}}));
    EXPECT_EQ(contentOf(text.rewrittenWith({set(head)})), (Content{{head, "Info()"}, {below, "Info()"}}));
    EXPECT_TRUE(contentOf(text.rewrittenWith({set(head), remove(head)})).empty());
}

TEST(ProjectText, anAddressWithNothingLeftBelowItIsRemoved) {
    ProjectText text = readWhole(bodyOf({R"("a/b/c")", R"("a/d")"}));
    std::string const tail = text.tailFor({remove(fileAddress(u"a/b/c"))});
    ASSERT_TRUE(text.extend(tail).has_value());
    Children const left = text.children(fileAddress(u"a"));
    ASSERT_EQ(left.size(), 1U);
    EXPECT_EQ(left[0].element.getLocation(), u"d");
    EXPECT_TRUE(text.children(fileAddress(u"a/b")).empty());
}

TEST(ProjectText, differencesAreTheAddressesWhereNodesWereAddedRemovedOrChanged) {
    ProjectText const before =
        readWhole(bodyOf({R"("a")", R"("b")", R"({"file":"c","keys":{"k":"1"}})", R"("d")"}));
    ProjectText const after = readWhole(
        bodyOf({R"("a")", R"({"file":"c","keys":{"k":"2"}})", R"("d")", R"({"file":"e","node":false})"}));
    std::vector<Address> const expected{fileAddress(u"b"), fileAddress(u"c"), fileAddress(u"e")};
    EXPECT_EQ(addressesOf(before.differencesTo(after)), expected);
    EXPECT_EQ(addressesOf(after.differencesTo(before)), expected);
    EXPECT_TRUE(before.differencesTo(before).empty());
}

TEST(ProjectText, textsWithTheSameContentDoNotDiffer) {
    ProjectText const tidy = readWhole(bodyOf({R"("a")", R"("b")"}));
    ProjectText const odd = readWhole(bodyOf({R"("b")", R"({"file":"a"})"}));
    EXPECT_TRUE(tidy.differencesTo(odd).empty());
    EXPECT_TRUE(odd.differencesTo(tidy).empty());
    ProjectText tailed = readWhole(bodyOf({R"("a")", R"("x/y")"}));
    ASSERT_TRUE(tailed.extend(tailed.tailFor({remove(fileAddress(u"x")), set(fileAddress(u"b"))})));
    EXPECT_TRUE(tidy.differencesTo(tailed).empty());
    EXPECT_TRUE(tailed.differencesTo(tidy).empty());
}

TEST(ProjectText, aDifferenceBeforeATailIsFound) {
    ProjectText text = readWhole(bodyOf({R"("a")", R"("x/y")", R"("x/z")"}));
    ProjectText tailed = readWhole(text.body());
    ASSERT_TRUE(tailed.extend(tailed.tailFor({remove(fileAddress(u"x")), set(fileAddress(u"x/z"))})));
    EXPECT_EQ(addressesOf(text.differencesTo(tailed)), (std::vector{fileAddress(u"x/y")}));
    EXPECT_EQ(addressesOf(tailed.differencesTo(text)), (std::vector{fileAddress(u"x/y")}));
}

TEST(ProjectText, differencesHaveTheEarlierAndTheLaterNode) {
    ProjectText text = readWhole(bodyOf({R"("b")", R"({"file":"c","keys":{"k":"1"}})"}));
    ProjectText const other = readWhole(bodyOf({R"("a")", R"({"file":"c","keys":{"k":"2"}})"}));
    std::string const tail =
        text.tailFor({remove(fileAddress(u"b")), set(fileAddress(u"c"), makeNode(u"Info", {{u"k", u"2"}})),
                      set(fileAddress(u"a"))});
    std::vector<std::string> const expected{"nothing -> Info()", "Info() -> nothing",
                                            "Info(k=1;) -> Info(k=2;)"};

    EXPECT_EQ(statesOf(text.differencesTo(other)), expected);
    EXPECT_EQ(statesOf(text.extend(tail).value()), expected);
}

TEST(ProjectText, sizesAndBytesAreThoseOfTheReadText) {
    std::string const body = bodyOf({R"("a")"});
    std::string const tail = readWhole(body).tailFor({someFile});
    ProjectText const text = readWhole(body + tail + "torn");
    EXPECT_EQ(text.size(), body.size() + tail.size() + 4);
    EXPECT_EQ(text.bodySize(), body.size());
    EXPECT_EQ(text.tailSize(), tail.size() + 4);
    EXPECT_EQ(text.body(), body);
    EXPECT_TRUE(text.hasSameBytes(body + tail + "torn"));
    EXPECT_FALSE(text.hasSameBytes(body + tail + "born"));
    EXPECT_FALSE(text.hasSameBytes(body + tail));
    EXPECT_FALSE(text.hasSameBytes(body));
}

} // namespace

} // namespace project::stores
