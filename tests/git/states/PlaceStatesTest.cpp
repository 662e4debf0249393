#include <sys/stat.h>

#include "git/GitRepository.hpp"

namespace project::git {
namespace {

/// Folders, paths outside the work tree, and entries of an unexpected type.
class PlaceStates : public GitTest {};

TEST_F(PlaceStates, aFolderIs1WhenAnythingBelowItIsTracked) {
    commitFile("d/e/a");
    repository.write("d/ignored");
    repository.write(".gitignore", "d\nignored\n");
    EXPECT_EQ(stateOf("d"), 1);
    EXPECT_EQ(stateOf("d/e"), 1);
    EXPECT_EQ(stateOf(""), 1);
    repository.remove("d");
    EXPECT_EQ(stateOf("d/e"), 1);
}

TEST_F(PlaceStates, aFolderIs2WhenItIsIgnoredAndElse0) {
    EXPECT_EQ(stateOf(""), 0);
    repository.write(".gitignore", "out/\n");
    repository.write("out/deep/a");
    repository.write("d/a");
    folder.addFolder("work/empty");
    EXPECT_EQ(stateOf("out"), 2);
    EXPECT_EQ(stateOf("out/deep"), 2);
    EXPECT_EQ(stateOf("d"), 0);
    EXPECT_EQ(stateOf("empty"), 0);
}

TEST_F(PlaceStates, aFolderWhoseOnlyFileHasASimilarNameBesideItIsNotTracked) {
    commitFile("da");
    commitFile("d.a");
    commitFile("d-a");
    folder.addFolder("work/d");
    EXPECT_EQ(stateOf("d"), 0);
}

TEST_F(PlaceStates, aFileInPlaceOfATrackedFolderIs0AndTheFilesBelowAre3) {
    commitFile("d/a");
    repository.remove("d");
    repository.write("d");
    EXPECT_EQ(agreedStateOf("d"), 0);
    EXPECT_EQ(agreedStateOf("d/a"), 3);
}

TEST_F(PlaceStates, aFolderInPlaceOfATrackedFileLeavesThatAt3) {
    commitFile("a");
    repository.remove("a");
    repository.write("a/b");
    EXPECT_EQ(agreedStateOf("a"), 3);
    EXPECT_EQ(agreedStateOf("a/b"), 0);
}

TEST_F(PlaceStates, aPathThatDoesNotExistIs9) {
    commitFile("a");
    EXPECT_EQ(stateOf("b"), 9);
    EXPECT_EQ(stateOf("c/d/e"), 9);
    EXPECT_EQ(stateOf("a/below"), 9);
    EXPECT_EQ(stateOf(std::string(300, 'x')), 9);
}

TEST_F(PlaceStates, aSpecialFileIs9) {
    ASSERT_EQ(::mkfifo((repository.onDisk() / "pipe").c_str(), 0600), 0);
    EXPECT_EQ(stateOf("pipe"), 9);
}

TEST_F(PlaceStates, everythingOutsideTheWorkTreeIs8) {
    commitFile("a");
    folder.addFile(u"beside", "");
    std::vector<Path> const outside{folder.path(u"beside"),
                                    folder.path(u"work-not"),
                                    folder.path(u"work/../beside"),
                                    repository.path(".git"),
                                    repository.path(".git/index"),
                                    Path(u"/"),
                                    Path(u""),
                                    Path(u"relative"),
                                    Path(std::u16string(u"/lone") + char16_t{0xD800}),
                                    Path(std::u16string(5000, u'/') + u"x"),
                                    Path(u"/" + std::u16string(5000, u'x'))};
    auto const states = adapter.getFileStates(outside);
    for (auto const& path : outside) {
        ASSERT_TRUE(states.contains(path));
        EXPECT_EQ(states.at(path).getState(), cmlink::LocalStatus::NotInRepository);
    }
}

TEST_F(PlaceStates, everythingBeyondALinkIs8) {
    repository.write("real/a");
    repository.run({"add", "-A"});
    folder.addLink("work/link", "real");
    EXPECT_EQ(stateOf("link/a"), 8);
    EXPECT_EQ(agreedStateOf("link"), 0);
}

TEST_F(PlaceStates, aTrackedFileWhoseFolderBecameALinkIs3) {
    commitFile("d/a");
    std::filesystem::rename(repository.onDisk() / "d", repository.onDisk() / "moved");
    folder.addLink("work/d", "moved");
    EXPECT_EQ(agreedStateOf("d/a"), 3);
    EXPECT_EQ(agreedStateOf("d"), 0);
}

TEST_F(PlaceStates, everythingInAnotherRepositoryInsideIs8) {
    GitRepository::init(folder.addFolder("work/inner")).write("deep/a");
    EXPECT_EQ(stateOf("inner"), 0);
    EXPECT_EQ(stateOf("inner/deep/a"), 8);
    EXPECT_EQ(stateOf("inner/deep"), 8);
}

TEST_F(PlaceStates, aFolderWithAnythingElseCalledDotGitIsNotARepository) {
    repository.write("d/.git", "not a repository\n");
    repository.write("d/a");
    EXPECT_EQ(agreedStateOf("d/a"), 0);
}

TEST_F(PlaceStates, everythingInARepositoryWhoseDotGitIsAFileIs8) {
    runGit(folder.onDisk(),
           {"init", "-q", "--separate-git-dir", (folder.onDisk() / "meta").string(), "work/inner"});
    repository.write("inner/a");
    EXPECT_EQ(stateOf("inner"), 0);
    EXPECT_EQ(stateOf("inner/a"), 8);
    adapter.addToSourceControl(repository.paths({"inner/a"}));
    EXPECT_EQ(repository.index(), "");
}

TEST_F(PlaceStates, aFolderWithPartOfARepositoryIsNotARepository) {
    for (std::string const part : {"HEAD", "objects", "refs"}) {
        GitRepository::init(folder.addFolder("work/" + part));
        repository.write(part + "/a");
        EXPECT_EQ(stateOf(part + "/a"), 8);
        repository.remove(part + "/.git/" + part);
        EXPECT_EQ(agreedStateOf(part + "/a"), 0) << "without " << part;
    }
}

TEST_F(PlaceStates, pathsMayBeWrittenInManyWays) {
    commitFile("d/a");
    std::vector<Path> const spellings{repository.root() / u"d/a/",
                                      repository.root() / u"d//a",
                                      repository.root() / u"./d/./a",
                                      repository.root() / u"x/../d/a",
                                      Path(u"//" + repository.root().native() + u"/d/a"),
                                      Path(u"/.." + repository.root().native() + u"/d/a")};
    auto const states = adapter.getFileStates(spellings);
    for (auto const& path : spellings) {
        EXPECT_EQ(states.at(path).getState(), cmlink::LocalStatus::Unmodified);
    }
}

TEST_F(PlaceStates, aProjectWhoseFolderHasNoNameOnDiskIsInNoRepository) {
    commitFile("a");
    GitAdapter nowhere(Path(u"/lone" + std::u16string(1, char16_t{0xD800})));
    EXPECT_EQ(repository.adapterStates(nowhere, {"a"}).at("a"), 8);
    EXPECT_TRUE(nowhere.trackedBelow({repository.root()}).empty());
    EXPECT_TRUE(nowhere.trackedBelow({}).empty());
}

TEST_F(PlaceStates, aProjectThatWasOpenedThroughALinkFindsItsFiles) {
    commitFile("sub/a");
    folder.addLink("way", "work/sub");
    GitAdapter throughLink(folder.path(u"way"));
    auto const path = folder.path(u"way/a");
    EXPECT_EQ(throughLink.getFileStates({path}).at(path).getState(), cmlink::LocalStatus::Unmodified);
}

} // namespace
} // namespace project::git
