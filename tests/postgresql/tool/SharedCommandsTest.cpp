#include <csignal>

#include "postgresql/FaultyProxy.hpp"
#include "postgresql/tool/SharedToolTest.hpp"

namespace project::test {
namespace {

using postgresql::sharedServer;
using ::testing::AllOf;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;
using ::testing::Not;

/// Commands that every project has, on a shared one.
class SharedCommands : public SharedToolTest {
protected:
    static bool isEmpty(std::filesystem::path const& folder) { return std::filesystem::is_empty(folder); }

    static std::string withoutFolder(std::string text, TemporaryFolder const& folder) {
        auto const name = folder.onDisk().string();
        for (auto at = text.find(name); at != std::string::npos; at = text.find(name)) {
            text.erase(at, name.size());
        }
        return text;
    }

    /// Changes the content of an entry on the server.
    void damage(std::string const& version) const {
        query("UPDATE pm.entry SET lines = convert_to(replace(convert_from(lines, 'UTF8'), 'valve', "
              "'vampe'), 'UTF8')",
              " AND version = " + version);
    }

    /// A project with three files, each added by an entry of its own.
    void initWithFiles() {
        initShared();
        for (auto const* name : {"pump.cpp", "valve.cpp", "gate.cpp"}) {
            folder_.addFile(name);
            ASSERT_EQ(tool({"add", name}).exitCode, 0);
        }
    }
};

TEST_F(SharedCommands, everyCommandHasTheResultThatItHasWithAText) {
    std::vector<std::vector<std::string>> const commands{
        {"name"},
        {"description", "a pump"},
        {"add", "--recursive", "src", "valve.cpp"},
        {"list", "--json"},
        {"remove", "src/main.cpp"},
        {"list"},
        {"category", "create", "Status"},
        {"label", "create", "Status", "Done"},
        {"label", "put", "Status", "Done", "valve.cpp"},
        {"label", "find", "Status", "Done"},
        {"label", "show", "valve.cpp"},
        {"label", "take", "Status", "Done", "valve.cpp"},
        {"category", "list"},
        {"entry", "set", "valve.cpp"},
        {"entry", "list"},
        {"group", "create", "all"},
        {"group", "list"},
        {"path", "add", "src"},
        {"path", "list"},
        {"reference", "add", "."},
        {"reference", "list"},
        {"add", "--dry-run", "src/main.cpp"},
        {"add", "nosuchfile"},
        {"remove", "nosuchfile"},
        {"label", "put", "Status", "Missing", "valve.cpp"},
        {"status"},
        {"check"},
        {"tidy"},
        {"root"},
    };
    initShared();
    ASSERT_EQ(elsewhere({"init", "--name", "Engine"}).exitCode, 0);
    for (TemporaryFolder const* const folder : {static_cast<TemporaryFolder const*>(&folder_), &elsewhere_}) {
        std::filesystem::create_directories(folder->onDisk() / "src");
        for (auto const* name : {"src/main.cpp", "src/gate.cpp", "valve.cpp"}) {
            folder->addFile(name);
        }
    }

    for (auto const& command : commands) {
        auto const shared = tool(command);
        auto const text = elsewhere(command);

        EXPECT_EQ(shared.exitCode, text.exitCode) << command[0] << ": " << shared.errors;
        if (command[0] != "root") {
            EXPECT_EQ(shared.output, text.output) << command[0];
            EXPECT_EQ(withoutFolder(shared.errors, folder_), withoutFolder(text.errors, elsewhere_))
                << command[0];
        }
    }
    EXPECT_THAT(list(), ElementsAre("src", "src/gate.cpp", "valve.cpp"));
}

TEST_F(SharedCommands, aChangeInOneFolderIsVisibleInTheOther) {
    initShared();
    leadElsewhereTo("anna");

    elsewhere({"description", "a pump"});

    EXPECT_THAT(tool({"description"}), Prints("a pump\n"));
    EXPECT_THAT(elsewhere({"name"}), Prints("Engine\n"));
}

TEST_F(SharedCommands, aBatchIsOneEntry) {
    initShared();
    auto const before = std::stoi(newestVersion());

    auto const result = tool({"batch"}, "category create Status\nlabel create Status Done\nname Pump\n");

    EXPECT_EQ(result.exitCode, 0) << result.errors;
    EXPECT_EQ(newestVersion(), std::to_string(before + 1));
    EXPECT_THAT(tool({"name"}), Prints("Pump\n"));
}

TEST_F(SharedCommands, aBatchWithAnErrorStoresNothing) {
    initShared();
    auto const before = newestVersion();

    EXPECT_NE(tool({"batch"}, "category create Status\nlabel create Missing Done\n").exitCode, 0);

    EXPECT_EQ(newestVersion(), before);
}

TEST_F(SharedCommands, watchPrintsTheChangesOfOthers) {
    initShared();
    leadElsewhereTo("anna");
    RunningProgram watching(commandFor({"watch"}), settings_);
    ASSERT_EQ(watching.readLine(), "ready\t2");

    elsewhere({"category", "create", "Status"});
    EXPECT_EQ(watching.readLine(), "categoryAdded\tStatus");
    elsewhere({"name", "Pump"});
    EXPECT_EQ(watching.readLine(), "nameChanged");

    watching.sendSignal(SIGINT);
    EXPECT_EQ(watching.finish().signal, SIGINT);
}

TEST_F(SharedCommands, commandsForATextSayWhyTheyDoNotApply) {
    initShared();

    EXPECT_THAT(tool({"resolve", "--ours"}), FailsWith(1, "there are no conflicts to resolve"));
    EXPECT_THAT(tool({"setup"}), FailsWith(1, "git merges no text of it"));
}

TEST_F(SharedCommands, tidyAppendsABody) {
    initWithFiles();

    EXPECT_THAT(tool({"tidy"}), SucceedsSilently());

    auto const newest = newestVersion();
    EXPECT_EQ(query("SELECT kind FROM pm.entry", " AND version = " + newest), "b");
    EXPECT_THAT(tool({"tidy"}), SucceedsSilently());
    EXPECT_EQ(newestVersion(), newest) << "there was nothing to tidy";
    EXPECT_THAT(list(), ElementsAre("gate.cpp", "pump.cpp", "valve.cpp"));
}

TEST_F(SharedCommands, anInitThatTheServerRefusesLeavesNothing) {
    auto const result = tool({"init", "--store", "rita"});

    EXPECT_THAT(result, FailsWith(1, "the user may not do this"));
    EXPECT_TRUE(isEmpty(folder_.onDisk()));
}

TEST_F(SharedCommands, anInitWithAServerThatIsUnreachableTriesOnceAndLeavesNothing) {
    FaultyProxy proxy(sharedServer().port());
    proxy.breakAfter(1, FaultyProxy::Fault::Cut);
    addService("far", PostgresServer::connectionAt(proxy.port(), "owner"));

    auto const result = tool({"init", "--store", "far"});

    EXPECT_EQ(result.exitCode, 7);
    EXPECT_THAT(result.errors, HasSubstr("the server cannot be reached"));
    EXPECT_EQ(proxy.connections(), 1);
    EXPECT_TRUE(isEmpty(folder_.onDisk()));
}

TEST_F(SharedCommands, aServiceThatDoesNotExistIsNamed) {
    EXPECT_THAT(tool({"init", "--store", "nosuchservice"}),
                FailsWith(1, "nosuchservice: the service cannot be used"));
    EXPECT_TRUE(isEmpty(folder_.onDisk()));
    initShared();
    leadElsewhereTo("nosuchservice");
    EXPECT_THAT(elsewhere({"list"}), FailsWith(1, "nosuchservice: the service cannot be used"));
}

/// The library of the server is loaded, and has texts and a language of its own.
TEST_F(SharedCommands, errorsOfTheServerAreInTheLanguageOfTheUser) {
    settings_.environment["LANG"] = "de_DE.UTF-8";

    EXPECT_THAT(tool({"init", "--store", "nosuchservice"}),
                FailsWith(1, "nosuchservice: der Dienst kann nicht benutzt werden"));
    EXPECT_THAT(tool({"init", "--store", "rita"}), FailsWith(1, "der Benutzer darf das nicht"));
}

TEST_F(SharedCommands, aDatabaseThatIsNotOursIsRefused) {
    addService("foreign", sharedServer().connection("owner", "postgres"));

    EXPECT_THAT(tool({"init", "--store", "foreign"}), FailsWith(1, "does not contain shared projects"));
    EXPECT_TRUE(isEmpty(folder_.onDisk()));
}

TEST_F(SharedCommands, aProjectThatWasDeletedMeanwhileIsReported) {
    initShared();
    query("DELETE FROM pm.entry");
    query("DELETE FROM pm.project");

    EXPECT_THAT(tool({"list"}), FailsWith(1, "the project is not on the server"));
    EXPECT_THAT(tool({"name", "Pump"}), FailsWith(1, "the project is not on the server"));
}

TEST_F(SharedCommands, aProjectOfALaterFormatIsRefused) {
    initShared();
    query("UPDATE pm.project SET format = 2");

    EXPECT_THAT(tool({"list"}), FailsWith(1, "format"));
    EXPECT_THAT(tool({"name", "Pump"}), FailsWith(1, "format"));
}

TEST_F(SharedCommands, aReaderReadsAndCannotWrite) {
    initWithFiles();
    leadElsewhereTo("rita");
    auto const before = newestVersion();

    EXPECT_EQ(elsewhere({"list"}).output, "gate.cpp\npump.cpp\nvalve.cpp\n");
    EXPECT_THAT(elsewhere({"name", "Pump"}), FailsWith(1, "the user may not do this"));
    EXPECT_EQ(newestVersion(), before);
}

TEST_F(SharedCommands, aDamagedEntryIsNamedAndTheRestIsReadAndWritesAreRefused) {
    initWithFiles();
    leadElsewhereTo("anna");
    auto const damaged = std::to_string(std::stoi(newestVersion()) - 1); // of valve.cpp
    damage(damaged);

    auto const listed = elsewhere({"list"});
    auto const checked = elsewhere({"check"});
    auto const written = elsewhere({"name", "Pump"});

    EXPECT_EQ(listed.output, "pump.cpp\n") << "the entries before the damage";
    EXPECT_THAT(listed.errors, HasSubstr("warning: "));
    EXPECT_THAT(listed.errors, HasSubstr("version " + damaged + " is damaged"));
    EXPECT_EQ(checked.exitCode, 3);
    EXPECT_THAT(checked.output + checked.errors, AllOf(HasSubstr("version " + damaged + " is damaged"),
                                                       HasSubstr("1 later entries cannot be applied")));
    EXPECT_THAT(written, FailsWith(5, "version " + damaged + " is damaged"));
}

TEST_F(SharedCommands, onlyTheOwnerSetsADamagedEntryAside) {
    initWithFiles();
    leadElsewhereTo("anna");
    auto const newest = newestVersion();
    damage(std::to_string(std::stoi(newest) - 1));
    std::filesystem::remove_all(folder_.onDisk() / ".projectdata/cache"); // so that it has to read the damage

    EXPECT_THAT(elsewhere({"check", "--repair"}), FailsWith(1, "only the owner of the project may do this"));
    EXPECT_EQ(newestVersion(), newest);
    auto const repaired = tool({"check", "--repair"});

    EXPECT_EQ(repaired.exitCode, 0) << repaired.errors;
    EXPECT_THAT(repaired.output + repaired.errors, HasSubstr("are set aside; what could be read is kept"));
    EXPECT_EQ(elsewhere({"list"}).output, "pump.cpp\n");
    EXPECT_EQ(elsewhere({"name", "Pump"}).exitCode, 0);
}

TEST_F(SharedCommands, aClientThatHasReadAnEntryBeforeItWasDamagedRepairsItWithoutLoss) {
    initWithFiles();
    damage(newestVersion());
    damage(std::to_string(std::stoi(newestVersion()) - 1));

    auto const repaired = tool({"check", "--repair"});

    EXPECT_THAT(repaired.output + repaired.errors, HasSubstr("nothing is lost"));
    leadElsewhereTo("anna");
    EXPECT_EQ(elsewhere({"list"}).output, "gate.cpp\npump.cpp\nvalve.cpp\n");
}

TEST_F(SharedCommands, theLibraryOfAnotherKindOfServerIsNamed) {
    initShared();
    auto content = contentOf(location());
    content.replace(content.find("postgresql"), 10, "otherstore");
    std::ofstream(location()) << content;

    EXPECT_THAT(tool({"list"}), FailsWith(1, "Install the library for otherstore projects"));
}

} // namespace
} // namespace project::test
