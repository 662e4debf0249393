// Every pair of changes, made on two branches through the managers and merged by git with the tool as its
// merge driver, against both made in one project.
#include <filesystem>
#include <fstream>
#include <iterator>
#include <map>
#include <optional>
#include <sstream>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "project/core/FileManager.hpp"
#include "project/stores/TextMerge.hpp"
#include "stores/merge_matrix/ExpectedMerges.hpp"
#include "support/GitFolder.hpp"
#include "support/NightlyScale.hpp"

namespace project::test {

using stores::mergeTexts;

namespace {

constexpr char const* textPath = ".projectdata/project.jsonl";
constexpr char const* attributes = "project.jsonl -text merge=project-definition\n";

/// A repository in which projectctl merges texts, with a commit for each version of a text.
class MergingRepository {
public:
    MergingRepository() {
        ProgramSettings settings;
        settings.folder = folder_.onDisk();
        auto const result = runProgram({PROJECTCTL, "init"}, settings); // which sets up the merge driver
        EXPECT_EQ(result.exitCode, 0) << result.errors;
    }

    /// Commits versions of a text, each to a branch of its name.
    /// @param base the branch that they start from; without one they have no common ancestor.
    void commit(std::map<std::string, std::string> const& versions, std::string const& base) const {
        std::ostringstream stream;
        for (auto const& [name, text] : versions) {
            stream << "commit refs/heads/" << name << "\ncommitter A <a@b> 0 +0000\ndata 0\n";
            if (!base.empty()) {
                stream << "from refs/heads/" << base << '\n';
            }
            for (auto const& [path, content] : {std::pair<std::string, std::string>{textPath, text},
                                                {".projectdata/.gitattributes", attributes}}) {
                stream << "M 100644 inline " << path << "\ndata " << content.size() << '\n'
                       << content << '\n';
            }
        }
        git_.run({"fast-import", "--quiet", "--force"}, stream.str());
    }

    void checkOut(std::string const& branch) const { git_.run({"checkout", "-q", "-f", "--detach", branch}); }

    struct Pair {
        std::string ours;
        std::string theirs;
    };

    struct Merged {
        bool isClean;
        std::string text; ///< with markers when it is not clean
    };

    /// Merges many pairs, without touching the work tree.
    std::vector<Merged> mergeAll(std::vector<Pair> const& pairs) const {
        std::string input;
        for (auto const& pair : pairs) {
            input += pair.ours + ' ' + pair.theirs + '\n';
        }
        std::vector<Merged> result;
        std::string trees;
        for (auto const& [isClean, tree] :
             mergesIn(git_.run({"merge-tree", "--stdin", "--allow-unrelated-histories"}, input))) {
            result.push_back({isClean, {}});
            trees += tree + ':' + textPath + '\n';
        }
        std::istringstream texts(git_.run({"cat-file", "--batch"}, trees));
        for (auto& merged : result) {
            merged.text = nextObject(texts);
        }
        return result;
    }

    /// Merges one pair as people do, in the work tree.
    Merged mergeHere(Pair const& pair) const {
        checkOut(pair.ours);
        auto const merge =
            git_.tryTo({"merge", "-q", "-m", "both", "--allow-unrelated-histories", pair.theirs});
        std::ifstream file(folder_.onDisk() / textPath, std::ios::binary);
        Merged result{merge.exitCode == 0, {std::istreambuf_iterator<char>(file), {}}};
        EXPECT_EQ(git_.run({"status", "--porcelain"}).empty(), result.isClean);
        git_.tryTo({"merge", "--abort"});
        return result;
    }

private:
    /// For each merge: whether it is clean, and its tree. A record ends with an empty field after its
    /// messages.
    static std::vector<std::pair<bool, std::string>> mergesIn(std::string const& output) {
        std::vector<std::pair<bool, std::string>> result;
        std::istringstream fields(output);
        for (std::string state, tree;
             std::getline(fields, state, '\0') && std::getline(fields, tree, '\0');) {
            result.emplace_back(state == "1", tree);
            skipRest(fields, state == "1");
        }
        return result;
    }

    /// After a clean merge, only a line end follows; after any other, the entries in conflict, an empty
    /// field, and messages up to the next merge.
    static void skipRest(std::istringstream& fields, bool isClean) {
        std::string field;
        for (int sections = isClean ? 1 : 2; sections > 0 && std::getline(fields, field, '\0');) {
            sections -= field.empty() ? 1 : 0;
        }
    }

    static std::string nextObject(std::istringstream& objects) {
        std::string name;
        std::string kind;
        std::size_t size = 0;
        objects >> name >> kind >> size;
        std::string content(size, '\0');
        objects.ignore();
        objects.read(content.data(), static_cast<std::streamsize>(size));
        return content;
    }

    TemporaryFolder folder_;
    GitFolder const git_{
        folder_.onDisk(),
        {{"PATH", std::filesystem::path(PROJECTCTL).parent_path().string() + ":/usr/bin:/bin"}}};
};

/// Two changes, and how the versions with them are written.
struct Meeting {
    NamedChange const* ours;
    Writing oursWriting;
    NamedChange const* theirs;
    Writing theirsWriting;
};

class GitMergeMatrix : public testing::Test {
protected:
    GitMergeMatrix() {
        std::map<std::string, std::string> versions;
        for (std::size_t number = 0; number < projectChanges().size(); ++number) {
            for (auto const writing : {Writing::Rewriting, Writing::Appending}) {
                auto const text =
                    merges.project().after(merges.common(), projectChanges()[number].make, writing);
                versions.emplace(branchOf(number, writing), text);
            }
        }
        repository.commit({{"common", merges.common()}}, {});
        repository.commit(versions, "common");
        repository.checkOut("common");
    }

