#include <benchmark/benchmark.h>

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <fstream>
#include <functional>
#include <memory>
#include <stdexcept>
#include <string>
#include <string_view>
#include <vector>

#include <fcntl.h>
#include <libpq-fe.h>
#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>

#include "GeneratedTree.hpp"
#include "fl/i18n/Utf8.hpp"
#include "postgresql/PostgresServer.hpp"
#include "project/core/FileManager.hpp"
#include "project/postgresql/PostgresJournal.hpp"
#include "project/postgresql/SharedProjects.hpp"
#include "project/session.hpp"
#include "project/stores/JournalBackend.hpp"
#include "project/stores/SharedLocation.hpp"
#include "project/stores/TextBackend.hpp"

// A shared project beside bare statements on the same server, which this program starts: PostgreSQL with its
// default, durable settings, over the loopback interface, each client with prepared statements.
//
//   project_shared_benchmark [options of the benchmark library]
//   project_shared_benchmark --without-fsync ...    the same without durability, which hides the time of
//   everything else project_shared_benchmark --memory     the memory of a client with 100,000 files

namespace project::benchmarks {
namespace {

using postgresql::PostgresJournal;
using postgresql::ServiceSettings;
using stores::Access;
using stores::Address;
using stores::Batch;
using stores::Change;
using stores::JournalBackend;

constexpr char const* owner = "owner";
constexpr char const* writer = "anna"; // the policies for rows apply to her, and not to the owner

/// A server that is prepared for shared projects, with a table of rows for the peers.
class Server {
public:
    static Server& shared() {
        static Server server;
        return server;
    }

    std::string connection() const { return server_.connection(writer); }

    test::PostgresServer const& process() const { return server_; }

    /// Whether the server waits for its disk. Set it before the first use.
    static inline bool isDurable = true;

    /// Creates a project without entries. @return its UUID.
    std::string createProject() const {
        auto const id = stores::newSharedProjectId();
        auto const role = "w_" + id;
        postgresql::SharedProjects(settingsOf(owner)).create({id, "benchmark", 0, "r_" + id, role, true});
        server_.query("GRANT \"" + role + "\" TO " + writer);
        return id;
    }

    /// A client that is connected and has read nothing.
    std::unique_ptr<JournalBackend> connect(std::string const& project) const {
        auto journal = std::make_unique<PostgresJournal>(settingsOf(writer), project);
        journal->records(std::nullopt, 0);
        return std::make_unique<JournalBackend>(std::move(journal));
    }

private:
    Server() : server_(isDurable ? std::vector<std::string>() : std::vector<std::string>{"fsync = off"}) {
        server_.query("CREATE ROLE owner LOGIN CREATEROLE PASSWORD 'secret'");
        server_.query("CREATE ROLE anna LOGIN PASSWORD 'secret'");
        server_.query("GRANT CREATE ON DATABASE projects TO owner, anna");
        server_.runProgram({test::PostgresServer::program("psql"), "--no-psqlrc", "--quiet", "--set",
                            "ON_ERROR_STOP=1", "--single-transaction", "--file", PROJECT_SETUP_SQL,
                            server_.connection(owner)});
    }

    ServiceSettings settingsOf(char const* user) const {
        ServiceSettings result;
        result.service = server_.connection(user);
        return result;
    }

    test::PostgresServer server_;
};

/// Statements on a table with a row for each address.
class Rows {
public:
    Rows() : connection_(PQconnectdb(Server::shared().connection().c_str()), &PQfinish) {
        run("CREATE SCHEMA IF NOT EXISTS peer");
        run("CREATE TABLE IF NOT EXISTS peer.node (address text PRIMARY KEY, content text NOT NULL)");
        prepare("insert", "INSERT INTO peer.node VALUES ($1::text, $2::text)");
        prepare("one", "SELECT 1");
    }

    void run(char const* statement) const { require(PQexec(connection_.get(), statement)); }

