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
/// A change of the personal layer begins with the word personal, or has a member "personal" in JSON. It has
/// no lines for the files themselves, which are those of the project.
///
/// Texts are quoted as appendQuoted does, so that a line is always one change. The labels and data of a
/// removed file have no lines of their own.
class ChangeLines {
public:
    /// @param project in the transaction.
    ChangeLines(OpenProject& project, bool isJson)
        : shown_(project.root()), project_(project), isJson_(isJson) {}

    /// Writes changes of the project. @param changes sorted by address.
    void write(std::vector<project::stores::Difference> const& changes);

    /// Writes changes of the personal layer.
    void writePersonal(std::vector<project::stores::Difference> const& changes);

    /// Ends the document. Call it once, at the end.
    void finish();

private:
    using Address = project::metadata::MetadataPath;
    using Difference = project::stores::Difference;

    /// A text of a change.
    struct Member {
        std::string_view key; ///< in JSON
        std::u16string text;  ///< of "path", relative to the root
    };

    void writeAll();
    void markPersonal();
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

    ShownPaths shown_;
    OpenProject& project_;
    bool isJson_;
    std::vector<Difference> changes_; ///< of the layer that is being written
    bool isPersonal_ = false;         ///< the layer
    JsonRows rows_{json::dryRun, "changes"};
};

} // namespace projectctl