    static std::string branchOf(std::size_t number, Writing writing) {
        return "change" + std::to_string(number) + (writing == Writing::Rewriting ? "" : "-tail");
    }

    static std::string branchOf(NamedChange const* change, Writing writing) {
        return branchOf(static_cast<std::size_t>(change - projectChanges().data()), writing);
    }

    /// Every pair with versions written in every way; in the usual run, each pair once, with alternating
    /// sides and ways.
    static std::vector<Meeting> meetings(bool all) {
        std::vector<Meeting> result;
        auto const& changes = projectChanges();
        constexpr Writing writings[] = {Writing::Rewriting, Writing::Appending};
        for (std::size_t i = 0; i < changes.size(); ++i) {
            for (std::size_t j = 0; j < changes.size(); ++j) {
                for (std::size_t way = 0; way < 4; ++way) {
                    bool const isItsTurn = ((i + j) % 2 == 0 ? i <= j : i > j) && way == (i * 7 + j) % 4;
                    if (all || isItsTurn) {
                        result.push_back({&changes[i], writings[way % 2], &changes[j], writings[way / 2]});
                    }
                }
            }
        }
        return result;
    }

    static MergingRepository::Pair branchesOf(Meeting const& meeting) {
        return {branchOf(meeting.ours, meeting.oursWriting), branchOf(meeting.theirs, meeting.theirsWriting)};
    }

    void expectMerged(Meeting const& meeting, MergingRepository::Merged const& merged) const {
        auto const& [ours, oursWriting, theirs, theirsWriting] = meeting;
        SCOPED_TRACE(ours->name + (oursWriting == Writing::Appending ? " (tail)" : "") + " and " +
                     theirs->name + (theirsWriting == Writing::Appending ? " (tail)" : ""));
        if (ours == theirs) {
            EXPECT_TRUE(merged.isClean);
            EXPECT_EQ(contentOf(merged.text), contentOf(merges.project().after(merges.common(), ours->make)));
        } else if (ExpectedMerges::conflict(ours->name, theirs->name).empty()) {
            ASSERT_TRUE(merged.isClean);
            merges.expectBoth(merged.text, *ours, *theirs);
        } else {
            EXPECT_FALSE(merged.isClean);
            EXPECT_EQ(merged.text, withMarkers(*ours, *theirs));
        }
    }

    std::string withMarkers(NamedChange const& ours, NamedChange const& theirs) const {
        auto const& project = merges.project();
        return mergeTexts(merges.common(), project.after(merges.common(), ours.make),
                          project.after(merges.common(), theirs.make))
            .textWithMarkers();
    }

    ExpectedMerges const merges;
    MergingRepository const repository;
};

bool isNightly() {
    return testSeconds(0) > 0;
}

TEST_F(GitMergeMatrix, mergesEveryPairOfChangesLikeBothInOneProject) {
    auto const all = meetings(isNightly());
    std::vector<MergingRepository::Pair> pairs;
    for (auto const& meeting : all) {
        pairs.push_back(branchesOf(meeting));
    }

    auto const merged = repository.mergeAll(pairs);

    ASSERT_EQ(merged.size(), all.size());
    for (std::size_t number = 0; number < all.size(); ++number) {
        expectMerged(all[number], merged[number]);
    }
    RecordProperty("merges", static_cast<int>(all.size()));
}

TEST_F(GitMergeMatrix, mergesTheSameInAWorkTree) {
    auto const all = meetings(false);
    std::size_t const step = isNightly() ? 1 : 29;
    for (std::size_t number = 0; number < all.size(); number += step) {
        expectMerged(all[number], repository.mergeHere(branchesOf(all[number])));
    }
}

/// Projects that were just created: by one side, in a repository that has none yet, or by both.
class GitMergeOfNewProjects : public testing::Test {
protected:
    std::string make(std::u16string const& name, std::u16string const& file,
                     Writing writing = Writing::Rewriting) const {
        return project.after(
            {},
            [&](ProjectManager& it, TemporaryFolder const& folder) {
                it.create(name);
                it.getFileManager().add({folder.path(file)});
            },
            writing);
    }

    MergingRepository::Merged merge(std::string const& ours, std::string const& theirs) const {
        repository.commit({{"ours", ours}}, {});
        repository.commit({{"theirs", theirs}}, {});
        repository.checkOut("ours");
        auto merged = repository.mergeHere({"ours", "theirs"});
        EXPECT_EQ(repository.mergeAll({{"ours", "theirs"}}).front().text, merged.text);
        return merged;
    }

    SampleProject project;
    MergingRepository const repository;
};

TEST_F(GitMergeOfNewProjects, hasTheFilesOfBoth) {
    auto const both = project.after({}, [](ProjectManager& it, TemporaryFolder const& folder) {
        it.create(u"Pumps");
        it.getFileManager().add({folder.path(u"src/one.cpp"), folder.path(u"src/two.cpp")});
    });
    for (auto const writing : {Writing::Rewriting, Writing::Appending}) {
        auto const merged = merge(make(u"Pumps", u"src/one.cpp", writing),
                                  make(u"Pumps", u"src/two.cpp", Writing::Rewriting));

        EXPECT_TRUE(merged.isClean);
        EXPECT_EQ(merged.text, both);
    }
}

TEST_F(GitMergeOfNewProjects, reportsTwoNamesAsAConflict) {
    auto const merged = merge(make(u"Pumps", u"new.txt"), make(u"Station", u"new.txt"));

    EXPECT_FALSE(merged.isClean);
    EXPECT_NE(merged.text.find("<<<<<<< "), std::string::npos);
}

} // namespace

} // namespace project::test
