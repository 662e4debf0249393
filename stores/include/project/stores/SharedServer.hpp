#pragma once

#include <memory>
#include <string>
#include <vector>

#include "project/stores/Export.hpp"
#include "project/stores/Journal.hpp"

namespace project::stores {

/// A project on a server, as its users see it.
struct SharedProject {
    std::string id;          ///< a UUID in lower case, 36 characters
    std::string name;        ///< for people
    int format = 0;          ///< of its log
    std::string reader;      ///< members of this role read the project
    std::string writer;      ///< members of this role write it
    bool isWritable = false; ///< whether the user may change it
};

/// A server with projects that teams share. An adapter implements it in a library of its own.
///
/// All operations connect, and throw StoreError as Journal does.
class PROJECT_STORES_EXPORT SharedServer {
public:
    virtual ~SharedServer() = default;

    /// The projects that the user may read, by name.
    virtual std::vector<SharedProject> list() const = 0;

    /// Adds a project without entries, and its two roles if they do not exist. Only the owner of the server's
    /// projects may do that.
    /// @param project id, name, reader and writer; the rest is ignored.
    /// @throws StoreError with the kind Refused if the project exists or a right is missing.
    virtual void create(SharedProject const& project) const = 0;

    /// Deletes a project with its entries. The roles stay.
    /// @return false if the project does not exist.
    /// @throws StoreError with the kind Refused if the user is not the owner.
    virtual bool remove(std::string const& id) const = 0;

    /// The users that have a role, themselves or through another one, by name; without those who have every
    /// role.
    virtual std::vector<std::string> members(std::string const& role) const = 0;

    /// The log of a project. Does not connect yet.
    /// @throws StoreError with the kind Refused if the id is not a UUID.
    virtual std::unique_ptr<Journal> open(std::string const& id) const = 0;
};

/// The kind of server that a service leads to if nothing else is said.
inline constexpr char const* usualServerKind = "postgresql";

/// The server of a service. The first call for a kind loads the adapter's library, `libproject_<kind>`, which
/// only applications with shared projects need; it is never unloaded. Does not connect.
/// Errors of the library are in the language that fl::i18n::MessageCatalog has at the time of this call.
/// @param kind of the server, in lower-case letters, for example "postgresql".
/// @param service the name of the service in the configuration of the adapter. A name and not an address: a
///        project's files may come from anybody, and must not decide to which machine a program connects.
/// @throws StoreError with the kind Refused if the library is not installed or the names are not valid.
PROJECT_STORES_EXPORT std::unique_ptr<SharedServer> connectTo(std::string const& kind,
                                                              std::string const& service);

/// The function of an adapter's library that creates its server: `project_make_shared_server`, with C
/// linkage.
/// @param locale for the errors of the library: a program that is linked to static libraries has a
///        fl::i18n::MessageCatalog of its own.
/// @return owned by the caller.
using MakeSharedServer = SharedServer* (*)(char const* service, char const* locale);

} // namespace project::stores
