#include "SystemOperations.hpp"

#include <filesystem>
#include <fstream>
#include <sstream>

#include <unistd.h>

#include "project/stores/SystemDisk.hpp"
#include "writing/StoreFiles.hpp"

namespace project::test {

namespace {

using std::chrono::milliseconds;

TextBackend::Options const rewriting{
    .patience = milliseconds(20), .alwaysRewritten = 1'000'000, .bodyToTail = 16};
TextBackend::Options const appending{.patience = milliseconds(20), .alwaysRewritten = 0, .bodyToTail = 1};

Batch const many = addFiles(manyFiles(20));
Batch const one = addFiles({u"b"});
Batch const another = addFiles({u"c"});

void readFirst(RealProject& project) {
    contentOf(*project.backend);
}

void nothing(RealProject& /*project*/) {
}

void commitOne(RealProject& project) {
    commit(*project.backend, one);
}

void commitAnother(RealProject& project) {
    commit(*project.backend, another);
}

std::string damagedText() {
    auto text = textOf(many);
    return text.insert(text.find('\n') + 1, "\"a name without its end\n");
}

std::string conflictedText() {
    auto text = textOf(many);
    return text.insert(text.find('\n') + 1, "<<<<<<< ours\n\"our\"\n=======\n\"their\"\n>>>>>>> theirs\n");
}

void letAnotherProcessAppend(RealProject& project) {
    readFirst(project);
    // The state before that process tidies the text.
    std::ofstream(project.root.onDisk() / ".projectdata/project.jsonl", std::ios::binary)
        << textOf(many, {one});
}

void leaveATemporaryFile(RealProject& project) {
    project.root.addFile(".projectdata/project.jsonl.1-0123456789abcdef.tmp", "half a text");
}

/// A new text gets the owner of the old one, if the process has the right to set it.
void giveAway(RealProject& project) {
    constexpr uid_t nobody = 65534;
    static_cast<void>(
        ::chown((project.root.onDisk() / ".projectdata/project.jsonl").c_str(), nobody, nobody));
}

void discardOne(RealProject& project) {
    Entered const entered(*project.backend, Access::Write);
    try {
        project.backend->write(one);
    } catch (...) {
        project.backend->discard();
        throw;
    }
    project.backend->discard();
}

/// Sets the content before an operation to that of its text.
SystemOperation changing(SystemOperation operation) {
    if (operation.text) {
        operation.before = stores::samples::contentOf(stores::samples::readWhole(*operation.text));
    }
    return operation;
}

/// The same for an operation that leaves the content as it is.
SystemOperation unchanging(SystemOperation operation) {
    operation = changing(std::move(operation));
    operation.after = operation.before;
    return operation;
}

} // namespace

std::unique_ptr<TextBackend> RealProject::open(TextBackend::Options options) const {
    return std::make_unique<TextBackend>(stores::makeSystemDisk(root.path(), stores::TextBackend::folderName),
                                         options);
}

std::string RealProject::text() const {
    std::ifstream file(root.onDisk() / ".projectdata/project.jsonl", std::ios::binary);
    std::ostringstream bytes;
    bytes << file.rdbuf();
    return bytes.str();
}

std::vector<std::string> RealProject::names() const {
    std::vector<std::string> names;
    for (auto const& entry : std::filesystem::directory_iterator(root.onDisk() / ".projectdata")) {
        names.push_back(entry.path().filename().string());
    }
    return names;
}

std::unique_ptr<RealProject> projectFor(SystemOperation const& operation) {
    auto project = std::make_unique<RealProject>();
    if (operation.text) {
        project->root.addFile(".projectdata/.gitattributes",
                              std::string(stores::StoreFiles::attributesContent));
        project->root.addFile(".projectdata/.gitignore", std::string(stores::StoreFiles::ignoredContent));
        project->root.addFile(".projectdata/project.jsonl", *operation.text);
    }
    project->backend = project->open(operation.options);
    operation.prepare(*project);
    return project;
}

SystemOperation appendingOperation() {
    return changing({.name = "append",
                     .text = textOf(many),
                     .options = appending,
                     .prepare = readFirst,
                     .perform = commitOne,
                     .after = contentAfter({many, one})});
}

SystemOperation rewritingOperation() {
    return changing({.name = "rewrite",
                     .text = textOf(many),
                     .options = rewriting,
                     .prepare = readFirst,
                     .perform = commitOne,
                     .after = contentAfter({many, one})});
}

SystemOperation creatingOperation() {
    return changing({.name = "create",
                     .text = std::nullopt,
                     .options = rewriting,
                     .prepare = nothing,
                     .perform = commitOne,
                     .after = contentAfter({one})});
}

std::vector<SystemOperation> systemOperations() {
    return {
        appendingOperation(),
        rewritingOperation(),
        creatingOperation(),
        changing({.name = "recover",
                  .text = textOf(many),
                  .options = rewriting,
                  .prepare = leaveATemporaryFile,
                  .perform = commitOne,
                  .after = contentAfter({many, one})}),
        changing({.name = "rewrite another owner's text",
                  .text = textOf(many),
                  .options = rewriting,
                  .prepare = giveAway,
                  .perform = commitOne,
                  .after = contentAfter({many, one})}),
        {.name = "append after others",
         .text = textOf(many),
         .options = appending,
         .prepare = letAnotherProcessAppend,
         .perform = commitAnother,
         .before = contentAfter({many, one}),
         .after = contentAfter({many, one, another})},
        {.name = "check for changes after others",
         .text = textOf(many),
         .options = appending,
         .prepare = letAnotherProcessAppend,
         .perform = readFirst,
         .before = contentAfter({many, one}),
         .after = contentAfter({many, one})},
        {.name = "close",
         .text = textOf(many),
         .options = appending,
         .prepare = commitOne,
         .perform = [](RealProject& project) { project.backend.reset(); },
         .before = contentAfter({many, one}),
         .after = contentAfter({many, one})},
        unchanging({.name = "discard",
                    .text = textOf(many),
                    .options = appending,
                    .prepare = nothing,
                    .perform = discardOne}),
        unchanging({.name = "discard creation",
                    .text = std::nullopt,
                    .options = appending,
                    .prepare = nothing,
                    .perform = discardOne}),
        unchanging({.name = "tidy",
                    .text = textOf(many, {one}),
                    .options = appending,
                    .prepare = nothing,
                    .perform = [](RealProject& project) { project.backend->tidy(); }}),
        unchanging({.name = "repair",
                    .text = damagedText(),
                    .options = appending,
                    .prepare = nothing,
                    .perform = [](RealProject& project) { project.backend->repair(); }}),
        changing({.name = "resolve",
                  .text = conflictedText(),
                  .options = appending,
                  .prepare = nothing,
                  .perform = [](RealProject& project) { project.backend->resolve(textOf(many)); },
                  .after = contentAfter({many})}),
        unchanging({.name = "check for changes",
                    .text = textOf(many),
                    .options = appending,
                    .prepare = nothing,
                    .perform = readFirst}),
        unchanging({.name = "check",
                    .text = textOf(many),
                    .options = appending,
                    .prepare = nothing,
                    .perform = [](RealProject& project) { project.backend->check(); }}),
    };
}

} // namespace project::test
