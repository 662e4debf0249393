#pragma once

#include <optional>
#include <string>

#include "changes/DryRun.hpp"
#include "exchange/ImportedItem.hpp"
#include "exchange/Unmapped.hpp"
#include "project/ProjectCommand.hpp"

namespace projectctl {

/// A command that brings data of another form into the project, in one step. Items that cannot be in the
/// project are listed and left out.
class ImportCommand : public ProjectCommand {
public:
    int run(OpenProject& project) override;

protected:
    /// @param name of the form.
    CLI::App* declareForm(CLI::App& group, std::string const& name);

    /// Declares the argument FILE.
    void declareFile(CLI::App& app);

    std::optional<std::string> const& file() const noexcept { return file_; }

    /// A name for the source, for messages.
    virtual std::string source(OpenProject& project) const = 0;

    /// Reads the data, before the transaction.
    virtual std::string load(OpenProject& project) const = 0;

    /// The items in the data. Called in the transaction.
    virtual ImportedItems itemsIn(std::string const& data, OpenProject& project,
                                  Unmapped& unmapped) const = 0;

private:
    std::optional<std::string> file_;
    DryRun dryRun_;
};

} // namespace projectctl
