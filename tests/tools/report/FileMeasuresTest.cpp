#include "report/FileMeasures.hpp"

#include <filesystem>

#include <gmock/gmock.h>
#include <sys/stat.h>

#include "support/TemporaryFolder.hpp"

namespace projectctl {
namespace {

using ::testing::ElementsAre;

MATCHER_P2(Measures, size, lines, "") {
    *result_listener << arg.size << " bytes, " << arg.lines << " lines";
    return arg.size == std::uint64_t{size} && arg.lines == std::uint64_t{lines};
}

class FileMeasures : public ::testing::Test {
protected:
    std::vector<FileMeasure> measure(std::vector<std::pair<std::u16string, Kind>> const& entries) const {
        std::vector<Definition::Entry> list;
        list.reserve(entries.size());
        for (auto const& [path, kind] : entries) {
            list.push_back({path, kind, {}});
        }
        Progress progress(Message("ProgressReportFiles"));
        return measureFiles(folder_.root(), list, progress);
    }

    project::test::TemporaryFolder folder_;
};

TEST_F(FileMeasures, countALastLineWithoutItsEnd) {
    folder_.file(u"a", "one\ntwo\n");
    folder_.file(u"b", "one\ntwo");
    folder_.file(u"c", "");

    EXPECT_THAT(measure({{u"a", Kind::File}, {u"b", Kind::File}, {u"c", Kind::File}}),
                ElementsAre(Measures(8U, 2U), Measures(7U, 2U), Measures(0U, 0U)));
}

TEST_F(FileMeasures, countNoLinesInAFileThatIsNotText) {
    folder_.file(u"a", std::string("\n\0\n", 3));

    EXPECT_THAT(measure({{u"a", Kind::File}}), ElementsAre(Measures(3U, 0U)));
}

TEST_F(FileMeasures, countTheLinesOfAFileThatIsReadInSeveralPieces) {
    folder_.file(u"a", std::string(1000000, '\n'));

    EXPECT_THAT(measure({{u"a", Kind::File}}), ElementsAre(Measures(1000000U, 1000000U)));
}

TEST_F(FileMeasures, leaveOutFoldersAndFilesThatAreNotOnDisk) {
    folder_.file(u"src/a", "x\n");

    EXPECT_THAT(measure({{u"gone", Kind::File}, {u"src", Kind::Folder}, {u"src/a", Kind::File}}),
                ElementsAre(Measures(0U, 0U), Measures(0U, 0U), Measures(2U, 1U)));
}

TEST_F(FileMeasures, neverLeaveTheProject) {
    folder_.file(u"outside/a", "secret\n");
    folder_.folder(u"project");
    std::filesystem::create_directory_symlink("../outside", folder_.onDisk() / "project/link");
    std::filesystem::create_symlink("../outside/a", folder_.onDisk() / "project/file");
    std::vector<Definition::Entry> const entries{
        {u"..", Kind::Folder, {}}, {u"../outside", Kind::Folder, {}}, {u"../outside/a", Kind::File, {}},
        {u"file", Kind::File, {}}, {u"link", Kind::Folder, {}},       {u"link/a", Kind::File, {}}};
    Progress progress(Message("ProgressReportFiles"));

    auto const measures = measureFiles(folder_.path(u"project"), entries, progress);

    EXPECT_THAT(measures, ::testing::Each(Measures(0U, 0U)));
}

TEST_F(FileMeasures, doNotWaitForAPipe) {
    ASSERT_EQ(mkfifo((folder_.onDisk() / "pipe").c_str(), 0600), 0);

    EXPECT_THAT(measure({{u"pipe", Kind::File}}), ElementsAre(Measures(0U, 0U)));
}

} // namespace
} // namespace projectctl
