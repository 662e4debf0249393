#include "merge/ConflictWords.hpp"

#include <optional>
#include <string_view>

#include "output/NameForms.hpp"
#include "project/Schema.hpp"

namespace projectctl {

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
        if (element.getType() == schema::file) {
            result += (result.empty() ? u"" : u"/") + element.getLocation();
        }
    }
    return result;
}

/// What a thing in the project is called that has the address's last element for its type and UUID.
std::optional<std::string> nounFor(std::u16string_view head, std::u16string_view type) {
    if (type == schema::category) {
        return "the category";
    }
    if (type == schema::label) {
        return "the label";
    }
    if (head == schema::entryPoints) {
        return "the entry point";
    }
    if (head == schema::entryPointGroups) {
        return "the entry point group";
    }
    if (head == schema::projectPath) {
        return "the reference in the project path";
    }
    if (head == schema::references) {
        return "the reference in the referenced projects";
    }
    return std::nullopt;
}

std::string described(MetadataPath const& address) {
    auto const& elements = address.getPath();
    auto const& leaf = address.leaf();
    auto const head = elements.front().getType();
    if (head == schema::files) {
        auto const file = "the file " + inQuotes(pathOf(address));
        return leaf.getType() == schema::file ? file : "what is kept of " + file;
    }
    if (elements.size() > 1) {
        if (auto const noun = nounFor(head, leaf.getType())) {
            return *noun + ' ' + inQuotes(leaf.getLocation());
        }
    }
    std::string result = "what is kept at";
    for (auto const& element : elements) {
        result += ' ' + inQuotes(element.getType() + u' ' + element.getLocation());
    }
    return result;
}

/// "the label "uuid" of the category "uuid" on", for what is nested in a node; empty for the node itself.
std::string describedNested(MergeConflict const& conflict) {
    std::string result;
    for (auto step = conflict.nested.rbegin(); step != conflict.nested.rend(); ++step) {
        bool const isLabel = step->type == schema::label || step->type == schema::category;
        auto const noun = nounFor({}, step->type).value_or("the " + inQuotes(step->type));
        result += noun + ' ' + inQuotes(step->value) +
                  (isLabel && step + 1 != conflict.nested.rend() ? " of " : " on ");
    }
    return result;
}

std::string said(std::optional<std::u16string> const& value, MergeSide side) {
    return value ? "set to " + inQuotes(*value) + " by " + wordFor(side)
                 : std::string("removed by ") + wordFor(side);
}

std::string excluding(MergeConflict const& conflict) {
    auto const removing = conflict.removedBy.value_or(MergeSide::Ours);
    return std::string(" is removed by ") + wordFor(removing) + " and changed by " +
           wordFor(otherThan(removing));
}

} // namespace

std::string inWords(MergeConflict const& conflict) {
    auto const what = describedNested(conflict) + described(conflict.address);
    auto const both = said(conflict.values.ours, MergeSide::Ours) + " and " +
                      said(conflict.values.theirs, MergeSide::Theirs);
    switch (conflict.kind) {
    case MergeConflict::Kind::Key:
        return "the " + inQuotes(conflict.key) + " of " + what + " is " + both;
    case MergeConflict::Kind::Type:
        return "the type of " + what + " is " + both;
    case MergeConflict::Kind::Nested:
        return what + excluding(conflict);
    case MergeConflict::Kind::Subtree:
        break;
    }
    auto const isOther = !conflict.changed.empty() && conflict.changed.front() != conflict.address;
    return what + excluding(conflict) + (isOther ? ", in " + described(conflict.changed.front()) : "");
}

} // namespace projectctl
