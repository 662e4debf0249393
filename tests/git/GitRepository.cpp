#include "git/GitRepository.hpp"

#include <fstream>
#include <stdexcept>

#include <git2.h>

#include "support/RunningProgram.hpp"

namespace project::git {

namespace {

/// Keeps libgit2 from reading the configuration of the machine and of its user.
class NoOutsideConfiguration : public ::testing::Environment {
public:
    void SetUp() override {
        git_libgit2_init();
        for (auto const level : {GIT_CONFIG_LEVEL_SYSTEM, GIT_CONFIG_LEVEL_GLOBAL, GIT_CONFIG_LEVEL_XDG}) {
            git_libgit2_opts(GIT_OPT_SET_SEARCH_PATH, level, "/nowhere");
        }
    }

    void TearDown() override { git_libgit2_shutdown(); }
};

auto const* const environment = ::testing::AddGlobalTestEnvironment(new NoOutsideConfiguration);

/// From the two letters of `git status --porcelain=v2`: the index against the last commit, the disk against
/// the index.
int stateFromLetters(char staged, char onDisk) {
    if (staged == 'D' && onDisk == '.') {
        return 6;
    }
    if (staged == 'D' || onDisk == 'D') {
        return 3; // removed and intended to be added again, or deleted from the disk
    }
    if (staged == 'A' || onDisk == 'A') {
        return 5;
    }
    if (staged == 'T' || onDisk == 'T') {
        return 7;
    }
    if (staged == 'M' || onDisk == 'M') {
        return 3;
    }
    throw std::runtime_error(std::string("unknown letters of git status: ") + staged + onDisk);
}

/// The part of a record after so many spaces.
std::string afterSpaces(std::string const& record, int count) {
    std::size_t position = 0;
    for (int i = 0; i < count; ++i) {
        position = record.find(' ', position) + 1;
    }
    return record.substr(position);
}

void collect(std::string const& record, States& states) {
    if (record[0] == '1') {
        states[afterSpaces(record, 8)] = stateFromLetters(record[2], record[3]);
    } else if (record[0] == 'u') {
        states[afterSpaces(record, 10)] = 4;
    } else if (record[0] == '?' || record[0] == '!') {
        states.try_emplace(record.substr(2),
                           record[0] == '?' ? 0 : 2); // a staged removal has its own record before
    } else {
        throw std::runtime_error("unknown record of git status: " + record);
    }
}

} // namespace

std::string runGit(std::filesystem::path const& folder, std::vector<std::string> const& arguments,
                   std::map<std::string, std::string> const& environmentOfRun) {
    std::vector<std::string> command{"git",
                                     "-c",
                                     "user.name=Tester",
                                     "-c",
                                     "user.email=tester@example.org",
                                     "-c",
                                     "protocol.file.allow=always",
                                     "-c",
                                     "advice.addIgnoredFile=false"};
    command.insert(command.end(), arguments.begin(), arguments.end());
    test::ProgramSettings settings;
    settings.folder = folder;
    settings.environment = environmentOfRun;
    settings.environment.insert(
        {{"GIT_CONFIG_GLOBAL", "/dev/null"}, {"GIT_CONFIG_NOSYSTEM", "1"}, {"HOME", "/nowhere"}});
    auto const result = test::runProgram(command, settings);
    if (result.exitCode != 0) {
        throw std::runtime_error("git " + arguments.front() + ": " + result.errors);
    }
    return result.output;
}

std::vector<std::string> recordsOf(std::string const& text) {
    std::vector<std::string> result;
    for (std::size_t begin = 0; begin < text.size();) {
        auto const end = text.find('\0', begin);
        result.push_back(text.substr(begin, end - begin));
        begin = end + 1;
    }
    return result;
}

GitRepository GitRepository::init(std::filesystem::path const& workTree) {
    runGit(workTree, {"init", "-q", "-b", "main"});
    return GitRepository(workTree);
}

std::vector<Path> GitRepository::paths(std::vector<std::string> const& names) const {
    std::vector<Path> result;
    result.reserve(names.size());
    for (auto const& name : names) {
        result.push_back(path(name));
    }
    return result;
}

std::string GitRepository::run(std::vector<std::string> const& arguments) const {
    return runGit(workTree_, arguments, environment_);
}

std::string GitRepository::runOnIndex(std::filesystem::path const& index,
                                      std::vector<std::string> const& arguments) const {
    auto variables = environment_;
    variables["GIT_INDEX_FILE"] = index;
    return runGit(workTree_, arguments, variables);
}

void GitRepository::commitAll() const {
    run({"add", "-A"});
    run({"commit", "-q", "--allow-empty", "-m", "a commit"});
}

void GitRepository::write(std::string const& name, std::string const& content) const {
    std::filesystem::create_directories((workTree_ / name).parent_path());
    std::ofstream(workTree_ / name, std::ios::binary) << content;
}

std::filesystem::path GitRepository::indexFile() const {
    auto name = run({"rev-parse", "--path-format=absolute", "--git-path", "index"});
    name.pop_back();
    return name;
}

States GitRepository::statusStates() const {
    States result;
    for (auto const& name : recordsOf(run({"ls-files", "-z"}))) {
        result[name] = 1;
    }
    States changed;
    for (auto const& record : recordsOf(run({"status", "--porcelain=v2", "-z", "--untracked-files=all",
                                             "--ignored", "--no-renames", "--ignore-submodules=dirty"}))) {
        collect(record, changed);
    }
    for (auto const& [name, state] : changed) {
        result[name] = state;
    }
    return result;
}

States GitRepository::adapterStates(GitAdapter& adapter, std::vector<std::string> const& names) const {
    auto const states = adapter.getFileStates(paths(names));
    States result;
    for (auto const& name : names) {
        auto const found = states.find(path(name));
        result[name] = found == states.end() ? -1 : static_cast<int>(found->second.getState());
    }
    return result;
}

} // namespace project::git
