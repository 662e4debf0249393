#include <algorithm>
#include <cstdint>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <map>
#include <optional>
#include <random>
#include <regex>
#include <set>
#include <string>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "fl/i18n/Utf8.hpp"
#include "project/session.hpp"
#include "support/GitFolder.hpp"
#include "support/NightlyScale.hpp"
#include "support/TemporaryFolder.hpp"

namespace project::session {
namespace {

namespace disk = std::filesystem;

using fl::i18n::fromUtf8;
using fl::i18n::toUtf8;

using Names = std::set<std::string>;

/// Patterns of rules, each with a regular expression of the same meaning.
std::map<std::string, std::regex> const patterns{
    {"*.c", std::regex(R"([^/]*\.c)")},
    {"**/*.c", std::regex(R"((.*/)?[^/]*\.c)")},
    {"a", std::regex("a")},
    {"a/**", std::regex("a/.+")},
    {"**/b/*", std::regex(R"((.*/)?b/[^/]*)")},
    {"[ab]*", std::regex("[ab][^/]*")},
    {"**/x.?", std::regex(R"((.*/)?x\.[^/])")},
    {"**", std::regex(".+")},
};

bool isMatch(std::string const& pattern, std::string const& path) {
    return std::regex_match(path, patterns.at(pattern));
}

std::string folderOf(std::string const& path) {
    auto const end = path.rfind('/');
    return end == std::string::npos ? "" : path.substr(0, end);
}

bool isBelow(std::string const& path, std::string const& folder) {
    return folder.empty() ? !path.empty() : path.starts_with(folder + '/');
}

/// A rule, and the files and folders of a project as the rules say that they are after a synchronisation.
struct ModelRule {
    Names included;
    Names excluded;
};

class Model {
public:
    std::map<std::string, ModelRule> rules;
    Names files; ///< of the project
    Names folders;

    void add(std::string const& file) {
        files.insert(file);
        for (auto folder = folderOf(file); !folder.empty(); folder = folderOf(folder)) {
            folders.insert(folder);
        }
    }

    void synchronise(Names const& filesOnDisk, Names const& foldersOnDisk) {
        std::erase_if(files, [&](auto const& file) {
            return !filesOnDisk.contains(file) && !foldersOnDisk.contains(file) && ruleAbove(file) &&
                   !hasRuleAtOrBelow(file);
        });
        for (auto const& file : filesOnDisk) {
            if (isCovered(file)) {
                add(file);
            }
        }
        Names remaining;
        for (auto folder = folders.rbegin(); folder != folders.rend(); ++folder) {
            bool const isKept = foldersOnDisk.contains(*folder) || filesOnDisk.contains(*folder) ||
                                !ruleAbove(*folder) || isAnythingBelow(*folder, remaining);
            if (isKept) {
                remaining.insert(*folder);
            }
        }
        folders = remaining;
    }

private:
    std::optional<std::string> ruleAbove(std::string path) const {
        while (!path.empty()) {
            path = folderOf(path);
            if (rules.contains(path)) {
                return path;
            }
        }
        return std::nullopt;
    }

    bool isCovered(std::string const& file) const {
        auto const folder = ruleAbove(file);
        if (!folder) {
            return false;
        }
        auto const& rule = rules.at(*folder);
        auto below = file.substr(folder->empty() ? 0 : folder->size() + 1);
        auto const matches = [&below](auto const& pattern) { return isMatch(pattern, below); };
        if (!rule.included.empty() && std::ranges::none_of(rule.included, matches)) {
            return false;
        }
        for (; !below.empty(); below = folderOf(below)) {
            if (std::ranges::any_of(rule.excluded, matches)) {
                return false;
            }
        }
        return true;
    }

    bool isAnythingBelow(std::string const& folder, Names const& remaining) const {
        auto const isIn = [&folder](auto const& path) { return isBelow(path, folder); };
        return hasRuleAtOrBelow(folder) || std::ranges::any_of(files, isIn) ||
               std::ranges::any_of(remaining, isIn);
    }

    bool hasRuleAtOrBelow(std::string const& folder) const {
        return std::ranges::any_of(rules, [&folder](auto const& rule) {
            return rule.first == folder || isBelow(rule.first, folder);
        });
    }
};

/// A random tree on disk, with random rules.
class SyncModel : public ::testing::Test {
protected:
    std::string randomPath() {
        std::string result = randomName();
        while (random_() % 3 != 0) {
            result += '/' + randomName();
        }
        return result;
    }

    std::string randomName() {
        static std::vector<std::string> const names{"a", "b", "c", "x.c", "x.o", "a.c", "b-b"};
        return names[random_() % names.size()];
    }

    Names randomPatterns() {
        Names result;
        while (random_() % 2 == 0) {
            result.insert(
                std::next(patterns.begin(), static_cast<std::ptrdiff_t>(random_() % patterns.size()))->first);
        }
        return result;
    }

