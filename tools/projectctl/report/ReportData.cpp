#include "report/ReportData.hpp"

#include <cstddef>
#include <string_view>
#include <utility>

#include "history/ChangeWords.hpp"
#include "project/metadata/MetadataFunctions.hpp"
#include "project/metadata/TreeSchema.hpp"
#include "report/Columns.hpp"
#include "report/JsonWriter.hpp"
#include "report/LabelTable.hpp"
#include "report/PageTexts.hpp"

namespace projectctl {

namespace {

using State = ReferenceGraph::State;

std::string_view stateWord(State state) {
    switch (state) {
    case State::Project:
        return "project";
    case State::NoFolder:
        return "missing";
    case State::NoProject:
        return "empty";
    case State::Unreadable:
        break;
    }
    return "unreadable";
}

/// Writes the members of the page's data, one after the other.
class DataWriter {
public:
    explicit DataWriter(ReportData const& data)
        : data_(data),
          labels_(data.definition.categories,
                  data.comparison ? data.comparison->categoriesBefore : noCategories_) {}

    std::string write() {
        json_.beginObject();
        writeTexts();
        writeProject();
        writeEntries();
        writeEntryPoints();
        writeReferences();
        writeFindings();
        writeHistory();
        writeComparison();
        labels_.write(json_); // all sets of labels are known now
        json_.endObject();
        return json_.bytes();
    }

private:
    void writeTexts() {
        json_.key("texts");
        json_.beginObject();
        for (auto const& [name, text] : pageTexts()) {
            json_.member(name, text);
        }
        json_.endObject();
        json_.member("language", pageText("Language"));
    }

    void writeProject() {
        json_.key("project");
        json_.beginObject();
        json_.member("name", data_.definition.name);
        json_.member("description", data_.definition.description);
        json_.key("lastChange");
        if (data_.lastChange) {
            json_.beginObject();
            writeCommit(*data_.lastChange);
            json_.endObject();
        } else {
            json_.null();
        }
        json_.endObject();
    }

    void writeCommit(LoggedCommit const& commit) {
        json_.member("commit", commit.id);
        json_.member("date", commit.time);
        json_.member("author", commit.author);
        json_.member("subject", commit.subject);
    }

    /// The columns of all entries.
    struct Entries {
        PathColumn paths;
        Column folders;
        Column sizes; ///< of files only, like the lines
        Column lines;
        Column labels;
        Column changes;
    };

    void writeEntries() {
        Entries columns;
        if (data_.comparison) {
            auto measure = data_.measures.begin();
            for (auto const& compared : data_.comparison->entries) {
                bool const isRemoved = compared.change == FileChange::Removed;
                add(columns, compared.entry, isRemoved ? FileMeasure{compared.sizeBefore, 0} : *measure);
                measure += isRemoved ? 0 : 1;
                columns.changes.push_back(static_cast<std::uint64_t>(compared.change));
            }
        } else {
            for (std::size_t i = 0; i < data_.measures.size(); ++i) {
                add(columns, data_.definition.entries[i], data_.measures[i]);
            }
        }
        write(columns);
    }

    void add(Entries& columns, Definition::Entry const& entry, FileMeasure const& measure) {
        bool const isFolder = entry.kind == Kind::Folder;
        columns.paths.add(entry.path);
        columns.folders.push_back(isFolder ? 1 : 0);
        columns.labels.push_back(labels_.setOf(entry.labels));
        if (!isFolder) {
            columns.sizes.push_back(measure.size);
            columns.lines.push_back(measure.lines);
        }
    }

    void write(Entries const& columns) {
        json_.key("entries");
        json_.beginObject();
        json_.numberMember("count", columns.folders.size());
        columns.paths.write(json_);
        writeColumn(json_, "folders", columns.folders);
        writeColumn(json_, "sizes", columns.sizes);
        writeColumn(json_, "lines", columns.lines);
        writeColumn(json_, "labels", columns.labels);
        if (data_.comparison) {
            writeColumn(json_, "changes", columns.changes);
        }
        json_.endObject();
    }

    void writeEntryPoints() {
        namespace entrypoints = project::metadata::schema::entrypoints;
        json_.objectsMember("entryPoints", data_.definition.entryPoints, [this](auto const& item) {
            auto const& entry = item.second;
            json_.member("path", entry.path);
            json_.member("name", entry.name);
            json_.member("type", entry.type);
            json_.member("group", entry.groupUUID.empty() ? entrypoints::defaultGroupUUID : entry.groupUUID);
            json_.flagMember("isVisible", entry.isVisible);
        });
        auto groups = data_.definition.groups;
        groups.try_emplace(entrypoints::defaultGroupUUID); // which need not be stored
        json_.objectsMember("groups", groups, [this](auto const& group) {
            json_.member("uuid", group.first);
            json_.member("name", group.second);
            json_.flagMember("isDefault", group.first == entrypoints::defaultGroupUUID);
        });
    }

