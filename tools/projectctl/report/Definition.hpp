#pragma once

#include <functional>
#include <map>
#include <string>
#include <string_view>
#include <vector>

#include "output/Kind.hpp"
#include "project/LabelsOnFile.hpp"
#include "project/OpenProject.hpp"
#include "project/stores/Node.hpp"

namespace projectctl {

/// What the report shows of a project's definition, as it is stored: also the parts that the managers leave
/// out or fail on.
struct Definition {
    struct Entry {
        std::u16string path; ///< relative to the root
        Kind kind = Kind::File;
        LabelsOnFile labels;
    };

    struct Category {
        std::u16string name;
        bool isSingleValued = false;
        std::map<std::u16string, std::u16string> labels; ///< their names by UUID
    };

    struct EntryPoint {
        std::u16string path;
        std::u16string name;
        std::u16string type;
        std::u16string groupUUID;
        bool isVisible = true;

        friend bool operator==(EntryPoint const&, EntryPoint const&) = default;
    };

    struct Reference {
        std::u16string storedPath;
        std::u16string type;

        friend bool operator==(Reference const&, Reference const&) = default;
    };

    std::u16string name;
    std::u16string description;
    std::vector<Entry> entries;                    ///< in the order of `list`
    std::map<std::u16string, Category> categories; ///< by UUID, like the next four
    std::map<std::u16string, EntryPoint> entryPoints;
    std::map<std::u16string, std::u16string> groups; ///< their names
    std::map<std::u16string, Reference> references;
    std::map<std::u16string, Reference> projectPath;
};

/// Passes on the addresses directly below one address.
using ChildSource =
    std::function<void(project::metadata::MetadataPath const& address, project::stores::ChildSink& children)>;

/// Reads the definition from the tree that the source has.
Definition readDefinition(ChildSource const& source);

/// Reads the definition of an open project. The caller holds no guard.
Definition readDefinition(OpenProject& project);

/// Reads the definition in the bytes of a text.
/// @param file the name of the text in errors.
/// @throws StoreError if it is not a project's text; Failure if it is incomplete.
Definition readDefinition(std::string bytes, std::string const& file);

} // namespace projectctl