    void insert(std::string const& address) const {
        char const* const values[] = {address.c_str(), content};
        require(PQexecPrepared(connection_.get(), "insert", 2, values, nullptr, nullptr, 1));
    }

    void selectOne() const {
        require(PQexecPrepared(connection_.get(), "one", 0, nullptr, nullptr, nullptr, 1));
    }

    /// Inserts rows in one COPY.
    void copyIn(std::vector<std::string> const& addresses) const {
        require(PQexec(connection_.get(), "COPY peer.node FROM STDIN"), PGRES_COPY_IN);
        std::string buffer;
        for (auto const& address : addresses) {
            buffer += address + '\t' + content + '\n';
            if (buffer.size() > 65536) {
                send(buffer);
            }
        }
        send(buffer);
        PQputCopyEnd(connection_.get(), nullptr);
        require(PQgetResult(connection_.get()));
        PQclear(PQgetResult(connection_.get()));
    }

    /// Reads all rows in one COPY. @return their bytes.
    std::string copyOut() const {
        require(PQexec(connection_.get(), "COPY peer.node TO STDOUT"), PGRES_COPY_OUT);
        std::string rows;
        char* row = nullptr;
        for (int length = 0; (length = PQgetCopyData(connection_.get(), &row, 0)) > 0;) {
            rows.append(row, static_cast<std::size_t>(length));
            PQfreemem(row);
        }
        require(PQgetResult(connection_.get()));
        PQclear(PQgetResult(connection_.get()));
        return rows;
    }

private:
    static constexpr char const* content = "{\"type\":\"Info\"}";

    void prepare(char const* name, char const* statement) const {
        require(PQprepare(connection_.get(), name, statement, 0, nullptr));
    }

    void send(std::string& buffer) const {
        PQputCopyData(connection_.get(), buffer.data(), static_cast<int>(buffer.size()));
        buffer.clear();
    }

    void require(PGresult* result, ExecStatusType wanted = PGRES_COMMAND_OK) const {
        auto const status = PQresultStatus(result);
        PQclear(result);
        if (status != wanted && status != PGRES_TUPLES_OK) {
            throw std::runtime_error(PQerrorMessage(connection_.get()));
        }
    }

