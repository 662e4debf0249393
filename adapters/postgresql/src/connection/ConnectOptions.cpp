#include "connection/ConnectOptions.hpp"

#include <array>
#include <memory>
#include <string_view>

#include <libpq-fe.h>

#include "project/stores/StoreError.hpp"
#include "texts/ErrorTexts.hpp"

namespace project::postgresql {

namespace {

using stores::StoreError;

struct Freed {
    void operator()(PQconninfoOption* options) const noexcept { PQconninfoFree(options); }

    void operator()(PGconn* connection) const noexcept { PQfinish(connection); }

    void operator()(char* text) const noexcept { PQfreemem(text); }
};

using OptionList = std::unique_ptr<PQconninfoOption, Freed>;

/// Our values where the configuration has libpq's default. A dead peer is noticed after some 25 seconds.
constexpr auto ownDefaults = std::to_array<std::pair<std::string_view, char const*>>({
    {"sslmode", "verify-full"},
    {"keepalives_idle", "10"},
    {"keepalives_interval", "5"},
    {"keepalives_count", "3"},
    {"tcp_user_timeout", "10000"},
    {"fallback_application_name", "project"},
});

/// Our values whatever the configuration says: only a server that can write has the newest entries.
constexpr auto ownValues = std::to_array<std::pair<std::string_view, char const*>>({
    {"target_session_attrs", "read-write"},
    {"client_encoding", "UTF8"},
});

bool isConnectionString(std::string const& service) {
    return service.find('=') != std::string::npos || service.starts_with("postgresql://") ||
           service.starts_with("postgres://");
}

std::string connectionString(std::string const& service) {
    if (isConnectionString(service)) {
        return service;
    }
    std::string quoted = "service='";
    for (char const symbol : service) {
        quoted += symbol == '\'' || symbol == '\\' ? std::string{'\\', symbol} : std::string{symbol};
    }
    return quoted + "'";
}

/// All options of a service with their values. libpq resolves a service only when it connects, so this tries
/// three sockets in a folder that does not exist, which fails at once. If the configuration has a number of
/// addresses, it fails even earlier, because that is not three.
OptionList resolve(std::string const& service) {
    auto const text = connectionString(service);
    std::array<char const*, 3> const keywords{"dbname", "host", nullptr};
    std::array<char const*, 3> const values{text.c_str(), "/nonexistent,/nonexistent,/nonexistent", nullptr};
    std::unique_ptr<PGconn, Freed> const probe(PQconnectStartParams(keywords.data(), values.data(), 1));
    OptionList options(probe != nullptr ? PQconninfo(probe.get()) : nullptr);
    for (auto const* option = options.get(); option != nullptr && option->keyword != nullptr; ++option) {
        if (std::string_view(option->keyword) == "host" && option->val != nullptr) {
            return options;
        }
    }
    std::string problem = probe != nullptr ? PQerrorMessage(probe.get()) : errorTexts.get("OutOfMemory");
    while (!problem.empty() && problem.back() == '\n') {
        problem.pop_back();
    }
    throw StoreError(StoreError::Kind::Refused, ConnectOptions::nameOf(service), 0,
                     errorTexts.get("ServiceUnusable", problem), errorTexts.get("RemedyOfService"));
}

} // namespace

ConnectOptions::ConnectOptions(std::string const& service) {
    auto const resolved = resolve(service);
    for (auto const* option = resolved.get(); option->keyword != nullptr; ++option) {
        std::string_view const keyword = option->keyword;
        std::string_view const value = option->val != nullptr ? option->val : "";
        bool const isDefault = value.empty() || (option->compiled != nullptr && value == option->compiled);
        for (auto const& [ownKeyword, ownValue] : ownDefaults) {
            if (isDefault && keyword == ownKeyword) {
                options_.emplace_back(ownKeyword, ownValue);
            }
        }
    }
    options_.emplace_back("dbname", connectionString(service));
    for (auto const& [keyword, value] : ownValues) {
        options_.emplace_back(keyword, value);
    }
}

std::string ConnectOptions::nameOf(std::string const& service) {
    if (!isConnectionString(service)) {
        return service;
    }
    char* problem = nullptr;
    OptionList const options(PQconninfoParse(service.c_str(), &problem));
    std::unique_ptr<char, Freed> const freed(problem);
    std::string name;
    for (auto const* option = options.get(); option != nullptr && option->keyword != nullptr; ++option) {
        std::string_view const keyword = option->keyword;
        if (option->val != nullptr && (keyword == "service" || keyword == "host" || keyword == "dbname")) {
            name += (name.empty() ? "" : " ") + std::string(option->val);
        }
    }
    return name.empty() ? errorTexts.get("TheServer") : name;
}

std::vector<char const*> ConnectOptions::keywords() const {
    std::vector<char const*> result;
    for (auto const& option : options_) {
        result.push_back(option.first.c_str());
    }
    result.push_back(nullptr);
    return result;
}

std::vector<char const*> ConnectOptions::values() const {
    std::vector<char const*> result;
    for (auto const& option : options_) {
        result.push_back(option.second.c_str());
    }
    result.push_back(nullptr);
    return result;
}

} // namespace project::postgresql
