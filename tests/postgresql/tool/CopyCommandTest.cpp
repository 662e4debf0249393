#include "postgresql/FaultyProxy.hpp"
#include "postgresql/tool/SharedToolTest.hpp"
#include "support/GitFolder.hpp"

namespace project::test {
namespace {

using postgresql::sharedServer;
using ::testing::AllOf;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;
using ::testing::Not;
using ::testing::UnorderedElementsAre;

/// A project in a text, with content of every kind.
class CopyCommand : public SharedToolTest {
protected:
    void SetUp() override {
        SharedToolTest::SetUp();
        if (IsSkipped()) {
            return;
        }
        ASSERT_EQ(tool({"init", "--name", "Engine"}).exitCode, 0);
        std::filesystem::create_directories(folder_.onDisk() / "src");
        for (auto const* name : {"src/pump.cpp", "src/\xC3\xBC.cpp", "src/\xFF", "valve.cpp"}) {
            folder_.addFile(name);
        }
        auto const result =
            tool({"batch"}, "add -r src valve.cpp\ncategory create Status\nlabel create Status Done\n"
                            "label put Status Done valve.cpp\nentry set valve.cpp\n"
                            "path add src\nreference add .\ndescription 'a \"pump\"'\n");
        ASSERT_EQ(result.exitCode, 0) << result.errors;
        ASSERT_EQ(tool({"tidy"}).exitCode, 0);
        before_ = readText();
    }

    ProgramResult copyTo(std::string const& service) const {
        return tool({"copy", "--to", service, "--reader", reader_, "--writer", writer_});
    }

    /// The names in the store's folder, without the cache.
    std::vector<std::string> files() const {
        std::vector<std::string> names;
        for (auto const& entry : std::filesystem::directory_iterator(folder_.onDisk() / ".projectdata")) {
            if (entry.path().filename() != "cache") {
                names.push_back(entry.path().filename());
            }
        }
        return names;
    }

    void expectUnchanged() const {
        EXPECT_EQ(readText(), before_);
        EXPECT_FALSE(std::filesystem::exists(location()));
        EXPECT_EQ(tool({"check"}).exitCode, 0);
    }

    static std::string projects() { return sharedServer().query("SELECT count(*) FROM pm.project"); }

