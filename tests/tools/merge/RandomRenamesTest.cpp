// Random histories of two people who move files and folders, put labels on files, add files and set entry
// points, merged by the real git in both directions.
#include <algorithm>
#include <chrono>
#include <filesystem>
#include <iostream>
#include <map>
#include <random>
#include <set>

#include "support/NightlyScale.hpp"
#include "tools/merge/MergingProject.hpp"

namespace project::test {
namespace {

using Labels = std::set<std::string>;

/// A project as a person sees it. The first label of a file is its own, by which it is found again.
struct ProjectState {
    std::map<std::string, Labels> files;
    std::map<std::string, std::string> entryPoints; ///< the file by the UUID

    std::set<std::string> folders() const {
        std::set<std::string> result;
        for (auto const& [path, labels] : files) {
            for (auto at = path.rfind('/'); at != path.npos && at > 0; at = path.rfind('/', at - 1)) {
                result.insert(path.substr(0, at));
            }
        }
        return result;
    }

    /// The text, with its lines in any order.
    std::string text() const {
        std::string result = "{\"format\":\"project-definition\",\"version\":1}\n"
                             R"({"at":["Categories","Root","Category","c"],"keys":{"Name":"Mark"}})"
                             "\n";
        for (auto const& folder : folders()) {
            result += '"' + folder + "\"\n\"" + folder + "/\"\n";
        }
        std::set<std::string> all;
        for (auto const& [path, labels] : files) {
            result += R"({"file":")" + path +
                      R"(","children":[{"type":"Category","keys":{"UUID":"c"},"children":[)";
            for (auto const& label : labels) {
                result += R"({"type":"Label","keys":{"UUID":")" + label + R"("}},)";
            }
            result.back() = ']';
            result += "}]}\n";
            all.insert(labels.begin(), labels.end());
        }
        for (auto const& label : all) {
            result += R"({"at":["Categories","Root","Category","c","Label",")" + label +
                      R"("],"keys":{"Name":")" + label + "\"}}\n";
        }
        for (auto const& [uuid, path] : entryPoints) {
            result += R"({"at":["EntryPoints","Root","EntryPoint",")" + uuid + R"("],"keys":{"File":")" +
                      path + R"(","Name":")" + uuid + "\",\"Type\":\"Basic\"}}\n";
        }
        return result + "{\"end\":\"project-definition\"}\n";
    }
};

/// The project, and the random changes of one person.
class Person {
public:
    Person(ProjectState state, std::mt19937& random, std::string name)
        : state_(std::move(state)), random_(random), name_(std::move(name)) {
        for (int count = draw(6) + 1; count > 0; --count) {
            act();
        }
    }

    ProjectState const& state() const noexcept { return state_; }

private:
    int draw(int below) { return std::uniform_int_distribution<int>(0, below - 1)(random_); }

    std::string drawFile() {
        return std::next(state_.files.begin(), draw(static_cast<int>(state_.files.size())))->first;
    }

    std::string drawFolder() {
        static std::vector<std::string> const folders{"", "src/", "lib/", "src/io/", "old/", "lib/deep/"};
        return folders[static_cast<std::size_t>(draw(static_cast<int>(folders.size())))];
    }

    void act() {
        auto const number = std::to_string(++count_);
        switch (draw(5)) {
        case 0:
            move(drawFile(), drawFolder() + "moved-" + name_ + number);
            break;
        case 1:
            moveFolder();
            break;
        case 2:
            state_.files[drawFolder() + "new-" + name_ + number] = {"0-" + name_ + number};
            break;
        case 3:
            state_.files.at(drawFile()).insert("mark-" + name_ + number);
            break;
        default:
            setEntryPoint(drawFile(), name_ + number);
        }
    }

    /// A file has one entry point at most, so each person sets those of other files.
    void setEntryPoint(std::string const& path, std::string const& uuid) {
        auto const& own = *state_.files.at(path).begin();
        bool const isEven = (own.back() - '0') % 2 == 0;
        bool const hasOne =
            std::ranges::any_of(state_.entryPoints, [&](auto const& entry) { return entry.second == path; });
        if (!hasOne && isEven == (name_ == "h")) {
            state_.entryPoints[uuid] = path;
        }
    }

    void moveFolder() {
        auto const folders = state_.folders();
        if (folders.empty()) {
            return;
        }
        auto const from = *std::next(folders.begin(), draw(static_cast<int>(folders.size())));
        auto const to = "to-" + name_ + std::to_string(count_);
        for (auto const& [path, labels] : std::map(state_.files)) {
            if (path.starts_with(from + '/')) {
                move(path, to + path.substr(from.size()));
            }
        }
    }

    void move(std::string const& from, std::string const& to) {
        state_.files[to] = state_.files.extract(from).mapped();
        for (auto& [uuid, path] : state_.entryPoints) {
            path = path == from ? to : path;
        }
    }

    ProjectState state_;
    std::mt19937& random_;
    std::string name_;
    int count_ = 0;
};

class RandomRenames : public MergingProject {
protected:
    static ProjectState base() {
        ProjectState result;
        for (auto const* path : {"a", "src/a", "src/b", "src/io/c", "old/d", "old/e"}) {
            result.files[path] = {"0-" + std::string(path).substr(std::string(path).size() - 1) +
                                  std::to_string(result.files.size())};
        }
        result.entryPoints = {{"e1", "src/a"}, {"e2", "old/d"}};
        return result;
    }