    std::unique_ptr<PGconn, decltype(&PQfinish)> connection_;
};

/// The path of a file: twenty files in a folder, fifty folders in a folder.
std::vector<std::u16string> stepsTo(std::size_t number) {
    auto const text = [](char const* name, std::size_t value) {
        return fl::i18n::fromUtf8(name + std::to_string(value));
    };
    return {text("module", number / 1000), text("component", number / 20), text("file", number) + u".cpp"};
}

constexpr std::size_t fileCount = 100'000;

Address addressOf(std::vector<std::u16string> const& steps) {
    auto address = Address::root().child({u"Files", u"Root"});
    for (auto const& step : steps) {
        address = address.child({u"File", step});
    }
    return address;
}

/// One batch with a node for each of 100,000 files.
Batch const& allNodes() {
    static Batch const result = [] {
        Batch batch;
        for (std::size_t number = 0; number < fileCount; ++number) {
            batch.push_back({Change::Kind::Set, addressOf(stepsTo(number)), stores::plainNode()});
        }
        std::ranges::sort(batch,
                          [](auto const& left, auto const& right) { return left.address < right.address; });
        return batch;
    }();
    return result;
}

std::vector<std::string> const& allAddresses() {
    static std::vector<std::string> const result = [] {
        std::vector<std::string> addresses;
        for (std::size_t number = 0; number < fileCount; ++number) {
            std::string address = "Files/Root";
            for (auto const& step : stepsTo(number)) {
                address += "/File/" + fl::i18n::toUtf8(step);
            }
            addresses.push_back(std::move(address));
        }
        return addresses;
    }();
    return result;
}

void commit(JournalBackend& backend, Batch const& batch) {
    backend.enter(Access::Write);
    backend.write(batch);
    backend.keep();
    backend.leave();
}

/// A project with 100,000 files.
std::string const& largeProject() {
    static std::string const result = [] {
        auto id = Server::shared().createProject();
        commit(*Server::shared().connect(id), allNodes());
        return id;
    }();
    return result;
}

/// A number that no other call returns.
std::size_t nextNumber() {
    static std::size_t next = fileCount;
    return next++;
}

void writeOne(benchmark::State& state) {
    auto const backend = Server::shared().connect(largeProject());
    commit(*backend, {{Change::Kind::Set, addressOf(stepsTo(nextNumber())), stores::plainNode()}});
    for (auto _ : state) {
        commit(*backend, {{Change::Kind::Set, addressOf(stepsTo(nextNumber())), stores::plainNode()}});
    }
}

void insertOne(benchmark::State& state) {
    Rows const rows;
    for (auto _ : state) {
        rows.insert("Files/Root/File/module/File/component/File/file" + std::to_string(nextNumber()) +
                    ".cpp");
    }
}

void readGuard(benchmark::State& state) {
    auto const backend = Server::shared().connect(largeProject());
    backend->enter(Access::Read);
    backend->leave();
    for (auto _ : state) {
        backend->enter(Access::Read);
        backend->leave();
    }
}

void selectOne(benchmark::State& state) {
    Rows const rows;
    for (auto _ : state) {
        rows.selectOne();
    }
}

void writeAll(benchmark::State& state) {
    auto const& batch = allNodes();
    for (auto _ : state) {
        state.PauseTiming();
        auto const backend = Server::shared().connect(Server::shared().createProject());
        state.ResumeTiming();
        commit(*backend, batch);
    }
}

void copyIn(benchmark::State& state) {
    Rows const rows;
    auto const& addresses = allAddresses();
    for (auto _ : state) {
        state.PauseTiming();
        rows.run("TRUNCATE peer.node");
        state.ResumeTiming();
        rows.copyIn(addresses);
    }
}

void open(benchmark::State& state) {
    auto const& project = largeProject();
    for (auto _ : state) {
        state.PauseTiming();
        auto backend = Server::shared().connect(project);
        state.ResumeTiming();
        backend->enter(Access::Read);
        backend->leave();
        state.PauseTiming();
        backend.reset();
        state.ResumeTiming();
    }
}

void copyOut(benchmark::State& state) {
    Rows const rows;
    rows.run("TRUNCATE peer.node");
    rows.copyIn(allAddresses());
    for (auto _ : state) {
        benchmark::DoNotOptimize(rows.copyOut());
    }
}

void registerCases() {
    struct Case {
        char const* name;
        void (*run)(benchmark::State&);
        int iterations;
    };

    for (auto const& [name, run, iterations] : {Case{"shared/write-one", writeOne, 300},
                                                {"shared/bare-insert", insertOne, 300},
                                                {"shared/read-guard", readGuard, 2000},
                                                {"shared/select-1", selectOne, 2000},
                                                {"shared/write-all", writeAll, 1},
                                                {"shared/copy-in", copyIn, 1},
                                                {"shared/open", open, 3},
                                                {"shared/copy-out", copyOut, 3}}) {
        benchmark::RegisterBenchmark(name, run)
            ->Iterations(iterations)
            ->UseRealTime()
            ->Unit(benchmark::kMicrosecond);
    }
}

/// A value of this process in KiB, from the kernel's list.
long memory(std::string_view name) {
    std::ifstream status("/proc/self/status");
    for (std::string line; std::getline(status, line);) {
        if (line.starts_with(name)) {
            return std::stol(line.substr(name.size() + 1));
        }
    }
    throw std::runtime_error("the kernel does not list " + std::string(name));
}

/// A client: opens the project of the working folder, and asks for all files.
int runClient() {
    auto session = session::Session::open(fl::filesystem::fromSystem(std::filesystem::current_path()));
    std::size_t found = 0;
    for (std::size_t number = 0; number < fileCount; ++number) {
        auto path = session.root();
        for (auto const& step : stepsTo(number)) {
            path = path / fl::filesystem::Path(step);
        }
        found += session.project().getFileManager().isFileInProject(path) ? 1 : 0;
    }
    std::printf("%ld %ld\n", memory("VmRSS:"), memory("VmHWM:"));
    return found == fileCount ? 0 : 1;
}

/// Runs a program in a folder without its output. @return the largest memory of it in KiB.
long peakOf(std::filesystem::path const& folder, std::vector<std::string> command) {
    std::vector<char*> arguments;
    for (auto& argument : command) {
        arguments.push_back(argument.data());
    }
    arguments.push_back(nullptr);
    auto const child = fork();
    if (child == 0) {
        int const nowhere = ::open("/dev/null", O_WRONLY);
        if (::dup2(nowhere, STDOUT_FILENO) >= 0 && ::chdir(folder.c_str()) == 0) {
            ::execv(arguments.front(), arguments.data());
        }
        ::_exit(127);
    }
    int status = 0;
    rusage usage{};
    if (child < 0 || ::wait4(child, &status, 0, &usage) != child || status != 0) {
        throw std::runtime_error(command.front() + " failed");
    }
    return usage.ru_maxrss;
}

void print(char const* client, long kibibytes) {
    std::printf("%-66s %6.1f MiB, at most 48\n", client, static_cast<double>(kibibytes) / 1024);
}

/// The same in a process of its own: the largest memory of a program includes that of the process that
/// started it.
std::string largeProjectOfAnotherProcess() {
    auto id = Server::shared().createProject();
    std::fflush(nullptr);
    auto const child = fork();
    if (child == 0) {
        commit(*Server::shared().connect(id), allNodes());
        ::_exit(0);
    }
    int status = 0;
    if (child < 0 || ::waitpid(child, &status, 0) != child || status != 0) {
        throw std::runtime_error("the project cannot be created");
    }
    return id;
}

int measureMemory(char const* self) {
    constexpr long most = 48 * 1024;
    auto const& server = Server::shared();
    test::TemporaryFolder const folder;
    auto lines = server.connection();
    std::ranges::replace(lines, ' ', '\n');
    ::setenv("PGSERVICEFILE", folder.addFile("services", "[benchmark]\n" + lines + "\n").c_str(), 1);
    auto const root = folder.onDisk() / "project";
    std::filesystem::create_directories(root / ".projectdata");
    std::ofstream(root / ".projectdata/store.json")
        << R"({"format":"project-store","version":1,"kind":"postgresql","service":"benchmark","project":")" +
               largeProjectOfAnotherProcess() + "\"}\n";
    long const client = peakOf(root, {self, "--client"});
    print("a session with 100,000 files, each queried, at most", client);
    std::filesystem::remove_all(root / ".projectdata/cache");
    long const first = peakOf(root, {PROJECTCTL, "list"});
    print("projectctl list of 100,000 files without a cache, at most", first);
    long const cached = peakOf(root, {PROJECTCTL, "list"});
    print("projectctl list of 100,000 files with a cache, at most", cached);
    long const write = peakOf(root, {PROJECTCTL, "name", "Pump"});
    print("projectctl name in a project of 100,000 files, at most", write);
    return std::max({client, first, cached, write}) <= most ? 0 : 3;
}

} // namespace
} // namespace project::benchmarks

int main(int argc, char** argv) {
    using namespace project::benchmarks;
    std::string_view const argument = argc > 1 ? argv[1] : "";
    if (argument == "--client") {
        return runClient();
    }
    if (auto const obstacle = project::test::PostgresServer::obstacle(); !obstacle.empty()) {
        std::fprintf(stderr, "%s\n", obstacle.c_str());
        return 1;
    }
    if (argument == "--memory") {
        return measureMemory("/proc/self/exe");
    }
    if (argument == "--without-fsync") {
        Server::isDurable = false;
        argv[1] = argv[0];
        ++argv;
        --argc;
    }
    registerCases();
    benchmark::Initialize(&argc, argv);
    benchmark::RunSpecifiedBenchmarks();
    return 0;
}