    std::string before_;
};

TEST_F(CopyCommand, aTextThatIsCopiedToAServerAndBackHasTheSameBytes) {
    auto const listed = tool({"list", "--json"}).output;

    EXPECT_THAT(copyTo("owner"), SucceedsSilently());
    EXPECT_EQ(tool({"list", "--json"}).output, listed);
    EXPECT_EQ(newestVersion(), "1") << "a copy is one entry";
    EXPECT_THAT(tool({"copy", "--to", "text"}), SucceedsSilently());

    EXPECT_EQ(readText(), before_);
    EXPECT_EQ(tool({"list", "--json"}).output, listed);
    EXPECT_THAT(files(), UnorderedElementsAre("project.jsonl", "project.jsonl.old", "store.json.old",
                                              ".gitignore", ".gitattributes"));
    EXPECT_EQ(contentOf(folder_.onDisk() / ".projectdata/project.jsonl.old"), before_);
}

TEST_F(CopyCommand, changesOnTheServerAreInTheTextThatIsCopiedBack) {
    copyTo("owner");
    grant();
    leadElsewhereTo("anna");
    elsewhere({"name", "Pump"});
    auto const json = elsewhere({"list", "--json"}).output;

    EXPECT_THAT(tool({"copy", "--to", "text"}), SucceedsSilently());

    EXPECT_EQ(tool({"name"}).output, "Pump\n");
    EXPECT_EQ(tool({"list", "--json"}).output, json);
    EXPECT_EQ(elsewhere({"name"}).output, "Pump\n") << "the project on the server remains";
    ASSERT_EQ(tool({"name", "Engine"}).exitCode, 0);
    ASSERT_EQ(tool({"tidy"}).exitCode, 0);
    EXPECT_EQ(readText(), before_);
}

TEST_F(CopyCommand, aReaderCopiesToAText) {
    copyTo("owner");
    grant();
    leadElsewhereTo("rita");

    EXPECT_THAT(elsewhere({"copy", "--to", "text"}), SucceedsSilently());

    EXPECT_EQ(contentOf(elsewhere_.onDisk() / ".projectdata/project.jsonl"), before_);
}

TEST_F(CopyCommand, aSecondCopyLeadsToAnotherProjectAndKeepsTheOldFiles) {
    copyTo("owner");
    tool({"name", "Pump"});
    tool({"copy", "--to", "text"});
    auto const second = readText();

    EXPECT_THAT(copyTo("owner"), SucceedsSilently());

    EXPECT_THAT(tool({"name"}), Prints("Pump\n"));
    EXPECT_THAT(tool({"shared", "log"}).output, Not(HasSubstr("batch"))) << "it is a new project";
    EXPECT_EQ(contentOf(folder_.onDisk() / ".projectdata/project.jsonl.old"), before_);
    EXPECT_EQ(contentOf(folder_.onDisk() / ".projectdata/project.jsonl.old2"), second);
}

TEST_F(CopyCommand, aCopyThatIsRefusedChangesNothing) {
    auto const before = projects();

    EXPECT_THAT(copyTo("rita"), FailsWith(1, "the user may not do this"));
    EXPECT_THAT(copyTo("nosuchservice"), FailsWith(1, "the service cannot be used"));

    expectUnchanged();
    EXPECT_EQ(projects(), before);
}

TEST_F(CopyCommand, aCopyWhoseConnectionIsCutIsCompleteOrChangesNothing) {
    FaultyProxy proxy(sharedServer().port());
    addService("far", PostgresServer::connectionAt(proxy.port(), "owner"));
    int copies = 0;
    int failures = 0;
    for (std::size_t bytes = 200; bytes < 12'000; bytes += 800) {
        proxy.breakAfter(bytes, FaultyProxy::Fault::Cut);
        auto const result = copyTo("far");
        if (result.exitCode != 0) {
            ++failures;
            EXPECT_EQ(result.exitCode, 7) << result.errors;
            expectUnchanged();
            continue;
        }
        ++copies;
        proxy.breakAfter(1'000'000'000, FaultyProxy::Fault::Cut); // not any more
        EXPECT_EQ(query("SELECT count(*) FROM pm.entry"), "1");
        ASSERT_EQ(tool({"copy", "--to", "text"}).exitCode, 0);
        EXPECT_EQ(readText(), before_);
    }
    EXPECT_GT(copies, 2);
    EXPECT_GT(failures, 2);
}

TEST_F(CopyCommand, aCopyThatTheServerCannotStoreLeavesNoProjectThere) {
    auto const before = projects();
    sharedServer().query(
        "CREATE FUNCTION full_disk() RETURNS trigger LANGUAGE plpgsql AS $$ BEGIN"
        " RAISE EXCEPTION 'could not extend file: no space left' USING ERRCODE = 'disk_full'; END $$;"
        " CREATE TRIGGER full_disk BEFORE INSERT ON pm.entry EXECUTE FUNCTION full_disk()");

    auto const result = copyTo("owner");
    sharedServer().query("DROP TRIGGER full_disk ON pm.entry; DROP FUNCTION full_disk()");

    EXPECT_THAT(result, FailsWith(7, "the server's disk is full"));
    expectUnchanged();
    EXPECT_EQ(projects(), before);
}

TEST_F(CopyCommand, aFolderThatCannotBeChangedLeavesNoProjectOnTheServer) {
    auto const before = projects();
    auto const ignored = folder_.onDisk() / ".projectdata/.gitignore";
    std::filesystem::remove(ignored);
    std::filesystem::create_directory(ignored);

    EXPECT_NE(copyTo("owner").exitCode, 0);

    expectUnchanged();
    EXPECT_EQ(projects(), before);
}

TEST_F(CopyCommand, aDamagedTextIsNotCopied) {
    insertLineBefore("{", "nonsense");
    auto const before = projects();

    EXPECT_THAT(copyTo("owner"), FailsWith(5, "damaged"));

    EXPECT_FALSE(std::filesystem::exists(location()));
    EXPECT_EQ(projects(), before);
}

TEST_F(CopyCommand, aTargetThatIsInUseAlreadyIsRefused) {
    EXPECT_THAT(tool({"copy", "--to", "text"}), FailsWith(1, "stored in a text already"));
    copyTo("owner");
    EXPECT_THAT(copyTo("owner"), FailsWith(1, "a server stores the project already"));
}

TEST_F(CopyCommand, gitSeesTheNewFileInPlaceOfTheOldOne) {
    GitFolder const git(folder_.onDisk());
    git.commitAll();

    copyTo("owner");
    EXPECT_EQ(git.run({"status", "--porcelain"}),
              "M  .projectdata/.gitignore\nD  .projectdata/project.jsonl\nA  .projectdata/store.json\n");
    git.commitAll();
    tool({"copy", "--to", "text"});

    EXPECT_EQ(git.run({"status", "--porcelain"}),
              "A  .projectdata/project.jsonl\nD  .projectdata/store.json\n");
}

} // namespace
} // namespace project::test
