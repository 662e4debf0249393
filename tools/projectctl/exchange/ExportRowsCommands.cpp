#include <string>

#include "exchange/CsvText.hpp"
#include "exchange/ExportCommands.hpp"
#include "exchange/ProjectRows.hpp"
#include "output/JsonObject.hpp"
#include "output/NameForms.hpp"
#include "output/Output.hpp"
#include "project/FileList.hpp"
#include "project/ProjectCommand.hpp"

namespace projectctl {

namespace {

/// Writes a row for each label of each file.
class ExportRowsCommand : public ProjectCommand {
public:
    int run(OpenProject& project) override {
        project.warnOfDamage();
        Unmapped unmapped("export");
        begin();
        visitRows(project, unmapped, [this](FileRow const& row, Kind /*kind*/) {
            write(row);
            output().flushWhenLarge();
        });
        return unmapped.report();
    }

protected:
    virtual void begin() const {}

    virtual void write(FileRow const& row) const = 0;
};

class ExportCsvCommand : public ExportRowsCommand {
public:
    CLI::App* declare(CLI::App& group) override { return group.add_subcommand("csv"); }

protected:
    void begin() const override { appendCsvRecord(output().text(), {"path", "category", "label", "data"}); }

    void write(FileRow const& row) const override {
        appendCsvRecord(output().text(),
                        {bytesOf(row.path), bytesOf(row.category), bytesOf(row.label), bytesOf(row.data)});
    }
};

class ExportJsonLinesCommand : public ExportRowsCommand {
public:
    CLI::App* declare(CLI::App& group) override { return group.add_subcommand("jsonl"); }

protected:
    void write(FileRow const& row) const override {
        JsonObject object;
        object.begin();
        object.addText("path", row.path);
        if (!row.category.empty() || !row.label.empty()) {
            object.addText("category", row.category);
            object.addText("label", row.label);
        }
        if (!row.data.empty()) {
            object.addText("data", row.data);
        }
        object.end();
        output().text() += '\n';
    }
};

/// Writes the paths of the files, without the folders.
class ExportFilesCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& group) override {
        auto* const app = group.add_subcommand("files");
        app->add_flag("-0,--null", isNullEnded_);
        return app;
    }

    int run(OpenProject& project) override {
        project.warnOfDamage();
        FileList(project).visit(project.root(), [this](FileList::File const& file) {
            if (file.kind == Kind::File) {
                appendBytes(output().text(), file.path);
                output().text() += isNullEnded_ ? '\0' : '\n';
                output().flushWhenLarge();
            }
        });
        return 0;
    }

private:
    bool isNullEnded_ = false;
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
