#include "journal/LookRows.hpp"

#include "journal/BodyPieces.hpp"
#include "project/stores/StoreError.hpp"
#include "texts/ErrorTexts.hpp"

namespace project::postgresql {

namespace {

using stores::JournalEntry;
using stores::StoreError;

constexpr int knownFormat = 1;

// A project without entries has one row, without a version. So a project that does not exist differs from it.
constexpr Statement lookSince{
    "look_since",
    "SELECT p.format, pg_backend_pid(), e.version, e.id::text, e.kind::text, e.sum, e.after,"
    " CASE WHEN e.version > $2::bigint THEN e.lines END, e.pieces"
    " FROM pm.project p LEFT JOIN pm.entry e ON e.project = p.project AND e.version >= $2::bigint"
    " WHERE p.project = $1::uuid ORDER BY e.version"};

constexpr Statement lookFromBody{
    "look_from_body",
    "SELECT p.format, pg_backend_pid(), e.version, e.id::text, e.kind::text, e.sum, e.after, e.lines, "
    "e.pieces"
    " FROM pm.project p LEFT JOIN pm.entry e ON e.project = p.project AND e.version >="
    " coalesce((SELECT max(version) FROM pm.entry WHERE project = $1::uuid AND kind = 'b'), 0)"
    " WHERE p.project = $1::uuid ORDER BY e.version"};

constexpr Statement newestPieces{
    "newest_pieces", "SELECT id::text, number, bytes FROM pm.piece WHERE project = $1::uuid AND id ="
                     " (SELECT id FROM pm.entry WHERE project = $1::uuid AND kind = 'b'"
                     " ORDER BY version DESC LIMIT 1) ORDER BY number"};

JournalEntry entryAt(Result const& rows, int row) {
    JournalEntry entry;
    entry.position = {static_cast<std::uint64_t>(rows.number(row, 2)), rows.text(row, 3), rows.text(row, 5)};
    entry.isBody = rows.bytes(row, 4) == "b";
    entry.after = rows.text(row, 6);
    entry.lines = rows.text(row, 7);
    return entry;
}

void requireKnownFormat(std::int64_t format, std::string const& where) {
    if (format > knownFormat) {
        throw StoreError(StoreError::Kind::Refused, where, 0,
                         errorTexts.get("LaterFormat", format, knownFormat),
                         errorTexts.get("RemedyOfLaterFormat"));
    }
}

} // namespace

LookRows::LookRows(std::string const& project, std::optional<std::uint64_t> seen) : project_(project) {
    if (seen) {
        seen_ = std::to_string(*seen);
    }
}

std::vector<Call> LookRows::calls() const {
    if (seen_) {
        return {{lookSince, {{project_}, {*seen_}}}};
    }
    return {{lookFromBody, {{project_}}}, {newestPieces, {{project_}}}};
}

std::optional<stores::JournalLook> LookRows::read(std::vector<Result> const& answers,
                                                  std::string const& where) const {
    auto const& rows = answers[0];
    if (rows.rows() == 0) {
        throwNoProject(where);
    }
    requireKnownFormat(rows.number(0, 0), where);
    stores::JournalLook look;
    if (rows.isNull(0, 2)) {
        return look;
    }
    for (int row = 0; row < rows.rows(); ++row) {
        look.entries.push_back(entryAt(rows, row));
    }
    if (!seen_ && look.entries.front().isBody) {
        auto const& pieces = answers[1];
        if (pieces.rows() > 0 && pieces.bytes(0, 0) != look.entries.front().position.id) {
            return std::nullopt;
        }
        look.body = readPieces(pieces, rows.number(0, 8));
    }
    return look;
}

std::int64_t LookRows::process(std::vector<Result> const& answers) {
    return answers[0].rows() > 0 ? answers[0].number(0, 1) : 0;
}

std::optional<std::string> readPieces(Result const& rows, std::int64_t count) {
    if (rows.rows() != count) {
        return std::nullopt;
    }
    std::string body;
    for (int row = 0; row < rows.rows(); ++row) {
        if (rows.number(row, 1) != row + 1 || !appendPiece(body, rows.bytes(row, 2))) {
            return std::nullopt;
        }
    }
    return body;
}

void throwNoProject(std::string const& where) {
    throw StoreError(StoreError::Kind::Refused, where, 0, errorTexts.get("ProjectMissing"),
                     errorTexts.get("RemedyOfMissingProject"));
}

} // namespace project::postgresql
