#include "line/NodeLine.hpp"

#include <rapidcheck/gtest.h>

#include "line/CanonicalLine.hpp"
#include "line/LineParser.hpp"
#include "project/metadata/MetadataNodeSpecification.hpp"
#include "project/stores/StoreError.hpp"
#include "support/TextGenerators.hpp"

namespace project::stores {

namespace {

using namespace samples;

std::string lineOf(Change const& change) {
    std::string line;
    appendChangeLine(line, change);
    return line;
}

/// The change that a line describes, written again.
std::string rewritten(std::string const& line) {
    ParsedLine const parsed = parseLine(line);
    return parsed.change ? lineOf(*parsed.change) : std::string("damaged");
}

std::string nestedLine(std::size_t levels) {
    std::string line = R"({"file":"a")";
    for (std::size_t i = 0; i < levels; ++i) {
        line += R"(,"children":[{"type":"")";
    }
    for (std::size_t i = 0; i < levels; ++i) {
        line += "}]";
    }
    return line + "}";
}

std::string deepLine(std::size_t steps) {
    std::string line = R"({"at":[)";
    for (std::size_t i = 0; i < steps; ++i) {
        line += i == 0 ? R"("","")" : R"(,"","")";
    }
    return line + "]}";
}

TEST(NodeLine, aPlainFileIsJustItsPath) {
    EXPECT_EQ(lineOf(set(fileAddress(u"a/b/c"))), R"("a/b/c")");
    EXPECT_EQ(lineOf(set(fileAddress(u"a/b").child({u"DIR_SIGNIFIER", u"1"}))), R"("a/b/")");
}

TEST(NodeLine, membersThatCanBeOmittedAreNotWritten) {
    Node const labelled = makeNode(u"Info", {}, {{u"Category", {{u"UUID", u"c"}}, {{u"Label", {}, {}}}}});
    EXPECT_EQ(
        lineOf(set(fileAddress(u"a"), labelled)),
        R"({"file":"a","children":[{"type":"Category","keys":{"UUID":"c"},"children":[{"type":"Label"}]}]})");
    EXPECT_EQ(lineOf(set(addressOf({u"Info", u"ProjectData"}), makeNode(u"", {{u"Name", u"x"}}))),
              R"({"at":["Info","ProjectData"],"type":"","keys":{"Name":"x"}})");
    EXPECT_EQ(lineOf(set(addressOf({u"Files", u"Root"}))), R"({"at":["Files","Root"]})");
}

TEST(NodeLine, aMarkerWithSomethingInItKeepsItsSlash) {
    Address const marker = fileAddress(u"a").child({u"DIR_SIGNIFIER", u"1"});
    EXPECT_EQ(lineOf(set(marker, makeNode(u"Info", {{u"k", u"v"}}))), R"({"file":"a/","keys":{"k":"v"}})");
}

TEST(NodeLine, createdAddressesAndRemovalsHaveLinesOfTheirOwn) {
    EXPECT_EQ(lineOf(make(fileAddress(u"a/b"))), R"({"file":"a/b","node":false})");
    EXPECT_EQ(lineOf(make(addressOf({u"References", u"Root"}))),
              R"({"at":["References","Root"],"node":false})");
    EXPECT_EQ(lineOf(remove(fileAddress(u"a/b"))), R"({"remove":"a/b"})");
    EXPECT_EQ(lineOf(remove(addressOf({u"Categories", u"Root"}))), R"({"remove":["Categories","Root"]})");
}

TEST(NodeLine, keysAreSortedByCodeUnits) {
    Node const node = makeNode(u"Info", {{u"\xE000", u"3"}, {u"\xD83D\xDE00", u"2"}, {u"Z", u"1"}});
    EXPECT_EQ(lineOf(set(fileAddress(u"a"), node)),
              "{\"file\":\"a\",\"keys\":{\"Z\":\"1\",\"\xF0\x9F\x98\x80\":\"2\",\"\xEE\x80\x80\":\"3\"}}");
}

RC_GTEST_PROP(NodeLine, anyNodeIsReadBackFromItsLine, (Address const& address)) {
    Node const node = *anyNode();
    std::string const line = lineOf(set(address, node));
    ParsedLine const parsed = parseLine(line);
    RC_ASSERT(parsed.change.has_value());
    RC_ASSERT(parsed.change->kind == Change::Kind::Set);
    RC_ASSERT(parsed.change->address == address);
    RC_ASSERT(described(parsed.change->node) == described(node));
    RC_ASSERT(described(stateOfLine(line).node) == described(node));
}

RC_GTEST_PROP(NodeLine, anyWrittenLineIsCanonicalAndShowsItsAddress, (Address const& address)) {
    Change const change = *rc::gen::element(0, 1) == 0 ? make(address) : set(address, *anyNode());
    std::string const line = lineOf(change);
    auto const found = canonicalAddress(line);
    RC_ASSERT(found.has_value());
    RC_ASSERT(toAddress(*found) == address);
    RC_ASSERT(toAddress(addressOfCanonical(line)) == address);
}

RC_GTEST_PROP(NodeLine, aLineIsCanonicalExactlyIfRewritingItGivesTheSameBytes, (Address const& address)) {
    std::string line = lineOf(*rc::gen::element(0, 1) == 0 ? make(address) : set(address, *anyNode()));
    auto const at = *rc::gen::inRange<std::size_t>(0, line.size());
    std::string const put = *rc::gen::elementOf(std::vector<std::string>{
        " ", "\"", ",", "{", "}", "[", "]", ":", "\\", "/", "a", "\\u0041", "{}", ""});
    line.replace(at, *rc::gen::inRange<std::size_t>(0, 3), put);
    bool const removal = parseLine(line).change && parseLine(line).change->kind == Change::Kind::Remove;
    RC_ASSERT(canonicalAddress(line).has_value() == (rewritten(line) == line && !removal));
}

RC_GTEST_PROP(NodeLine, theFastPathAcceptsOnlyCanonicalPaths, ()) {
    auto const content = *rc::gen::scale(0.2, rc::gen::container<std::string>(rc::gen::element(
                                                  'a', 'b', '/', '.', '"', '\\', '\n', '\0', '\xC3')));
    std::string const line = '"' + content + '"';
    std::size_t const length = plainPathLength(line);
    if (length > 0) {
        RC_ASSERT(canonicalAddress(line.substr(0, length + 2)).has_value());
    }
    bool const plain = canonicalAddress(line) && content.find_first_of("\\\xC3") == std::string::npos;
    RC_ASSERT(!plain || length == content.size());
}

TEST(NodeLine, theFastPathChecksEveryByteOfAPath) {
    std::string const path = "folder/sub folder/file_of_some_length.cpp";
    for (std::size_t at = 0; at < path.size(); ++at) {
        for (int byte = 0; byte < 256; ++byte) {
            std::string line = '"' + path + '"';
            line[at + 1] = static_cast<char>(byte);
            bool const isPlain = byte >= 0x20 && byte < 0x80 && byte != '\\' && canonicalAddress(line);
            EXPECT_EQ(plainPathLength(line) == path.size(), isPlain) << "byte " << byte << " at " << at;
        }
    }
}

TEST(NodeLine, linesOfOtherProgramsAreReadAlthoughTheyAreNotCanonical) {
    struct {
        char const* line;
        char const* canonical;
    } const cases[] = {
        {R"( "a" )", R"("a")"},
        {R"("\u0061\/b")", R"("a/b")"},
        {R"({"file":"a"})", R"("a")"},
        {R"({"file":"a","type":"Info","keys":{},"children":[]})", R"("a")"},
        {R"({"at":["Files","Root","File","a"]})", R"("a")"},
        {R"({"at":["Files","Root","File","a","DIR_SIGNIFIER","1"]})", R"("a/")"},
        {R"({ "keys" : { "b":"2", "a":"1" }, "file" : "a" })", R"({"file":"a","keys":{"a":"1","b":"2"}})"},
        {R"({"children":[{"keys":{"k":"v"},"type":"T"}],"file":"a"})",
         R"({"file":"a","children":[{"type":"T","keys":{"k":"v"}}]})"},
        {R"({"node":false,"file":"a"})", R"({"file":"a","node":false})"},
        {R"({ "remove" : [ "A" , "b" ] })", R"({"remove":["A","b"]})"},
    };

    for (auto const& [line, canonical] : cases) {
        EXPECT_FALSE(canonicalAddress(line).has_value()) << line;
        EXPECT_EQ(rewritten(line), canonical) << line;
    }
}

TEST(NodeLine, anInvalidLineIsDamage) {
    char const* const damaged[] = {
        "",
        "a",
        "null",
        "1",
        "[]",
        "{}",
        "\"a",
        "a\"",
        "\"a\" x",
        "\"a\"\"b\"",
        R"("")",
        R"("/")",
        R"("/a")",
        R"("a//b")",
        R"("a//")",
        R"({"file":"a")",
        R"({"file":"a",})",
        R"({"file":"a"}})",
        R"({"file":1})",
        R"({"file":["a"]})",
        R"({"file":""})",
        R"({"at":[]})",
        R"({"at":["a"]})",
        R"({"at":["a","b","c"]})",
        R"({"at":"a"})",
        R"({"at":["a",1]})",
        R"({"at":["a","b"],"file":"a"})",
        R"({"file":"a","file":"a"})",
        R"({"keys":{"a":"b"}})",
        R"({"file":"a","keys":{"k":"1","k":"2"}})",
        R"({"file":"a","keys":{"k":1}})",
        R"({"file":"a","keys":[]})",
        R"({"file":"a","keys":{},"keys":{}})",
        R"({"file":"a","more":"b"})",
        R"({"file":"a","type":null})",
        R"({"file":"a","type":"x","type":"y"})",
        R"({"file":"a","children":{}})",
        R"({"file":"a","children":[{}]})",
        R"({"file":"a","children":[{"keys":{}}]})",
        R"({"file":"a","children":[{"type":"x"},{"children":[]}]})",
        R"({"file":"a","children":[{"type":"x","at":["a","b"]}]})",
        R"({"file":"a","children":[{"type":"x"},]})",
        R"({"file":"a","node":true})",
        R"({"file":"a","node":falsey})",
        R"({"file":"a","node":false,"type":"x"})",
        R"({"file":"a","node":false,"keys":{}})",
        R"({"file":"a","node":false,"node":false})",
        R"({"remove":"a","type":"x"})",
        R"({"remove":"a","node":false})",
        R"({"remove":[]})",
        R"({"remove":"a","file":"b"})",
        R"({"node":false})",
        R"({"end":"project-definition"})",
        R"({"batch":{"lines":1,"after":"","sum":""}})",
    };
    for (char const* const line : damaged) {
        ParsedLine const parsed = parseLine(line);
        EXPECT_FALSE(parsed.change.has_value()) << line;
        EXPECT_NE(parsed.problem, nullptr) << line;
        EXPECT_FALSE(canonicalAddress(line).has_value()) << line;
    }
}

TEST(NodeLine, aRemovalIsNotALineOfABody) {
    EXPECT_TRUE(parseLine(R"({"remove":"a"})").change.has_value());
    EXPECT_FALSE(parseBodyLine(R"({"remove":"a"})").change.has_value());
    EXPECT_FALSE(canonicalAddress(R"({"remove":"a"})").has_value());
}

TEST(NodeLine, nestedNodesAreReadDownToALimit) {
    EXPECT_TRUE(parseLine(nestedLine(deepestNesting)).change.has_value());
    EXPECT_TRUE(canonicalAddress(nestedLine(deepestNesting)).has_value());
    EXPECT_FALSE(parseLine(nestedLine(deepestNesting + 1)).change.has_value());
    EXPECT_FALSE(canonicalAddress(nestedLine(deepestNesting + 1)).has_value());
    EXPECT_FALSE(parseLine(nestedLine(100'000)).change.has_value());
}

TEST(NodeLine, addressesAreReadDownToALimit) {
    EXPECT_TRUE(parseLine(deepLine(deepestAddress)).change.has_value());
    EXPECT_TRUE(canonicalAddress(deepLine(deepestAddress)).has_value());
    EXPECT_FALSE(parseLine(deepLine(deepestAddress + 1)).change.has_value());
    EXPECT_FALSE(canonicalAddress(deepLine(deepestAddress + 1)).has_value());
}

TEST(NodeLine, pathsAreReadDownToTheSameLimit) {
    std::string path = "\"a";
    for (std::size_t depth = 2; depth < deepestAddress; ++depth) {
        path += "/a";
    }
    EXPECT_EQ(parseLine(path + '"').change->address.depth(), deepestAddress);
    EXPECT_TRUE(canonicalAddress(path + '"').has_value());
    EXPECT_FALSE(parseLine(path + "/a\"").change.has_value());
    EXPECT_FALSE(canonicalAddress(path + "/a\"").has_value());
    EXPECT_EQ(plainPathLength(path + "/a\""), 0U);
}

Node nestedNode(std::size_t levels) {
    auto node = std::make_shared<metadata::MetadataNodeSpecification>(u"Info");
    metadata::MetadataNode* deepest = node.get();
    for (std::size_t i = 0; i < levels; ++i) {
        deepest = deepest->addChild(u"");
    }
    return node;
}

Address deepFile(std::size_t depth) {
    Address address = addressOf({u"Files", u"Root"});
    while (address.depth() < depth) {
        address = address.child({u"File", u"a"});
    }
    return address;
}

TEST(NodeLine, nodesThatCouldNotBeReadAgainAreNotWritten) {
    EXPECT_NO_THROW(requireWritable(set(fileAddress(u"a"), nestedNode(deepestNesting))));
    EXPECT_NO_THROW(requireWritable(set(deepFile(deepestAddress))));
    for (auto const& change : {set(fileAddress(u"a"), nestedNode(deepestNesting + 1)),
                               set(deepFile(deepestAddress + 1)), make(deepFile(deepestAddress + 1))}) {
        try {
            requireWritable(change);
            ADD_FAILURE() << "a change that cannot be read again was accepted";
        } catch (StoreError const& error) {
            EXPECT_EQ(error.kind(), StoreError::Kind::Refused);
        }
    }
}

} // namespace

} // namespace project::stores
