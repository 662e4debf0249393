#include <array>
#include <random>
#include <sstream>

#include <sys/stat.h>

#include "git/GitRepository.hpp"
#include "project/git/GitError.hpp"

namespace project::git {
namespace {

using std::filesystem::perms;

/// Random changes in a small work tree, by hand, by git and by the adapter. After each, the adapter must
/// agree with git about every name, and must stage as git does.
class RandomWork {
public:
    RandomWork(unsigned seed, GitRepository const& repository, std::filesystem::path indexCopy)
        : random_(seed),
          repository_(repository),
          indexCopy_(std::move(indexCopy)),
          adapter_(repository.root()) {}

    void doSomething() {
        auto const name = std::string(pick(names));
        done_ += "\n" + name + ": ";
        switch (below(15)) {
        case 0:
        case 1:
        case 2:
            write(name);
            break;
        case 3:
            note("rm -r");
            removeFromDisk(name);
            break;
        case 4:
            link(name);
            break;
        case 5:
            changeMode(name);
            break;
        case 6:
            rename(name, std::string(pick(names)));
            break;
        case 7:
            git({"add", "-A", "--", name});
            break;
        case 8:
            git({"rm", "-q", "-r", "--cached", "--force", "--", name});
            break;
        case 9:
            git({"commit", "-q", "-m", "some"});
            break;
        case 10:
            git({below(2) == 0 ? "reset" : "stash", "-q"});
            break;
        case 11:
            git({"add", "-N", "--", name});
            break;
        case 12:
            writeIgnoreRules();
            break;
        default:
            below(3) == 0 ? removeLikeGit(name) : addLikeGit(name);
        }
    }

    void expectAgreement() {
        auto const expected = repository_.statusStates();
        auto const ignored = ignoredFolders();
        for (auto const& [name, state] : repository_.adapterStates(adapter_, {names.begin(), names.end()})) {
            EXPECT_EQ(state, expectedState(name, expected, ignored)) << name << " after" << done_;
        }
    }

private:
    static constexpr std::array<char const*, 14> names{"a",     "b",       "d",        "d/a",  "d/b",
                                                       "d/e",   "d/e/a",   "d/e/\xff", "D",    "d.a",
                                                       "sp ce", "d/e/f/a", "out",      "out/a"};

    template <std::size_t Count>
    char const* pick(std::array<char const*, Count> const& values) {
        return values[below(Count)];
    }

    std::size_t below(std::size_t count) {
        return std::uniform_int_distribution<std::size_t>(0, count - 1)(random_);
    }

    void note(std::string const& what) { done_ += what; }

    std::filesystem::path onDisk(std::string const& name) const { return repository_.onDisk() / name; }

    std::filesystem::file_type typeOf(std::string const& name) const {
        std::error_code nothingThere;
        return std::filesystem::symlink_status(onDisk(name), nothingThere).type();
    }

    void removeFromDisk(std::string const& name) const {
        std::error_code notBelowAFile;
        std::filesystem::remove_all(onDisk(name), notBelowAFile);
    }

    /// Makes room for a file or link: removes the entry at its path, and files in place of the folders above.
    void makeRoom(std::string const& name) {
        for (auto slash = name.find('/'); slash != std::string::npos; slash = name.find('/', slash + 1)) {
            if (typeOf(name.substr(0, slash)) != std::filesystem::file_type::directory) {
                removeFromDisk(name.substr(0, slash));
            }
        }
        std::filesystem::create_directories(onDisk(name).parent_path());
        removeFromDisk(name);
    }

    void write(std::string const& name) {
        std::string const content = pick(std::array{"1\n", "2\n", "", "long\n"});
        note("write " + content.substr(0, 1));
        auto const isFile = typeOf(name) == std::filesystem::file_type::regular;
        if (!isFile || below(2) == 0) {
            makeRoom(name);
        }
        repository_.write(name, content);
    }

    void link(std::string const& name) {
        note("link");
        makeRoom(name);
        std::filesystem::create_symlink(pick(std::array{".", "nowhere", "else"}), onDisk(name));
    }

    void changeMode(std::string const& name) {
        note("chmod");
        if (typeOf(name) == std::filesystem::file_type::regular) {
            std::filesystem::permissions(onDisk(name), perms{below(2) == 0 ? 0755U : 0644U});
        }
    }

    void rename(std::string const& from, std::string const& to) {
        note("rename to " + to);
        std::error_code impossible;
        std::filesystem::rename(onDisk(from), onDisk(to), impossible);
    }

    void writeIgnoreRules() {
        std::string const place = pick(std::array{".gitignore", "d/.gitignore"});
        std::string rules;
        for (auto count = below(4); count > 0; --count) {
            rules += std::string(pick(std::array{"a", "/a", "e/", "out/", "*", "!a", "d/e", "!/d", "d/*",
                                                 "**/a", "sp ce", "!d/e/a", "out", "D", "!e/"})) +
                     "\n";
        }
        note(place + " = " + rules);
        if (place == ".gitignore" || typeOf("d") == std::filesystem::file_type::directory) {
            repository_.write(place, rules);
        }
    }

