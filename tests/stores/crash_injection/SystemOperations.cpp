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

TextBackend::Options const rewriting{milliseconds(20), 1'000'000, 16};
TextBackend::Options const appending{milliseconds(20), 0, 1};

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
    // As it is before that process tidies up.
    std::ofstream(project.root.onDisk() / ".projectdata/project.jsonl", std::ios::binary)
        << textOf(many, {one});
}

void leaveWhatADeadWriterLeft(RealProject& project) {
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

SystemOperation operation(char const* name, std::optional<std::string> text,
                          TextBackend::Options const& options, std::function<void(RealProject&)> prepare,
                          std::function<void(RealProject&)> perform) {
    auto const before = text ? stores::samples::contentOf(stores::samples::readWhole(*text)) : Content();
    return {name, std::move(text), options, std::move(prepare), std::move(perform), before, before};
}

SystemOperation withAfter(SystemOperation operation, Content after) {
    operation.after = std::move(after);
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
    return withAfter(operation("append", textOf(many), appending, readFirst, commitOne),
                     contentAfter({many, one}));
}

SystemOperation rewritingOperation() {
    return withAfter(operation("rewrite", textOf(many), rewriting, readFirst, commitOne),
                     contentAfter({many, one}));
}

SystemOperation creatingOperation() {
    return withAfter(operation("create", std::nullopt, rewriting, nothing, commitOne), contentAfter({one}));
}

std::vector<SystemOperation> systemOperations() {
    auto const text = textOf(many);
    auto afterOthers =
        operation("append after others", textOf(many), appending, letAnotherProcessAppend, commitAnother);
    afterOthers.before = contentAfter({many, one});
    auto lookAfterOthers =
        operation("look after others", text, appending, letAnotherProcessAppend, readFirst);
    lookAfterOthers.before = contentAfter({many, one});
    auto close =
        operation("close", text, appending, commitOne, [](RealProject& project) { project.backend.reset(); });
    close.before = contentAfter({many, one});
    return {
        appendingOperation(),
        rewritingOperation(),
        creatingOperation(),
        withAfter(operation("recover", text, rewriting, leaveWhatADeadWriterLeft, commitOne),
                  contentAfter({many, one})),
        withAfter(operation("rewrite somebody else's text", text, rewriting, giveAway, commitOne),
                  contentAfter({many, one})),
        withAfter(afterOthers, contentAfter({many, one, another})),
        withAfter(lookAfterOthers, contentAfter({many, one})),
        withAfter(close, contentAfter({many, one})),
        operation("discard", text, appending, nothing, discardOne),
        operation("discard creation", std::nullopt, appending, nothing, discardOne),
        operation("tidy", textOf(many, {one}), appending, nothing,
                  [](RealProject& project) { project.backend->tidy(); }),
        operation("repair", damagedText(), appending, nothing,
                  [](RealProject& project) { project.backend->repair(); }),
        withAfter(operation("settle", conflictedText(), appending, nothing,
                            [](RealProject& project) { project.backend->resolve(textOf(many)); }),
                  contentAfter({many})),
        operation("look", text, appending, nothing, readFirst),
        operation("check", text, appending, nothing, [](RealProject& project) { project.backend->check(); }),
    };
}

} // namespace project::test