    /// Replaces the files and the text, and commits them.
    void commitState(ProjectState const& state) const {
        for (auto const& entry : std::filesystem::directory_iterator(folder_.onDisk())) {
            if (!entry.path().filename().string().starts_with('.')) {
                std::filesystem::remove_all(entry.path());
            }
        }
        for (auto const& [path, labels] : state.files) {
            std::string content;
            for (int line = 0; line < 12; ++line) {
                content += *labels.begin() + " line " + std::to_string(line) + '\n';
            }
            folder_.addFile(path, content);
        }
        writeText(state.text());
        ASSERT_EQ(tool({"tidy"}).exitCode, 0);
        git_.run({"add", "-A"});
        git_.run({"commit", "-q", "--allow-empty", "-m", "a state"});
    }

    /// All labels in the lines that have a file's own label.
    static Labels labelsBeside(std::string const& text, std::string const& own) {
        Labels result;
        std::string const mark = R"("Label","keys":{"UUID":")";
        for (auto const& line : linesOf(text)) {
            if (line.starts_with(R"({"file":)") && line.find(mark + own + '"') != line.npos) {
                for (auto at = line.find(mark); at != line.npos; at = line.find(mark, at + 1)) {
                    auto const from = at + mark.size();
                    result.insert(line.substr(from, line.find('"', from) - from));
                }
            }
        }
        return result;
    }

    void expectNothingLost(std::string const& text, ProjectState const& side) const {
        for (auto const& [path, labels] : side.files) {
            auto const found = labelsBeside(text, *labels.begin());
            EXPECT_TRUE(std::ranges::includes(found, labels)) << path << '\n' << text;
        }
        for (auto const& [uuid, path] : side.entryPoints) {
            EXPECT_NE(text.find("\"EntryPoint\",\"" + uuid + '"'), text.npos) << uuid << '\n' << text;
        }
    }

    /// A folder out of which each side has moved some of its files stays in the project.
    void expectGoneAreFolders(std::string const& status) const {
        for (auto const& line : linesOf(status)) {
            EXPECT_TRUE(line.starts_with("gone ") &&
                        readText().find('"' + line.substr(5) + "/\"") != line.npos)
                << line;
        }
    }

    /// @return the merged text, which may contain markers, and whether git found no conflict.
    std::pair<std::string, bool> mergeInto(std::string const& into, std::string const& other) const {
        git_.run({"switch", "-q", "-f", "--detach", into});
        auto const merged = git_.tryTo({"merge", "-q", "-m", "both", other});
        auto const text = readText();
        if (merged.exitCode == 0) {
            expectGoneAreFolders(tool({"status"}).output);
            EXPECT_THAT(tool({"check"}), SucceedsSilently()) << text;
        } else {
            git_.tryTo({"merge", "--abort"});
            git_.run({"reset", "-q", "--hard"});
        }
        return {text, merged.exitCode == 0};
    }
};

TEST_F(RandomRenames, loseNothingAndDoNotDependOnTheDirectionOfTheMerge) {
    auto const seed = testSeed();
    std::mt19937 random(static_cast<std::mt19937::result_type>(seed));
    int histories = 0;
    int clean = 0;
    auto const end = std::chrono::steady_clock::now() + std::chrono::seconds(testSeconds(3));
    while (!HasFailure() && (histories == 0 || std::chrono::steady_clock::now() < end)) {
        SCOPED_TRACE("PROJECT_TEST_SEED=" + std::to_string(seed) + ", history " + std::to_string(histories));
        git_.run({"config", "merge.directoryRenames", histories % 3 == 0 ? "conflict" : "true"});
        git_.run({"switch", "-q", "-f", "--detach", "main"});
        commitState(base());
        auto const common = git_.run({"rev-parse", "HEAD"}).substr(0, 40);
        Person const hers(base(), random, "h");
        Person const his(base(), random, "m");
        for (auto const& [name, person] : {std::pair("hers", &hers), std::pair("his", &his)}) {
            git_.run({"switch", "-q", "-f", "-C", name, common});
            commitState(person->state());
        }

        auto const [text, isClean] = mergeInto("his", "hers");
        auto const [exchanged, isExchangedClean] = mergeInto("hers", "his");

        for (auto const* person : {&hers, &his}) {
            expectNothingLost(text, person->state());
            expectNothingLost(exchanged, person->state());
        }
        EXPECT_EQ(isClean, isExchangedClean);
        bool const hasMarkers = text.find("<<<<<<<") != text.npos || exchanged.find("<<<<<<<") != text.npos;
        if (!hasMarkers) {
            EXPECT_EQ(text, exchanged);
        }
        ++histories;
        clean += isClean ? 1 : 0;
    }
    RecordProperty("histories", histories);
    RecordProperty("clean", clean);
    std::cout << histories << " histories, " << clean << " of them merged without a conflict\n";
}

} // namespace
} // namespace project::test