    /// git may refuse.
    void git(std::vector<std::string> const& arguments) {
        note("git " + arguments[0] + (arguments[1] == "-N" ? " -N" : ""));
        try {
            repository_.run(arguments);
        } catch (std::runtime_error const&) {
            note(" refused");
        }
    }

    void addLikeGit(std::string const& name) {
        note("add");
        auto const type = typeOf(name);
        copyIndex();
        if (type == std::filesystem::file_type::regular || type == std::filesystem::file_type::symlink) {
            runOnCopy({"add", "--force", "--", name});
        }
        adapter_.addToSourceControl({repository_.path(name)});
        expectLikeCopy();
    }

    void removeLikeGit(std::string const& name) {
        note("remove");
        copyIndex();
        runOnCopy({"rm", "-q", "-r", "--cached", "--force", "--ignore-unmatch", "--", name});
        adapter_.removeFromSourceControl({repository_.path(name)});
        expectLikeCopy();
    }

    void copyIndex() const {
        std::filesystem::remove(indexCopy_);
        if (std::filesystem::exists(repository_.indexFile())) {
            std::filesystem::copy_file(repository_.indexFile(), indexCopy_);
        }
    }

    void runOnCopy(std::vector<std::string> const& arguments) {
        try {
            repository_.runOnIndex(indexCopy_, arguments);
        } catch (std::runtime_error const&) {
            note(" refused"); // a file beyond a link
        }
    }

    void expectLikeCopy() const {
        EXPECT_EQ(repository_.index(),
                  repository_.runOnIndex(indexCopy_, {"ls-files", "-z", "-s", "-t", "-v"}))
            << "after" << done_;
    }

    /// Of the folders among the names that are on disk.
    std::vector<std::string> ignoredFolders() const {
        std::vector<std::string> command{"-c", "core.quotePath=false", "check-ignore", "--no-index", "--"};
        for (std::string const name : names) {
            if (typeOf(name) == std::filesystem::file_type::directory && !isBeyondLink(name)) {
                command.push_back(name);
            }
        }
        std::vector<std::string> result;
        try {
            std::istringstream answer(command.size() > 5 ? repository_.run(command) : "");
            for (std::string line; std::getline(answer, line);) {
                result.push_back(line);
            }
        } catch (std::runtime_error const& error) {
            EXPECT_TRUE(std::string(error.what()).ends_with(": "))
                << error.what(); // without a message of git's
        }
        return result;
    }

    bool isBeyondLink(std::string const& name) const {
        for (auto slash = name.find('/'); slash != std::string::npos; slash = name.find('/', slash + 1)) {
            if (typeOf(name.substr(0, slash)) == std::filesystem::file_type::symlink) {
                return true;
            }
        }
        return false;
    }

    int expectedState(std::string const& name, States const& status,
                      std::vector<std::string> const& ignored) const {
        bool const isBeyond = isBeyondLink(name);
        auto const type = isBeyond ? std::filesystem::file_type::not_found : typeOf(name);
        auto const found = status.find(name);
        bool const isThere =
            std::filesystem::file_type::none != type && type != std::filesystem::file_type::not_found;
        bool const isFolder = type == std::filesystem::file_type::directory;
        bool const mayBeFolder = !isThere || isFolder;
        auto const below = status.lower_bound(name + "/");
        bool isTrackedBelow = false;
        for (auto at = below; at != status.end() && at->first.starts_with(name + "/"); ++at) {
            isTrackedBelow = isTrackedBelow || (at->second != 0 && at->second != 2 && at->second != 6);
        }
        if (found != status.end() && found->second != 6) {
            return found->second;
        }
        if (mayBeFolder && isTrackedBelow) {
            return 1;
        }
        if (found != status.end()) {
            return found->second;
        }
        if (isBeyond) {
            return 8;
        }
        if (!isFolder) {
            return 9;
        }
        return std::find(ignored.begin(), ignored.end(), name) != ignored.end() ? 2 : 0;
    }

    std::mt19937 random_;
    GitRepository repository_;
    std::filesystem::path indexCopy_;
    GitAdapter adapter_;
    std::string done_;
};

class RandomChanges : public ::testing::TestWithParam<unsigned> {};

TEST_P(RandomChanges, areSeenAndStagedAsGitDoes) {
    test::TemporaryFolder folder;
    auto const repository = GitRepository::init(folder.addFolder("work"));
    if (GetParam() % 2 == 0) {
        repository.write("d/e/a", "1\n");
        repository.write("a", "1\n");
        repository.commitAll();
    }
    RandomWork work(GetParam(), repository, folder.onDisk() / "index-copy");
    for (int i = 0; i < 60 && !HasFailure(); ++i) {
        work.doSomething();
        work.expectAgreement();
    }
}

INSTANTIATE_TEST_SUITE_P(Seeds, RandomChanges, ::testing::Range(1U, 9U));

} // namespace
} // namespace project::git
