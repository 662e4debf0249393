// Random moves of files and folders, against a model of the project.
#include <algorithm>
#include <chrono>
#include <filesystem>
#include <map>
#include <random>
#include <set>
#include <string>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "project/files/FileMetadataManager.hpp"
#include "project/metadata/MetadataNodeSpecification.hpp"
#include "project/session.hpp"
#include "support/NightlyScale.hpp"
#include "support/TemporaryFolder.hpp"

namespace project::session {
namespace {

using management::CategoryDefinition;
using management::EntryPointDefinition;
using management::Label;
using management::LabelDefinition;

using Name = std::u16string;

/// The state of a file or folder of the project.
struct ModelFile {
    bool isFolder = false;
    bool isLabelled = false;
    bool isLabelledPersonally = false;
    bool hasData = false;
    bool isEntryPoint = false;
    bool isOnPath = false;

    friend bool operator==(ModelFile const&, ModelFile const&) = default;

    friend std::ostream& operator<<(std::ostream& out, ModelFile const& file) {
        return out << (file.isFolder ? "folder" : "file") << (file.isLabelled ? " labelled" : "")
                   << (file.isLabelledPersonally ? " personal" : "") << (file.hasData ? " data" : "")
                   << (file.isEntryPoint ? " entry" : "") << (file.isOnPath ? " path" : "");
    }
};

using Model = std::map<Name, ModelFile>;

bool isAtOrBelow(Name const& path, Name const& folder) {
    return path == folder || path.starts_with(folder + u'/');
}

Name nameOf(Name const& path) {
    return path.substr(path.rfind(u'/') + 1);
}

void moveIn(Model& model, Name const& from, Name const& to) {
    Model after;
    for (auto const& [path, file] : model) {
        after.emplace(isAtOrBelow(path, from) ? to + path.substr(from.size()) : path, file);
    }
    model = std::move(after);
}

/// A project with random contents, its model, and random moves of both.
class RandomMoves {
public:
    explicit RandomMoves(std::uint64_t seed) : random_(seed) {
        session_.project().getLabelManager().createCategory(status_);
        session_.project().getLabelManager().createLabel(status_, done_.getLabelIdentifier());
        session_.personal().getLabelManager().createCategory(mine_);
        session_.personal().getLabelManager().createLabel(mine_, later_.getLabelIdentifier());
        for (int count = 0; count < 12; ++count) {
            Name path;
            for (auto depth = below(3); depth > 0; --depth) {
                path += Name(u"d") + char16_t(u'0' + below(3)) + u'/';
                model_[path.substr(0, path.size() - 1)].isFolder = true;
            }
            path += newName();
            model_[path];
            session_.project().getFileManager().add({folder_.file(path)});
        }
        for (auto& [path, file] : model_) {
            attach(path, file);
        }
    }

    /// Moves some files or folders into a folder, or one of them to a new name.
    /// @return a description of the move; empty if there was none.
    std::string move() {
        auto const sources = randomSources();
        bool const isInto = sources.size() > 1 || below(2) == 0;
        auto const target = isInto ? randomFolder() : withFolder(randomFolder(), newName());
        for (auto const& source : sources) {
            auto const to = isInto ? withFolder(target, nameOf(source)) : target;
            if (isAtOrBelow(target, source) || model_.contains(to)) {
                return {};
            }
        }
        std::vector<Path> paths;
        std::string described;
        for (auto const& source : sources) {
            paths.push_back(at(source));
            described += fl::filesystem::toSystem(Path(source)).string() + ' ';
        }
        session_.move(paths, at(target));
        for (auto const& source : sources) {
            moveIn(model_, source, isInto ? withFolder(target, nameOf(source)) : target);
        }
        return described + "-> " + fl::filesystem::toSystem(Path(target)).string();
    }

    Model const& model() const { return model_; }

