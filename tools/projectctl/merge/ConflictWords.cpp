#include "merge/ConflictWords.hpp"

#include <optional>
#include <string_view>

#include "output/NameForms.hpp"
#include "project/metadata/TreeSchema.hpp"
#include "texts/Message.hpp"

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

/// The message that names an entry of the definition. @param head the type of the first step. @param type of
/// the last one.
std::optional<std::string> messageFor(std::u16string_view head, std::u16string_view type) {
    if (type == treeSchema::categories::categoryType) {
        return "ConflictCategory";
    }
    if (type == treeSchema::categories::labelType) {
        return "ConflictLabel";
    }
    if (head == treeSchema::entrypoints::entryPointsType) {
        return "ConflictEntry";
    }
    if (head == treeSchema::entrypoints::groupsType) {
        return "ConflictGroup";
    }
    if (head == treeSchema::references::projectPathType) {
        return "ConflictPath";
    }
    if (head == treeSchema::references::referencesType) {
        return "ConflictReference";
    }
    return std::nullopt;
}

Message described(MetadataPath const& address) {
    auto const& elements = address.getPath();
    auto const& leaf = address.leaf();
    std::u16string const head = elements.front().getType();
    if (head == treeSchema::files::filesType) {
        bool const isFile = leaf.getType() == treeSchema::files::fileType;
        return Message(isFile ? "ConflictFile" : "ConflictFileData", pathOf(address));
    }
    if (elements.size() > 1) {
        if (auto const message = messageFor(head, leaf.getType())) {
            return Message(*message, leaf.getLocation());
        }
    }
    std::string steps;
    for (auto const& element : elements) {
        steps += (steps.empty() ? "" : " ") + inQuotes(element.getType() + u' ' + element.getLocation());
    }
    return Message("ConflictData", steps);
}

/// "the label "uuid" of the category "uuid" on the file ..." for a nested node; otherwise the node itself.
std::string subjectOf(MergeConflict const& conflict) {
    auto result = described(conflict.address).text();
    for (auto const& step : conflict.nested) {
        auto const message = messageFor({}, step.type);
        auto const name =
            message ? Message(*message, step.value) : Message("ConflictOther", step.type, step.value);
        bool const isWithin = message && &step != &conflict.nested.front();
        result = Message(isWithin ? "ConflictOf" : "ConflictOn", name.text(), result).text();
    }
    return result;
}

std::string changeBy(std::optional<std::u16string> const& value, MergeSide side) {
    return (value ? Message("ConflictSet", *value, wordFor(side)) : Message("ConflictRemoved", wordFor(side)))
        .text();
}

} // namespace

std::string inWords(MergeConflict const& conflict) {
    auto const subject = subjectOf(conflict);
    auto const ours = changeBy(conflict.values.ours, MergeSide::Ours);
    auto const theirs = changeBy(conflict.values.theirs, MergeSide::Theirs);
    if (conflict.kind == MergeConflict::Kind::Key) {
        return Message("ConflictOfKey", conflict.key, subject, ours, theirs).text();
    }
    if (conflict.kind == MergeConflict::Kind::Type) {
        return Message("ConflictOfType", subject, ours, theirs).text();
    }
    auto const removing = conflict.removedBy.value_or(MergeSide::Ours);
    auto const* const remover = wordFor(removing);
    auto const* const changer = wordFor(otherThan(removing));
    bool const isOther = conflict.kind == MergeConflict::Kind::Subtree && !conflict.changed.empty() &&
                         conflict.changed.front() != conflict.address;
    if (isOther) {
        auto const place = described(conflict.changed.front()).text();
        return Message("ConflictOfRemovalIn", subject, remover, changer, place).text();
    }
    return Message("ConflictOfRemoval", subject, remover, changer).text();
}

} // namespace projectctl
