#include <array>
#include <functional>
#include <random>

#include "tools/ProjectModel.hpp"
#include "tools/ToolTest.hpp"

namespace project::test {
namespace {

using Lines = ProjectModel::Lines;

/// A project with over 20,000 files that is changed by every command of the tool, each in a process of its
/// own. All output is compared with that of a model.
class EndToEnd : public ToolTest {
protected:
    static constexpr int folders = 1'000;
    static constexpr int filesInEach = 21;
    static constexpr int steps = 120;

    void SetUp() override {
        for (int folder = 0; folder < folders; ++folder) {
            for (int file = 0; file < filesInEach; ++file) {
                makeFile(folderName(folder) + "/file" + std::to_string(file) + ".txt");
            }
        }
        initProject();
    }

    static std::string folderName(int number) {
        return "part" + std::to_string(number % 10) + "/group" + std::to_string(number / 10 % 10) + "/unit" +
               std::to_string(number / 100);
    }

    void makeFile(std::string const& path) {
        folder_.addFile(path);
        model_.createOnDisk(path);
    }

    void succeed(std::vector<std::string> const& command, std::string_view input = {}) const {
        EXPECT_THAT(tool(command, input), SucceedsSilently()) << ::testing::PrintToString(command);
    }

    Lines linesFrom(std::vector<std::string> const& command) const {
        auto const result = tool(command);
        EXPECT_EQ(result.errors, "") << ::testing::PrintToString(command);
        auto const lines = linesOf(result.output);
        return {lines.begin(), lines.end()};
    }

    // Random choices, the same in every run.

    std::size_t below(std::size_t limit) {
        return std::uniform_int_distribution<std::size_t>(0, limit - 1)(chance_);
    }

    std::string oneOf(std::vector<std::string> const& things) { return things[below(things.size())]; }

    std::vector<std::string> someFiles(std::size_t most) {
        auto const files = model_.files();
        std::vector<std::string> result(1 + below(most));
        for (auto& file : result) {
            file = oneOf(files);
        }
        return result;
    }

    // The changes. Each is applied to the project and to the model.

    void addNewFiles() {
        std::string input;
        std::vector<std::string> files;
        for (std::size_t count = 1 + below(30); count > 0; --count) {
            auto const file = folderName(static_cast<int>(below(folders))) + "/new" + std::to_string(++made_);
            makeFile(file);
            files.push_back(file);
            input += file + '\n';
        }
        succeed({"add", "-"}, input);
        model_.add(files);
    }

    /// Adds files that are in the project already: nothing changes.
    void addFilesAgain() { succeed({"add", "-0"}, withZeros(someFiles(20))); }

    void addAFileAnew() {
        auto const file = oneOf(model_.files());
        succeed({"add", "--anew", file});
        model_.addAnew(file);
    }

    void addAFolderAgain() {
        auto const folder = folderName(static_cast<int>(below(folders)));
        makeFile(folder + "/more" + std::to_string(++made_));
        succeed({"add", "-r", folder});
        model_.addContents(folder);
    }

    /// Adds, labels and removes files in one batch.
    void runABatch() {
        std::string commands;
        for (std::size_t count = 1 + below(30); count > 0; --count) {
            auto const file =
                folderName(static_cast<int>(below(folders))) + "/made" + std::to_string(++made_);
            auto const [category, label] = aLabel();
            makeFile(file);
            model_.add({file});
            model_.put(category, label, file);
            commands += "add " + file + "\nlabel put " + category + ' ' + label + " '" + file + "'\n";
            if (below(3) == 0) {
                commands += "remove " + file + '\n';
                model_.remove(file);
            }
        }
        succeed({"batch"}, commands);
    }

    void removeFiles() {
        auto const files = someFiles(20);
        succeed({"remove", "-0"}, withZeros(files));
        for (auto const& file : files) {
            model_.remove(file);
        }
    }

    void removeAFolder() {
        auto const folder = folderName(static_cast<int>(below(folders)));
        if (model_.list().contains(folder)) {
            succeed({"remove", folder});
            model_.remove(folder);
        }
    }

