#pragma once

#include <cstddef>
#include <string>
#include <vector>

#include "project/core/FileManager.hpp"
#include "project/metadata/MetadataManager.hpp"

namespace projectctl {

/// Looks through the whole tree of a project for what the managers would stumble over or pass by in silence.
///
/// It reads the store and not the managers' lists, since those end at the first fault.
class TreeCheck {
public:
    struct Finding {
        bool isFault; ///< else it is only worth knowing
        std::string text;
    };

    TreeCheck(project::metadata::MetadataManager& store, project::management::FileManager& files);

    /// All that is found, under one read guard.
    std::vector<Finding> run();

private:
    using Address = project::metadata::MetadataPath;
    using Node = project::metadata::MetadataNode;

    void checkHead(Address const& head);
    void checkFiles(Address const& scope);
    void checkFile(Address const& file);
    void checkLabelsOn(Address const& file, Node const& node);
    void checkLabelOn(Address const& file, Node const& category, std::u16string const& labelUuid);
    void checkCategories(Address const& head);
    void checkLabels(Address const& category);
    void checkEntryPoints(Address const& head);
    void checkGroups(Address const& head);
    void checkReferences(Address const& head);
    bool requireNode(Address const& address, std::string const& what);
    void fault(std::string text);
    void note(std::string text);

    project::metadata::MetadataManager& store_;
    project::management::FileManager& files_;
    std::vector<Finding> findings_;
};

} // namespace projectctl
