#pragma once

#include <memory>
#include <string>
#include <vector>

#include "project/metadata/MetadataNode.hpp"

namespace project::metadata {

/// The concrete node: callers build it to store it, and the store returns it.
///
/// A node without keys and nested nodes, whose type is empty or that of most nodes, takes no memory beside
/// the object: a project has one for each file while it is added. A copy has the values of its original in
/// common with other copies; only values that were put since are its own.
class PROJECT_METADATA_EXPORT MetadataNodeSpecification : public MetadataNode {
public:
    /// Creates a node without a type, keys and nested nodes.
    MetadataNodeSpecification();

    /// A node of this type, without keys and nested nodes.
    explicit MetadataNodeSpecification(std::u16string type);

    /// Copies the type, the keys and the nested nodes of another node.
    MetadataNodeSpecification(MetadataNode const& other);
    /// A deep copy.
    MetadataNodeSpecification(MetadataNodeSpecification const& other);
    MetadataNodeSpecification& operator=(MetadataNodeSpecification const&) = delete;
    ~MetadataNodeSpecification() override;

    std::u16string const& get(std::u16string const& key) const override;
    void put(std::u16string key, std::u16string value) override;
    std::vector<std::u16string> getKeys() const override;
    std::u16string const& getType() const override;
    std::vector<std::unique_ptr<MetadataNode>> const& getChildren() const override;
    MetadataNode* addChild(std::u16string type) override;
    void removeChild(MetadataNode* child) override;

    /// Lets copies of this node share its values and those of its nested nodes. For a node that is copied
    /// more than once: otherwise, each copy copies the values that were put into this node. References to
    /// values become invalid.
    void shareValues();

private:
    friend PROJECT_METADATA_EXPORT bool isEqual(MetadataNode const& left, MetadataNode const& right);

    struct Content;

    void copyValues(MetadataNode const& other);
    bool hasEqualValues(MetadataNodeSpecification const& other) const;
    Content& makeContent();
    void setType(std::u16string type);

    std::unique_ptr<Content> content_; ///< null as long as there is nothing to store in it
    std::u16string const* type_;       ///< in the content, or one of the constants
};

} // namespace project::metadata