    /// The state of the project as a new session reads it.
    Model read() {
        Model result;
        auto session = Session::open(folder_.root(), {SourceControl::Off});
        for (auto const& found : session.find({})) {
            auto& file = result[relative(found.path)];
            file.isFolder = found.kind == FileKind::Folder;
            file.isLabelled = !session.project().getFileManager().getLabelIDSets(found.path).empty();
            file.isLabelledPersonally =
                !session.personal().getFileManager().getLabelIDSets(found.path).empty();
            EXPECT_TRUE(std::filesystem::exists(fl::filesystem::toSystem(found.path)));
        }
        auto const data = session.project().getFileManager().getFileMetadataManagerFor(u"Build");
        for (auto const& [path, node] : data->getAllFileNodes()) {
            EXPECT_EQ(node->get(u"Flags"), u"-O2");
            result[relative(path)].hasData = true;
        }
        for (auto const& entry : session.project().getEntryPointManager().getEntryPoints()) {
            result[relative(entry->getFile())].isEntryPoint = true;
        }
        for (auto const& reference :
             session.project().getProjectPathManager().getFolderReferenceManager().getReferences()) {
            result[reference.getStoredPath()].isOnPath = true;
        }
        EXPECT_TRUE(session.personal().hiddenFiles().empty());
        return result;
    }

private:
    std::size_t below(std::size_t bound) {
        return std::uniform_int_distribution<std::size_t>(0, bound - 1)(random_);
    }

    Name newName() {
        Name name = u"n";
        for (auto const digit : std::to_string(++names_)) {
            name += static_cast<char16_t>(digit);
        }
        return name;
    }

    Path at(Name const& path) const { return path.empty() ? folder_.root() : folder_.path(path); }

    Name relative(Path const& path) const { return metadata::getRelativePath(folder_.root(), path); }

    static Name withFolder(Name const& folder, Name const& name) {
        return folder.empty() ? name : folder + u'/' + name;
    }

    void attach(Name const& path, ModelFile& file) {
        auto& files = session_.project().getFileManager();
        if (below(3) == 0) {
            files.addLabels({at(path)}, {done_});
            file.isLabelled = true;
        }
        if (below(3) == 0) {
            session_.personal().getFileManager().addLabels({at(path)}, {later_});
            file.isLabelledPersonally = true;
        }
        if (below(4) == 0) {
            auto node = std::make_shared<metadata::MetadataNodeSpecification>(u"Info");
            node->put(u"Flags", u"-O2");
            files.getFileMetadataManagerFor(u"Build")->setFileNodes({{at(path), node}});
            file.hasData = true;
        }
        if (!file.isFolder && below(3) == 0) {
            EntryPointDefinition entry(at(path));
            session_.project().getEntryPointManager().setEntryPoint(entry);
            file.isEntryPoint = true;
        }
        if (file.isFolder && below(2) == 0) {
            session_.project().getProjectPathManager().getFolderReferenceManager().addReferences(
                {management::relativeFolderReference(at(path), folder_.root())});
            file.isOnPath = true;
        }
    }

    /// One to three files or folders, none of them below another one, and all of different names.
    std::vector<Name> randomSources() {
        std::vector<Name> result;
        for (auto count = below(3) + 1; count > 0; --count) {
            auto const path = std::next(model_.begin(), static_cast<long>(below(model_.size())))->first;
            bool const isApart = std::ranges::none_of(result, [&path](Name const& other) {
                return isAtOrBelow(path, other) || isAtOrBelow(other, path) || nameOf(path) == nameOf(other);
            });
            if (isApart) {
                result.push_back(path);
            }
        }
        return result;
    }

    /// A folder of the project, or its root.
    Name randomFolder() {
        std::vector<Name> folders{Name()};
        for (auto const& [path, file] : model_) {
            if (file.isFolder) {
                folders.push_back(path);
            }
        }
        return folders[below(folders.size())];
    }

    std::mt19937_64 random_;
    test::TemporaryFolder folder_;
    Session session_ = Session::create(folder_.root(), u"Engine", {SourceControl::Off});
    CategoryDefinition const status_{u"Status"};
    CategoryDefinition const mine_{u"Mine"};
    Label const done_{status_, LabelDefinition(u"Done")};
    Label const later_{mine_, LabelDefinition(u"Later")};
    Model model_;
    std::size_t names_ = 0;
};

/// A hundred moves, or as many as there is time for.
TEST(SessionMoves, keepWhateverBelongsToAFileAtItsNewPath) {
    auto const seed = test::testSeed();
    auto const end = std::chrono::steady_clock::now() + std::chrono::seconds(test::testSeconds(0));
    std::size_t moves = 0;
    for (std::uint64_t round = 0; moves < 100 || std::chrono::steady_clock::now() < end; ++round) {
        RandomMoves project(seed + round);
        std::string history;
        for (int turn = 0; turn < 12; ++turn) {
            auto const move = project.move();
            moves += move.empty() ? 0 : 1;
            history += move + '\n';
        }
        ASSERT_EQ(project.read(), project.model()) << "PROJECT_TEST_SEED=" << seed + round << '\n' << history;
    }
}

} // namespace
} // namespace project::session
