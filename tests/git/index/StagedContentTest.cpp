#include <unistd.h>

#include "git/index/StagingFixture.hpp"
#include "support/ChildProcess.hpp"

namespace project::git {
namespace {

using std::filesystem::perms;

class StagedContent : public StagingTest {};

TEST_F(StagedContent, aLargeFileIsStagedAsGitDoes) {
    repository.write("large", std::string((std::size_t{64} << 20) + 7, 'x'));
    expectAddedAsGitDoes({"large"});
}

TEST_F(StagedContent, withoutExecutableBitsTheRecordedModeStays) {
    repository.write("runs");
    repository.write("plain");
    std::filesystem::permissions(repository.onDisk() / "runs", perms::owner_all);
    repository.commitAll();
    repository.run({"config", "core.fileMode", "false"});
    repository.write("runs", "other\n");
    std::filesystem::permissions(repository.onDisk() / "runs", perms::owner_read | perms::owner_write);
    std::filesystem::permissions(repository.onDisk() / "plain", perms::owner_all);
    repository.write("new");
    std::filesystem::permissions(repository.onDisk() / "new", perms::owner_all);
    expectAddedAsGitDoes({"runs", "plain", "new"});
}

TEST_F(StagedContent, withoutLinksAFileInPlaceOfALinkStaysOne) {
    folder.addLink("work/link", "target");
    repository.commitAll();
    repository.run({"config", "core.symlinks", "false"});
    repository.remove("link");
    repository.write("link", "other");
    EXPECT_EQ(stateOf("link"), 3);
    expectAddedAsGitDoes({"link"});
}

TEST_F(StagedContent, contentIsConvertedAsItsAttributesSay) {
    repository.write(
        ".gitattributes",
        "*.txt text\n*.crlf text eol=crlf\n*.id ident\n*.bin binary\n"
        "*.utf8 working-tree-encoding=utf-8\nd/*.txt working-tree-encoding=utf8\n*.none filter=unknown\n");
    for (auto const* const name : {"a.txt", "a.crlf", "a.bin", "a.none", "b.none", "a.utf8", "d/a.txt"}) {
        repository.write(name, "1\r\n2\r\n");
    }
    repository.write("a.id", "$Id: old $\n");
    expectAddedAsGitDoes({"a.txt", "a.crlf", "a.bin", "a.none", "b.none", "a.utf8", "d/a.txt", "a.id"});
}

TEST_F(StagedContent, contentIsConvertedAsTheConfigurationSays) {
    for (auto const* const setting : {"true", "input", "false"}) {
        repository.write("old", "1\r\n2\r\n");
        repository.run({"config", "core.autocrlf", "false"});
        repository.run({"add", "old"});
        repository.run({"config", "core.autocrlf", setting});
        repository.write(setting, "1\r\n2\r\n");
        repository.write("old", "1\r\n3\r\n");
        expectAddedAsGitDoes({setting, "old"});
    }
}

TEST_F(StagedContent, aFileOfAFilterDriverIsRefusedBeforeAnythingIsStaged) {
    repository.run({"config", "filter.upper.clean", "tr a-z A-Z"});
    repository.run({"config", "filter.server.process", "serve"});
    repository.run({"config", "filter.must.required", "true"});
    repository.write(".gitattributes", "*.up filter=upper\n*.srv filter=server\n*.must filter=must\n"
                                       "*.wide working-tree-encoding=UTF-16\n");
    repository.write("a");
    for (auto const* const name : {"d/x.up", "d/x.srv", "d/x.must", "d/x.wide"}) {
        repository.write(name);
        auto const error = errorOfAdding({"a", name});
        EXPECT_EQ(error.kind(), GitError::Kind::Refused);
        EXPECT_EQ(error.file(), (repository.onDisk() / name).string());
        EXPECT_NE(error.remedy().find("git add"), std::string::npos);
    }
    EXPECT_NE(errorOfAdding({"d/x.up"}).problem().find("\"upper\""), std::string::npos);
    EXPECT_NE(errorOfAdding({"d/x.wide"}).problem().find("\"UTF-16\""), std::string::npos);
    EXPECT_FALSE(std::filesystem::exists(repository.indexFile()));
    EXPECT_EQ(repository.run({"count-objects"}).substr(0, 2), "0 ");
    add({"a"});
    EXPECT_EQ(tracked(), std::vector<std::string>{"a"});
}

TEST_F(StagedContent, aFileWhoseAttributesLibGit2DoesNotUnderstandIsRefused) {
    repository.write(".gitattributes", "\"a b\" text\n");
    repository.write("a b", "1\r\n");
    EXPECT_NE(errorOfAdding({"a b"}).remedy().find("git add"), std::string::npos);
}

TEST_F(StagedContent, theAttributesOfAFileThatIsStagedComeFromTheIndexWhereTheDiskHasNone) {
    repository.run({"config", "filter.upper.clean", "tr a-z A-Z"});
    repository.write(".gitattributes", "*.up filter=upper\n");
    repository.run({"add", "-A"});
    repository.remove(".gitattributes");
    repository.write("a.up");
    EXPECT_NE(errorOfAdding({"a.up"}).problem().find("\"upper\""), std::string::npos);
}

TEST_F(StagedContent, aLinkHasNoFilterDriver) {
    repository.run({"config", "filter.upper.clean", "tr a-z A-Z"});
    repository.write(".gitattributes", "*.up filter=upper\n");
    folder.addLink("work/link.up", "target");
    expectAddedAsGitDoes({"link.up"});
}

TEST_F(StagedContent, aFileThatCannotBeReadIsAnErrorAndNothingIsStaged) {
    repository.write("a");
    repository.write("secret");
    std::filesystem::permissions(repository.onDisk() / "secret", perms::none);
    auto const everywhere = std::filesystem::recursive_directory_iterator(folder.onDisk());
    for (auto const& entry : everywhere) {
        if (::geteuid() == 0) {
            ASSERT_EQ(::lchown(entry.path().c_str(), 65534, 65534), 0);
        }
    }
    ASSERT_EQ(::geteuid() == 0 ? ::chown(folder.onDisk().c_str(), 65534, 65534) : 0, 0);
    auto const text = test::inUnprivilegedProcess([&] {
        add({"a", "secret"});
        return std::string("nothing was thrown");
    });
    EXPECT_EQ(text,
              (repository.onDisk() / "secret").string() +
                  ": the file cannot be read: Permission denied. Check its permissions, and try again.");
    EXPECT_FALSE(std::filesystem::exists(repository.onDisk() / ".git/index"));
    EXPECT_FALSE(std::filesystem::exists(repository.onDisk() / ".git/index.lock"));
}

} // namespace
} // namespace project::git
