#pragma once

#include <map>
#include <set>
#include <string>
#include <vector>

#include "Pairing.hpp"
#include "fl/filesystem/Path.hpp"
#include "project/git/GitAdapter.hpp"
#include "project/session/Query.hpp"
#include "project/session/Renames.hpp"
#include "project/stores/TreeMetadataManager.hpp"

namespace project::session {

using fl::filesystem::Path;

/// Pairs the files of the project that are missing on disk with files that are not in the project, as
/// Session::findRenames describes. The caller holds a guard of the store.
class RenameSearch {
public:
    /// @param store, root, git borrowed.
    /// @param writer the file whose last commit the contents are taken from, or a folder.
    RenameSearch(stores::TreeMetadataManager& store, Path const& root, git::GitAdapter& git, Path writer);

    RenamesFound run(RenameOptions const& options);

private:
    using Contents = std::map<Path, std::string>;

    void compareWithDisk();
    std::vector<FoundFile> withoutIgnored(std::vector<FoundFile> found);
    void takeGone(std::vector<FoundFile> const& gone);
    void pairByContents(int similarity);
    void pairSimilar(PairedFiles const& rest, int similarity);
    void pairByNames();
    void add(RenamesFound found);
    std::vector<FileContentId> idsOf(Contents const& contents, std::set<std::string> const& empty) const;
    std::set<std::string> emptyOf(Contents const& onDisk) const;
    std::u16string relative(Path const& path) const;

    stores::TreeMetadataManager& store_;
    Path const& root_;
    git::GitAdapter& git_;
    Path writer_;
    bool usesGit_ = true;
    std::vector<Path> goneFiles_;
    std::vector<std::u16string> goneFolders_; ///< a folder before its contents
    std::vector<Path> added_;
    Contents before_; ///< of the files that are gone
    RenamesFound result_;
};

} // namespace project::session
