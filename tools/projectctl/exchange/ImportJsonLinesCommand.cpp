#include <algorithm>
#include <string_view>

#include "exchange/FileRow.hpp"
#include "exchange/ImportCommands.hpp"
#include "exchange/ImportTableCommand.hpp"
#include "exchange/JsonLine.hpp"
#include "output/Failure.hpp"

namespace projectctl {

namespace {

/// Adds files with labels and their data, one JSON object per line.
class ImportJsonLinesCommand : public ImportTableCommand {
public:
    ImportJsonLinesCommand() : ImportTableCommand("jsonl") {}

protected:
    ImportedItems itemsIn(std::string const& data, OpenProject& project, Unmapped& unmapped) const override {
        ImportedItems result;
        std::size_t number = 1;
        for (std::string_view rest = data; !rest.empty(); ++number) {
            std::size_t const end = std::min(rest.find('\n'), rest.size());
            try {
                appendItem(result, rest.substr(0, end), number, project.root());
            } catch (Failure const& problem) {
                unmapped.add(number, problem);
            }
            rest.remove_prefix(std::min(end + 1, rest.size()));
        }
        return result;
    }

private:
    static void appendItem(ImportedItems& items, std::string_view line, std::size_t number,
                           Path const& root) {
        if (line.find_first_not_of(" \t\r") != std::string_view::npos) {
            auto texts = readJsonLine(line);
            items.push_back(
                itemOf({texts[u"path"], texts[u"category"], texts[u"label"], texts[u"data"]}, number, root));
        }
    }
};

} // namespace

std::unique_ptr<Command> makeImportJsonLinesCommand() {
    return std::make_unique<ImportJsonLinesCommand>();
}

} // namespace projectctl
