#include "git/MergeSetup.hpp"

#include <filesystem>
#include <optional>
#include <string>
#include <string_view>
#include <system_error>

#include "git/GitCommand.hpp"
#include "git/ThisProgram.hpp"
#include "output/NameForms.hpp"

namespace projectctl {

namespace {

constexpr char const* driverKey = "merge.project-definition.driver";
constexpr char const* nameKey = "merge.project-definition.name";
constexpr char const* textInProject = "./.projectdata/project.jsonl";

// A merge driver that ends with 1 to 128 reports a conflict, and git then keeps the content of the file of
// "ours". A shell ends with 126 or 127 when it cannot run a program. Both together would lose the other side
// without a trace, so the command runs the program itself and checks its exit code: 0 and 1 are the
// program's answer, anything else is followed by a merge of the lines. When the program failed, the command
// ends with more than 128, which newer versions of git report as an error; the older ones report a conflict,
// and the markers are in the text. The markers have seven characters whatever %L says: the store does not
// recognise any others.
constexpr std::string_view commandStart = "p=";
constexpr std::string_view commandEnd =
    R"(; s=127; if test -f "$p" && test -x "$p"; then "$p" merge %O %A %B %P; s=$?; fi; )"
    R"(test $s -le 1 && exit $s; )"
    R"(printf 'projectctl: the text is merged line by line, since "%%s" did not merge it\n' "$p" >&2; )"
    R"(git merge-file -q --marker-size=7 -L ours -L base -L theirs %A %O %B; m=$?; )"
    R"(test $m -lt 128 && { test $s -eq 126 || test $s -eq 127; } && exit $m; exit 255)";

std::string replaced(std::string text, std::string_view from, std::string_view to) {
    for (auto at = text.find(from); at != std::string::npos; at = text.find(from, at + to.size())) {
        text.replace(at, from.size(), to);
    }
    return text;
}

constexpr std::string_view quoteInQuotes = R"('\'')";

/// The program in single quotes for the shell, and with its percent signs doubled for git.
std::string commandFor(std::string const& program) {
    return std::string(commandStart) + replaced(quotedForShell(program), "%", "%%") + std::string(commandEnd);
}

/// The program that a command of commandFor calls; empty for any other command.
std::optional<std::string> programIn(std::string_view command) {
    if (!command.starts_with(commandStart) || !command.ends_with(commandEnd)) {
        return std::nullopt;
    }
    command.remove_prefix(commandStart.size());
    command.remove_suffix(commandEnd.size());
    if (command.size() < 2) {
        return std::nullopt;
    }
    auto const inside = std::string(command.substr(1, command.size() - 2));
    std::string program = replaced(replaced(inside, quoteInQuotes, "'"), "%%", "%");
    return commandFor(program).substr(commandStart.size(), command.size()) == command
               ? std::optional(std::move(program))
               : std::nullopt;
}

/// Whether git's attributes assign the driver to the text.
bool isAssigned(Path const& folder) {
    std::string const answer = runGit(folder, {"check-attr", "-z", "merge", "--", textInProject}).output;
    return answer.find(std::string("\0merge\0project-definition\0", 26)) != std::string::npos;
}

/// The setup according to git's attributes and configuration, which also apply where there is no work tree.
MergeSetup configuredSetup(Path const& folder) {
    if (!isAssigned(folder)) {
        return MergeSetup::NotAssigned;
    }
    auto const configured = runGit(folder, {"config", "-z", "--get", driverKey});
    if (configured.exitCode != 0) {
        return MergeSetup::Missing;
    }
    auto const program =
        programIn(std::string_view(configured.output).substr(0, configured.output.find('\0')));
    if (!program) {
        return MergeSetup::OtherCommand;
    }
    return canBeRun(*program) ? MergeSetup::Works : MergeSetup::ProgramMissing;
}

bool isInWorkTree(Path const& folder) {
    return runGit(folder, {"rev-parse", "--is-inside-work-tree"}).output == "true\n";
}

} // namespace

MergeSetup mergeSetupOf(Path const& folder) {
    try {
        auto const setup = configuredSetup(folder);
        bool const isKnown = setup == MergeSetup::Works || isInWorkTree(folder); // each question is a process
        return isKnown ? setup : MergeSetup::NoRepository;
    } catch (std::system_error const&) {
        return MergeSetup::NoRepository;
    }
}

void setUpMerge(Path const& folder) {
    std::string const command = commandFor(thisProgram());
    configureGit(folder, nameKey, "projects, by address and key instead of by line");
    configureGit(folder, driverKey, command);
}

} // namespace projectctl
