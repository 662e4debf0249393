#include "merge/ConflictWords.hpp"

#include <optional>
#include <string_view>

#include "output/NameForms.hpp"
#include "project/metadata/TreeSchema.hpp"

namespace projectctl {

namespace treeSchema = project::metadata::schema;

using project::metadata::MetadataPath;
using project::stores::MergeConflict;
using project::stores::MergeSide;

namespace {

char const* wordFor(MergeSide side) {
    return side == MergeSide::Ours ? "ours" : "theirs";
}

MergeSide otherThan(MergeSide side) {
    return side == MergeSide::Ours ? MergeSide::Theirs : MergeSide::Ours;
}

std::u16string pathOf(MetadataPath const& address) {
    std::u16string result;
    for (auto const& element : address.getPath()) {
        if (element.getType() == treeSchema::files::fileType) {
            result += (result.empty() ? u"" : u"/") + element.getLocation();
        }
    }
    return result;
}

/// The noun for an entry of the definition. @param head the type of the first step. @param type of the last
/// one.
std::optional<std::string> nounFor(std::u16string_view head, std::u16string_view type) {
    if (type == treeSchema::categories::categoryType) {
        return "the category";
    }
    if (type == treeSchema::categories::labelType) {
        return "the label";
    }
    if (head == treeSchema::entrypoints::entryPointsType) {
        return "the entry point";
    }
    if (head == treeSchema::entrypoints::groupsType) {
        return "the entry point group";
    }
    if (head == treeSchema::references::projectPathType) {
        return "the reference in the project path";
    }
    if (head == treeSchema::references::referencesType) {
        return "the reference in the referenced projects";
    }
    return std::nullopt;
}

std::string described(MetadataPath const& address) {
    auto const& elements = address.getPath();
    auto const& leaf = address.leaf();
    std::u16string const head = elements.front().getType();
    if (head == treeSchema::files::filesType) {
        std::string const file = "the file " + inQuotes(pathOf(address));
        return leaf.getType() == treeSchema::files::fileType ? file : "the data of " + file;
    }
    if (elements.size() > 1) {
        if (auto const noun = nounFor(head, leaf.getType())) {
            return *noun + ' ' + inQuotes(leaf.getLocation());
        }
    }
    std::string result = "the data at";
    for (auto const& element : elements) {
        result += ' ' + inQuotes(element.getType() + u' ' + element.getLocation());
    }
    return result;
}

/// "the label "uuid" of the category "uuid" on" for a nested node; empty for the node itself.
std::string describedNested(MergeConflict const& conflict) {
    std::string result;
    for (auto step = conflict.nested.rbegin(); step != conflict.nested.rend(); ++step) {
        bool const isLabel = step->type == treeSchema::categories::labelType ||
                             step->type == treeSchema::categories::categoryType;
        std::string const noun = nounFor({}, step->type).value_or("the " + inQuotes(step->type));
        result += noun + ' ' + inQuotes(step->value) +
                  (isLabel && step + 1 != conflict.nested.rend() ? " of " : " on ");
    }
    return result;
}

std::string changeBy(std::optional<std::u16string> const& value, MergeSide side) {
    return value ? "set to " + inQuotes(*value) + " by " + wordFor(side)
                 : std::string("removed by ") + wordFor(side);
}

std::string removedAndChanged(MergeConflict const& conflict) {
    auto const removing = conflict.removedBy.value_or(MergeSide::Ours);
    return std::string(" is removed by ") + wordFor(removing) + " and changed by " +
           wordFor(otherThan(removing));
}

} // namespace

std::string inWords(MergeConflict const& conflict) {
    std::string const subject = describedNested(conflict) + described(conflict.address);
    std::string const both = changeBy(conflict.values.ours, MergeSide::Ours) + " and " +
                             changeBy(conflict.values.theirs, MergeSide::Theirs);
    switch (conflict.kind) {
    case MergeConflict::Kind::Key:
        return "the " + inQuotes(conflict.key) + " of " + subject + " is " + both;
    case MergeConflict::Kind::Type:
        return "the type of " + subject + " is " + both;
    case MergeConflict::Kind::Nested:
        return subject + removedAndChanged(conflict);
    case MergeConflict::Kind::Subtree:
        break;
    }
    bool const isOther = !conflict.changed.empty() && conflict.changed.front() != conflict.address;
    return subject + removedAndChanged(conflict) +
           (isOther ? ", in " + described(conflict.changed.front()) : "");
}

} // namespace projectctl
