#pragma once

#include <map>
#include <set>
#include <string>

#include "checks/Finding.hpp"
#include "cli/ShownPaths.hpp"
#include "project/metadata/MetadataManager.hpp"

namespace projectctl {

/// Compares the labels on files with the categories and labels of the project. A merge, or a label that
/// stands on a file twice and is deleted, leaves labels on files that nobody can resolve any more.
class LabelCheck {
public:
    /// Reads all categories and labels. The caller holds a read guard, and holds it while it checks.
    explicit LabelCheck(project::metadata::MetadataManager& store);

    /// What is wrong with the labels on one file. Cheap for a file without labels.
    /// @param path relative to the root. @param node of the file.
    void check(std::u16string_view path, project::metadata::MetadataNode const& node, ShownPaths& shown,
               Findings& findings) const;

private:
    /// A category as the store has it. One without a node exists for nobody who reads a file's labels.
    struct Category {
        std::u16string name;
        bool isSingleValued = false;
        std::map<std::u16string, std::u16string> labels; ///< their names by UUID
    };

    using Node = project::metadata::MetadataNode;

    /// How often each label stands on a file, by UUID.
    using Counts = std::map<std::u16string, std::size_t>;

    static std::map<std::u16string, Counts> labelsOn(Node const& node);
    void checkCategory(std::string const& file, std::u16string const& uuid, Counts const& labels,
                       Findings& findings) const;

    std::map<std::u16string, Category> categories_; ///< by UUID
};

} // namespace projectctl
