#pragma once

#include <string>
#include <utility>
#include <vector>

namespace project::postgresql {

/// The parameters of a connection: libpq's configuration of a service, completed with our own defaults.
class ConnectOptions {
public:
    /// Reads libpq's configuration. Does not connect.
    /// @param service the name of a service, or a connection string.
    /// @throws StoreError with the kind Refused if the service or the string is not valid.
    explicit ConnectOptions(std::string const& service);

    /// The service for messages, without a secret.
    static std::string nameOf(std::string const& service);

    /// Keywords and values for libpq, each list with a null at its end. Valid as long as this object.
    std::vector<char const*> keywords() const;
    std::vector<char const*> values() const;

private:
    std::vector<std::pair<std::string, std::string>> options_;
};

} // namespace project::postgresql
