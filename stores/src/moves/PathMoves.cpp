#include "project/stores/PathMoves.hpp"

#include <memory>
#include <utility>
#include <vector>

#include "project/metadata/MetadataNodeSpecification.hpp"
#include "project/metadata/TreeSchema.hpp"

namespace project::stores {

namespace {

namespace schema = metadata::schema;

bool isFileStep(metadata::PathElement const& step) {
    return step.getType() == schema::files::fileType;
}

/// The path that the leading steps of an address in a scope spell. Empty if they spell none.
std::u16string pathIn(Address const& address, std::size_t end) {
    std::u16string path;
    for (std::size_t step = 1; step < end; ++step) {
        auto const& name = address[step].getLocation();
        if (name.empty() || name.find(u'/') != std::u16string::npos) {
            return {};
        }
        path += path.empty() ? u"" : u"/";
        path += name;
    }
    return path;
}

void appendSteps(std::vector<metadata::PathElement>& steps, std::u16string_view path) {
    while (!path.empty()) {
        auto const end = std::min(path.find(u'/'), path.size());
        steps.emplace_back(schema::files::fileType, std::u16string(path.substr(0, end)));
        path.remove_prefix(std::min(end + 1, path.size()));
    }
}

Node withValue(Node const& node, char16_t const* key, std::u16string value) {
    auto changed = std::make_shared<metadata::MetadataNodeSpecification>(*node);
    changed->put(key, std::move(value));
    return changed;
}

bool isReference(Address const& address) {
    auto const& head = address[0].getType();
    return head == schema::references::projectPathType || head == schema::references::referencesType;
}

} // namespace

void PathMoves::add(std::u16string from, std::u16string to, bool isTree) {
    entries_.insert_or_assign(std::move(from), Target{std::move(to), isTree});
}

void PathMoves::remove(std::u16string_view from) {
    auto const found = entries_.find(from);
    if (found != entries_.end()) {
        entries_.erase(found);
    }
}

std::optional<std::u16string> PathMoves::moved(std::u16string_view path) const {
    for (auto prefix = path; !prefix.empty();) {
        auto const found = entries_.find(prefix);
        bool const isOwn = prefix.size() == path.size();
        if (found != entries_.end() && (isOwn || found->second.isTree)) {
            auto to = found->second.path;
            to += path.substr(prefix.size());
            return to == path ? std::nullopt : std::optional(std::move(to));
        }
        auto const slash = prefix.rfind(u'/');
        prefix = prefix.substr(0, slash == prefix.npos ? 0 : slash);
    }
    return std::nullopt;
}

std::optional<Address> PathMoves::moved(Address const& address) const {
    if (address.depth() < 2 || address[0].getType() != schema::files::filesType) {
        return std::nullopt;
    }
    std::size_t end = 1;
    while (end < address.depth() && isFileStep(address[end])) {
        ++end;
    }
    auto const to = moved(pathIn(address, end));
    if (!to) {
        return std::nullopt;
    }
    std::vector<metadata::PathElement> steps{address[0]};
    appendSteps(steps, *to);
    for (std::size_t step = end; step < address.depth(); ++step) {
        steps.push_back(address[step]);
    }
    return Address(std::move(steps));
}

Node PathMoves::moved(Address const& address, Node const& node, std::u16string_view root) const {
    if (!node || address.depth() != 2) {
        return node;
    }
    if (address[0].getType() == schema::entrypoints::entryPointsType) {
        auto to = moved(node->get(schema::entrypoints::fileKey));
        return to ? withValue(node, schema::entrypoints::fileKey, *std::move(to)) : node;
    }
    if (!isReference(address)) {
        return node;
    }
    constexpr auto const* key = schema::references::storedPathKey;
    auto const stored = node->get(key);
    if (node->get(schema::references::typeKey) == schema::references::relative) {
        auto to = moved(stored);
        return to ? withValue(node, key, *std::move(to)) : node;
    }
    bool const isBelowRoot = !root.empty() && stored.size() > root.size() + 1 && stored.starts_with(root) &&
                             stored[root.size()] == u'/';
    auto const to = isBelowRoot ? moved(std::u16string_view(stored).substr(root.size() + 1)) : std::nullopt;
    return to ? withValue(node, key, std::u16string(root) + u'/' + *to) : node;
}

PathMoves PathMoves::reversed() const {
    PathMoves result;
    for (auto const& [from, target] : entries_) {
        result.add(target.path, from, target.isTree);
    }
    return result;
}

} // namespace project::stores
