#pragma once

#include <map>
#include <memory>
#include <string>

#include "project/FileList.hpp"
#include "project/OpenProject.hpp"

namespace projectctl {

/// The data that labels have on files. The managers read these records and have no operation that writes
/// them.
class LabelData {
public:
    /// @param project borrowed. A guard of its store is open as long as this object is used.
    explicit LabelData(OpenProject& project) : project_(project), files_(project) {}

    /// The data of a label on a file; empty if it has none.
    std::u16string of(Path const& file, std::u16string const& labelUUID) const;

    /// Changes the data of a label on a file.
    void set(Path const& file, std::u16string const& labelUUID, std::u16string const& data);

    /// Writes all changes in one batch; nothing if there are none.
    void write();

private:
    using Node = std::shared_ptr<project::metadata::MetadataNode>;

    project::metadata::MetadataPath addressOf(Path const& file) const;
    Node nodeOf(project::metadata::MetadataPath const& address) const;

    OpenProject& project_;
    FileList files_;
    std::map<project::metadata::MetadataPath, Node> changed_;
};

} // namespace projectctl
