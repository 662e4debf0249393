#include "docs/Blocks.hpp"

#include <filesystem>
#include <fstream>
#include <iostream>
#include <sstream>

#include "support/TemporaryFolder.hpp"

namespace docs {
namespace {

/// Redirects std::cout as long as it exists.
class CapturedOutput {
public:
    CapturedOutput() : earlier_(std::cout.rdbuf(text_.rdbuf())) {}

    CapturedOutput(CapturedOutput const&) = delete;
    CapturedOutput& operator=(CapturedOutput const&) = delete;

    ~CapturedOutput() { std::cout.rdbuf(earlier_); }

    std::string text() const { return text_.str(); }

private:
    std::ostringstream text_;
    std::streambuf* earlier_;
};

/// A working folder with the files and folders that the pages mention.
class WorkingFolder {
public:
    WorkingFolder() : earlier_(std::filesystem::current_path()), path_(folder_.onDisk() / "controller") {
        for (char const* name : {"src/io", "engine", "pump", "my-sources"}) {
            std::filesystem::create_directories(path_ / name);
        }
        std::filesystem::current_path(path_);
        for (char const* name : {"readme.md", "src/main.cpp", "src/valve.cpp", "src/io/pump.cpp"}) {
            std::ofstream(path_ / name) << "// " << name << '\n';
        }
    }

    WorkingFolder(WorkingFolder const&) = delete;
    WorkingFolder& operator=(WorkingFolder const&) = delete;

    ~WorkingFolder() { std::filesystem::current_path(earlier_); }

private:
    project::test::TemporaryFolder folder_;
    std::filesystem::path earlier_;
    std::filesystem::path path_;
};

} // namespace

std::string runBlock(void (*block)(project::session::Session&)) {
    WorkingFolder const folder;
    auto session = project::session::Session::create(u".", u"Engine controller");
    CapturedOutput const output;
    block(session);
    return output.text();
}

std::string runProgram(int (*program)(int, char**), std::vector<std::string> arguments) {
    WorkingFolder const folder;
    std::string name = "program";
    std::vector<char*> words = {name.data()};
    for (auto& argument : arguments) {
        words.push_back(argument.data());
    }
    words.push_back(nullptr);
    CapturedOutput const output;
    EXPECT_EQ(program(static_cast<int>(words.size()) - 1, words.data()), 0);
    return output.text();
}

} // namespace docs
