#pragma once

#include <map>
#include <set>
#include <string>

#include "checks/CheckedFile.hpp"
#include "checks/Finding.hpp"
#include "cli/ShownPaths.hpp"
#include "project/metadata/MetadataManager.hpp"

namespace projectctl {

/// Compares the labels on files with the categories and labels of the project. After a merge, or after the
/// deletion of a label that a file has twice, files can have labels that do not exist.
class LabelCheck {
public:
    /// Reads all categories and labels. The caller holds a read guard, and holds it while it checks.
    explicit LabelCheck(project::metadata::MetadataManager& store);

    /// Adds the faults of the labels on one file to the findings. Cheap for a file without labels.
    /// @param node of the file.
    void check(CheckedFile const& subject, project::metadata::MetadataNode const& node, ShownPaths& shown,
               Findings& findings) const;

private:
    /// A category in the store. A category without a node is left out: it does not exist for readers of a
    /// file's labels.
    struct Category {
        std::u16string name;
        bool isSingleValued = false;
        std::map<std::u16string, std::u16string> labels; ///< their names by UUID
    };

    using Node = project::metadata::MetadataNode;

    /// The number of times that a file has each label, by UUID.
    using Counts = std::map<std::u16string, std::size_t>;

    static std::map<std::u16string, Counts> labelsOn(Node const& node);
    void checkCategory(std::u16string const& file, std::u16string const& uuid, Counts const& labels,
                       Findings& findings) const;

    std::map<std::u16string, Category> categories_; ///< by UUID
};

} // namespace projectctl
