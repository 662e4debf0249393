#include "report/Comparison.hpp"

#include <algorithm>
#include <functional>
#include <set>
#include <utility>

#include "output/Failure.hpp"

namespace projectctl {

namespace {

using project::stores::DefinitionChange;
using Entry = Definition::Entry;
using Subject = DefinitionChange::Subject;

/// The order of `list`: by elements of the path, in code units.
bool isBefore(Entry const& left, Entry const& right) {
    auto const rank = [](char16_t unit) { return unit == u'/' ? 0 : unit + 1; };
    return std::ranges::lexicographical_compare(left.path, right.path, std::less<>(), rank, rank);
}

bool isAboutFiles(Subject subject) {
    return subject == Subject::File || subject == Subject::FileLabel;
}

/// Compares the files of two definitions.
class EntryComparison {
public:
    /// @param contents the tracked files whose content differs.
    EntryComparison(std::vector<DefinitionChange> const& changes, std::vector<RawChange> const& contents,
                    GitProject const& project, std::string const& commit)
        : sizes_(project.fileSizes(commit)) {
        for (auto const& change : changes) {
            if (change.subject == Subject::File && change.kind == DefinitionChange::Kind::Renamed) {
                earlier_[change.name] = change.earlier;
                renamedAway_.insert(change.earlier);
            } else if (change.subject == Subject::FileLabel) {
                relabelled_.insert(change.name);
            }
        }
        for (auto const& change : contents) {
            if (auto path = project.pathFromRoot(change.to)) {
                withOtherContent_.insert(*std::move(path));
            }
        }
    }

    std::vector<ComparedEntry> compare(std::vector<Entry> const& before, std::vector<Entry> const& now) {
        for (auto const& entry : before) {
            labelsBefore_.emplace(entry.path, &entry.labels);
        }
        std::vector<ComparedEntry> result;
        auto old = before.begin();
        for (auto const& entry : now) {
            for (; old != before.end() && isBefore(*old, entry); ++old) {
                addRemoved(*old, result);
            }
            old += old != before.end() && old->path == entry.path ? 1 : 0;
            result.push_back(compared(entry));
        }
        for (; old != before.end(); ++old) {
            addRemoved(*old, result);
        }
        return result;
    }

private:
    void addRemoved(Entry const& entry, std::vector<ComparedEntry>& to) const {
        if (!renamedAway_.contains(entry.path)) {
            auto const size = sizes_.find(entry.path);
            to.push_back({entry, FileChange::Removed, {}, size == sizes_.end() ? 0 : size->second, {}});
        }
    }

    ComparedEntry compared(Entry const& entry) const {
        ComparedEntry result{entry, FileChange::None, {}, 0, {}};
        auto const renamed = earlier_.find(entry.path);
        auto const& pathBefore = renamed == earlier_.end() ? entry.path : renamed->second;
        auto const labels = labelsBefore_.find(pathBefore);
        if (labels == labelsBefore_.end()) {
            result.change = FileChange::Added;
            return result;
        }
        bool const isRelabelled = relabelled_.contains(entry.path);
        if (isRelabelled) {
            result.labelsBefore = *labels->second;
        }
        if (renamed != earlier_.end()) {
            result.change = FileChange::Renamed;
            result.pathBefore = pathBefore;
        } else if (isRelabelled) {
            result.change = FileChange::Labels;
        } else if (withOtherContent_.contains(entry.path)) {
            result.change = FileChange::Content;
        }
        return result;
    }

    std::map<std::u16string, std::uint64_t> sizes_;
    std::map<std::u16string, std::u16string> earlier_; ///< paths of renamed files, by their later paths
    std::set<std::u16string> renamedAway_;
    std::set<std::u16string> relabelled_;
    std::set<std::u16string> withOtherContent_;
    std::map<std::u16string_view, LabelsOnFile const*> labelsBefore_;
};

} // namespace

Comparison compareWith(std::string const& revision, GitProject const& project, Definition const& now) {
    Comparison result;
    result.revision = revision;
    auto const id = project.commit(revision);
    result.commit = readCommitLog(project.root(), {"-1", "--no-patch", id, "--"}).front();
    auto textBefore = project.textIn(id);
    if (textBefore.empty()) {
        throw Failure(Message("ReportNoDefinition", revision));
    }
    auto const contents = project.changedFiles(id);
    auto changes =
        project::stores::changesBetween(textBefore, project.textOnDisk(), project.renamesIn(contents));
    auto before = readDefinition(std::move(textBefore), id);
    result.entries = EntryComparison(changes, contents, project, id).compare(before.entries, now.entries);
    std::erase_if(changes, [](DefinitionChange const& change) { return isAboutFiles(change.subject); });
    result.other = std::move(changes);
    result.categoriesBefore = std::move(before.categories);
    return result;
}

} // namespace projectctl
