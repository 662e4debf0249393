#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "cli/ShownPaths.hpp"
#include "output/JsonRows.hpp"
#include "project/OpenProject.hpp"
#include "project/stores/Change.hpp"

namespace projectctl {

/// Writes the changes of a transaction to standard output, one per line, in the order of their addresses:
///
///     add PATH                    remove PATH                  change PATH (only its data)
///     put CATEGORY=LABEL PATH     take CATEGORY=LABEL PATH
///     category create NAME        category delete NAME         category rename OLD=NEW
///     label create CATEGORY=NAME  label delete CATEGORY=NAME   label rename CATEGORY=OLD=NEW
///     group create NAME           group delete NAME            group rename OLD=NEW
///     entry set PATH              entry remove PATH
///     path add PATH               path remove PATH             the same with reference
///     name TEXT                   description TEXT             other STEP... (any other address)
///
/// In JSON, each change is an object with "change", the first words of its line, and a member for each of its
/// texts.
///
/// Texts are quoted as appendQuoted does, so that a line is always one change. The labels and data of a
/// removed file have no lines of their own.
class ChangeLines {
public:
    /// @param project in the transaction. @param changes sorted by address; borrowed.
    ChangeLines(OpenProject& project, std::vector<project::stores::Difference> const& changes, bool isJson);

    void write();

private:
    using Address = project::metadata::MetadataPath;
    using Difference = project::stores::Difference;

    /// A text of a change.
    struct Member {
        std::string_view key; ///< in JSON
        std::u16string text;  ///< of "path", relative to the root
    };

    void write(Difference const& change);
    void write(std::string_view words, std::vector<Member> const& members);
    void writeFile(Difference const& change);
    void writeLabelsOfFile(Difference const& change, std::u16string const& path);
    void writeDataOfFile(Difference const& change);
    void writeNamed(std::string_view kind, Difference const& change, std::u16string const& owner);
    void writeReference(std::string_view kind, Difference const& change);
    void writeEntry(Difference const& change);
    void writeOther(Difference const& change);

    static std::u16string pathOf(Address const& address);

    /// Whether the file of an address, which may be in another scope, is removed from the file list.
    bool isOfRemovedFile(Address const& address) const;
    Difference const* find(Address const& address) const;

    /// The name of a category or a label, also of a deleted one; its UUID if it has none.
    std::u16string nameAt(Address const& address) const;

    OpenProject& project_;
    std::vector<Difference> const& changes_;
    ShownPaths shown_;
    bool isJson_;
    JsonRows rows_{json::dryRun, "changes"};
};

} // namespace projectctl
