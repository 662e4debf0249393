#pragma once

#include <cstddef>
#include <string>

#include "tools/ToolTest.hpp"

namespace project::test {

/// The project on which the examples of the help work, in a git repository, with other projects beside it.
class SampleProject : public ToolTest {
protected:
    void SetUp() override {
        auto const created = runIn("", script());
        ASSERT_EQ(created.exitCode, 0) << created.errors;
    }

    /// Runs a shell command in a copy of the sample.
    ProgramResult runInCopy(std::string const& command) const {
        auto const copy = "copy" + std::to_string(++copies_);
        auto const prepared =
            runIn("", "cp -a sample " + copy + " && cd " + copy + "/engine\n" + preparation(command));
        EXPECT_EQ(prepared.exitCode, 0) << prepared.errors;
        bool const isEndless = command.starts_with("projectctl watch");
        return runIn(copy + "/engine", (isEndless ? "timeout 1 " : "") + command);
    }

public:
    using ToolTest::linesOf;

private:
    ProgramResult runIn(std::string const& folder, std::string const& script) const {
        auto settings = settings_;
        settings.folder = folder_.onDisk() / folder;
        auto const programs = std::filesystem::path(PROJECTCTL).parent_path().string();
        return runProgram({"bash", "-euc", "export PATH=\"" + programs + ":$PATH\"\n" + script}, settings);
    }

    static std::string script() {
        return R"(
            mkdir sample && cd sample
            for name in pump valve; do mkdir $name && projectctl init $name; done
            mkdir -p engine/src/io engine/tools engine/lib common && cd engine
            touch readme.md src/main.cpp src/io/pump.cpp src/io/new.cpp tools/clean.py
            git init -q -b main && git config user.name Ada && git config user.email ada@example.org
            echo '*.o' >.gitignore
            projectctl init --name 'Engine controller'
            projectctl add readme.md src/main.cpp src/io/pump.cpp tools/clean.py
            projectctl category create Status --single-valued
            projectctl label create Status Open
            projectctl label create Status Reviewed
            projectctl label put Status Open src/main.cpp src/io/pump.cpp
            projectctl group create Nightly
            projectctl entry set tools/clean.py --type Batch_Job --group Nightly
            projectctl path add lib
            projectctl reference add ../pump
            git add -A && git commit -qm first
        )";
    }

    /// The examples of `merge` and `resolve` need versions of the text, and a conflict.
    static std::string preparation(std::string const& command) {
        std::string result;
        if (command.find(" merge ") != std::string::npos) {
            result += "for name in base ours theirs; do cp .projectdata/project.jsonl $name.jsonl; done\n";
        }
        if (command.find(" import ") != std::string::npos) {
            result += R"(
                echo '* ada@example.org' >CODEOWNERS
                mkdir build && echo '[]' >build/compile_commands.json
                projectctl export csv >labels.csv && projectctl export jsonl >labels.jsonl
            )";
        }
        if (command.find(" resolve") != std::string::npos) {
            result += R"(
                git switch -qc other && projectctl name Hers && git commit -qam hers
                git switch -q main && projectctl name Ours && git commit -qam ours
                ! git merge -q other >merge.log 2>&1
            )";
        }
        return result;
    }

    mutable std::size_t copies_ = 0;
};

} // namespace project::test
