#include <algorithm>
#include <random>
#include <set>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "project/session.hpp"
#include "support/EventLog.hpp"
#include "support/NightlyScale.hpp"
#include "support/TemporaryFolder.hpp"

namespace project::session {
namespace {

using management::CategoryDefinition;
using management::CategoryIdentifier;
using management::EntryPointDefinition;
using management::Label;
using management::LabelDefinition;
using management::ProjectManager;

using Lines = std::multiset<std::u16string>;

/// Everything that events report, as plain values.
struct Picture {
    std::u16string name;
    std::u16string description;
    std::map<Path, std::vector<std::u16string>>
        labelsOfFiles;                                   ///< of each file in the project, in their order
    std::map<std::u16string, std::u16string> categories; ///< names by UUID
    std::set<std::u16string> labels;                     ///< "<category> <label>", by UUID
    std::set<std::u16string> entryPoints;
};

Picture pictureOf(ProjectManager& project) {
    Picture picture{project.getName(), project.getDescription(), {}, {}, {}, {}};
    for (auto const& file : project.getFileManager().getProjectFiles()) {
        auto& labels = picture.labelsOfFiles[file];
        for (auto const& set : project.getFileManager().getLabelIDSets(file)) {
            labels.push_back(set.getCategoryUUID() + u' ' + set.getLabelUUID());
        }
    }
    for (auto const& category : project.getLabelManager().getAllCategories()) {
        picture.categories.emplace(category.getUUID(), category.getName());
        for (auto const& label : project.getLabelManager().getLabels(category)) {
            picture.labels.insert(category.getUUID() + u' ' + label.getUUID());
        }
    }
    for (auto const& point : project.getEntryPointManager().getEntryPoints()) {
        picture.entryPoints.insert(point->getFile().native() + u' ' + point->getName());
    }
    return picture;
}

void addFileEvents(Picture const& before, Picture const& after, Lines& lines) {
    std::set<Path> addedOrRemoved;
    std::set<Path> labelled;
    for (auto const& [file, labels] : before.labelsOfFiles) {
        auto const now = after.labelsOfFiles.find(file);
        if (now == after.labelsOfFiles.end()) {
            addedOrRemoved.insert(file);
        } else if (now->second != labels) {
            labelled.insert(file);
        }
    }
    for (auto const& [file, labels] : after.labelsOfFiles) {
        if (!before.labelsOfFiles.contains(file)) {
            addedOrRemoved.insert(file);
            if (!labels.empty()) {
                labelled.insert(file);
            }
        }
    }
    for (auto const& [name, files] :
         {std::pair(u"fileListUpdate", addedOrRemoved), {u"fileLabelsChanged", labelled}}) {
        std::u16string line = name;
        for (auto const& file : files) {
            line += u' ' + file.native();
        }
        if (!files.empty()) {
            lines.insert(line);
        }
    }
}

void addCategoryEvents(Picture const& before, Picture const& after, Lines& lines) {
    for (auto const& [uuid, name] : before.categories) {
        auto const now = after.categories.find(uuid);
        if (now == after.categories.end()) {
            lines.insert(u"categoryDeleted " + uuid + u' ' + name);
        } else if (now->second != name) {
            lines.insert(u"categoryRenamed " + uuid + u' ' + name);
        }
    }
    for (auto const& [uuid, name] : after.categories) {
        if (!before.categories.contains(uuid)) {
            lines.insert(u"categoryAdded " + uuid + u' ' + name);
        }
    }
    std::vector<std::u16string> changed;
    std::set_symmetric_difference(before.labels.begin(), before.labels.end(), after.labels.begin(),
                                  after.labels.end(), std::back_inserter(changed));
    for (auto const& label : changed) {
        auto const category = label.substr(0, label.find(u' '));
        if (after.labels.contains(label) || after.categories.contains(category)) {
            lines.insert(u"labelModified " + label);
        }
    }
}

/// The events that a refresh must dispatch if the project changed from one picture to the other.
Lines eventsBetween(Picture const& before, Picture const& after) {
    Lines lines;
    addFileEvents(before, after, lines);
    addCategoryEvents(before, after, lines);
    if (before.name != after.name) {
        lines.insert(u"nameChanged");
    }
    if (before.description != after.description) {
        lines.insert(u"metadataChange");
    }
    if (before.entryPoints != after.entryPoints) {
        lines.insert(u"entryPointsChanged");
    }
    return lines;
}

/// Makes random changes in a project.
class RandomChanges {
public:
    RandomChanges(ProjectManager& project, test::TemporaryFolder const& folder, std::uint64_t seed)
        : project_(project), random_(seed) {
        for (auto const* name : {u"a", u"b", u"src/a", u"src/b", u"src/io/a", u"src/io/b"}) {
            files_.push_back(folder.file(name));
        }
        files_.push_back(folder.path(u"src"));
        files_.push_back(folder.path(u"src/io"));
    }

