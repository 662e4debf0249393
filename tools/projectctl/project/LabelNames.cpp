#include "project/LabelNames.hpp"

#include "cli/Choice.hpp"
#include "cli/Nearest.hpp"
#include "output/Failure.hpp"
#include "output/NameForms.hpp"
#include "project/metadata/Messages.hpp"
#include "project/metadata/ProjectException.hpp"

namespace projectctl {

using project::management::CategoryDefinition;
using project::management::CategoryIdentifier;
using project::management::Label;
using project::management::LabelDefinition;
using project::management::LabelIdentifier;
using ZEPHRA::project::management::CategoryDoesNotExist;

CategoryIdentifier LabelNames::category(std::string const& name) {
    std::u16string const wanted = textOf(name);
    if (auto const found = find(wanted)) {
        return *found;
    }
    if (isUUID(wanted)) {
        return labels_.getCategoryByUUID(wanted);
    }
    if (auto const meant = nearest(wanted, namesOf(labels_.getAllCategories()))) {
        throw Failure(Message("CategoryMeant", wanted, *meant));
    }
    project::exception::raise(CategoryDoesNotExist(wanted));
}

Label LabelNames::label(std::string const& category, std::string const& name) {
    auto const found = this->category(category);
    std::u16string const wanted = textOf(name);
    if (auto const label = find(found, wanted)) {
        return {found, *label};
    }
    if (isUUID(wanted)) {
        return {found, labels_.getLabelByUUID(found, wanted)};
    }
    auto const meant = nearest(wanted, namesOf(labels_.getLabels(found)));
    throw Failure(meant ? Message("LabelMeant", found.getName(), wanted, *meant)
                        : Message("LabelUnknown", found.getName(), wanted));
}

project::session::LabelChoice LabelNames::choice(std::string const& category,
                                                 std::optional<std::string> const& name) {
    if (!name) {
        return {this->category(category).getUUID(), {}};
    }
    auto const found = label(category, *name);
    return {found.getCategory().getUUID(), found.getUUID()};
}

Label LabelNames::labelEvenIfDeleted(std::string const& category, std::string const& name) {
    std::u16string const categoryUUID = textOf(category);
    std::u16string const labelUUID = textOf(name);
    auto const known = find(categoryUUID);
    bool const isKnown = known && find(*known, labelUUID);
    if (isKnown || !isUUID(labelUUID) || (!known && !isUUID(categoryUUID))) {
        return label(category, name);
    }
    return {known.value_or(CategoryDefinition({}, categoryUUID)), LabelDefinition({}, labelUUID)};
}

std::optional<CategoryIdentifier> LabelNames::find(std::u16string const& category) {
    auto const categories = labels_.getAllCategories();
    auto const chosen = choose(namesOf(categories), category, "SeveralCategories");
    return chosen ? std::optional(categories[*chosen]) : std::nullopt;
}

std::optional<LabelIdentifier> LabelNames::find(CategoryIdentifier const& category,
                                                std::u16string const& label) {
    auto const labels = labels_.getLabels(category);
    auto const chosen = choose(namesOf(labels), label, "SeveralLabels");
    return chosen ? std::optional(labels[*chosen]) : std::nullopt;
}

} // namespace projectctl
