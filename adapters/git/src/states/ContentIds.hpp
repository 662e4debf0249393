#pragma once

#include <optional>
#include <string>

#include <sys/stat.h>

#include "fl/filesystem/Path.hpp"
#include "repository/Repository.hpp"
#include "rules/ContentRules.hpp"

namespace project::git {

/// The identity of a file or link on disk, as it would be staged.
/// @return false if it cannot be read, or if only git can convert its content.
bool hashOnDisk(git_oid& id, Repository const& repository, ContentRules& rules, TreePath const& path,
                struct stat const& found);

/// The identities by which git knows the contents of files: equal contents have equal identities.
class ContentIds {
public:
    /// @param repository borrowed.
    explicit ContentIds(Repository& repository) : repository_(repository), rules_(repository) {}

    /// Of the staged content of a file or link, otherwise of that in the last commit; nothing if there is
    /// none.
    std::optional<std::string> stored(fl::filesystem::Path const& file);

    /// Of a file or link on disk, as it would be staged; nothing if it cannot be read, or if only git can
    /// convert its content.
    std::optional<std::string> onDisk(fl::filesystem::Path const& file);

private:
    Repository& repository_;
    ContentRules rules_;
};

} // namespace project::git