    void writeReferences() {
        json_.key("references");
        json_.beginObject();
        json_.objectsMember("projects", data_.projects, [this](auto const& node) {
            auto const folder = project::metadata::getRelativePath(data_.root, node.folder);
            json_.member("folder", folder.empty() ? std::u16string(u".") : folder);
            json_.member("name", node.name);
            json_.member("state", stateWord(node.state));
            json_.member("problem", node.problem);
        });
        writeReferenceList();
        json_.objectsMember("projectPath", data_.definition.projectPath, [this](auto const& item) {
            json_.member("text", item.second.storedPath);
            json_.member("type", item.second.type);
        });
        json_.endObject();
    }

    void writeReferenceList() {
        json_.key("references");
        json_.beginArray();
        for (std::size_t from = 0; from < data_.projects.size(); ++from) {
            for (auto const& reference : data_.projects[from].references) {
                json_.beginObject();
                json_.numberMember("from", from);
                json_.numberMember("to", reference.to);
                json_.member("text", reference.text);
                json_.member("type", reference.type);
                json_.flagMember("closesCycle", reference.closesCycle);
                json_.endObject();
            }
        }
        json_.endArray();
    }

    void writeFindings() {
        json_.objectsMember("findings", data_.findings.findings, [this](auto const& finding) {
            json_.member("source", finding.source);
            json_.member("code", finding.code);
            json_.flagMember("isFault", finding.isFault);
            json_.member("text", finding.text);
            json_.member("path", finding.path);
        });
        json_.numberMember("omittedFindings", data_.findings.omitted);
    }

    void writeHistory() {
        std::map<LabelUUIDs, std::size_t> numbers;
        json_.key("history");
        json_.beginObject();
        json_.objectsMember("labels", data_.history.labels, [&](auto const& label) {
            numbers.emplace(label.first, numbers.size());
            json_.member("category", label.second.category);
            json_.member("name", label.second.label);
        });
        json_.key("versions");
        json_.beginArray();
        for (auto const& version : data_.history.versions) {
            write(version, numbers);
        }
        json_.endArray();
        json_.numberMember("omitted", data_.history.omitted);
        json_.endObject();
    }

    void write(Version const& version, std::map<LabelUUIDs, std::size_t> const& numbers) {
        json_.beginObject();
        writeCommit(version.commit);
        json_.numberMember("files", version.files);
        json_.numberMember("folders", version.folders);
        json_.key("labels");
        json_.beginArray();
        for (auto const& [uuids, count] : version.labels) {
            auto const number = numbers.find(uuids);
            if (number != numbers.end()) { // others were deleted before the first version that has them
                json_.beginArray();
                json_.number(number->second);
                json_.number(count);
                json_.endArray();
            }
        }
        json_.endArray();
        json_.endObject();
    }

    void writeComparison() {
        json_.key("compare");
        if (!data_.comparison) {
            json_.null();
            return;
        }
        auto const& comparison = *data_.comparison;
        json_.beginObject();
        json_.member("revision", comparison.revision);
        writeCommit(comparison.commit);
        writeBefore(comparison.entries);
        json_.objectsMember("other", comparison.other, [this](auto const& change) { writeMembers(change); });
        json_.endObject();
    }

    void writeMembers(project::stores::DefinitionChange const& change) {
        json_.member("what", wordFor(change.subject));
        json_.member("change", wordFor(change.kind));
        json_.member("name", change.name);
        if (change.subject != project::stores::DefinitionChange::Subject::FileData &&
            !change.category.empty()) {
            json_.member("category", change.category);
        }
        if (!change.earlier.empty()) {
            json_.member("earlier", change.earlier);
        }
    }

    /// The earlier labels and paths of entries, by their indices.
    void writeBefore(std::vector<ComparedEntry> const& entries) {
        json_.key("labelsBefore");
        json_.beginArray();
        for (std::size_t i = 0; i < entries.size(); ++i) {
            if (auto const& before = entries[i].labelsBefore) {
                json_.beginArray();
                json_.number(i);
                json_.number(labels_.setOf(*before));
                json_.endArray();
            }
        }
        json_.endArray();
        json_.key("pathsBefore");
        json_.beginArray();
        for (std::size_t i = 0; i < entries.size(); ++i) {
            if (entries[i].change == FileChange::Renamed) {
                json_.beginArray();
                json_.number(i);
                json_.text(entries[i].pathBefore);
                json_.endArray();
            }
        }
        json_.endArray();
    }

    LabelTable::Categories const noCategories_;
    ReportData const& data_;
    JsonWriter json_;
    LabelTable labels_;
};

} // namespace

std::string jsonOf(ReportData const& data) {
    return DataWriter(data).write();
}

} // namespace projectctl
