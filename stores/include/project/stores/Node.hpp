#pragma once

#include <memory>
#include <string_view>
#include <utility>
#include <vector>

#include "project/metadata/MetadataNode.hpp"
#include "project/metadata/MetadataPath.hpp"
#include "project/stores/Export.hpp"

namespace project::stores {

/// The address of a node.
using Address = metadata::MetadataPath;

/// A stored node. It never changes once it is stored, and its users share it. Null where none is stored.
using Node = std::shared_ptr<metadata::MetadataNode const>;

/// The node of type "Info" without keys and children. Most nodes are equal to it, and all of them share this
/// one.
PROJECT_STORES_EXPORT Node const& plainNode();

/// One address directly below another.
struct Child {
    metadata::PathElement element; ///< the last step of its address
    Node node;                     ///< null if no node is stored there
    bool isCreated;   ///< there is no node, and the address exists even if nothing is stored below it
    bool hasChildren; ///< something is stored below it
};

/// The addresses directly below one address, sorted by element, each element once. Every child has a node, is
/// created, or has children.
using Children = std::vector<Child>;

/// A Child while it is passed on. What it refers to is valid during the call that receives it.
struct LoadedChild {
    std::u16string_view type;     ///< of the last step of its address
    std::u16string_view location; ///< of the last step of its address
    Node const& node;             ///< null if the address has none
    bool isCreated;               ///< whether createPaths created the address
    bool hasChildren;             ///< whether there is an address below it
};

/// Receives the children of one address, sorted by element, each element once.
class PROJECT_STORES_EXPORT ChildSink {
public:
    virtual ~ChildSink() = default;

    /// Receives one address. It is valid during the call.
    virtual void add(LoadedChild const& child) = 0;

protected:
    ChildSink() = default;
    ChildSink(ChildSink const&) = default;
    ChildSink& operator=(ChildSink const&) = default;
};

/// Collects children in a list.
class PROJECT_STORES_EXPORT ChildCollector : public ChildSink {
public:
    /// Keeps a copy of the address.
    void add(LoadedChild const& child) override;

    /// Returns the addresses that were received.
    Children take() noexcept { return std::move(children_); }

private:
    Children children_;
};

} // namespace project::stores
