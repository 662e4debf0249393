#include "project/stores/SharedLocation.hpp"

#include <fstream>
#include <sstream>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "project/stores/StoreError.hpp"
#include "project/stores/SystemDisk.hpp"
#include "support/TemporaryFolder.hpp"

namespace project::stores {
namespace {

using ::testing::HasSubstr;

class SharedLocationTest : public ::testing::Test {
protected:
    std::filesystem::path folder() const { return root_.onDisk() / ".projectdata"; }

    void write(char const* name, std::string const& content) const {
        std::filesystem::create_directories(folder());
        std::ofstream(folder() / name) << content;
    }

    std::string read(char const* name) const {
        std::ostringstream content;
        content << std::ifstream(folder() / name).rdbuf();
        return content.str();
    }

    /// The error of reading a content.
    StoreError errorFor(std::string const& content) const {
        write("store.json", content);
        try {
            readSharedLocation(*disk_);
        } catch (StoreError const& error) {
            return error;
        }
        ADD_FAILURE() << "nothing was thrown for " << content;
        return {StoreError::Kind::Busy, "", 0, "", ""};
    }

    test::TemporaryFolder const root_;
    std::unique_ptr<Disk> const disk_ = makeSystemDisk(root_.root(), u".projectdata");
    SharedLocation const location_{"postgresql", "engine", "3f0d6f0e-8c2b-4f52-9d0e-5a3f9b7c1d2e"};
};

TEST_F(SharedLocationTest, aProjectWithoutTheFileIsNotShared) {
    EXPECT_FALSE(readSharedLocation(*disk_).has_value());
    write("project.jsonl", "");
    EXPECT_FALSE(readSharedLocation(*disk_).has_value());
}

TEST_F(SharedLocationTest, whatWasCreatedIsRead) {
    auto const created = createSharedLocation(*disk_, location_);

    EXPECT_EQ(readSharedLocation(*disk_), location_);
    EXPECT_EQ(created.added.size(), 2U);
    EXPECT_EQ(read("store.json"), R"({"format":"project-store","version":1,"kind":"postgresql",)"
                                  R"("service":"engine","project":"3f0d6f0e-8c2b-4f52-9d0e-5a3f9b7c1d2e"})"
                                  "\n");
    EXPECT_THAT(read(".gitignore"), HasSubstr("/cache/\n"));
}

TEST_F(SharedLocationTest, namesOfAnyCharactersAreRead) {
    SharedLocation const strange{"kind", "a \"b\" \\ \xC3\xA4\n", "id"};
    createSharedLocation(*disk_, strange);

    EXPECT_EQ(readSharedLocation(*disk_), strange);
}

TEST_F(SharedLocationTest, aProjectInTheFolderIsNotReplaced) {
    createSharedLocation(*disk_, location_);
    auto const before = read("store.json");

    EXPECT_THROW(createSharedLocation(*disk_, {"postgresql", "other", "id"}), StoreError);

    EXPECT_EQ(read("store.json"), before);
}

TEST_F(SharedLocationTest, aTextInTheFolderIsNotReplaced) {
    write("project.jsonl", "text");

    EXPECT_THROW(createSharedLocation(*disk_, location_), StoreError);

    EXPECT_FALSE(std::filesystem::exists(folder() / "store.json"));
    EXPECT_EQ(read("project.jsonl"), "text");
}

TEST_F(SharedLocationTest, aTextBesideTheFileIsReported) {
    createSharedLocation(*disk_, location_);
    write("project.jsonl", "");

    EXPECT_THAT(errorFor(read("store.json")).what(), HasSubstr("there is a text beside it"));
}

TEST_F(SharedLocationTest, aDamagedFileIsReported) {
    for (auto const* content :
         {"", "{", "[]", R"({"format":"other","version":1})",
          R"({"format":"project-store","version":1,"kind":"a","service":"b"})",
          R"({"format":"project-store","version":1,"service":"b","kind":"a","project":"c"})",
          R"({"format":"project-store","version":1,"kind":"a","service":"b","project":"c"}x)"}) {
        EXPECT_EQ(errorFor(content).kind(), StoreError::Kind::Damaged) << content;
    }
}

TEST_F(SharedLocationTest, aLaterFormatAsksForALaterProgram) {
    auto const error = errorFor(R"({"format":"project-store","version":2,"where":"moon"})");

    EXPECT_EQ(error.kind(), StoreError::Kind::Refused);
    EXPECT_THAT(error.what(), HasSubstr("later format 2"));
}

} // namespace
} // namespace project::stores
