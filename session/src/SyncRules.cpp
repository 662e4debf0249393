#include "SyncRules.hpp"

#include <algorithm>
#include <iterator>
#include <memory>
#include <optional>
#include <utility>

#include "project/metadata/MetadataFunctions.hpp"
#include "project/metadata/MetadataNodeSpecification.hpp"
#include "project/metadata/TreeSchema.hpp"
#include "project/session/DiskFolder.hpp"

namespace project::session {

namespace schema = metadata::schema;

using metadata::MetadataNode;
using metadata::MetadataPath;
using metadata::PathElement;

namespace {

std::vector<Glob> globsOf(std::set<std::u16string> const& patterns) {
    return {patterns.begin(), patterns.end()};
}

/// The path of the folder above; empty for one directly below the root.
std::u16string_view folderOf(std::u16string_view path) {
    auto const end = path.rfind(u'/');
    return path.substr(0, end == std::u16string_view::npos ? 0 : end);
}

std::set<std::u16string> patternsOf(MetadataNode const& node, char16_t const* type) {
    std::set<std::u16string> result;
    for (auto const& child : node.getChildren()) {
        if (child->getType() == type) {
            result.insert(child->get(schema::sync::patternKey));
        }
    }
    return result;
}

SyncRule ruleOf(Path folder, MetadataNode const& node) {
    return {std::move(folder), patternsOf(node, schema::sync::includeType),
            patternsOf(node, schema::sync::excludeType),
            node.get(schema::sync::gitIgnoreKey) != schema::sync::gitIgnoreOff};
}

void addPatterns(MetadataNode& node, std::set<std::u16string> const& patterns, char16_t const* type) {
    for (auto const& pattern : patterns) {
        node.addChild(type)->put(schema::sync::patternKey, pattern);
    }
}

} // namespace

SyncPatterns::SyncPatterns(SyncRule const& rule)
    : included_(globsOf(rule.included)),
      excluded_(globsOf(rule.excluded)),
      usesGitIgnore_(rule.usesGitIgnore) {
}

bool SyncPatterns::covers(std::u16string_view file) const {
    auto const matches = [file](Glob const& glob) { return glob.isMatch(file); };
    return (included_.empty() || std::ranges::any_of(included_, matches)) && !excludes(file);
}

bool SyncPatterns::excludes(std::u16string_view path) const {
    for (std::size_t end = 0; end < path.size() && !excluded_.empty(); ++end) {
        end = std::min(path.find(u'/', end), path.size());
        auto const matches = [&](Glob const& glob) { return glob.isMatch(path.substr(0, end)); };
        if (std::ranges::any_of(excluded_, matches)) {
            return true;
        }
    }
    return false;
}

SyncRules::SyncRules(std::vector<SyncRule> const& rules, Path const& root) {
    for (auto const& rule : rules) {
        rules_.emplace(metadata::getRelativePath(root, rule.folder), SyncPatterns(rule));
    }
}

std::vector<std::u16string> SyncRules::tops() const {
    std::vector<std::u16string> result;
    for (auto const& [folder, patterns] : rules_) {
        if (!decide(folder)) {
            result.push_back(folder);
        }
    }
    return result;
}

bool SyncRules::hasAtOrBelow(std::u16string_view folder) const {
    if (folder.empty() || rules_.contains(folder)) {
        return !rules_.empty();
    }
    std::u16string const below = std::u16string(folder) + u'/';
    auto const next = rules_.lower_bound(below);
    return next != rules_.end() && next->first.starts_with(below);
}

std::optional<SyncRules::Decision> SyncRules::decide(std::u16string_view path) const {
    for (auto folder = path; !folder.empty();) {
        folder = folderOf(folder);
        auto const rule = rules_.find(folder);
        if (rule != rules_.end()) {
            return Decision{rule->first, rule->second, path.substr(folder.empty() ? 0 : folder.size() + 1)};
        }
    }
    return std::nullopt;
}

std::vector<SyncRule> readSyncRules(metadata::MetadataManager& store, Path const& root) {
    std::vector<SyncRule> result;
    // Not recursive: a text from another source may contain a tree of any depth.
    std::vector<std::pair<MetadataPath, Path>> waiting;
    waiting.emplace_back(
        MetadataPath::root().child(PathElement(schema::files::filesType, schema::sync::rulesScope)), root);
    while (!waiting.empty()) {
        auto const [address, folder] = std::move(waiting.back());
        waiting.pop_back();
        if (auto const node = store.getNode(address)) {
            result.push_back(ruleOf(folder, *node));
        }
        auto const children = store.getChildNodes(address);
        for (auto child = children.rbegin(); child != children.rend(); ++child) {
            auto const& name = child->leaf().getLocation();
            bool const isPossible = canBeInProject(name) && !metadata::leadsUpward(root, folder / Path(name));
            if (isPossible && child->leaf().getType() == schema::files::fileType) {
                waiting.emplace_back(*child, folder / Path(name));
            }
        }
    }
    return result;
}

std::shared_ptr<MetadataNode> nodeOf(SyncRule const& rule) {
    auto result = std::make_shared<metadata::MetadataNodeSpecification>(schema::nodeType);
    if (!rule.usesGitIgnore) {
        result->put(schema::sync::gitIgnoreKey, schema::sync::gitIgnoreOff);
    }
    addPatterns(*result, rule.excluded, schema::sync::excludeType);
    addPatterns(*result, rule.included, schema::sync::includeType);
    return result;
}

} // namespace project::session
