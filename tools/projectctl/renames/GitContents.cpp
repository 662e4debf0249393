#include "renames/GitContents.hpp"

#include <cstdlib>
#include <filesystem>
#include <system_error>
#include <utility>

#include "git/GitCommand.hpp"
#include "git/RawChanges.hpp"
#include "output/Failure.hpp"

namespace projectctl {

namespace {

std::vector<std::string_view> split(std::string_view text, char end) {
    std::vector<std::string_view> result;
    while (!text.empty()) {
        auto const length = std::min(text.find(end), text.size());
        result.push_back(text.substr(0, length));
        text.remove_prefix(std::min(length + 1, text.size()));
    }
    return result;
}

std::string joined(std::vector<std::string> const& names) {
    std::string result;
    for (auto const& name : names) {
        result.append(name).append(1, '\0');
    }
    return result;
}

std::string newFolder() {
    auto pattern = (std::filesystem::temp_directory_path() / "projectctl-XXXXXX").string();
    if (mkdtemp(pattern.data()) == nullptr) {
        throw std::system_error(errno, std::generic_category(), pattern);
    }
    return pattern;
}

/// The lines of an index without stages.
std::string indexInfo(GitContents const& contents, std::string const& prefix) {
    std::string result;
    for (auto const& [name, content] : contents) {
        result.append(content.mode).append(1, ' ').append(content.id).append(1, '\t');
        result.append(prefix).append(name).append(1, '\0');
    }
    return result;
}

bool isFile(std::string_view mode) {
    return mode.starts_with("100") || mode.starts_with("120");
}

} // namespace

GitContentQuery::GitContentQuery(Path const& root) : root_(root), folder_(newFolder()) {
    auto const answer = ask({"rev-parse", "--path-format=absolute", "--git-path", "index", "--git-path",
                             "objects", "--show-object-format", "--show-prefix"});
    auto const lines = split(answer, '\n');
    if (lines.size() < 3) {
        throw Failure(Message("GitFailed", answer));
    }
    index_ = lines[0];
    objects_ = lines[1];
    emptyId_ = lines[2] == "sha256" ? "473a0f4c3be8a93681a267e3b1e9a7dcda1185436fe141f7749120a303721813"
                                    : "e69de29bb2d1d6434b8b29ae775ad8c2e48c5391";
    prefix_ = lines.size() > 3 ? lines[3] : std::string_view();
    std::filesystem::create_directory(temporary("objects"));
}

GitContentQuery::~GitContentQuery() {
    std::error_code ignored;
    std::filesystem::remove_all(folder_, ignored);
}

std::optional<std::string> GitContentQuery::lastCommitOf(std::string const& file) const {
    auto const result = runGit(root_, {"log", "-1", "--format=%H", "--", file});
    bool const isFound = result.exitCode == 0 && result.output.size() > 1;
    return isFound ? std::optional(result.output.substr(0, result.output.size() - 1)) : std::nullopt;
}

GitContents GitContentQuery::of(std::string const& commit) const {
    GitContents result;
    auto const answer = ask({"ls-tree", "-r", "-z", commit});
    for (auto const line : split(answer, '\0')) { // "100644 blob <id>\t<name>"
        auto const tab = line.find('\t');
        auto const words = split(line.substr(0, tab), ' ');
        if (tab != line.npos && words.size() == 3 && isFile(words[0])) {
            result.emplace(line.substr(tab + 1), GitContent{std::string(words[0]), std::string(words[2])});
        }
    }
    return result;
}

GitContents GitContentQuery::deleted(std::vector<std::string> const& files) const {
    GitContents result;
    std::string input = "HEAD\n--\n";
    for (auto const& file : files) {
        bool const isLine = file.find('\n') == file.npos; // git reads the names as lines
        input += isLine ? file + '\n' : std::string();
    }
    auto const answer = runGit(root_,
                               {"--literal-pathspecs", "log", "--diff-filter=D", "--no-renames", "--raw",
                                "--no-abbrev", "--relative", "-z", "--format=", "--stdin"},
                               input);
    for (auto const& change : readRawChanges(answer.output)) {
        result.try_emplace(change.from, GitContent{"100644", change.before}); // the newest is the first
    }
    return result;
}

std::vector<std::string> GitContentQuery::tracked() const {
    auto const answer = ask({"ls-files", "-z"});
    auto const names = split(answer, '\0');
    return {names.begin(), names.end()};
}

std::vector<std::string> GitContentQuery::untracked() const {
    auto const answer = ask({"ls-files", "-z", "--others", "--exclude-standard"});
    auto const names = split(answer, '\0');
    return {names.begin(), names.end()};
}

GitContents GitContentQuery::staged(std::vector<std::string> const& onDisk) const {
    auto const copy = temporary("index");
    std::error_code missing;
    std::filesystem::copy_file(index_, copy, std::filesystem::copy_options::overwrite_existing, missing);
    if (!onDisk.empty()) {
        askOn(copy, {"update-index", "--add", "--replace", "--info-only", "-z", "--stdin"}, joined(onDisk));
    }
    GitContents result;
    auto const answer = askOn(copy, {"ls-files", "-s", "-z"});
    for (auto const line : split(answer, '\0')) { // "100644 <id> 0\t<name>"
        auto const tab = line.find('\t');
        auto const words = split(line.substr(0, tab), ' ');
        if (tab != line.npos && words.size() == 3 && isFile(words[0]) && words[2] == "0") {
            result.emplace(line.substr(tab + 1), GitContent{std::string(words[0]), std::string(words[1])});
        }
    }
    return result;
}

std::vector<GitRename> GitContentQuery::similar(GitContents const& before, GitContents const& onDisk,
                                                int similarity) const {
    std::vector<GitRename> result;
    if (before.empty() || onDisk.empty()) {
        return result;
    }
    auto const earlier = newIndex("earlier");
    askOn(earlier, {"update-index", "--add", "-z", "--index-info"}, indexInfo(before, prefix_));
    auto tree = askOn(earlier, {"write-tree", "--missing-ok"});
    tree.pop_back(); // the line feed
    auto const later = newIndex("later");
    std::vector<std::string> names;
    for (auto const& [name, content] : onDisk) {
        names.push_back(name);
    }
    askOn(later, {"update-index", "--add", "--info-only", "-z", "--stdin"}, joined(names));
    auto const answer = askOn(later, {"diff-index", "-r", "-z", "--raw", "--relative", "-l0",
                                      "-M" + std::to_string(similarity) + '%', "--diff-filter=R", tree});
    for (auto const& change : readRawChanges(answer)) {
        result.push_back({change.from, change.to, change.similarity});
    }
    return result;
}

std::string GitContentQuery::newIndex(char const* name) const {
    auto result = temporary(name);
    std::filesystem::remove(result); // that of an earlier question
    return result;
}

std::string GitContentQuery::ask(Arguments const& arguments, std::string_view input) const {
    auto result = runGit(root_, arguments, input);
    if (result.exitCode != 0) {
        throw Failure(Message("GitFailed", result.errors.substr(0, result.errors.find('\n'))));
    }
    return std::move(result.output);
}

/// Asks about another index than git's own. New objects are stored beside it.
std::string GitContentQuery::askOn(std::string const& index, Arguments const& arguments,
                                   std::string_view input) const {
    Arguments all{"-c", "core.splitIndex=false", "-c", "core.safecrlf=false",
                  "-c", "core.fsmonitor=false",  "-c", "core.fsync=none"};
    all.insert(all.end(), arguments.begin(), arguments.end());
    auto result = runGit(root_, all, input,
                         {"GIT_INDEX_FILE=" + index, "GIT_OBJECT_DIRECTORY=" + temporary("objects"),
                          "GIT_ALTERNATE_OBJECT_DIRECTORIES=" + objects_});
    if (result.exitCode != 0) {
        throw Failure(Message("GitFailed", result.errors.substr(0, result.errors.find('\n'))));
    }
    return std::move(result.output);
}

} // namespace projectctl
