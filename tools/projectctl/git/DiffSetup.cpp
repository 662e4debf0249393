#include "git/DiffSetup.hpp"

#include <filesystem>
#include <fstream>
#include <sstream>
#include <string>
#include <string_view>

#include "git/GitCommand.hpp"
#include "git/ThisProgram.hpp"
#include "output/Failure.hpp"
#include "output/NameForms.hpp"

namespace projectctl {

using fl::filesystem::Path;

namespace {

constexpr char const* filterKey = "diff.project-definition.textconv";
constexpr char const* filterSection = "diff.project-definition";
constexpr std::string_view wordsAttribute = "**/.projectdata/project.jsonl diff=project-definition\n";

/// Git calls it with the name of a file as its last argument.
std::string filterCommand(std::string const& program) {
    auto const quoted = quotedForShell(program);
    return "f() { " + quoted + R"( textconv "$1" 2>/dev/null || cat "$1"; }; f)";
}

/// The repository's own file of attributes, which is not part of its commits.
std::filesystem::path attributesFile(Path const& folder) {
    auto const answer =
        runGit(folder, {"rev-parse", "--path-format=absolute", "--git-path", "info/attributes"});
    if (answer.exitCode != 0) {
        throw Failure(Message("GitFailed", answer.errors.substr(0, answer.errors.find('\n'))));
    }
    return answer.output.substr(0, answer.output.find('\n'));
}

std::string readAttributes(std::filesystem::path const& file) {
    std::ostringstream content;
    content << std::ifstream(file, std::ios::binary).rdbuf();
    return content.str();
}

void writeAttributes(std::filesystem::path const& name, std::string const& content) {
    std::error_code error;
    std::filesystem::create_directories(name.parent_path(), error);
    std::ofstream file(name, std::ios::binary | std::ios::trunc);
    file << content << std::flush;
    if (!file) {
        throw Failure(Message("FileUnwritable", name.string()));
    }
}

} // namespace

void setUpDiff(Path const& folder) {
    configureGit(folder, filterKey, filterCommand(thisProgram()));
    auto const file = attributesFile(folder);
    auto content = readAttributes(file);
    if (content.find(wordsAttribute) == std::string::npos) {
        content += content.empty() || content.ends_with('\n') ? "" : "\n";
        writeAttributes(file, content + std::string(wordsAttribute));
    }
}

void removeDiffSetup(Path const& folder) {
    runGit(folder, {"config", "--remove-section", filterSection}); // which fails if it is not there
    auto const file = attributesFile(folder);
    auto content = readAttributes(file);
    auto const at = content.find(wordsAttribute);
    if (at != std::string::npos) {
        writeAttributes(file, content.erase(at, wordsAttribute.size()));
    }
}

} // namespace projectctl
