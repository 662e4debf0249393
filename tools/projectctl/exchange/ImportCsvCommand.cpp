#include <algorithm>
#include <array>
#include <cstddef>
#include <vector>

#include "cli/CommandText.hpp"
#include "exchange/CsvText.hpp"
#include "exchange/FileRow.hpp"
#include "exchange/ImportCommands.hpp"
#include "exchange/ImportTableCommand.hpp"
#include "output/Failure.hpp"
#include "output/NameForms.hpp"

namespace projectctl {

namespace {

/// The columns of a table with their places in a row.
class Columns {
public:
    explicit Columns(CsvText::Record const& header) : count_(header.fields.size()) {
        for (std::size_t place = 0; place < count_; ++place) {
            auto const known = std::ranges::find(members, header.fields[place], &Member::name);
            if (known == members.end()) {
                throw Failure(
                    atLine(header.line, Message("ColumnUnknown", textOf(header.fields[place])).text()));
            }
            places_.push_back(known->field);
        }
        if (std::ranges::find(places_, &FileRow::path) == places_.end()) {
            throw Failure(atLine(header.line, Message("ColumnPathMissing").text()));
        }
    }

    FileRow rowOf(CsvText::Record const& record) const {
        if (record.fields.size() != count_) {
            throw Failure(Message("FieldCount", record.fields.size(), count_));
        }
        FileRow result;
        for (std::size_t place = 0; place < count_; ++place) {
            result.*places_[place] = textOf(record.fields[place]);
        }
        return result;
    }

private:
    using Field = std::u16string FileRow::*;

    struct Member {
        char const* name;
        Field field;
    };

    static constexpr std::array<Member, 4> members{{{"path", &FileRow::path},
                                                    {"category", &FileRow::category},
                                                    {"label", &FileRow::label},
                                                    {"data", &FileRow::data}}};

    std::size_t count_;
    std::vector<Field> places_;
};

/// Adds the files of a table, with labels and their data.
class ImportCsvCommand : public ImportTableCommand {
public:
    ImportCsvCommand() : ImportTableCommand("csv") {}

protected:
    ImportedItems itemsIn(std::string const& data, OpenProject& project, Unmapped& unmapped) const override {
        CsvText text(data);
        auto const header = text.next();
        if (!header) {
            throw Failure(Message("ColumnPathMissing"));
        }
        Columns const columns(*header);
        ImportedItems result;
        while (auto const record = text.next()) {
            try {
                result.push_back(itemOf(columns.rowOf(*record), record->line, project.root()));
            } catch (Failure const& problem) {
                unmapped.add(record->line, problem);
            }
        }
        return result;
    }
};

} // namespace

std::unique_ptr<Command> makeImportCsvCommand() {
    return std::make_unique<ImportCsvCommand>();
}

} // namespace projectctl
