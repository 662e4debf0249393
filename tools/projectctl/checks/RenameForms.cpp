#include "checks/RenameForms.hpp"

#include <cstddef>
#include <string>
#include <vector>

#include "output/JsonRows.hpp"
#include "output/Kind.hpp"
#include "output/NameForms.hpp"
#include "output/Output.hpp"
#include "texts/Message.hpp"

namespace projectctl {

namespace {

using Evidence = Rename::Evidence;

std::u16string_view wordOf(Evidence evidence) {
    switch (evidence) {
    case Evidence::Content:
        return u"content";
    case Evidence::Similarity:
        return u"similarity";
    case Evidence::Folder:
        return u"folder";
    case Evidence::Name:
        return u"name";
    }
    return {};
}

void writeNames(std::vector<std::u16string> const& paths, ShownPaths& shown) {
    bool isFirst = true;
    for (auto const& path : paths) {
        output().text() += isFirst ? "" : ", ";
        output().name(shown.of(path));
        isFirst = false;
    }
}

void writeLine(char const* word, std::vector<std::u16string> const& from,
               std::vector<std::u16string> const& to, ShownPaths& shown) {
    output().text() += word;
    writeNames(from, shown);
    output().text() += " -> ";
    writeNames(to, shown);
}

void addPair(JsonRows& rows, Rename const& pair) {
    rows.begin();
    rows.addText("from", pair.from);
    rows.addText("to", pair.to);
    rows.addText("kind", pair.kind == Kind::Folder ? u"folder" : u"file");
    rows.addText("evidence", wordOf(pair.evidence));
    rows.addNumber("similarity", static_cast<std::size_t>(pair.similarity));
}

} // namespace

void writeRenameLines(Renames const& renames, ShownPaths shown) {
    for (auto const& pair : renames.pairs) {
        bool const isGuess = pair.evidence == Evidence::Name;
        writeLine(isGuess ? "ren? " : "ren  ", {pair.from}, {pair.to}, shown);
        if (isGuess) {
            output().text() += ' ' + Message("RenameGuessed").text();
        } else if (pair.evidence == Evidence::Similarity) {
            output().text() += ' ' + Message("RenameSimilar", pair.similarity).text();
        }
        output().text() += '\n';
        output().flushWhenLarge();
    }
    for (auto const& pair : renames.personal) {
        writeLine("ren  ", {pair.from}, {pair.to}, shown);
        output().text() += ' ' + Message("RenamePersonal").text() + '\n';
        output().flushWhenLarge();
    }
    for (auto const& group : renames.ambiguous) {
        writeLine("ren? ", group.from, group.to, shown);
        output().text() += ' ' + Message("RenameAmbiguous").text() + '\n';
    }
}

void writeRenameRows(Renames const& renames) {
    JsonRows rows;
    for (auto const& pair : renames.pairs) {
        addPair(rows, pair);
    }
    for (auto const& pair : renames.personal) {
        addPair(rows, pair);
        rows.addText("layer", u"personal");
    }
    for (auto const& group : renames.ambiguous) {
        rows.begin();
        rows.addList("from", group.from);
        rows.addList("to", group.to);
        rows.addText("evidence", u"ambiguous");
    }
    rows.finish();
}

} // namespace projectctl
