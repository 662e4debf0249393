#include "ReviewLabel.hpp"

#include <algorithm>
#include <memory>
#include <optional>
#include <utility>

#include <project/metadata/TreeSchema.hpp>

namespace review_linter {

using project::management::CategoryDefinition;
using project::management::CategoryIdentifier;
using project::management::Label;
using project::management::LabelDefinition;
using project::management::LabelIdentifier;
using project::management::LabelManager;
using project::metadata::MetadataNode;
using project::session::Session;
namespace schema = project::metadata::schema;

namespace {

char16_t const* const categoryName = u"Linter";
char16_t const* const labelName = u"Reviewed";

/// The first of some categories or labels that has a name.
template <class Named>
std::optional<Named> withName(std::vector<Named> const& all, std::u16string const& name) {
    auto const found =
        std::find_if(all.begin(), all.end(), [&](Named const& one) { return one.getName() == name; });
    return found == all.end() ? std::nullopt : std::optional<Named>(*found);
}

std::optional<CategoryIdentifier> findCategory(LabelManager& labels) {
    return withName(labels.getAllCategories(), categoryName);
}

std::optional<LabelIdentifier> findLabel(LabelManager& labels) {
    auto const category = findCategory(labels);
    return category ? withName(labels.getLabels(*category), labelName) : std::nullopt;
}

CategoryIdentifier newCategory() {
    CategoryDefinition category(categoryName);
    // Single-valued: a label that a file has already then replaces itself, instead of being there twice.
    category.setIsSingleValued(true).setDataType(u"String");
    return category;
}

/// The label of the project, as far as it exists. Creates nothing.
Label findOrDefine(LabelManager& labels) {
    return {findCategory(labels).value_or(newCategory()),
            findLabel(labels).value_or(LabelDefinition(labelName))};
}

/// The nested node of a type with a UUID; null if there is none.
MetadataNode* nestedNode(MetadataNode const& node, std::u16string const& type, std::u16string const& uuidKey,
                         std::u16string const& uuid) {
    for (auto const& child : node.getChildren()) {
        if (child->getType() == type && child->get(uuidKey) == uuid) {
            return child.get();
        }
    }
    return nullptr;
}

/// The node of a label in the node of a file; null if the file does not have the label.
MetadataNode* labelNode(MetadataNode const& file, Label const& label) {
    auto const* const category = nestedNode(file, schema::files::categoryType, schema::files::categoryUUIDKey,
                                            label.getCategory().getUUID());
    return category == nullptr ? nullptr
                               : nestedNode(*category, schema::files::labelType, schema::files::labelUUIDKey,
                                            label.getUUID());
}

} // namespace

ReviewLabel::ReviewLabel(Session& session)
    : session_(session), label_(findOrDefine(session.project().getLabelManager())) {
}

std::u16string ReviewLabel::hashOn(Path const& file) const {
    auto const nodes =
        session_.project().getFileManager().getFileMetadataManagerFor(schema::files::fileListScope);
    auto const node = nodes->getFileNode(file);
    auto const* const label = labelNode(*node, label_);
    return label == nullptr ? u"" : label->get(schema::files::labelValueKey);
}

void ReviewLabel::put(std::map<Path, std::u16string> const& hashes) {
    createIfNew();
    std::vector<Path> files;
    files.reserve(hashes.size());
    for (auto const& [file, hash] : hashes) {
        files.push_back(file);
    }
    session_.project().getFileManager().addLabels(files, {label_});
    writeHashes(hashes);
}

void ReviewLabel::remove(std::vector<Path> files) {
    auto& manager = session_.project().getFileManager();
    std::erase_if(files, [&](Path const& file) { return !manager.isFileInProject(file); });
    manager.removeLabels(files, {label_});
}

void ReviewLabel::createIfNew() {
    auto& labels = session_.project().getLabelManager();
    label_ = findOrDefine(labels); // somebody else may have created it since
    if (!findCategory(labels)) {
        labels.createCategory(label_.getCategory());
    }
    if (!findLabel(labels)) {
        labels.createLabel(label_.getCategory(), label_.getLabelIdentifier());
    }
}

/// The managers read the data of labels. To write it is up to the program that it belongs to.
void ReviewLabel::writeHashes(std::map<Path, std::u16string> const& hashes) {
    auto const nodes =
        session_.project().getFileManager().getFileMetadataManagerFor(schema::files::fileListScope);
    std::map<Path, std::shared_ptr<MetadataNode>> changed;
    for (auto const& [file, hash] : hashes) {
        if (!nodes->hasFileNode(file)) {
            continue;
        }
        std::shared_ptr<MetadataNode> node = nodes->getFileNode(file);
        if (auto* const label = labelNode(*node, label_)) {
            label->put(schema::files::labelValueKey, hash);
            changed.emplace(file, std::move(node));
        }
    }
    nodes->setFileNodes(std::move(changed));
}

} // namespace review_linter
