#include <algorithm>
#include <filesystem>
#include <fstream>
#include <random>
#include <set>
#include <string>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "project/files/FileMetadataManager.hpp"
#include "project/metadata/Messages.hpp"
#include "project/metadata/MetadataFunctions.hpp"
#include "project/metadata/MetadataNodeSpecification.hpp"
#include "project/metadata/ProjectException.hpp"
#include "project/session.hpp"
#include "support/EventLog.hpp"
#include "support/GitFolder.hpp"
#include "support/TemporaryFolder.hpp"

namespace project::session {
namespace {

using management::CategoryDefinition;
using management::Label;
using management::LabelDefinition;
using ::testing::ElementsAre;
using ::testing::IsEmpty;

/// A project in which labels are put on files that other programs then rename.
class Adoption : public ::testing::Test {
protected:
    Adoption() {
        session.project().getLabelManager().createCategory(status);
        session.project().getLabelManager().createLabel(status, done.getLabelIdentifier());
    }

    Path at(std::u16string const& name) const { return folder.path(name); }

    void add(std::vector<std::u16string> const& names) {
        for (auto const& name : names) {
            session.project().getFileManager().add({folder.file(name)});
        }
    }

    void label(std::u16string const& name) {
        session.project().getFileManager().addLabels({at(name)}, {done});
    }

    bool isLabelled(std::u16string const& name) {
        return !session.project().getFileManager().getLabelIDSets(at(name)).empty();
    }

    void renameOnDisk(std::u16string const& from, std::u16string const& to) const {
        auto const target = fl::filesystem::toSystem(at(to));
        std::filesystem::create_directories(target.parent_path());
        std::filesystem::rename(fl::filesystem::toSystem(at(from)), target);
    }

    std::vector<std::u16string> listed() {
        std::vector<std::u16string> result;
        for (auto const& file : session.find({})) {
            result.push_back(metadata::getRelativePath(folder.root(), file.path));
        }
        return result;
    }

    std::string text() const {
        std::ifstream file(folder.onDisk() / ".projectdata" / "project.jsonl", std::ios::binary);
        return {std::istreambuf_iterator<char>(file), {}};
    }

