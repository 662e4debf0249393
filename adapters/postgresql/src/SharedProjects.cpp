#include "project/postgresql/SharedProjects.hpp"

#include <utility>

#include "fl/i18n/MessageCatalog.hpp"
#include "journal/ProjectId.hpp"
#include "journal/ServerSession.hpp"
#include "project/postgresql/PostgresJournal.hpp"

namespace project::postgresql {

namespace {

constexpr Statement listProjects{
    "", "SELECT project::text, name, format, reader::text, writer::text,"
        " coalesce(pg_has_role(to_regrole(quote_ident(writer))::oid, 'USAGE'), false)"
        " FROM pm.project ORDER BY name, project"};

constexpr Statement membersOfRole{"",
                                  "SELECT rolname::text FROM pg_roles WHERE rolcanlogin AND NOT rolsuper"
                                  " AND coalesce(pg_has_role(oid, to_regrole(quote_ident($1::text))::oid, "
                                  "'USAGE'), false) ORDER BY rolname"};

constexpr Statement isRole{"", "SELECT FROM pg_roles WHERE rolname = $1::name"};

constexpr Statement insertProject{"", "INSERT INTO pm.project (project, name, reader, writer)"
                                      " VALUES ($1::uuid, $2::text, $3::name, $4::name)"};

constexpr Statement insertBarrier{"", "INSERT INTO pm.barrier (project) VALUES ($1::uuid)"};

constexpr Statement deleteProject{"", "DELETE FROM pm.project WHERE project = $1::uuid"};
constexpr Statement deleteAllEntries{"", "DELETE FROM pm.entry WHERE project = $1::uuid"};
constexpr Statement deleteAllPieces{"", "DELETE FROM pm.piece WHERE project = $1::uuid"};
constexpr Statement deleteBarrier{"", "DELETE FROM pm.barrier WHERE project = $1::uuid"};

/// A connection for one operation.
class OneSession {
public:
    explicit OneSession(ServiceSettings const& settings)
        : session_(settings, ConnectOptions::nameOf(settings.service)), deadline_(session_.deadline()) {
        session_.connect(deadline_);
    }

    std::vector<Result> run(std::vector<Call> const& calls) { return session_.run(calls, deadline_); }

    bool hasRole(std::string const& name) { return run({{isRole, {{name}}}}).front().rows() > 0; }

    std::string quoted(std::string const& identifier) const {
        return session_.connection().quoted(identifier);
    }

    std::string const& where() const { return session_.where(); }

private:
    ServerSession session_;
    Deadline deadline_;
};

} // namespace

SharedProjects::SharedProjects(ServiceSettings settings) : settings_(std::move(settings)) {
}

std::vector<SharedProject> SharedProjects::list() const {
    OneSession session(settings_);
    auto const answers = session.run({{listProjects, {}}});
    auto const& rows = answers.front();
    std::vector<SharedProject> projects;
    projects.reserve(static_cast<std::size_t>(rows.rows()));
    for (int row = 0; row < rows.rows(); ++row) {
        projects.push_back({rows.text(row, 0), rows.text(row, 1), static_cast<int>(rows.number(row, 2)),
                            rows.text(row, 3), rows.text(row, 4), rows.number(row, 5) != 0});
    }
    return projects;
}

void SharedProjects::create(SharedProject const& project) const {
    OneSession session(settings_);
    requireUuid(project.id, session.where());
    auto const reader = session.quoted(project.reader);
    auto const writer = session.quoted(project.writer);
    auto const createReader = "CREATE ROLE " + reader + " NOLOGIN IN ROLE pm_reader";
    auto const createWriter = "CREATE ROLE " + writer + " NOLOGIN IN ROLE pm_writer, " + reader;
    std::vector<Call> calls;
    if (!session.hasRole(project.reader)) {
        calls.push_back({{"", createReader.c_str()}, {}});
    }
    if (!session.hasRole(project.writer)) {
        calls.push_back({{"", createWriter.c_str()}, {}});
    }
    calls.push_back({insertProject, {{project.id}, {project.name}, {project.reader}, {project.writer}}});
    calls.push_back({insertBarrier, {{project.id}}});
    session.run(calls);
}

bool SharedProjects::remove(std::string const& id) const {
    OneSession session(settings_);
    requireUuid(id, session.where());
    auto const answers = session.run({{deleteProject, {{id}}},
                                      {deleteAllEntries, {{id}}},
                                      {deleteAllPieces, {{id}}},
                                      {deleteBarrier, {{id}}}});
    return answers.front().affected() > 0;
}

std::vector<std::string> SharedProjects::members(std::string const& role) const {
    OneSession session(settings_);
    auto const answers = session.run({{membersOfRole, {{role}}}});
    std::vector<std::string> names;
    names.reserve(static_cast<std::size_t>(answers.front().rows()));
    for (int row = 0; row < answers.front().rows(); ++row) {
        names.push_back(answers.front().text(row, 0));
    }
    return names;
}

std::unique_ptr<stores::Journal> SharedProjects::open(std::string const& id) const {
    return std::make_unique<PostgresJournal>(settings_, id);
}

} // namespace project::postgresql

project::stores::SharedServer* project_make_shared_server(char const* service, char const* locale) {
    fl::i18n::MessageCatalog::setGlobalLocale(locale);
    project::postgresql::ServiceSettings settings;
    settings.service = service;
    return new project::postgresql::SharedProjects(std::move(settings)); // owned by the caller
}
