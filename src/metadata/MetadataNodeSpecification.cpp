#include "project/metadata/MetadataNodeSpecification.hpp"

#include <algorithm>
#include <iterator>
#include <map>
#include <typeinfo>
#include <utility>

#include "project/metadata/TreeSchema.hpp"

namespace project::metadata {

namespace {

using Values = std::map<std::u16string, std::u16string>;

/// Values that never change, sorted by key: less memory than a map, and all in one place.
using SharedValues = std::vector<std::pair<std::u16string, std::u16string>>;

std::u16string const* find(Values const& values, std::u16string const& key) {
    auto const found = values.find(key);
    return found != values.end() ? &found->second : nullptr;
}

std::u16string const* find(SharedValues const& values, std::u16string const& key) {
    auto const found = std::ranges::lower_bound(values, key, {}, &SharedValues::value_type::first);
    return found != values.end() && found->first == key ? &found->second : nullptr;
}

std::u16string const& noText() {
    static std::u16string const text;
    return text;
}

std::u16string const& usualType() {
    static std::u16string const type = schema::nodeType;
    return type;
}

template <typename AnyValues>
std::vector<std::u16string> keysOf(AnyValues const& values) {
    std::vector<std::u16string> keys;
    keys.reserve(values.size());
    for (auto const& [key, value] : values) {
        keys.push_back(key);
    }
    return keys;
}

} // namespace

struct MetadataNodeSpecification::Content {
    bool hasValues() const noexcept { return (own && !own->empty()) || shared; }

    /// The value of a key; null if there is none.
    std::u16string const* find(std::u16string const& key) const {
        auto const* const found = own ? metadata::find(*own, key) : nullptr;
        return found == nullptr && shared ? metadata::find(*shared, key) : found;
    }

    /// Own values and shared ones.
    Values allValues() const {
        Values all = own ? *own : Values();
        if (shared) {
            all.insert(shared->begin(), shared->end()); // keeps the own ones
        }
        return all;
    }

    /// The same, for copies of the node. The node must have values.
    std::shared_ptr<SharedValues const> valuesToShare() const {
        if (!own) {
            return shared;
        }
        auto all = allValues();
        return std::make_shared<SharedValues const>(std::move_iterator(all.begin()),
                                                    std::move_iterator(all.end()));
    }

    std::unique_ptr<Values> own;                ///< put after the node was created; null if there are none
    std::shared_ptr<SharedValues const> shared; ///< with copies of the node; null if there are none
    std::vector<std::unique_ptr<MetadataNode>> children;
    std::u16string type; ///< unless it is one of the constants
};

MetadataNodeSpecification::MetadataNodeSpecification() : type_(&noText()) {
}

MetadataNodeSpecification::MetadataNodeSpecification(std::u16string type) : type_(&noText()) {
    setType(std::move(type));
}

MetadataNodeSpecification::MetadataNodeSpecification(MetadataNode const& other) : type_(&noText()) {
    setType(other.getType());
    copyValues(other);
    for (auto const& child : other.getChildren()) {
        makeContent().children.push_back(std::make_unique<MetadataNodeSpecification>(*child));
    }
}

MetadataNodeSpecification::~MetadataNodeSpecification() = default;

void MetadataNodeSpecification::copyValues(MetadataNode const& other) {
    if (typeid(other) != typeid(MetadataNodeSpecification)) {
        for (auto& key : other.getKeys()) {
            put(key, other.get(key));
        }
        shareValues();
        return;
    }
    auto const& content = static_cast<MetadataNodeSpecification const&>(other).content_;
    if (content && content->hasValues()) {
        makeContent().shared = content->valuesToShare();
    }
}

void MetadataNodeSpecification::shareValues() {
    if (!content_) {
        return;
    }
    if (content_->hasValues()) {
        content_->shared = content_->valuesToShare();
        content_->own.reset();
    }
    for (auto const& child : content_->children) {
        static_cast<MetadataNodeSpecification&>(*child).shareValues(); // created by this class
    }
}

bool MetadataNodeSpecification::hasEqualValues(MetadataNodeSpecification const& other) const {
    auto const* left = content_ && content_->hasValues() ? content_.get() : nullptr;
    auto const* right = other.content_ && other.content_->hasValues() ? other.content_.get() : nullptr;
    if (left == nullptr || right == nullptr) {
        return left == right;
    }
    if (!left->own && !right->own) {
        return left->shared == right->shared || *left->shared == *right->shared;
    }
    return left->allValues() == right->allValues();
}

MetadataNodeSpecification::Content& MetadataNodeSpecification::makeContent() {
    if (!content_) {
        content_ = std::make_unique<Content>();
    }
    return *content_;
}

void MetadataNodeSpecification::setType(std::u16string type) {
    if (type == usualType()) {
        type_ = &usualType();
    } else if (!type.empty()) {
        makeContent().type = std::move(type);
        type_ = &content_->type;
    }
}

MetadataNodeSpecification::MetadataNodeSpecification(MetadataNodeSpecification const& other)
    : MetadataNodeSpecification(static_cast<MetadataNode const&>(other)) {
}

std::u16string const& MetadataNodeSpecification::get(std::u16string const& key) const {
    auto const* const found = content_ ? content_->find(key) : nullptr;
    return found != nullptr ? *found : noText();
}

void MetadataNodeSpecification::put(std::u16string key, std::u16string value) {
    auto& own = makeContent().own;
    if (!own) {
        own = std::make_unique<Values>();
    }
    own->insert_or_assign(std::move(key), std::move(value));
}

std::vector<std::u16string> MetadataNodeSpecification::getKeys() const {
    if (!content_ || !content_->hasValues()) {
        return {};
    }
    return content_->own ? keysOf(content_->allValues()) : keysOf(*content_->shared);
}

std::u16string const& MetadataNodeSpecification::getType() const {
    return *type_;
}

std::vector<std::unique_ptr<MetadataNode>> const& MetadataNodeSpecification::getChildren() const {
    static std::vector<std::unique_ptr<MetadataNode>> const none;
    return content_ ? content_->children : none;
}

MetadataNode* MetadataNodeSpecification::addChild(std::u16string type) {
    return makeContent()
        .children.emplace_back(std::make_unique<MetadataNodeSpecification>(std::move(type)))
        .get();
}

void MetadataNodeSpecification::removeChild(MetadataNode* child) {
    if (content_) {
        std::erase_if(content_->children,
                      [child](auto const& candidate) { return candidate.get() == child; });
    }
}

} // namespace project::metadata