    test::TemporaryFolder folder;
    Session session = Session::create(folder.root(), u"Engine", {SourceControl::Off});
    CategoryDefinition const status{u"Status"};
    Label const done{status, LabelDefinition(u"Done")};
};

TEST_F(Adoption, letsTheLabelsOfAFileFollowItsNewName) {
    add({u"src/a"});
    label(u"src/a");
    renameOnDisk(u"src/a", u"lib/new/b");

    session.adopt({{at(u"src/a"), at(u"lib/new/b")}});

    EXPECT_THAT(listed(), ElementsAre(u"lib", u"lib/new", u"lib/new/b"));
    EXPECT_TRUE(isLabelled(u"lib/new/b"));
}

TEST_F(Adoption, keepsAnEmptiedFolderForWhichSomethingIsStored) {
    add({u"src/a", u"data/b"});
    label(u"src");
    auto const scope = session.project().getFileManager().getFileMetadataManagerFor(u"Build");
    scope->setFileNodes({{at(u"data"), std::make_shared<metadata::MetadataNodeSpecification>(u"Info")}});

    session.adopt({{at(u"src/a"), at(u"a")}, {at(u"data/b"), at(u"b")}});

    EXPECT_THAT(listed(), ElementsAre(u"a", u"b", u"data", u"src"));
}

TEST_F(Adoption, letsFilesExchangeTheirNames) {
    add({u"a", u"b"});
    label(u"a");

    session.adopt({{at(u"a"), at(u"b")}, {at(u"b"), at(u"a")}});

    EXPECT_FALSE(isLabelled(u"a"));
    EXPECT_TRUE(isLabelled(u"b"));
}

TEST_F(Adoption, ofAFolderAndOfAFileBelowItGivesEachItsOwnPlace) {
    add({u"src/a", u"src/b"});
    label(u"src/b");

    session.adopt({{at(u"src"), at(u"lib")}, {at(u"src/b"), at(u"b")}});

    EXPECT_THAT(listed(), ElementsAre(u"b", u"lib", u"lib/a"));
    EXPECT_TRUE(isLabelled(u"b"));
}

TEST_F(Adoption, ofAFileThatBecameAFolderIsPossibleInBothDirections) {
    add({u"a", u"z"});
    label(u"a");
    auto const before = text();

    session.adopt({{at(u"a"), at(u"a/a")}});
    EXPECT_THAT(listed(), ElementsAre(u"a", u"a/a", u"z"));
    EXPECT_TRUE(isLabelled(u"a/a"));
    session.adopt({{at(u"a/a"), at(u"a")}});

    EXPECT_EQ(text(), before);
}

TEST_F(Adoption, ofAFolderThatGotAFileFromElsewhereIsPossibleInBothDirections) {
    add({u"src/a", u"src/io/b", u"top"});
    label(u"src");
    auto const before = text();

    session.adopt({{at(u"src"), at(u"lib")}, {at(u"top"), at(u"lib/new/top")}, {at(u"src/io/b"), at(u"b")}});
    EXPECT_THAT(listed(), ElementsAre(u"b", u"lib", u"lib/a", u"lib/new", u"lib/new/top"));
    session.adopt({{at(u"lib"), at(u"src")}, {at(u"lib/new/top"), at(u"top")}, {at(u"b"), at(u"src/io/b")}});

    EXPECT_EQ(text(), before);
}

TEST_F(Adoption, isRefusedWithoutAnEffectWhereSomethingIsInTheWay) {
    add({u"a", u"b"});
    auto const before = text();
    auto const reasonOf = [this](std::vector<Move> const& moves) -> std::optional<MoveError::Reason> {
        try {
            session.adopt(moves);
            return std::nullopt;
        } catch (MoveError const& error) {
            return error.reason();
        }
    };

    EXPECT_EQ(reasonOf({{at(u"a"), at(u"b")}}), MoveError::Reason::IsInProject);
    EXPECT_EQ(reasonOf({{at(u"a"), at(u"c")}, {at(u"b"), at(u"c")}}), MoveError::Reason::IsInProject);
    EXPECT_EQ(reasonOf({{at(u"a"), at(u"../c")}}), MoveError::Reason::LeavesProject);
    EXPECT_EQ(reasonOf({{at(u"a"), at(u".projectdata/c")}}), MoveError::Reason::EntersStore);
    EXPECT_EQ(reasonOf({{folder.root(), at(u"c")}}), MoveError::Reason::IsRoot);
    EXPECT_THROW(session.adopt({{at(u"c"), at(u"d")}}),
                 exception::Raised<ZEPHRA::project::management::FileNotInProject>);
    EXPECT_EQ(text(), before);
}

TEST_F(Adoption, ofNothingRaisesNoEvents) {
    add({u"a"});
    test::EventLog log(*session.events());

    session.adopt({});
    session.adopt({{at(u"a"), at(u"a")}});

    EXPECT_THAT(log.take(), IsEmpty());
}

TEST_F(Adoption, isRolledBackWithItsTransaction) {
    add({u"a"});
    auto const before = text();
    {
        auto const transaction = session.transaction();
        session.adopt({{at(u"a"), at(u"b")}});
        EXPECT_THAT(listed(), ElementsAre(u"b"));
    }
    EXPECT_EQ(text(), before);
}

TEST_F(Adoption, stagesTheNewFileAndTheRemovalOfTheOldOne) {
    test::TemporaryFolder const repository;
    test::GitFolder const git(repository.onDisk());
    auto versioned = Session::create(repository.root(), u"Engine");
    versioned.project().getFileManager().add({repository.file(u"a"), repository.file(u"sub/b")});
    git.commitAll();
    std::filesystem::rename(repository.onDisk() / "a", repository.onDisk() / "c");
    std::filesystem::rename(repository.onDisk() / "sub", repository.onDisk() / "dir");

    versioned.adopt(
        {{repository.path(u"a"), repository.path(u"c")}, {repository.path(u"sub"), repository.path(u"dir")}});

    EXPECT_EQ(git.run({"status", "--porcelain"}),
              "M  .projectdata/project.jsonl\nR  a -> c\nR  sub/b -> dir/b\n");
}

/// A random file list with labels, data and entry points.
class RandomAdoption : public Adoption, public ::testing::WithParamInterface<unsigned> {
protected:
    std::size_t below(std::size_t bound) {
        return std::uniform_int_distribution<std::size_t>(0, bound - 1)(random_);
    }

