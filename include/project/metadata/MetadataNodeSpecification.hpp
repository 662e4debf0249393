#pragma once

#include <map>

#include "project/metadata/MetadataNode.hpp"

namespace project::metadata {

/// The concrete node: callers build it to store it, and the store returns it.
class PROJECT_METADATA_EXPORT MetadataNodeSpecification : public MetadataNode {
public:
    /// Creates a node without a type, keys and nested nodes.
    MetadataNodeSpecification() = default;

    explicit MetadataNodeSpecification(std::u16string type);

    /// Copies the type, the keys and the nested nodes of another node.
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
    friend PROJECT_METADATA_EXPORT bool isEqual(MetadataNode const& left, MetadataNode const& right);

    void copyChildren(MetadataNode const& other);

    std::map<std::u16string, std::u16string> values_;
    std::vector<std::unique_ptr<MetadataNode>> children_;
    std::u16string type_;
};

} // namespace project::metadata