    void changeDisk() {
        auto const path = folder_.onDisk() / randomPath();
        std::error_code ignored; // a file may be in the way
        if (random_() % 3 == 0) {
            disk::remove_all(path, ignored);
        } else if (!disk::exists(path) && !disk::create_directories(path.parent_path(), ignored) && ignored) {
            return;
        } else if (!disk::exists(path)) {
            std::ofstream(path) << "content";
        }
    }

    void setRule(Session& session) {
        auto const folder = random_() % 4 == 0 ? std::string() : randomPath();
        if (!disk::is_directory(folder_.onDisk() / folder)) {
            return;
        }
        ModelRule const rule{randomPatterns(), randomPatterns()};
        model_.rules[folder] = rule;
        session.setSyncRule({folder.empty() ? folder_.root() : folder_.path(fromUtf8(folder)),
                             inUtf16(rule.included), inUtf16(rule.excluded)});
    }

    static std::set<std::u16string> inUtf16(Names const& names) {
        std::set<std::u16string> result;
        std::ranges::transform(names, std::inserter(result, result.end()),
                               [](auto const& name) { return fromUtf8(name); });
        return result;
    }

    /// The entries on disk.
    Names onDisk(bool areFolders) const {
        Names result;
        for (auto entry = disk::recursive_directory_iterator(folder_.onDisk());
             entry != disk::recursive_directory_iterator(); ++entry) {
            if (entry->path().filename() == ".projectdata" || entry->path().filename() == ".git") {
                entry.disable_recursion_pending();
            } else if (entry->is_directory() == areFolders) {
                result.insert(disk::relative(entry->path(), folder_.onDisk()).string());
            }
        }
        return result;
    }

    static Names listed(Session& session) {
        Names result;
        for (auto const& file : session.find({})) {
            result.insert(toUtf8(metadata::getRelativePath(session.root(), file.path)));
        }
        return result;
    }

    test::TemporaryFolder folder_;
    std::uint64_t seed_ = test::testSeed();
    testing::ScopedTrace trace_{__FILE__, __LINE__, "PROJECT_TEST_SEED=" + std::to_string(seed_)};
    std::mt19937_64 random_{seed_};
    Model model_;
};

TEST_F(SyncModel, randomTreesAndRulesAgreeWithTheModel) {
    auto session = Session::create(folder_.root(), u"Engine", {SourceControl::Off});
    for (unsigned round = 0; round < 120; ++round) {
        for (auto changes = random_() % 12; changes > 0; --changes) {
            changeDisk();
        }
        if (random_() % 4 == 0) {
            setRule(session);
        }
        if (auto const path = randomPath(); disk::is_regular_file(folder_.onDisk() / path)) {
            session.project().getFileManager().add({folder_.path(fromUtf8(path))});
            model_.add(path);
        }
        model_.synchronise(onDisk(false), onDisk(true));

        session.sync({.removesMissingFolders = true});

        Names expected = model_.files;
        expected.insert(model_.folders.begin(), model_.folders.end());
        ASSERT_EQ(listed(session), expected) << "in round " << round;
        ASSERT_TRUE(session.sync().isEmpty()) << "in round " << round;
    }
}

TEST_F(SyncModel, filesOfRandomTreesAndIgnoreRulesAgreeWithGit) {
    test::GitFolder const git(folder_.onDisk());
    auto session = Session::create(folder_.root(), u"Engine", {SourceControl::Off});
    session.setSyncRule({folder_.root()});
    std::vector<std::string> const lines{"*.c", "!x.c", "a/", "/b", "**/b-b", "!a/", "c/*", "!c/a", "x.?"};
    for (unsigned round = 0; round < 40; ++round) {
        for (auto changes = random_() % 20; changes > 0; --changes) {
            changeDisk();
        }
        auto const place = random_() % 3 == 0 ? randomName() + '/' : std::string();
        if (place.empty() || disk::is_directory(folder_.onDisk() / place)) {
            folder_.addFile(place + ".gitignore",
                            lines[random_() % lines.size()] + '\n' + lines[random_() % lines.size()] + '\n');
        }
        if (auto const path = randomPath(); disk::is_regular_file(folder_.onDisk() / path)) {
            git.run({"add", "-f", path});
        }
        Names expected;
        auto const output = git.run({"ls-files", "-z", "--cached", "--others", "--exclude-standard"});
        for (std::size_t from = 0; from < output.size(); from = output.find('\0', from) + 1) {
            std::string const name = &output[from];
            if (!name.starts_with(".projectdata/") && disk::is_regular_file(folder_.onDisk() / name)) {
                expected.insert(name);
            }
        }
        for (auto const& file : session.planSync().added) {
            ASSERT_TRUE(expected.contains(toUtf8(metadata::getRelativePath(folder_.root(), file.path))))
                << "in round " << round << ": " << toUtf8(file.path.native());
        }
        session.sync({.removesMissingFolders = true});

        auto const result = listed(session);
        ASSERT_TRUE(std::ranges::includes(result, expected)) << "in round " << round;
    }
}

} // namespace
} // namespace project::session
