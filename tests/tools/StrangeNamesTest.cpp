#include "tools/ToolTest.hpp"

namespace project::test {
namespace {

using ::testing::ElementsAre;
using ::testing::HasSubstr;

/// Names that every command preserves as they are on disk.
class StrangeNames : public ToolTest {
protected:
    void SetUp() override { initProject(); }

    /// In the order in which they are listed: by UTF-16 code units, a stray byte 0x80 counting as U+DC80.
    std::vector<std::string> const names_{" leading and trailing ",
                                          "back\\slash",
                                          "line\nbreak",
                                          "tab\tand \x01 control",
                                          "two \"quotes\"",
                                          "\xC2\x85 next line",
                                          "\xD7\xA9\xD7\x9C\xD7\x95\xD7\x9D",
                                          "\xF0\x9F\x98\x80 beyond the basic plane",
                                          "\x80\xFF stray",
                                          "\xEF\xBF\xBD replacement"};
};

TEST_F(StrangeNames, arePreservedByAddAndList) {
    for (auto const& name : names_) {
        folder_.addFile(name);
    }

    EXPECT_THAT(tool({"add", "--recursive", "."}), SucceedsSilently());

    EXPECT_THAT(tool({"list", "-0"}), Prints(withZeros(names_)));
    EXPECT_THAT(linesOf(tool({"status"}).output), ElementsAre(HasSubstr("\"back\\slash\" has a backslash")));
    EXPECT_THAT(linesOf(tool({"check"}).output), ElementsAre(HasSubstr("\"back\\slash\" has a backslash")));
    EXPECT_EQ(tool({"check"}).exitCode, 0);
}

TEST_F(StrangeNames, arePreservedAsArguments) {
    auto command = names_;
    for (auto const& name : names_) {
        folder_.addFile(name);
    }
    command.insert(command.begin(), "add");

    EXPECT_THAT(tool(command), SucceedsSilently());

    for (auto const& name : names_) {
        EXPECT_THAT(tool({"list", "-0", name}), Prints(name + '\0'));
    }
}

TEST_F(StrangeNames, areRawInAPipe) {
    folder_.addFile("line\nbreak \xFF");
    ASSERT_THAT(tool({"add", "-r", "."}), SucceedsSilently());

    EXPECT_THAT(tool({"list"}), Prints("line\nbreak \xFF\n"));
    EXPECT_THAT(tool({"list", "--tree"}), Prints("line\nbreak \xFF\n"));
}

TEST_F(StrangeNames, areQuotedOnATerminal) {
    for (auto const& name : names_) {
        folder_.addFile(name);
    }
    ASSERT_THAT(tool({"add", "-r", "."}), SucceedsSilently());
    settings_.onTerminal = true;

    EXPECT_EQ(tool({"list"}).output, " leading and trailing \r\n"
                                     "\"back\\\\slash\"\r\n"
                                     "\"line\\nbreak\"\r\n"
                                     "\"tab\\tand \\001 control\"\r\n"
                                     "\"two \\\"quotes\\\"\"\r\n"
                                     "\"\\302\\205 next line\"\r\n"
                                     "\xD7\xA9\xD7\x9C\xD7\x95\xD7\x9D\r\n"
                                     "\xF0\x9F\x98\x80 beyond the basic plane\r\n"
                                     "\"\\200\\377 stray\"\r\n"
                                     "\xEF\xBF\xBD replacement\r\n");
}

TEST_F(StrangeNames, areExactInJson) {
    for (auto const& name : names_) {
        folder_.addFile(name);
    }
    ASSERT_THAT(tool({"add", "-r", "."}), SucceedsSilently());

    auto const output = tool({"list", "--json"}).output;

    for (auto const* path : {R"("back\\slash")", R"("line\nbreak")", R"("tab\tand \u0001 control")",
                             R"("two \"quotes\"")", R"("\u0085 next line")", R"("\udc80\udcff stray")",
                             "\"\xF0\x9F\x98\x80 beyond the basic plane\""}) {
        EXPECT_THAT(output, ::testing::HasSubstr(path));
    }
}

TEST_F(StrangeNames, canBeThoseOfTheProjectsOwnFolder) {
    auto const root = folder_.addFolder("caf\xE9 \xD7\xA9\n");
    settings_.folder = root;
    folder_.addFile("caf\xE9 \xD7\xA9\n/file");

    EXPECT_THAT(tool({"init"}), SucceedsSilently());
    EXPECT_THAT(tool({"add", "file"}), SucceedsSilently());

    EXPECT_THAT(tool({"list"}), Prints("file\n"));
    EXPECT_THAT(tool({"name"}), Prints("caf\xE9 \xD7\xA9\n\n"));
}

} // namespace
} // namespace project::test
