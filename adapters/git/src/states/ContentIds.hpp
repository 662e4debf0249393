#pragma once

#include <optional>
#include <string>

#include <sys/stat.h>

#include "fl/filesystem/Path.hpp"
#include "repository/Repository.hpp"
#include "rules/ContentRules.hpp"
#include "states/EntryComparison.hpp"

namespace project::git {

/// The identity of a file or link on disk, as it would be staged.
/// @return false if it cannot be read, or if only git can convert its content.
bool hashOnDisk(git_oid& id, Repository const& repository, ContentRules& rules, TreePath const& path,
                struct stat const& found);

/// The contents of files, and the identities by which git knows them: equal contents have equal identities.
class ContentIds {
public:
    /// @param repository borrowed.
    explicit ContentIds(Repository const& repository)
        : repository_(repository), rules_(repository), comparison_(repository) {}

    /// Of a file or link on disk, as it would be staged; nothing if it cannot be read, or if only git can
    /// convert its content. A file that is staged as it is on disk is not read.
    std::optional<std::string> onDisk(fl::filesystem::Path const& file);

    /// The content that an identity is of; nothing if the repository does not have it.
    std::optional<std::string> readStored(std::string const& id) const;

    /// The content of a file on disk, as it would be staged; nothing if onDisk returns nothing for it, or if
    /// it is a link.
    std::optional<std::string> readOnDisk(fl::filesystem::Path const& file);

private:
    Repository const& repository_;
    ContentRules rules_;
    EntryComparison comparison_;
};

} // namespace project::git
