#include "project/metadata/MetadataNodeSpecification.hpp"

#include <algorithm>
#include <typeinfo>
#include <utility>

namespace project::metadata {

MetadataNodeSpecification::MetadataNodeSpecification(std::u16string type) : type_(std::move(type)) {
}

MetadataNodeSpecification::MetadataNodeSpecification(MetadataNode const& other) : type_(other.getType()) {
    if (typeid(other) == typeid(MetadataNodeSpecification)) {
        values_ = static_cast<MetadataNodeSpecification const&>(other).values_; // much faster than key by key
    } else {
        for (auto& key : other.getKeys()) {
            values_.emplace_hint(values_.end(), key, other.get(key));
        }
    }
    copyChildren(other);
}

MetadataNodeSpecification::MetadataNodeSpecification(MetadataNodeSpecification const& other)
    : values_(other.values_), type_(other.type_) {
    copyChildren(other);
}

void MetadataNodeSpecification::copyChildren(MetadataNode const& other) {
    auto const& children = other.getChildren();
    children_.reserve(children.size());
    for (auto const& child : children) {
        children_.push_back(std::make_unique<MetadataNodeSpecification>(*child));
    }
}

std::u16string const& MetadataNodeSpecification::get(std::u16string const& key) const {
    static std::u16string const absent;
    auto const found = values_.find(key);
    return found == values_.end() ? absent : found->second;
}

void MetadataNodeSpecification::put(std::u16string key, std::u16string value) {
    values_.insert_or_assign(std::move(key), std::move(value));
}

std::vector<std::u16string> MetadataNodeSpecification::getKeys() const {
    std::vector<std::u16string> keys;
    keys.reserve(values_.size());
    for (auto const& [key, value] : values_) {
        keys.push_back(key);
    }
    return keys;
}

std::u16string const& MetadataNodeSpecification::getType() const {
    return type_;
}

std::vector<std::unique_ptr<MetadataNode>> const& MetadataNodeSpecification::getChildren() const {
    return children_;
}

MetadataNode* MetadataNodeSpecification::addChild(std::u16string type) {
    return children_.emplace_back(std::make_unique<MetadataNodeSpecification>(std::move(type))).get();
}

void MetadataNodeSpecification::removeChild(MetadataNode* child) {
    auto const found = std::find_if(children_.begin(), children_.end(),
                                    [child](auto const& candidate) { return candidate.get() == child; });
    if (found != children_.end()) {
        children_.erase(found);
    }
}

} // namespace project::metadata
