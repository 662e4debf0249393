#include <exception>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <optional>
#include <sstream>
#include <stdexcept>
#include <string>
#include <system_error>

#include "cli/TextArguments.hpp"
#include "cli/WorkingFolder.hpp"
#include "git/GitCommand.hpp"
#include "merge/Commands.hpp"
#include "merge/ConflictWords.hpp"
#include "merge/RenamesOfMerge.hpp"
#include "output/Failure.hpp"
#include "output/NameForms.hpp"
#include "output/Output.hpp"
#include "output/Progress.hpp"
#include "project/stores/TextMerge.hpp"

namespace projectctl {

namespace {

using project::stores::ThreeWay;

/// Merges two versions of a project's text, as git's merge driver.
///
/// The exit codes are those of a merge driver, and not those of the other commands: 1 for a conflict, and
/// more than 128 for a failure, because git takes anything in between for a conflict.
class MergeCommand : public Command {
public:
    CLI::App* declare(CLI::App& tool) override {
        auto* const app = tool.add_subcommand("merge");
        takeText(*app, "BASE", base_)->required();
        takeText(*app, "OURS", ours_)->required();
        takeText(*app, "THEIRS", theirs_)->required();
        takeText(*app, "PATH", path_);
        return app;
    }

    int run() override {
        Progress const progress(Message("ProgressMerge"));
        try {
            return mergeFiles();
        } catch (std::exception const& error) {
            printError(error);
            return failed;
        }
    }

private:
    static constexpr int failed = 129;

    int mergeFiles() const {
        ThreeWay<std::string> const texts{contentOf(*base_), contentOf(*ours_), contentOf(*theirs_)};
        auto const renames = path_ ? renamesKnownToGit() : RenamesOfMerge();
        auto const merge =
            project::stores::mergeTexts(texts.base, texts.ours, texts.theirs, renames.ours, renames.theirs);
        replace(*ours_, merge.textWithMarkers());
        reportSuggested(renames, texts);
        for (auto const& conflict : merge.conflicts()) {
            printError(Message("ConflictIn", path_.value_or(*ours_), inWords(conflict)));
        }
        return merge.conflicts().empty() ? 0 : 1;
    }

    RenamesOfMerge renamesKnownToGit() const try {
        auto const ids = runGit(workingFolder(), {"hash-object", "--no-filters", "--stdin-paths"},
                                *base_ + '\n' + *ours_ + '\n' + *theirs_ + '\n');
        std::istringstream lines(ids.output);
        ThreeWay<std::string> versions;
        lines >> versions.base >> versions.ours >> versions.theirs;
        return renamesOfMerge(workingFolder(), *path_, versions);

    } catch (std::runtime_error const&) {

        return {}; // git cannot be called
    }

    /// Names the files of the project whose place git only suggests.
    static void reportSuggested(RenamesOfMerge const& renames, ThreeWay<std::string> const& texts) {
        for (auto const& [from, to] : renames.suggested) {
            std::string path;
            appendJsonString(path, from);
            auto const has = [&](std::string const& text) { return text.find(path) != std::string::npos; };
            if (has(texts.ours) || has(texts.theirs)) {
                printError(Message("MergePlaceSuggested", from, to));
            }
        }
    }

    static std::string contentOf(std::string const& name) {
        std::ifstream file(name, std::ios::binary);
        std::string result{std::istreambuf_iterator<char>(file), {}};
        if (!file) {
            throw Failure(Message("FileUnreadable", name));
        }
        return result;
    }

    /// Replaces the content of a file as a whole: a full disk leaves the old content.
    static void replace(std::string const& name, std::string const& content) {
        std::string const next = name + ".merged";
        std::ofstream file(next, std::ios::binary | std::ios::trunc);
        file << content << std::flush;
        bool const isWritten = file.good();
        file.close();
        std::error_code error;
        if (isWritten) {
            std::filesystem::rename(next, name, error);
        }
        if (!isWritten || error) {
            std::filesystem::remove(next, error);
            throw Failure(Message("FileUnwritable", name));
        }
    }

    std::optional<std::string> base_;
    std::optional<std::string> ours_;
    std::optional<std::string> theirs_;
    std::optional<std::string> path_;
};

} // namespace

std::unique_ptr<Command> makeMergeCommand() {
    return std::make_unique<MergeCommand>();
}

} // namespace projectctl