    /// @return false if the managers refuse the change.
    bool makeOne() {
        try {
            act(pick(13));
            return true;
        } catch (exception::ProjectException const&) {
            return false;
        }
    }

private:
    std::size_t pick(std::size_t count) {
        return std::uniform_int_distribution<std::size_t>(0, count - 1)(random_);
    }

    Path const& file() { return files_[pick(files_.size())]; }

    std::u16string word() { return {static_cast<char16_t>(u'k' + pick(3))}; }

    static CategoryDefinition category(std::u16string const& word) {
        return {u"C" + word, u"category-" + word};
    }

    Label label() {
        auto const name = word();
        return {category(word()), LabelDefinition(u"L" + name, u"label-" + name)};
    }

    void act(std::size_t kind) {
        auto& files = project_.getFileManager();
        auto& labels = project_.getLabelManager();
        auto& entryPoints = project_.getEntryPointManager();
        auto const some = label();
        switch (kind) {
        case 0:
        case 1:
            files.add({file(), file()});
            break;
        case 2:
            files.remove({file()});
            break;
        case 3:
        case 4:
            files.addLabels({file(), file()}, {some});
            break;
        case 5:
            files.removeLabels({file()}, {some});
            break;
        case 6:
            labels.createCategory(some.getCategory());
            break;
        case 7:
            labels.renameCategory(some.getCategory(), u"renamed" + word());
            break;
        case 8:
            labels.deleteCategory(some.getCategory());
            break;
        case 9:
            labels.createLabel(some.getCategory(), some.getLabelIdentifier());
            break;
        case 10:
            labels.deleteLabel(some.getCategory(), some.getLabelIdentifier());
            break;
        case 11:
            describe();
            break;
        default:
            changeEntryPoint(entryPoints);
            break;
        }
    }

    void describe() {
        if (pick(2) == 0) {
            project_.setName(word());
        } else {
            project_.setDescription(word());
        }
    }

    void changeEntryPoint(management::EntryPointManager& entryPoints) {
        auto const where = file();
        if (pick(3) == 0) {
            entryPoints.removeEntryPoint(where);
        } else {
            EntryPointDefinition point(where);
            entryPoints.setEntryPoint(point.setName(word()));
        }
    }

    ProjectManager& project_;
    std::mt19937_64 random_;
    std::vector<Path> files_;
};

TEST(RefreshModel, reportsExactlyTheDifferencesWhateverOthersHaveDone) {
    constexpr Options withoutGit{.sourceControl = SourceControl::Off};
    auto const seed = test::testSeed();
    SCOPED_TRACE("PROJECT_TEST_SEED=" + std::to_string(seed));
    std::mt19937_64 random(seed);
    std::size_t done = 0;
    for (int history = 0; history < 8; ++history) {
        test::TemporaryFolder const folder;
        auto other = Session::create(folder.root(), u"Engine", withoutGit);
        auto session = Session::open(folder.root(), withoutGit);
        test::EventLog log(*session.events());
        RandomChanges changes(other.project(), folder, random());
        session.refresh();
        auto seen = pictureOf(session.project());
        for (int round = 0; round < 25; ++round) {
            for (auto count = random() % 4; count > 0; --count) {
                done += changes.makeOne() ? 1 : 0;
            }
            session.refresh();
            auto const reported = log.take();
            auto const now = pictureOf(other.project());
            ASSERT_EQ(Lines(reported.begin(), reported.end()), eventsBetween(seen, now)) << "round " << round;
            seen = now;
        }
    }
    EXPECT_GT(done, 100U);
}

} // namespace
} // namespace project::session
