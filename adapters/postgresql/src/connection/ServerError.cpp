#include "connection/ServerError.hpp"

#include <algorithm>
#include <array>
#include <cctype>

#include <unistd.h>

#include "texts/ErrorTexts.hpp"

namespace project::postgresql {

namespace {

using stores::StoreError;

/// What a code, or a class of codes, means for a user.
struct Meaning {
    std::string_view code; ///< its beginning
    StoreError::Kind kind;
    char const* problem; ///< the name of its text
    char const* remedy;  ///< the same; may be empty
};

constexpr auto meanings = std::to_array<Meaning>({
    {"28", StoreError::Kind::Refused, "UserRefused", "RemedyOfAccess"},
    {"3D000", StoreError::Kind::Refused, "DatabaseMissing", "RemedyOfSetup"},
    {"3F000", StoreError::Kind::Refused, "DatabaseEmpty", "RemedyOfSetup"},
    {"42P01", StoreError::Kind::Refused, "DatabaseEmpty", "RemedyOfSetup"},
    {"42703", StoreError::Kind::Refused, "DatabaseOfOtherVersion", "RemedyOfSetup"},
    {"42501", StoreError::Kind::Refused, "NotPermitted", "RemedyOfRights"},
    {"42710", StoreError::Kind::Refused, "RoleExists", ""},
    {"23505", StoreError::Kind::Refused, "ProjectExists", ""},
    {"23", StoreError::Kind::Refused, "ValuesRefused", ""},
    {"22", StoreError::Kind::Refused, "ValuesRefused", ""},
    {"53100", StoreError::Kind::DiskFailed, "ServerDiskFull", "RemedyOfFullDisk"},
    {"55P03", StoreError::Kind::Busy, "LockHeld", "TryAgainLater"},
});

/// Codes with which a server ends a session, or refuses one for now.
bool isPassing(std::string_view code) {
    constexpr auto passing = std::to_array<std::string_view>({"08", "57P", "25006", "40", "53300"});
    return code.empty() || std::any_of(passing.begin(), passing.end(),
                                       [&](auto const& start) { return code.starts_with(start); });
}

/// A message of several lines as a clause.
std::string asClause(std::string_view message) {
    std::string clause;
    for (char const symbol : message) {
        bool const isSpace = std::isspace(static_cast<unsigned char>(symbol)) != 0;
        if (!isSpace) {
            clause += symbol;
        } else if (!clause.empty() && clause.back() != ' ') {
            clause += ' ';
        }
    }
    while (!clause.empty() && (clause.back() == ' ' || clause.back() == '.')) {
        clause.pop_back();
    }
    return clause;
}

[[noreturn]] void throwMeaning(std::string const& where, std::string_view code, std::string const& message) {
    for (auto const& meaning : meanings) {
        if (code.starts_with(meaning.code)) {
            throw StoreError(meaning.kind, where, 0, errorTexts.get(meaning.problem, message),
                             *meaning.remedy == '\0' ? "" : errorTexts.get(meaning.remedy));
        }
    }
    throw StoreError(StoreError::Kind::DiskFailed, where, 0, errorTexts.get("ServerFailed", message, code),
                     errorTexts.get("RemedyOfFailure"));
}

/// The last code in a verbose message: with several hosts, that of the last one. Such a message contains
/// "FATAL:  28P01: the text", where the first word may be translated.
std::string_view codeIn(std::string_view message) {
    std::string_view code;
    for (auto at = message.find(":  "); at != std::string_view::npos; at = message.find(":  ", at + 1)) {
        auto const candidate = message.substr(at + 3, 5);
        bool const isCode = candidate.size() == 5 && message.substr(at + 8, 2) == ": " &&
                            std::all_of(candidate.begin(), candidate.end(), [](unsigned char symbol) {
                                return std::isdigit(symbol) != 0 || std::isupper(symbol) != 0;
                            });
        if (isCode) {
            code = candidate;
        }
    }
    return code;
}

} // namespace

ConnectionLost::ConnectionLost(std::string where, std::string const& reason)
    : StoreError(Kind::Unreachable, std::move(where), 0,
                 errorTexts.get("Unreachable", reason.empty() ? errorTexts.get("ConnectionClosed") : reason),
                 errorTexts.get("RemedyOfUnreachable")) {
}

void throwConnectError(std::string const& where, std::string_view message) {
    auto const code = codeIn(message);
    auto const shown = shownMessage(message);
    if (!code.empty() && !isPassing(code)) {
        throwMeaning(where, code, shown);
    }
    if (shown.find("certificate") != std::string::npos || shown.find("support SSL") != std::string::npos) {
        throw StoreError(StoreError::Kind::Refused, where, 0, errorTexts.get("NotSecure", shown),
                         errorTexts.get("RemedyOfNotSecure"));
    }
    if (shown.find("no password supplied") != std::string::npos) {
        throw StoreError(StoreError::Kind::Refused, where, 0, errorTexts.get("PasswordRequired", shown),
                         errorTexts.get("RemedyOfAccess"));
    }
    throw ConnectionLost(where, shown);
}

std::string shownMessage(std::string_view message) {
    std::string shown;
    for (std::size_t begin = 0; begin < message.size();) {
        auto const end = std::min(message.find('\n', begin), message.size());
        std::string line(message.substr(begin, end - begin));
        begin = end + 1;
        if (line.starts_with("LOCATION:") || line.find(".c:") != std::string::npos) {
            continue;
        }
        auto const code = codeIn(line);
        if (!code.empty()) {
            auto const at = static_cast<std::size_t>(code.data() - line.data());
            line.erase(at - 1, code.size() + 3);
        }
        shown += line + '\n';
    }
    return asClause(shown);
}

void throwStatementError(std::string const& where, PGresult const* result) {
    auto const code = codeOf(result);
    char const* const primary = PQresultErrorField(result, PG_DIAG_MESSAGE_PRIMARY);
    auto const message = asClause(primary != nullptr ? primary : PQresultErrorMessage(result));
    if (isPassing(code)) {
        throw ConnectionLost(where, message);
    }
    throwMeaning(where, code, message);
}

void refuseAfterFork(pid_t owner, std::string const& where) {
    if (::getpid() != owner) {
        throw StoreError(StoreError::Kind::Refused, where, 0, errorTexts.get("OpenedBeforeFork"),
                         errorTexts.get("RemedyOfFork"));
    }
}

std::string_view codeOf(PGresult const* result) {
    char const* const code = PQresultErrorField(result, PG_DIAG_SQLSTATE);
    return code != nullptr ? code : "";
}

} // namespace project::postgresql
