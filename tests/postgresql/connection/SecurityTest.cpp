#include <filesystem>
#include <fstream>
#include <string>

#include <gmock/gmock.h>

#include "postgresql/SharedProjectFixture.hpp"
#include "support/RunningProgram.hpp"
#include "support/Waiting.hpp"

namespace project::postgresql {

namespace {

using ::testing::AllOf;
using ::testing::HasSubstr;

/// Certificates of the server, and connection poolers.
class SecurityTest : public SharedProjectTest {
protected:
    /// Lets the server use a certificate.
    /// @param days the time from now for which it is valid; -1 for one that has expired.
    void useCertificate(std::string const& host, int days) const {
        auto& server = sharedServer();
        auto const name = [&](char const* file) { return (server.folder() / file).string(); };
        server.runProgram({"/usr/bin/openssl", "req", "-x509", "-newkey", "rsa:2048", "-nodes", "-subj",
                           "/CN=" + host, "-addext", "subjectAltName=DNS:" + host, "-days", "1", "-keyout",
                           name("key"), "-out", name("valid")});
        std::filesystem::remove(name("certificate"));
        if (days < 0) {
            server.runProgram({"/usr/bin/openssl", "x509", "-in", name("valid"), "-signkey", name("key"),
                               "-days", std::to_string(days), "-out", name("certificate")});
        } else {
            std::filesystem::copy_file(name("valid"), name("certificate"));
        }
        server.query("ALTER SYSTEM SET ssl_cert_file = '" + name("certificate") + "'");
        server.query("ALTER SYSTEM SET ssl_key_file = '" + name("key") + "'");
        server.query("ALTER SYSTEM SET ssl = on");
        server.query("SELECT pg_reload_conf()");
        EXPECT_TRUE(test::comesTrue([&] { return server.query("SHOW ssl") == "on"; }));
    }

    void TearDown() override {
        if (!IsSkipped()) {
            sharedServer().query("ALTER SYSTEM RESET ssl");
            sharedServer().query("SELECT pg_reload_conf()");
        }
    }

    /// A connection by name, in which the mode of TLS is not mentioned.
    std::string connection(std::string const& host) const {
        return "host=" + host + " hostaddr=127.0.0.1 user=anna dbname=projects password=secret port=" +
               std::to_string(sharedServer().port()) +
               " sslrootcert=" + (sharedServer().folder() / "certificate").string();
    }

    StoreError errorWith(std::string const& service) const {
        return errorOf([&] { PostgresJournal(settingsFor(service), project.id).look(std::nullopt); });
    }
};

} // namespace

TEST_F(SecurityTest, aServerWithAValidCertificateIsTrusted) {
    useCertificate("server.example", 1);
    PostgresJournal journal(settingsFor(connection("server.example")), project.id);
    EXPECT_TRUE(journal.look(std::nullopt).entries.empty());
    EXPECT_EQ(sharedServer().query("SELECT count(*) FROM pg_stat_ssl JOIN pg_stat_activity USING (pid)"
                                   " WHERE ssl AND usename = 'anna'"),
              "1");
}

TEST_F(SecurityTest, aCertificateForAnotherHostIsRefused) {
    useCertificate("server.example", 1);
    auto const error = errorWith(connection("other.example"));
    EXPECT_EQ(error.kind(), StoreError::Kind::Refused);
    EXPECT_THAT(error.what(), AllOf(HasSubstr("the connection is not secure"), HasSubstr("other.example")));
}

TEST_F(SecurityTest, anExpiredCertificateIsRefused) {
    useCertificate("server.example", -1);
    auto const error = errorWith(connection("server.example"));
    EXPECT_EQ(error.kind(), StoreError::Kind::Refused);
    EXPECT_THAT(error.what(), AllOf(HasSubstr("the connection is not secure"), HasSubstr("certificate")));
}

TEST_F(SecurityTest, anUnknownAuthorityIsRefused) {
    useCertificate("server.example", 1);
    auto const error = errorWith(connection("server.example") + " sslrootcert=/nonexistent");
    EXPECT_EQ(error.kind(), StoreError::Kind::Refused);
    EXPECT_THAT(error.what(), HasSubstr("root certificate file"));
}

TEST_F(SecurityTest, aConnectionPoolerIsDetectedAndRefused) {
    if (!std::filesystem::exists("/usr/sbin/pgbouncer")) {
        GTEST_SKIP() << "the package pgbouncer is not installed";
    }
    auto& server = sharedServer();
    int const port = test::freePort();
    auto const file = server.folder() / "pooler.ini";
    std::ofstream(server.folder() / "users") << "\"anna\" \"secret\"\n";
    std::ofstream(file)
        << "[databases]\nprojects = host=127.0.0.1 port=" << server.port()
        << "\n[pgbouncer]\nlisten_addr = 127.0.0.1\nunix_socket_dir =\npool_mode = transaction\n"
        << "listen_port = " << port
        << "\nauth_type = plain\nauth_file = " << (server.folder() / "users").string() << "\n";
    auto const pooler = server.startProgram({"/usr/sbin/pgbouncer", "--quiet", file});
    auto const through = test::PostgresServer::connectionAt(port, "anna");
    ASSERT_TRUE(test::comesTrue([&] { return PQping(through.c_str()) == PQPING_OK; }));
    auto const error = errorWith(through);
    EXPECT_EQ(error.kind(), StoreError::Kind::Refused);
    EXPECT_THAT(error.what(), HasSubstr("the service leads to a connection pooler"));
}

} // namespace project::postgresql
