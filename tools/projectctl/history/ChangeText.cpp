#include "history/ChangeText.hpp"

#include <string_view>

#include "output/NameForms.hpp"
#include "output/Output.hpp"

namespace projectctl {

namespace {

using project::stores::DefinitionChange;
using ChangeKind = DefinitionChange::Kind;
using Subject = DefinitionChange::Subject;

/// One word for each kind, in the order of the kinds.
struct Words {
    std::string_view added;
    std::string_view removed;
    std::string_view renamed;
    std::string_view changed;

    std::string_view of(ChangeKind kind) const {
        switch (kind) {
        case ChangeKind::Added:
            return added;
        case ChangeKind::Removed:
            return removed;
        case ChangeKind::Renamed:
            return renamed;
        case ChangeKind::Changed:
            break;
        }
        return changed;
    }
};

Words wordsFor(Subject subject) {
    switch (subject) {
    case Subject::Name:
        return {"name", "name", "name", "name"};
    case Subject::Description:
        return {"description", "description", "description", "description"};
    case Subject::File:
        return {"add", "remove", "rename", "change"};
    case Subject::FileLabel:
        return {"put", "take", "change", "change"};
    case Subject::FileData:
        return {"change", "change", "change", "change"};
    case Subject::Category:
        return {"category create", "category delete", "category rename", "category change"};
    case Subject::Label:
        return {"label create", "label delete", "label rename", "label change"};
    case Subject::EntryPoint:
        return {"entry set", "entry remove", "entry rename", "entry change"};
    case Subject::Group:
        return {"group create", "group delete", "group rename", "group change"};
    case Subject::ProjectPath:
        return {"path add", "path remove", "path rename", "path change"};
    case Subject::Reference:
        return {"reference add", "reference remove", "reference rename", "reference change"};
    case Subject::Other:
        break;
    }
    return {"other", "other", "other", "other"};
}

bool isNamedByFile(Subject subject) {
    return subject == Subject::File || subject == Subject::FileLabel || subject == Subject::FileData ||
           subject == Subject::EntryPoint;
}

} // namespace

void ChangeText::write(std::vector<DefinitionChange> const& changes) {
    for (auto const& change : changes) {
        if (!change.isWithFolder) {
            write(change);
        }
    }
}

void ChangeText::write(Change const& change) {
    auto& out = output().text();
    out += indent_;
    out += wordsFor(change.subject).of(change.kind);
    out += ' ' + subjectOf(change);
    bool const isOneText = change.subject == Subject::Name || change.subject == Subject::Description;
    for (auto const& value : change.values) {
        if (!isOneText) {
            out += ' ' + quotedName(value.key) + '=' + quotedName(value.after);
        }
    }
    out += '\n';
    output().flushWhenLarge();
}

std::string ChangeText::subjectOf(Change const& change) {
    if (isNamedByFile(change.subject)) {
        auto const path = pathText(change.name);
        if (change.kind == ChangeKind::Renamed) {
            return pathText(change.earlier) + ' ' + path;
        }
        bool const isLabel = change.subject == Subject::FileLabel;
        return isLabel ? quotedName(change.category) + '=' + quotedName(change.label) + ' ' + path : path;
    }
    bool const isPath = change.subject == Subject::ProjectPath || change.subject == Subject::Reference;
    auto const before =
        change.kind == ChangeKind::Renamed ? quotedName(change.earlier) + (isPath ? ' ' : '=') : "";
    auto const owner = change.subject == Subject::Label ? quotedName(change.category) + '=' : std::string();
    return owner + before + quotedName(change.name);
}

std::string ChangeText::pathText(std::u16string_view path) {
    return quotedName(shown_.of(path));
}

} // namespace projectctl
