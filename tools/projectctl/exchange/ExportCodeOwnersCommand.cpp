#include <algorithm>
#include <string>
#include <vector>

#include "exchange/CodeOwners.hpp"
#include "exchange/ExportCommands.hpp"
#include "exchange/OwnerCategory.hpp"
#include "exchange/ProjectRows.hpp"
#include "output/JsonRows.hpp"
#include "output/NameForms.hpp"
#include "output/Output.hpp"
#include "project/ProjectCommand.hpp"

namespace projectctl {

namespace {

/// Writes a rule for each file that has an owner.
class ExportCodeOwnersCommand : public ProjectCommand {
public:
    CLI::App* declare(CLI::App& group) override {
        auto* const app = group.add_subcommand("codeowners");
        app->add_flag("--json", isJson_);
        return app;
    }

    int run(OpenProject& project) override {
        project.warnOfDamage();
        Unmapped unmapped("export");
        Unmapped others("export"); // labels without names are not owners
        visitRows(project, others, [&](FileRow const& row, Kind kind) {
            if (row.category == ownerCategory) {
                take(row, kind, unmapped);
            }
        });
        writeLine(unmapped);
        if (isJson_) {
            rows_.finish();
        }
        return unmapped.report();
    }

private:
    void take(FileRow const& row, Kind kind, Unmapped& unmapped) {
        if (row.path != path_) {
            writeLine(unmapped);
            path_ = row.path;
        }
        auto const owner = bytesOf(row.label);
        if (kind == Kind::Folder) {
            unmapped.add(0, Message("FolderWithOwner", row.path));
        } else if (!isCodeOwner(owner)) {
            unmapped.add(0, Message("OwnerUnknown", row.label, row.path));
        } else {
            owners_.push_back(owner);
        }
    }

    /// Writes the line of the last file.
    void writeLine(Unmapped& unmapped) {
        if (owners_.empty()) {
            return;
        }
        std::ranges::sort(owners_);
        if (auto const line = codeOwnersLine(bytesOf(path_), owners_)) {
            isJson_ ? writeRule() : write(*line);
        } else {
            unmapped.add(0, Message("LineEndInPattern", path_));
        }
        owners_.clear();
    }

    static void write(std::string const& line) {
        output().text() += line;
        output().flushWhenLarge();
    }

    void writeRule() {
        std::vector<std::u16string> owners(owners_.size());
        std::ranges::transform(owners_, owners.begin(), textOf);
        rows_.begin();
        rows_.addText("path", path_);
        rows_.addList("owners", owners);
    }

    JsonRows rows_{json::exportCodeOwners, "rules"};
    bool isJson_ = false;
    std::u16string path_;
    std::vector<std::string> owners_;
};

} // namespace

std::unique_ptr<Command> makeExportCodeOwnersCommand() {
    return std::make_unique<ExportCodeOwnersCommand>();
}

} // namespace projectctl
