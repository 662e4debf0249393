#pragma once

#include <string>

#include "project/metadata/MetadataPath.hpp"

namespace project::metadata {

/// Builds an address step by step. A new builder has the root's address.
class PROJECT_METADATA_EXPORT MetadataPathBuilder {
public:
    /// Appends one step.
    MetadataPathBuilder& add(std::u16string const& type, std::u16string const& location);

    /// Appends all steps of an address.
    MetadataPathBuilder& add(MetadataPath const& path);

    /// Returns the address of the steps that were added so far.
    MetadataPath build() const;

private:
    MetadataPath path_ = MetadataPath::root();
};

} // namespace project::metadata