    std::u16string randomPath(char16_t prefix) {
        std::u16string path;
        for (std::size_t depth = below(3) + 1; depth > 0; --depth) {
            path += (path.empty() ? u"" : u"/") + std::u16string(1, prefix) + char16_t(u'0' + below(4));
        }
        return path;
    }

    void createProject() {
        auto const scope = session.project().getFileManager().getFileMetadataManagerFor(u"Build");
        for (int count = 0; count < 20; ++count) {
            add({randomPath(u'd') + u"/f" + char16_t(u'0' + below(10))});
        }
        for (auto const& path : listed()) {
            if (below(3) == 0) {
                label(path);
            }
            if (below(5) == 0) {
                auto node = std::make_shared<metadata::MetadataNodeSpecification>(u"Info");
                node->put(u"Of", path);
                scope->setFileNodes({{at(path), node}});
            }
        }
        for (auto const& file : session.find({.kind = FileKind::File})) {
            if (below(5) == 0) {
                management::EntryPointDefinition entry(file.path);
                session.project().getEntryPointManager().setEntryPoint(entry);
            }
        }
    }

    /// Files that move to new places, in folders that are new or contain something, or that change places.
    std::vector<Move> randomMoves() {
        auto files = session.find({.kind = FileKind::File});
        std::ranges::shuffle(files, random_);
        files.resize(below(files.size()) + 1);
        std::vector<Move> result;
        for (std::size_t index = 0; index < files.size(); ++index) {
            bool const isExchange = below(4) == 0 && index + 1 < files.size();
            if (isExchange) {
                result.push_back({files[index].path, files[index + 1].path});
                result.push_back({files[index + 1].path, files[index].path});
                ++index;
            } else {
                auto const folderOf = randomPath(below(2) == 0 ? u'd' : u'e');
                result.push_back({files[index].path, at(folderOf + u"/n" + std::u16string(++names_, u'n'))});
            }
        }
        return result;
    }

private:
    std::mt19937 random_{GetParam()};
    std::size_t names_ = 0;
};

TEST_P(RandomAdoption, ofTheReverseMovesRestoresTheTextToTheByte) {
    createProject();
    for (int round = 0; round < 5; ++round) {
        auto const before = text();
        auto const labelled = session.find({.isUnlabelled = true}).size();
        auto const moves = randomMoves();
        std::vector<Move> reverse;
        std::ranges::transform(moves, std::back_inserter(reverse), [](Move const& move) {
            return Move{move.to, move.from};
        });

        session.adopt(moves);
        EXPECT_EQ(session.find({.paths = {moves.front().to}}).size(), 1U);
        session.adopt(reverse);

        ASSERT_EQ(text(), before) << "round " << round;
        EXPECT_EQ(session.find({.isUnlabelled = true}).size(), labelled);
        session.adopt(moves);
    }
}

INSTANTIATE_TEST_SUITE_P(WithSeeds, RandomAdoption, ::testing::Range(0U, 20U));

} // namespace
} // namespace project::session
