#pragma once

#include <functional>
#include <map>
#include <optional>

#include "FileAttachments.hpp"
#include "Glob.hpp"
#include "fl/filesystem/Path.hpp"
#include "project/metadata/MetadataNodeSpecification.hpp"
#include "project/session/Query.hpp"
#include "project/session/ToolAccess.hpp"
#include "project/stores/TreeMetadataManager.hpp"

namespace project::session {

/// The conditions of a query on one file, prepared for many files. Only the conditions that are set cost
/// time.
class FileConditions {
public:
    /// Reads the entry points and the personal labels if the query asks for them. The caller holds a guard of
    /// the store until the last check.
    /// @param query must outlive this object.
    /// @param root of the project.
    FileConditions(Query const& query, stores::TreeMetadataManager& store,
                   stores::TreeMetadataManager& personal, fl::filesystem::Path const& root);

    /// Whether a file meets all of them, except that it is at or below one of the paths.
    bool hold(VisitedFile const& file) const;

private:
    bool holdForLabels(VisitedFile const& file) const;
    bool hasLabel(VisitedFile const& file, LabelChoice const* choice) const;

    Query const& query_;
    bool hasLabelConditions_;
    std::optional<Glob> glob_;
    EntryPointNames entryPoints_; ///< only if the query asks for them
    std::map<std::u16string, metadata::MetadataNodeSpecification, std::less<>>
        personal_; ///< the nodes with personal labels, by path relative to the root
};

} // namespace project::session
