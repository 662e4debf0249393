// Checked-in sample projects: a change of the format fails here first.
#include "text/ProjectText.hpp"

#include <algorithm>
#include <fstream>
#include <iterator>

#include "support/ProjectTextSamples.hpp"

namespace project::stores {

namespace {

using namespace samples;

std::u16string const category1 = u"5e0c7cf3-5c0e-4b7a-9d0f-1f6f5f3f0a01";
std::u16string const category2 = u"5e0c7cf3-5c0e-4b7a-9d0f-1f6f5f3f0a02";
std::u16string const label1 = u"8a1d2c60-30ee-4a77-bb0c-4a4c3e2d1b01";
std::u16string const label2 = u"8a1d2c60-30ee-4a77-bb0c-4a4c3e2d1b02";
std::u16string const entryPoint = u"c4c4c2de-0000-4000-8000-000000000001";
std::u16string const group = u"c4c4c2de-0000-4000-8000-000000000002";
std::u16string const reference = u"c4c4c2de-0000-4000-8000-000000000003";

/// A null node for an address that was created without one.
using Nodes = std::map<Address, Node>;

std::string fileBytes(std::string const& path) {
    std::ifstream file(path, std::ios::binary);
    EXPECT_TRUE(file.is_open()) << path;
    return {std::istreambuf_iterator<char>(file), {}};
}

std::string golden(std::string const& name) {
    return fileBytes(std::string(PROJECT_GOLDEN_FOLDER) + "/" + name);
}

Address markerOf(Address const& folder) {
    return folder.child({u"DIR_SIGNIFIER", u"1"});
}

Nested labelled(std::u16string const& category, std::vector<std::u16string> const& labels = {}) {
    Nested result{u"Category", {{u"UUID", category}}, {}};
    for (std::u16string const& label : labels) {
        result.nested.push_back({u"Label", {{u"UUID", label}, {u"Value", u""}}, {}});
    }
    return result;
}

Node info(Keys const& keys, std::vector<Nested> const& nested = {}) {
    return makeNode(u"Info", keys, nested);
}

Nodes plainProject() {
    Nodes nodes;
    for (char16_t const* const path : {u"README.md", u"include/engine.hpp", u"source/engine.cpp",
                                       u"source/engine test.cpp", u"source/io/reader.cpp", u"source.txt"}) {
        nodes[fileAddress(path)] = plainNode();
    }
    nodes[markerOf(fileAddress(u"source"))] = plainNode();
    nodes[markerOf(fileAddress(u"source/io"))] = plainNode();
    nodes[addressOf({u"Info", u"ProjectData"})] = makeNode(u"", {{u"Name", u"Pump station"}});
    return nodes;
}

void addCategories(Nodes& nodes) {
    Address const categories = addressOf({u"Categories", u"Root"});
    Address const first = categories.child({u"Category", category1});
    nodes[first] = info(
        {{u"Name", u"Classification"}, {u"ReadOnly", u"1"}, {u"SingleValued", u"1"}, {u"DataType", u"none"}});
    nodes[first.child({u"Label", label1})] = info({{u"Name", u"Design"}, {u"ReadOnly", u"0"}});
    nodes[first.child({u"Label", label2})] = info({{u"Name", u"Test"}, {u"ReadOnly", u"0"}});
    nodes[categories.child({u"Category", category2})] =
        info({{u"Name", u"Notes"}, {u"ReadOnly", u"0"}, {u"SingleValued", u"0"}, {u"DataType", u"text"}});
}

Nodes fullProject() {
    Nodes nodes = plainProject();
    addCategories(nodes);
    nodes[addressOf({u"Root", u"Extensions", u"Extension", u"Information"})] =
        makeNode(u"", {{u"description", u"Two pumps,\none tank."}});
    nodes[fileAddress(u"source/engine.cpp")] = info({}, {labelled(category1, {label1}), labelled(category2)});
    nodes[fileAddress(u"source/engine test.cpp")] = info({}, {labelled(category1, {label2})});
    nodes[fileAddress(u"source/engine.cpp").child({u"LabelData", u"Data"})] =
        info({}, {{u"Record", {{u"UUID", label1}, {u"Value", u"17"}}, {}}});
    nodes[markerOf(fileAddress(u"include"))] = info({{u"note", u"kept"}});
    nodes[addressOf({u"Files", u"Other", u"File", u"source"})] = plainNode();
    nodes[addressOf({u"Files", u"Root"})] = plainNode();
    nodes[addressOf({u"EntryPoints", u"Root"}).child({u"EntryPoint", entryPoint})] =
        info({{u"File", u"source/engine.cpp"},
              {u"Name", u"Run"},
              {u"Type", u"Run"},
              {u"Visible", u"1"},
              {u"GroupUUID", group}},
             {{u"Extension", {{u"Name", u"arguments"}, {u"Value", u"--fast"}}, {}}});
    nodes[addressOf({u"EntryPointGroups", u"Root"}).child({u"EntryPointGroup", group})] =
        info({{u"Name", u"Start"}});
    nodes[addressOf({u"ProjectPath", u"Root"})] = nullptr;
    nodes[addressOf({u"References", u"Root"})] = nullptr;
    nodes[addressOf({u"References", u"Root"}).child({u"Reference", reference})] =
        info({{u"Ref", u"../library"}, {u"Type", u"Relative"}});
    return nodes;
}

Nodes strangeNames() {
    Nodes nodes;
    std::u16string const names[] = {
        u"a\nb",       u"a\"b\\c",
        u"tab\there",  u"\x01",
        u"\x7F",       u"\u05E9\u05DC\u05D5\u05DD.txt",
        u"\u202Eevil", u"\xD83D\xDE00.png",
        u"\xD83D",     u"\xDE00\xD83D",
        u"\xD83Dx",    u"\xE000",
        u"\xFFFF",     u"caf\u00E9",
        u"cafe\u0301", u" leading",
        u"trailing ",  u".",
        u"..",         u"-",
        u"=======",    u"<<<<<<< HEAD",
        u"null",       u"{}",
        u"#",          u"a\u2028b",
        u"a",          u"a b",
        u"a.b",        u"a!",
        u"",           u"with/slash",
    };
    for (std::u16string const& name : names) {
        nodes[addressOf({u"Files", u"Root"}).child({u"File", name})] = plainNode();
    }
    nodes[fileAddress(u"a/b")] = plainNode();
    nodes[fileAddress(u"\xD83D\xDE00/\xD83D/x")] = plainNode();
    nodes[markerOf(fileAddress(u"\xD83D\xDE00"))] = plainNode();
    nodes[addressOf({u"\xD800", u"\xDFFF"})] = makeNode(u"\xDC00",
                                                        {{u"\xD83D", u"\xDE00"},
                                                         {u"\xD83D\xDE00", std::u16string(1, u'\0')},
                                                         {u"", u""},
                                                         {u"\xE000", u"\xFFFF"}},
                                                        {{u"", {}, {}}});
    return nodes;
}

Content contentOfNodes(Nodes const& nodes) {
    Content content;
    for (auto const& [address, node] : nodes) {
        content.emplace(address, described(node));
    }
    return content;
}

/// The text of some nodes that were written one by one, the last first.
ProjectText writtenBackwards(Nodes const& nodes) {
    ProjectText text = ProjectText::empty();
    for (auto at = nodes.rbegin(); at != nodes.rend(); ++at) {
        text = text.rewrittenWith({at->second ? set(at->first, at->second) : make(at->first)});
    }
    return text;
}

void expectGolden(std::string const& name, Nodes const& nodes) {
    std::string const bytes = golden(name);
    ProjectText const text = readWhole(bytes);
    EXPECT_EQ(described(text.faults()), "");
    EXPECT_TRUE(text.isTidy());
    EXPECT_EQ(contentOf(text), contentOfNodes(nodes));
    EXPECT_EQ(text.rewrittenWith({}).body(), bytes);
    EXPECT_EQ(writtenBackwards(nodes).body(), bytes);
}

TEST(GoldenText, aPlainProject) {
    expectGolden("plain.jsonl", plainProject());
}

TEST(GoldenText, aProjectWithEverythingInIt) {
    expectGolden("everything.jsonl", fullProject());
}

TEST(GoldenText, aProjectWithStrangeNames) {
    expectGolden("names.jsonl", strangeNames());
}

TEST(GoldenText, aProjectWithATail) {
    Batch const first{set(fileAddress(u"source/pump.cpp")),
                      set(fileAddress(u"README.md"), info({}, {labelled(category2)})),
                      remove(fileAddress(u"source/io"))};
    Batch const second{remove(addressOf({u"Info", u"ProjectData"})),
                       make(addressOf({u"References", u"Root"})), set(fileAddress(u"source/io/writer.cpp"))};
    ProjectText text = readWhole(golden("plain.jsonl"));
    ASSERT_TRUE(text.extend(text.tailFor(first)).has_value());
    ASSERT_TRUE(text.extend(text.tailFor(second)).has_value());
    EXPECT_TRUE(text.hasSameBytes(golden("tail.jsonl")));

    ProjectText const read = readWhole(golden("tail.jsonl"));
    EXPECT_EQ(described(read.faults()), "");
    EXPECT_FALSE(read.isTidy());
    EXPECT_EQ(contentOf(read), contentOf(readWhole(golden("tail-tidied.jsonl"))));
    EXPECT_EQ(read.rewrittenWith({}).body(), golden("tail-tidied.jsonl"));
}

TEST(GoldenText, aProjectWithAConflict) {
    ProjectText const text = readWhole(golden("conflict.jsonl"));
    EXPECT_EQ(described(text.faults()), "Conflict 6");
    EXPECT_TRUE(text.hasSameBytes(golden("conflict.jsonl")));
    EXPECT_EQ(text.rewrittenWith({}).body(), golden("conflict-joined.jsonl"));

    Nodes joined = plainProject();
    joined[fileAddress(u"source/engine.cpp")] =
        info({}, {labelled(category1, {label1, label2}), labelled(category2)});
    joined[fileAddress(u"source/gear.cpp")] = plainNode();
    joined[fileAddress(u"source/hose.cpp")] = plainNode();
    EXPECT_EQ(contentOf(text), contentOfNodes(joined));
}

/// The code blocks of a document that contain lines of the format.
std::vector<std::string> examplesIn(std::string const& document) {
    std::string const opening = "```jsonl\n";
    std::vector<std::string> examples;
    for (std::size_t at = document.find(opening); at != document.npos; at = document.find(opening, at)) {
        at += opening.size();
        std::size_t const end = document.find("```\n", at);
        examples.push_back(document.substr(at, end - at));
        at = end;
    }
    return examples;
}

TEST(StoreDocument, itsExampleEqualsTheWrittenText) {
    std::vector<std::string> const examples = examplesIn(fileBytes(PROJECT_STORE_DOCUMENT));
    ASSERT_EQ(examples.size(), 3U);
    std::string const& body = examples[0];
    std::string const& tail = examples[1];
    std::string const& tidied = examples[2];
    Address const category = addressOf({u"Categories", u"Root"}).child({u"Category", category1});
    Nodes const nodes{
        {addressOf({u"Info", u"ProjectData"}), makeNode(u"", {{u"Name", u"Pump station"}})},
        {category, info({{u"Name", u"Classification"}, {u"SingleValued", u"1"}})},
        {markerOf(fileAddress(u"source")), plainNode()},
        {fileAddress(u"source/engine.cpp"), info({}, {labelled(category1, {label1})})},
        {fileAddress(u"source/engine.hpp"), plainNode()},
        {fileAddress(u"source.txt"), plainNode()},
        {addressOf({u"References", u"Root"}), nullptr},
    };
    EXPECT_EQ(writtenBackwards(nodes).body(), body);

    Batch const batch{set(fileAddress(u"source/pump.cpp")), remove(category)};
    ProjectText text = readWhole(body);
    EXPECT_EQ(text.tailFor(batch), tail);

    ASSERT_TRUE(text.extend(tail).has_value());
    EXPECT_EQ(text.rewrittenWith({}).body(), tidied);
    EXPECT_EQ(contentOf(text), contentOf(readWhole(body + tail)));
}

} // namespace

} // namespace project::stores
