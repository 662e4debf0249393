#pragma once

#include <map>
#include <vector>

#include "fl/filesystem/Path.hpp"
#include "index/BlobWriter.hpp"
#include "index/IndexChanges.hpp"
#include "repository/Repository.hpp"

namespace project::git {

/// Applies the changes of one call to the index: all of them, or none.
class Staging {
public:
    explicit Staging(Repository& repository) : repository_(repository) {}

    void add(std::vector<fl::filesystem::Path> const& files);
    void remove(std::vector<fl::filesystem::Path> const& files);

private:
    using Names = std::map<TreePath, bool>; // and whether the content is converted

    Names stageable(std::vector<fl::filesystem::Path> const& files) const;
    void stage(TreePath const& path, bool isConverted, BlobWriter& blobs, IndexChanges& changes) const;
    void removeReplaced(TreePath const& path, IndexChanges& changes) const;
    void removeBelow(TreePath const& folder, IndexChanges& changes) const;

    Repository& repository_;
};

} // namespace project::git
