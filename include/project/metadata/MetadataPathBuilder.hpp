#pragma once

#include <string>

#include "project/metadata/MetadataPath.hpp"

namespace project::metadata {

/// An address under construction. It starts as the root; add steps, then build once.
class PROJECT_METADATA_EXPORT MetadataPathBuilder {
public:
    /// Appends one step.
    MetadataPathBuilder& add(std::u16string const& type, std::u16string const& location);

    /// Appends all steps of an address.
    MetadataPathBuilder& add(MetadataPath const& path);

    MetadataPath build() const;

private:
    MetadataPath path_ = MetadataPath::root();
};

} // namespace project::metadata
