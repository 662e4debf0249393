#pragma once

#include <cstddef>
#include <functional>
#include <map>
#include <utility>
#include <vector>

#include "fl/filesystem/Path.hpp"
#include "index/BlobWriter.hpp"
#include "index/IndexChanges.hpp"
#include "index/IndexUpdate.hpp"
#include "project/git/FileMove.hpp"
#include "repository/Repository.hpp"

namespace project::git {

/// Prepares the changes of one call to the index: all of them, or none.
class Staging {
public:
    /// Returns the open update of the index. It is called only if there is something to change.
    using OpenUpdate = std::function<IndexUpdate&()>;

    Staging(Repository& repository, OpenUpdate openUpdate)
        : repository_(repository), openUpdate_(std::move(openUpdate)) {}

    void add(std::vector<fl::filesystem::Path> const& files);
    void remove(std::vector<fl::filesystem::Path> const& files);
    void move(std::vector<FileMove> const& moves);

private:
    using Names = std::map<TreePath, bool>; // and whether the content is converted

    Names stageable(std::vector<fl::filesystem::Path> const& files) const;
    void stage(TreePath const& path, bool isConverted, BlobWriter& blobs, IndexChanges& changes) const;
    void removeReplaced(TreePath const& path, IndexChanges& changes) const;
    void removeBelow(TreePath const& folder, IndexChanges& changes) const;
    void moveEntry(std::size_t position, TreePath const& path, IndexChanges& changes) const;

    Repository& repository_;
    OpenUpdate openUpdate_;
};

} // namespace project::git
