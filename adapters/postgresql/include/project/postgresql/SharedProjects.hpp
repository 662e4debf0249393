#pragma once

#include <memory>
#include <string>
#include <vector>

#include "project/postgresql/Export.hpp"
#include "project/postgresql/ServiceSettings.hpp"
#include "project/stores/SharedServer.hpp"

namespace project::postgresql {

using stores::SharedProject;

/// The projects in the database of a service.
class PROJECT_POSTGRESQL_EXPORT SharedProjects : public stores::SharedServer {
public:
    /// Remembers the settings. The first operation connects.
    explicit SharedProjects(ServiceSettings settings);

    std::vector<SharedProject> list() const override;

    /// With new roles, the owner needs CREATEROLE.
    void create(SharedProject const& project) const override;

    bool remove(std::string const& id) const override;

    std::vector<std::string> members(std::string const& role) const override;

    std::unique_ptr<stores::Journal> open(std::string const& id) const override;

private:
    ServiceSettings settings_;
};

} // namespace project::postgresql

/// Creates the server of a service for stores::connectTo, which finds this function by its name.
extern "C" PROJECT_POSTGRESQL_EXPORT project::stores::SharedServer*
project_make_shared_server(char const* service, char const* locale);
