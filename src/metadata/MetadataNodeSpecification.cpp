#include "project/metadata/MetadataNodeSpecification.hpp"

#include <map>
#include <typeinfo>
#include <utility>

#include "project/metadata/TreeSchema.hpp"

namespace project::metadata {

namespace {

std::u16string const& noText() {
    static std::u16string const text;
    return text;
}

std::u16string const& usualType() {
    static std::u16string const type = schema::nodeType;
    return type;
}

} // namespace

struct MetadataNodeSpecification::Content {
    std::map<std::u16string, std::u16string> values;
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
    if (typeid(other) == typeid(MetadataNodeSpecification)) {
        auto const& content = static_cast<MetadataNodeSpecification const&>(other).content_;
        if (content && !content->values.empty()) {
            makeContent().values = content->values; // much faster than key by key
        }
        return;
    }
    for (auto& key : other.getKeys()) {
        auto& values = makeContent().values;
        values.emplace_hint(values.end(), key, other.get(key));
    }
}

bool MetadataNodeSpecification::hasEqualValues(MetadataNodeSpecification const& other) const {
    if (content_ && other.content_) {
        return content_->values == other.content_->values;
    }
    auto const& only = content_ ? content_ : other.content_;
    return !only || only->values.empty();
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
    if (!content_) {
        return noText();
    }
    auto const found = content_->values.find(key);
    return found == content_->values.end() ? noText() : found->second;
}

void MetadataNodeSpecification::put(std::u16string key, std::u16string value) {
    makeContent().values.insert_or_assign(std::move(key), std::move(value));
}

std::vector<std::u16string> MetadataNodeSpecification::getKeys() const {
    std::vector<std::u16string> keys;
    if (!content_) {
        return keys;
    }
    keys.reserve(content_->values.size());
    for (auto const& [key, value] : content_->values) {
        keys.push_back(key);
    }
    return keys;
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
