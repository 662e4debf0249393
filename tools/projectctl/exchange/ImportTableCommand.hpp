#pragma once

#include "exchange/ImportCommand.hpp"

namespace projectctl {

/// A command that imports rows from a file or standard input.
class ImportTableCommand : public ImportCommand {
public:
    /// @param form the name of the form of the rows.
    explicit ImportTableCommand(char const* form) : form_(form) {}

    CLI::App* declare(CLI::App& group) override;

protected:
    std::string source(OpenProject& project) const override;
    std::string load(OpenProject& project) const override;

private:
    char const* form_;
};

} // namespace projectctl
