#include "postgresql/PostgresServer.hpp"

#include <algorithm>
#include <atomic>
#include <csignal>
#include <fstream>
#include <sstream>
#include <stdexcept>
#include <thread>

#include <arpa/inet.h>
#include <netinet/in.h>
#include <pwd.h>
#include <sys/socket.h>
#include <unistd.h>

#include "support/Waiting.hpp"

namespace project::test {

namespace {

/// The account of the Debian package, for a test that runs as root.
constexpr char const* account = "postgres";

std::vector<std::string> asAccount(std::vector<std::string> const& command) {
    std::vector<std::string> full{"/usr/bin/setpriv", "--pdeathsig", "QUIT"};
    if (::geteuid() == 0) {
        full.insert(full.end(), {"--reuid", account, "--regid", account, "--clear-groups"});
    }
    full.insert(full.end(), command.begin(), command.end());
    return full;
}

void give(std::filesystem::path const& path) {
    if (auto const* user = ::getpwnam(account); ::geteuid() == 0 && user != nullptr) {
        if (::chown(path.c_str(), user->pw_uid, user->pw_gid) != 0) {
            throw std::runtime_error("cannot give " + path.string() + " to " + account);
        }
    }
}

std::vector<pid_t> childrenOf(pid_t parent) {
    auto const number = std::to_string(parent);
    std::ifstream file("/proc/" + number + "/task/" + number + "/children");
    std::vector<pid_t> children;
    for (pid_t child = 0; file >> child;) {
        children.push_back(child);
    }
    return children;
}

bool isRunning(pid_t process) {
    std::ifstream file("/proc/" + std::to_string(process) + "/stat");
    std::string text;
    std::getline(file, text);
    return !text.empty() && text.find(") Z ") == std::string::npos;
}

} // namespace

int freePort() {
    static std::atomic<int> next = 12000 + ::getpid() * 37 % 18000;
    for (;;) {
        int const port = next++;
        int const socket = ::socket(AF_INET, SOCK_STREAM | SOCK_CLOEXEC, 0);
        sockaddr_in address{};
        address.sin_family = AF_INET;
        address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
        address.sin_port = htons(static_cast<std::uint16_t>(port));
        bool const isFree = ::bind(socket, reinterpret_cast<sockaddr*>(&address), sizeof address) == 0;
        ::close(socket);
        if (isFree) {
            return port;
        }
    }
}

std::string PostgresServer::obstacle() {
    if (program("postgres").empty()) {
        return "the package postgresql is not installed: no server to test with";
    }
    if (::geteuid() == 0 && ::getpwnam(account) == nullptr) {
        return "no account postgres: the server does not run as root";
    }
    return "";
}

std::string PostgresServer::obstacleToSmallDisk() {
    auto const mount = asAccount({"/usr/bin/unshare", "--user", "--map-root-user", "--mount", "/bin/true"});
    bool const canMount = test::runProgram(mount, {}).exitCode == 0;
    return canMount ? obstacle() : "no user namespaces: nobody but root can mount a file system";
}

std::string PostgresServer::program(std::string const& name) {
    std::string newest;
    std::error_code ignored;
    for (auto const& version : std::filesystem::directory_iterator("/usr/lib/postgresql", ignored)) {
        auto const file = version.path() / "bin" / name;
        if (std::filesystem::exists(file) && file.string() > newest) {
            newest = file;
        }
    }
    return newest;
}

PostgresServer::PostgresServer(std::vector<std::string> const& settings, int smallDisk)
    : port_(freePort()), smallDisk_(smallDisk) {
    give(folder());
    auto const password = folder_.addFile("password", "secret");
    runProgram({program("initdb"), "--no-sync", "--username", superuser, "--auth", "scram-sha-256",
                "--pwfile", password, "--encoding", "UTF8", "--locale", "C.UTF-8", "--pgdata", data()});
    allowWithoutPassword("swift");
    configure(settings);
    std::filesystem::create_directory(folder() / "small");
    give(folder() / "small");
    start();
    query("CREATE DATABASE projects", "postgres");
    if (smallDisk > 0) {
        std::string const location = (folder() / "small").string();
        query("CREATE TABLESPACE small LOCATION '" + location + "'", "postgres");
    }
}

PostgresServer::PostgresServer(PostgresServer const& primary, std::vector<std::string> const& settings)
    : port_(freePort()) {
    give(folder());
    runProgram({program("pg_basebackup"), "--no-sync", "--checkpoint", "fast", "--write-recovery-conf",
                "--dbname", primary.connection(superuser, "postgres") + " application_name=standby",
                "--pgdata", data()});
    configure(settings);
    start();
}

PostgresServer::~PostgresServer() {
    if (running_) {
        running_->sendSignal(SIGQUIT); // ends the other processes, too, without writing anything
        comesTrue([this] { return !std::filesystem::exists(data() / "postmaster.pid"); },
                  std::chrono::seconds(10));
    }
}

/// The first line that fits a connection decides.
void PostgresServer::allowWithoutPassword(std::string const& user) {
    std::ifstream rules(data() / "pg_hba.conf");
    std::ostringstream text;
    text << "host all " << user << " 127.0.0.1/32 trust\n" << rules.rdbuf();
    std::ofstream(data() / "pg_hba.conf") << text.str();
}

void PostgresServer::configure(std::vector<std::string> const& settings) {
    std::ofstream file(data() / "postgresql.auto.conf", std::ios::app);
    file << "port = " << port_ << "\nlisten_addresses = '127.0.0.1'\nunix_socket_directories = '"
         << folder().string() << "'\nmax_connections = 150\nshared_buffers = 16MB\n";
    for (auto const& line : settings) {
        file << line << '\n';
    }
}

void PostgresServer::start() {
    std::filesystem::remove(folder() / "log");
    auto const log = folder_.addFile("log");
    give(log);
    running_ = startProgram(commandWith(log));
    awaitStart();
}

/// Each exec keeps the process, and the log keeps the pipe from filling up.
std::vector<std::string> PostgresServer::commandWith(std::string const& log) const {
    if (smallDisk_ == 0) {
        return {"/bin/sh", "-c", R"(exec "$0" -D "$1" >"$2" 2>&1)", program("postgres"), data(), log};
    }
    // Mounting needs the rights of root, which the server refuses to have: it gets a user of its own below.
    return {"/usr/bin/unshare",
            "--user",
            "--map-root-user",
            "--mount",
            "/bin/sh",
            "-c",
            R"(mount -t tmpfs -o size="$3"m,mode=700 none "$4" &&)"
            R"( exec unshare --user --map-user=1000 --map-group=1000 setpriv --pdeathsig QUIT)"
            R"( "$0" -D "$1" >"$2" 2>&1)",
            program("postgres"),
            data(),
            log,
            std::to_string(smallDisk_),
            folder() / "small"};
}

void PostgresServer::awaitStart() {
    bool const isUp =
        comesTrue([this] { return PQping(connection(superuser, "postgres").c_str()) == PQPING_OK; });
    if (!isUp) {
        std::ifstream log(folder() / "log");
        std::ostringstream text;
        text << log.rdbuf();
        throw std::runtime_error("the server does not start: " + text.str());
    }
}

void PostgresServer::stop() {
    running_->sendSignal(SIGINT);
    running_->finish();
    running_.reset();
}

void PostgresServer::kill() {
    std::ifstream file(data() / "postmaster.pid");
    pid_t server = 0;
    file >> server;
    running_->sendSignal(SIGSTOP); // no new process starts now
    auto const children = childrenOf(server);
    running_->sendSignal(SIGKILL);
    for (auto const child : children) {
        ::kill(child, SIGKILL);
    }
    running_->finish();
    running_.reset();
    comesTrue([&] { return std::none_of(children.begin(), children.end(), isRunning); });
}

void PostgresServer::promote() {
    runProgram({program("pg_ctl"), "promote", "--pgdata", data()});
}

std::string PostgresServer::connectionAt(int port, std::string const& user, std::string const& database) {
    return "host=127.0.0.1 port=" + std::to_string(port) + " user=" + user + " dbname=" + database +
           " password=secret sslmode=disable";
}

std::string PostgresServer::connection(std::string const& user, std::string const& database) const {
    return connectionAt(port_, user, database);
}

std::string PostgresServer::query(std::string const& statements, std::string const& database) const {
    std::unique_ptr<PGconn, decltype(&PQfinish)> const handle(
        PQconnectdb(connection(superuser, database).c_str()), &PQfinish);
    std::unique_ptr<PGresult, decltype(&PQclear)> const result(PQexec(handle.get(), statements.c_str()),
                                                               &PQclear);
    auto const status = PQresultStatus(result.get());
    if (status != PGRES_COMMAND_OK && status != PGRES_TUPLES_OK) {
        throw std::runtime_error(statements + ": " + PQerrorMessage(handle.get()));
    }
    int const rows = PQntuples(result.get());
    return rows > 0 && PQnfields(result.get()) > 0 ? PQgetvalue(result.get(), rows - 1, 0) : "";
}

std::unique_ptr<RunningProgram> PostgresServer::startProgram(std::vector<std::string> const& command) const {
    ProgramSettings settings;
    settings.folder = folder();
    return std::make_unique<RunningProgram>(asAccount(command), settings);
}

void PostgresServer::runProgram(std::vector<std::string> const& command) const {
    ProgramSettings settings;
    settings.folder = folder();
    auto const result = test::runProgram(asAccount(command), settings);
    if (result.exitCode != 0) {
        throw std::runtime_error(command.front() + ": " + result.output + result.errors);
    }
}

} // namespace project::test