    void deleteFromDisk() {
        for (auto const& file : someFiles(5)) {
            if (model_.isFile(file)) {
                std::filesystem::remove(folder_.onDisk() / file);
                model_.removeFromDisk(file);
            }
        }
    }

    std::array<std::string, 2> aLabel() {
        auto const categories = std::vector<std::string>{"Status", "Owner", area_};
        auto const& category = oneOf(categories);
        return {category, category == "Status" ? oneOf({"Open", "Done"}) : oneOf({"Ann", "Bob"})};
    }

    void putLabels() {
        auto const files = someFiles(2'000);
        auto const [category, label] = aLabel();
        succeed({"label", "put", category, label, "-0"}, withZeros(files));
        for (auto const& file : files) {
            model_.put(category, label, file);
        }
    }

    void takeLabels() {
        auto const files = someFiles(2'000);
        auto const [category, label] = aLabel();
        succeed({"label", "take", category, label, "-0"}, withZeros(files));
        for (auto const& file : files) {
            model_.take(category, label, file);
        }
    }

    void renameTheCategory() {
        auto const renamed = "Area" + std::to_string(++made_);
        succeed({"category", "rename", area_, renamed});
        model_.renameCategory(area_, renamed);
        area_ = renamed;
    }

    void createTheLabelAnew() {
        auto const [category, label] = aLabel();
        succeed({"label", "delete", category, label});
        succeed({"label", "create", category, label});
        model_.deleteLabel(category, label);
        model_.createLabel(category, label);
    }

    void createTheCategoryAnew() {
        succeed({"category", "delete", area_});
        model_.deleteCategory(area_);
        createCategory(area_, false, {"Ann", "Bob"});
    }

    void createCategory(std::string const& name, bool isSingleValued,
                        std::vector<std::string> const& labels) {
        isSingleValued ? succeed({"category", "create", name, "--single-valued"})
                       : succeed({"category", "create", name});
        model_.createCategory(name, isSingleValued);
        for (auto const& label : labels) {
            succeed({"label", "create", name, label});
            model_.createLabel(name, label);
        }
    }

    void setAnEntry() {
        auto const file = oneOf(model_.files());
        auto& entry = model_.entry(file);
        entry.type = oneOf({"Basic", "Startup", "Shutdown", "Batch_Job"});
        entry.name = "entry " + std::to_string(++made_);
        entry.visible = below(2) == 0;
        entry.group = oneOf({"Default", group_});
        succeed({"entry", "set", file, "--type", entry.type, "--name", entry.name,
                 entry.visible ? "--visible" : "--hidden", "--group", entry.group, "--extension", "k=v"});
        EXPECT_THAT(tool({"entry", "show", file}).output,
                    ::testing::StartsWith("name: " + entry.name + "\ntype: " + entry.type +
                                          "\nvisible: " + (entry.visible ? "yes" : "no") +
                                          "\ngroup: " + entry.group + "\nextension k: v\nuuid: "));
    }

    void removeAnEntry() {
        if (auto const files = model_.entryFiles(); !files.empty()) {
            auto const file = oneOf(files);
            succeed({"entry", "remove", file});
            model_.removeEntry(file);
        }
    }

    void renameTheGroup() {
        auto const renamed = "Nightly " + std::to_string(++made_);
        succeed({"group", "rename", group_, renamed});
        model_.renameGroup(group_, renamed);
        group_ = renamed;
    }

    void createTheGroupAnew() {
        succeed({"group", "delete", group_});
        succeed({"group", "create", group_});
        model_.deleteGroup(group_);
        model_.createGroup(group_);
    }

    void addAndRemoveReferences() {
        auto const folder = folderName(static_cast<int>(below(folders)));
        auto const list = oneOf({"path", "reference"});
        auto& present = list == "path" ? path_ : references_;
        bool const isNew = present.erase(folder) == 0;
        if (isNew) {
            present.insert(folder);
        }
        succeed({list, isNew ? "add" : "remove", folder});
    }

    void changeTheTexts() {
        name_ = "project " + std::to_string(++made_);
        succeed({"name", name_});
        succeed({"description", "about " + name_});
    }

    // The comparisons.

    void compareOneFile() const {
        auto const file = model_.files().front();
        EXPECT_EQ(linesFrom({"label", "show", file}), model_.labelsOn(file));
    }

    void compareEverything() const {
        ASSERT_EQ(linesFrom({"list"}), model_.list());
        EXPECT_EQ(linesFrom({"category", "list"}), model_.categories());
        EXPECT_EQ(linesFrom({"label", "list"}), model_.labels());
        for (auto const* label : {"Open", "Done"}) {
            EXPECT_EQ(linesFrom({"label", "find", "Status", label}), model_.find("Status", label));
        }
        for (auto const& category : {std::string("Owner"), area_}) {
            EXPECT_EQ(linesFrom({"label", "find", category, "Ann"}), model_.find(category, "Ann"));
        }
        EXPECT_EQ(linesFrom({"entry", "list"}), model_.entries());
        EXPECT_EQ(linesFrom({"group", "list"}), model_.groups());
        EXPECT_EQ(linesFrom({"path", "list"}), path_);
        EXPECT_EQ(linesFrom({"reference", "list"}), references_);
        EXPECT_THAT(tool({"name"}), Prints(name_ + "\n"));
        EXPECT_THAT(tool({"description"}), Prints("about " + name_ + "\n"));
        compareStatus();
        EXPECT_EQ(tool({"references", "--graph"}).exitCode,
                  references_.empty() ? 0 : 3); // no projects in them
    }

    void compareStatus() const {
        Lines files;
        std::size_t problems = 0;
        for (auto const& line : linesFrom({"status"})) {
            if (line.starts_with("new  ") || line.starts_with("gone ")) {
                files.insert(line);
            } else {
                ++problems;
            }
        }
        EXPECT_EQ(files, model_.differences());
        EXPECT_EQ(problems, model_.entryProblems() + references_.size());
    }

    ProjectModel model_;
    std::mt19937 chance_{20'000}; // NOLINT(cert-msc51-cpp): the same in every run
    int made_ = 0;
    std::string area_ = "Area";
    std::string group_ = "Nightly";
    std::string name_;
    Lines path_;
    Lines references_;
};

TEST_F(EndToEnd, everyCommandAgreesWithTheModel) {
    succeed({"add", "--recursive", "."});
    model_.addContents("");
    changeTheTexts();
    createCategory("Status", true, {"Open", "Done"});
    createCategory("Owner", false, {"Ann", "Bob"});
    createCategory(area_, false, {"Ann", "Bob"});
    succeed({"group", "create", group_});
    model_.createGroup(group_);
    compareEverything();

    std::vector<std::function<void()>> const changes{
        [this] { addNewFiles(); },        [this] { addAFolderAgain(); },
        [this] { addFilesAgain(); },      [this] { addAFileAnew(); },
        [this] { runABatch(); },          [this] { removeFiles(); },
        [this] { removeAFolder(); },      [this] { deleteFromDisk(); },
        [this] { putLabels(); },          [this] { putLabels(); },
        [this] { takeLabels(); },         [this] { renameTheCategory(); },
        [this] { createTheLabelAnew(); }, [this] { createTheCategoryAnew(); },
        [this] { setAnEntry(); },         [this] { setAnEntry(); },
        [this] { removeAnEntry(); },      [this] { renameTheGroup(); },
        [this] { createTheGroupAnew(); }, [this] { addAndRemoveReferences(); },
        [this] { changeTheTexts(); },
    };
    for (int step = 1; step <= steps && !HasFailure(); ++step) {
        auto const change = below(changes.size());
        SCOPED_TRACE("step " + std::to_string(step) + ", change " + std::to_string(change));
        changes[change]();
        compareOneFile();
        if (step % 20 == 0) {
            compareEverything();
        }
    }

    EXPECT_THAT(tool({"tidy"}), SucceedsSilently());
    EXPECT_EQ(tool({"check", "--repair"}).exitCode, model_.hasFaults() ? 3 : 0);
    compareEverything();
    EXPECT_GT(model_.files().size(), 20'000);
}

} // namespace
} // namespace project::test
