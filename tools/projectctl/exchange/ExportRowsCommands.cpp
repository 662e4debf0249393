#include <string>

#include "exchange/CsvText.hpp"
#include "exchange/ExportCommands.hpp"
#include "exchange/ProjectRows.hpp"
#include "output/JsonRows.hpp"
#include "output/NameForms.hpp"
#include "output/Output.hpp"
#include "project/FileList.hpp"
#include "project/ProjectCommand.hpp"

namespace projectctl {

namespace {

/// Writes a row for each label of each file.
class ExportRowsCommand : public ProjectCommand {
public:
    explicit ExportRowsCommand(char const* form) : form_(form) {}

    CLI::App* declare(CLI::App& group) override {
        auto* const app = group.add_subcommand(form_);
        app->add_flag("--json", isJson_);
        return app;
    }

    int run(OpenProject& project) override {
        project.warnOfDamage();
        Unmapped unmapped("export");
        isJson_ ? writeDocument(project, unmapped) : writeRows(project, unmapped);
        return unmapped.report();
    }

protected:
    virtual void begin() const {}

    virtual void write(FileRow const& row) const = 0;

    static void addMembers(JsonObject& object, FileRow const& row) {
        object.addText("path", row.path);
        if (!row.category.empty() || !row.label.empty()) {
            object.addText("category", row.category);
            object.addText("label", row.label);
        }
        if (!row.data.empty()) {
            object.addText("data", row.data);
        }
    }

private:
    void writeRows(OpenProject& project, Unmapped& unmapped) const {
        begin();
        visitRows(project, unmapped, [this](FileRow const& row, Kind /*kind*/) {
            write(row);
            output().flushWhenLarge();
        });
    }

    static void writeDocument(OpenProject& project, Unmapped& unmapped) {
        JsonRows rows(json::exportRows, "rows");
        visitRows(project, unmapped, [&rows](FileRow const& row, Kind /*kind*/) {
            rows.begin();
            addMembers(rows, row);
        });
        rows.finish();
    }

    char const* form_;
    bool isJson_ = false;
};

class ExportCsvCommand : public ExportRowsCommand {
public:
    ExportCsvCommand() : ExportRowsCommand("csv") {}

protected:
    void begin() const override { appendCsvRecord(output().text(), {"path", "category", "label", "data"}); }

    void write(FileRow const& row) const override {
        appendCsvRecord(output().text(),
                        {bytesOf(row.path), bytesOf(row.category), bytesOf(row.label), bytesOf(row.data)});
    }
};

class ExportJsonLinesCommand : public ExportRowsCommand {
public:
    ExportJsonLinesCommand() : ExportRowsCommand("jsonl") {}

protected:
    void write(FileRow const& row) const override {
        JsonObject object;
        object.begin();
        addMembers(object, row);
        object.end();
        output().text() += '\n';
    }
};

/// Writes the paths of the files, without the folders.
class ExportFilesCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& group) override {
        auto* const app = group.add_subcommand("files");
        auto* const null = app->add_flag("-0,--null", isNullEnded_);
        app->add_flag("--json", isJson_)->excludes(null);
        return app;
    }

    int run(OpenProject& project) override {
        project.warnOfDamage();
        JsonRows rows(json::list, "files");
        FileList(project).visit(project.root(), [this, &rows](FileList::File const& file) {
            if (file.kind == Kind::File) {
                write(file, rows);
            }
        });
        if (isJson_) {
            rows.finish();
        }
        return 0;
    }

private:
    void write(FileList::File const& file, JsonRows& rows) const {
        if (isJson_) {
            rows.begin();
            rows.addFile(file.path, file.kind);
        } else {
            appendBytes(output().text(), file.path);
            output().text() += isNullEnded_ ? '\0' : '\n';
            output().flushWhenLarge();
        }
    }

    bool isNullEnded_ = false;
    bool isJson_ = false;
};

} // namespace

std::unique_ptr<Command> makeExportCsvCommand() {
    return std::make_unique<ExportCsvCommand>();
}

std::unique_ptr<Command> makeExportJsonLinesCommand() {
    return std::make_unique<ExportJsonLinesCommand>();
}

std::unique_ptr<Command> makeExportFilesCommand() {
    return std::make_unique<ExportFilesCommand>();
}

} // namespace projectctl
