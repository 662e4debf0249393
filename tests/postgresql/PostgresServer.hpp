#pragma once

#include <filesystem>
#include <memory>
#include <string>
#include <vector>

#include <libpq-fe.h>

#include "support/RunningProgram.hpp"
#include "support/TemporaryFolder.hpp"

namespace project::test {

/// A PostgreSQL server in a temporary folder, on the loopback interface and a Unix socket. It does not run as
/// root. It ends with this object, and with the process, however that ends.
class PostgresServer {
public:
    /// The reason why no server can be started here; empty if it can.
    static std::string obstacle();

    /// The reason why no server with a small disk can be started here; empty if it can.
    static std::string obstacleToSmallDisk();

    /// Creates an empty server and starts it.
    /// @param settings lines for its configuration file.
    /// @param smallDisk the mebibytes of a file system that only the server sees, as a tablespace `small`; 0
    ///     for none.
    explicit PostgresServer(std::vector<std::string> const& settings = {}, int smallDisk = 0);

    /// Starts a standby of another server, which follows it from now on.
    PostgresServer(PostgresServer const& primary, std::vector<std::string> const& settings);
    ~PostgresServer();
    PostgresServer(PostgresServer const&) = delete;
    PostgresServer& operator=(PostgresServer const&) = delete;

    /// Starts the server again after kill or stop, with the same data on the same port.
    void start();

    /// Ends the server as a shutdown does.
    void stop();

    /// Ends all of its processes at once with SIGKILL.
    void kill();

    /// Makes a standby the primary server.
    void promote();

    int port() const { return port_; }

    std::filesystem::path const& folder() const { return folder_.onDisk(); }

    std::filesystem::path data() const { return folder() / "data"; }

    /// A connection string. All users have the password `secret`; the user swift needs none.
    std::string connection(std::string const& user, std::string const& database = "projects") const;

    /// The same for a proxy in front of the server.
    static std::string connectionAt(int port, std::string const& user,
                                    std::string const& database = "projects");

    /// Runs statements as the superuser. @return the first value of the last row.
    std::string query(std::string const& statements, std::string const& database = "projects") const;

    /// Runs a program of the server as its user. @throws std::runtime_error if it fails.
    void runProgram(std::vector<std::string> const& command) const;

    /// Starts a program as the server's user. It ends with the result.
    std::unique_ptr<RunningProgram> startProgram(std::vector<std::string> const& command) const;

    /// The full name of a program of the server.
    static std::string program(std::string const& name);

    static constexpr char const* superuser = "admin";

private:
    void allowWithoutPassword(std::string const& user);
    void configure(std::vector<std::string> const& settings);
    void awaitStart();
    std::vector<std::string> commandWith(std::string const& log) const;

    TemporaryFolder folder_;
    int port_;
    int smallDisk_ = 0;
    std::unique_ptr<RunningProgram> running_;
};

/// A port of the loopback interface that nobody listens to. It is below 32,768: the system gives no such port
/// to a client, so a client that connects again and again cannot connect to itself.
int freePort();

} // namespace project::test
