#pragma once

#include <map>
#include <string>
#include <vector>

#include <project/session.hpp>

namespace review_linter {

using fl::filesystem::Path;

/// The label on the files that were reviewed. Its data on a file is the hash of the content at that time.
class ReviewLabel {
public:
    /// Finds the label in a project. Changes nothing if it does not exist yet: no file has it then.
    explicit ReviewLabel(project::session::Session& session);

    /// The hash with which a file was reviewed; empty if it was not.
    std::u16string hashOn(Path const& file) const;

    /// Puts the label with these hashes on the files, and creates it before if it does not exist. Files that
    /// have left the project are skipped. Call it in a transaction.
    void put(std::map<Path, std::u16string> const& hashes);

    /// Takes the label off the files. Files that have left the project are skipped.
    void remove(std::vector<Path> files);

private:
    void createIfNew();
    void writeHashes(std::map<Path, std::u16string> const& hashes);

    project::session::Session& session_;
    project::management::Label label_;
};

} // namespace review_linter
