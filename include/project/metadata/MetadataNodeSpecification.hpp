#pragma once

#include <map>

#include "project/metadata/MetadataNode.hpp"

namespace project::metadata {

/// The one concrete node: what is built to be stored, and what the store gives back.
class PROJECT_METADATA_EXPORT MetadataNodeSpecification : public MetadataNode {
public:
    /// A node without type, keys and children.
    MetadataNodeSpecification() = default;

    explicit MetadataNodeSpecification(std::u16string type);

    /// A deep copy with type, keys and children.
    MetadataNodeSpecification(MetadataNode const& other);
    MetadataNodeSpecification(MetadataNodeSpecification const& other);
    MetadataNodeSpecification& operator=(MetadataNodeSpecification const&) = delete;

    std::u16string const& get(std::u16string const& key) const override;
    void put(std::u16string key, std::u16string value) override;
    std::vector<std::u16string> getKeys() const override;
    std::u16string const& getType() const override;
    std::vector<std::unique_ptr<MetadataNode>> const& getChildren() const override;
    MetadataNode* addChild(std::u16string type) override;
    void removeChild(MetadataNode* child) override;

private:
    std::map<std::u16string, std::u16string> values_;
    std::vector<std::unique_ptr<MetadataNode>> children_;
    std::u16string type_;
};

} // namespace project::metadata
