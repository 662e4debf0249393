#include "batch/BatchLines.hpp"

#include <optional>
#include <utility>

#include "changes/DryRun.hpp"
#include "cli/CodedFailure.hpp"
#include "cli/CommandLine.hpp"
#include "cli/CommandText.hpp"
#include "cli/CommonOptions.hpp"

namespace projectctl {

namespace {

/// The options that are about the whole batch must not be in one of its lines.
void requireOptionsOfOneCommand(std::vector<std::string> const& words) {
    for (auto const& word : words) {
        if (word == "--") {
            return;
        }
        if (isCommonOption(word) || word == DryRun::option) {
            throw WrongUse(Message("OptionOfBatch", word));
        }
    }
}

std::unique_ptr<ProjectCommand> parsed(std::vector<std::string> const& words, CommandList const& commands) {
    requireOptionsOfOneCommand(words);
    auto command = parseCommand(words, commands);
    auto* const ofProject = dynamic_cast<ProjectCommand*>(command.get());
    if (ofProject == nullptr || !ofProject->canRunInBatch()) {
        throw WrongUse(Message("NotInBatch", words.front()));
    }
    std::unique_ptr<ProjectCommand> result(ofProject);
    static_cast<void>(command.release());
    return result;
}

} // namespace

std::vector<BatchLine> parseBatch(std::string text, CommandList const& commands) {
    CommandText rest(std::move(text));
    std::vector<BatchLine> result;
    while (auto const line = rest.next()) {
        try {
            result.push_back({line->number, parsed(line->words, commands)});
        } catch (WrongUse const& error) {
            throw WrongUse(atLine(line->number, error.what()));
        }
    }
    return result;
}

} // namespace projectctl
