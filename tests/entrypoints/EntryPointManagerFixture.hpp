#pragma once

#include <map>
#include <memory>
#include <set>
#include <string>
#include <utility>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "entrypoints/EntryPointManagerBase.hpp"
#include "files/FileManagerBase.hpp"
#include "project/entrypoints/EntryPoint.hpp"
#include "support/ErrorMatchers.hpp"
#include "support/RecordingMetadataManager.hpp"

namespace project::test {

using Guard = StoreCall::Guard;

inline metadata::MetadataPath const ENTRY_POINTS = address({{u"EntryPoints", u"Root"}});
inline metadata::MetadataPath const GROUPS = address({{u"EntryPointGroups", u"Root"}});

inline metadata::MetadataPath entryPointAt(std::u16string const& uuid) {
    return ENTRY_POINTS.child({u"EntryPoint", uuid});
}

inline metadata::MetadataPath groupAt(std::u16string const& uuid) {
    return GROUPS.child({u"EntryPointGroup", uuid});
}

/// An entry point manager over a file list and a recording store, in the project "/project".
class EntryPointManagerFixture : public testing::Test {
protected:
    using Path = metadata::Path;

    EntryPointManagerFixture() { store->clear(); }

    /// Adds a file to the project without access to the disk. The call is not recorded.
    Path projectFile(std::u16string const& relative) {
        auto const file = root / relative;
        auto const place =
            management::PathLocalizedFileMetadataManager(root, store, u"Root").toMetadataPath(file);
        store->put(place, {});
        return file;
    }

    /// Stores an entry point, as another program would.
    void putEntryPoint(std::u16string const& uuid, std::u16string const& file,
                       std::map<std::u16string, std::u16string> values = {}) {
        values.emplace(u"File", file);
        values.emplace(u"Name", u"some name");
        values.emplace(u"Type", u"Basic");
        store->put(entryPointAt(uuid), values);
    }

    void putGroup(std::u16string const& uuid, std::u16string const& name) {
        store->put(groupAt(uuid), {{u"Name", name}});
    }

    /// The value of a key in the store.
    std::u16string stored(metadata::MetadataPath const& path, std::u16string const& key) {
        auto const node = store->content().getNode(path);
        return node ? node->get(key) : u"no node";
    }

    std::vector<std::u16string> storedKeys(metadata::MetadataPath const& path) {
        auto const node = store->content().getNode(path);
        return node ? node->getKeys() : std::vector<std::u16string>{u"no node"};
    }

    /// The locations directly below an address of the store.
    std::vector<std::u16string> locationsBelow(metadata::MetadataPath const& path) {
        std::vector<std::u16string> result;
        for (auto const& child : store->content().getChildNodes(path)) {
            result.push_back(child.getLeaf().getLocation());
        }
        return result;
    }

    /// Name and UUID of each group, in the order listed.
    std::vector<std::pair<std::u16string, std::u16string>> listedGroups() {
        std::vector<std::pair<std::u16string, std::u16string>> result;
        for (auto const& group : entryPoints.getEntryPointGroups()) {
            result.emplace_back(group->getName(), group->getUUID());
        }
        return result;
    }

    std::vector<std::u16string> listedUUIDs() {
        std::vector<std::u16string> result;
        for (auto const& entryPoint : entryPoints.getEntryPoints()) {
            result.push_back(entryPoint->getUUID());
        }
        return result;
    }

    /// Runs an operation and returns the guards that were held during its calls of the store, without the
    /// calls that acquire a guard.
    template <class Operation>
    std::set<Guard> guardsHeldBy(Operation const& operation) {
        store->clear();
        operation();
        std::set<Guard> result;
        for (auto const& call : store->calls()) {
            if (!call.operation.starts_with("acquire")) {
                result.insert(call.guard);
            }
        }
        return result;
    }

    Path const root = u"/project";
    std::shared_ptr<RecordingMetadataManager> store = std::make_shared<RecordingMetadataManager>();
    management::FileManagerBase files{root, store};
    management::EntryPointManagerBase entryPoints{store, &files, root};
};

} // namespace project::test
