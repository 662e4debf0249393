#pragma once

#include <string>
#include <vector>

#include "project/postgresql/Export.hpp"
#include "project/postgresql/ServiceSettings.hpp"

namespace project::postgresql {

/// A project in a database, as its users see it.
struct SharedProject {
    std::string id; ///< a UUID in lower case
    std::string name;
    int format = 0;
    std::string reader; ///< members of this role read the project
    std::string writer; ///< members of this role write it
    bool isWritable = false;
};

/// The projects in the database of a service.
///
/// All operations connect, and throw StoreError as Journal does.
class PROJECT_POSTGRESQL_EXPORT SharedProjects {
public:
    explicit SharedProjects(ServiceSettings settings);

    /// The projects that the user may read, by name.
    std::vector<SharedProject> list() const;

    /// Adds a project without entries, and its two roles if they do not exist. Only the owner of the
    /// database's projects may do that; with new roles, the owner needs CREATEROLE.
    /// @param project id, name, reader and writer; the rest is ignored.
    /// @throws StoreError with the kind Refused if the project exists or a right is missing.
    void create(SharedProject const& project) const;

    /// Deletes a project with its entries. The roles stay.
    /// @return false if there is no such project.
    /// @throws StoreError with the kind Refused if the user is not the owner.
    bool remove(std::string const& id) const;

private:
    ServiceSettings settings_;
};

} // namespace project::postgresql
