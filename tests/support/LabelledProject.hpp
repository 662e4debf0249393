#pragma once

#include <map>
#include <memory>
#include <string>
#include <tuple>
#include <utility>
#include <vector>

#include <gtest/gtest.h>

#include "files/FileManagerBase.hpp"
#include "labels/LabelManagerBase.hpp"
#include "project/files/FileLabel.hpp"
#include "project/files/LabelIDSet.hpp"
#include "project/labels/Label.hpp"
#include "project/metadata/MetadataNodeSpecification.hpp"
#include "support/RecordingMetadataManager.hpp"

namespace project::test {

/// A label on a file in a form to compare and print: the UUIDs of the category and the label, and the data.
using ShownLabel = std::tuple<std::u16string, std::u16string, std::u16string>;

inline std::vector<ShownLabel> shown(std::vector<management::FileLabel> const& labels) {
    std::vector<ShownLabel> result;
    for (auto const& label : labels) {
        result.emplace_back(label.getCategory().getUUID(), label.getUUID(), label.getData());
    }
    return result;
}

/// Succeeds if the first call took this guard as the outermost one, and all later calls were made under it.
inline ::testing::AssertionResult wasHeldThroughout(StoreCall::Guard guard,
                                                    std::vector<StoreCall> const& calls) {
    auto const taking = guard == StoreCall::Guard::Write ? "acquireWriteLock" : "acquireReadLock";
    if (calls.empty() || calls[0].operation != taking || calls[0].guard != StoreCall::Guard::None) {
        return ::testing::AssertionFailure() << "the first call was not an outermost " << taking;
    }
    for (std::size_t index = 1; index < calls.size(); ++index) {
        if (calls[index].guard != guard) {
            return ::testing::AssertionFailure()
                   << "call " << index << ", " << calls[index].operation << ", was not made under the guard";
        }
    }
    return ::testing::AssertionSuccess();
}

/// A project at /project over a recording store, with a connected file manager and label manager. None of its
/// files is on disk. The functions below are not recorded.
class LabelledProject : public ::testing::Test {
protected:
    using Guard = StoreCall::Guard;
    using CategoryDefinition = management::CategoryDefinition;
    using CategoryIdentifier = management::CategoryIdentifier;
    using Label = management::Label;
    using LabelDefinition = management::LabelDefinition;
    using LabelIdentifier = management::LabelIdentifier;
    using LabelReadOnlyState = management::LabelReadOnlyState;
    using MetadataNode = metadata::MetadataNode;
    using MetadataPath = metadata::MetadataPath;
    using Path = metadata::Path;

    LabelledProject() { files.setLabelManager(&labels); }

    /// Adds a file and the folders above it to the project.
    Path file(std::u16string const& relative) {
        auto const path = root / relative;
        for (auto address = at(path); address.depth() > 1; address = address.parent()) {
            if (!store->content().hasNode(address)) {
                store->put(address, {});
            }
        }
        return path;
    }

    MetadataPath at(Path const& path) const {
        return management::PathLocalizedFileMetadataManager(root, store, u"Root").toMetadataPath(path);
    }

    MetadataPath dataAt(Path const& path) const { return at(path).child({u"LabelData", u"Data"}); }

    static MetadataPath categoryAt(CategoryIdentifier const& category) {
        return address({{u"Categories", u"Root"}, {u"Category", category.getUUID()}});
    }

    static MetadataPath labelAt(CategoryIdentifier const& category, LabelIdentifier const& label) {
        return categoryAt(category).child({u"Label", label.getUUID()});
    }

    /// Stores a category and its labels.
    void define(CategoryIdentifier const& category, std::vector<LabelIdentifier> const& members) {
        store->put(categoryAt(category), {{u"Name", category.getName()},
                                          {u"ReadOnly", category.isReadOnly() ? u"1" : u"0"},
                                          {u"SingleValued", category.isSingleValued() ? u"1" : u"0"},
                                          {u"DataType", category.getDataType()}});
        for (auto const& label : members) {
            store->put(labelAt(category, label),
                       {{u"Name", label.getName()}, {u"ReadOnly", labelTypeToString(label.isReadOnly())}});
        }
    }

    /// A copy of the node at an address; an empty node without a type if the address has none.
    std::shared_ptr<MetadataNode> stored(MetadataPath const& path) {
        std::shared_ptr<MetadataNode> node = store->content().getNode(path);
        return node ? node : std::make_shared<metadata::MetadataNodeSpecification>();
    }

    void replace(MetadataPath const& path, std::shared_ptr<MetadataNode> node) {
        std::map<MetadataPath, std::shared_ptr<MetadataNode>> batch{{path, std::move(node)}};
        store->content().setNodes(batch);
    }

    /// Creates an address without a node.
    void createAddress(MetadataPath const& path) {
        std::vector<MetadataPath> paths{path};
        store->content().createPaths(paths);
    }

    void erase(MetadataPath const& path) {
        std::vector<MetadataPath> paths{path};
        store->content().removeNodes(paths);
    }

    /// Appends a nested node with these values to a node in memory.
    static MetadataNode& append(MetadataNode& node, std::u16string const& type,
                                std::map<std::u16string, std::u16string> const& values) {
        auto& child = *node.addChild(type);
        for (auto const& [key, value] : values) {
            child.put(key, value);
        }
        return child;
    }

    /// Appends a category with labels to the stored node of a file.
    void addLabelNodes(Path const& path, CategoryIdentifier const& category,
                       std::vector<LabelIdentifier> const& members) {
        auto const node = stored(at(path));
        auto& categoryNode = append(*node, u"Category", {{u"UUID", category.getUUID()}});
        for (auto const& label : members) {
            append(categoryNode, u"Label", {{u"UUID", label.getUUID()}});
        }
        replace(at(path), node);
    }

    /// Appends a data record for a label to a file's label data.
    void record(Path const& path, LabelIdentifier const& label, std::u16string const& value) {
        auto const node = store->content().hasNode(dataAt(path))
                              ? stored(dataAt(path))
                              : std::make_shared<metadata::MetadataNodeSpecification>(u"Info");
        append(*node, u"Record", {{u"UUID", label.getUUID()}, {u"Value", value}});
        replace(dataAt(path), node);
    }

    /// The values of the data records of a file.
    std::vector<std::u16string> records(Path const& path) {
        std::vector<std::u16string> result;
        auto const node = stored(dataAt(path));
        for (auto const& child : node->getChildren()) {
            result.push_back(child->get(u"Value"));
        }
        return result;
    }

    using LabelUUIDs = std::vector<std::pair<std::u16string, std::vector<std::u16string>>>;

    /// The stored UUIDs of a file's categories, each with those of its labels.
    LabelUUIDs labelUUIDs(Path const& path) {
        LabelUUIDs result;
        auto const node = stored(at(path));
        for (auto const& category : node->getChildren()) {
            auto& members = result.emplace_back(category->get(u"UUID"), std::vector<std::u16string>()).second;
            for (auto const& label : category->getChildren()) {
                members.push_back(label->get(u"UUID"));
            }
        }
        return result;
    }

    Path const root = u"/project";
    std::shared_ptr<RecordingMetadataManager> store = std::make_shared<RecordingMetadataManager>();
    management::FileManagerBase files{root, store};
    management::LabelManagerBase labels{store, &files};
};

} // namespace project::test
