#pragma once

#include <functional>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "Glob.hpp"
#include "project/session/Sync.hpp"
#include "project/stores/TreeMetadataManager.hpp"

namespace project::session {

using fl::filesystem::Path;

/// One rule, prepared for many files. Paths are relative to its folder.
class SyncPatterns {
public:
    explicit SyncPatterns(SyncRule const& rule);

    /// Whether a new file is added.
    bool covers(std::u16string_view file) const;

    /// Whether an exclude pattern matches a path or a folder above it.
    bool excludes(std::u16string_view path) const;

    bool usesGitIgnore() const noexcept { return usesGitIgnore_; }

private:
    std::vector<Glob> included_;
    std::vector<Glob> excluded_;
    bool usesGitIgnore_;
};

/// The rules of a project by their folders. Paths are relative to the root, which has the empty one.
class SyncRules {
public:
    /// A rule, and the path of a file relative to its folder.
    struct Decision {
        std::u16string_view folder;
        SyncPatterns const& patterns;
        std::u16string_view below;
    };

    explicit SyncRules(std::vector<SyncRule> const& rules, Path const& root);

    /// The folders of the rules that no other rule is above.
    std::vector<std::u16string> tops() const;

    /// Whether a folder or one below it has a rule.
    bool hasAtOrBelow(std::u16string_view folder) const;

    /// The nearest rule above a file or folder; its own does not count. Null if there is none.
    std::optional<Decision> decide(std::u16string_view path) const;

private:
    std::map<std::u16string, SyncPatterns, std::less<>> rules_;
};

/// Reads the rules of a project, by folder in the order of the store. Leaves out those of folders that no
/// project can contain: a text that another person wrote may name any. The caller holds a guard of the store.
std::vector<SyncRule> readSyncRules(metadata::MetadataManager& store, Path const& root);

/// The node of a rule.
std::shared_ptr<metadata::MetadataNode> nodeOf(SyncRule const& rule);

} // namespace project::session
