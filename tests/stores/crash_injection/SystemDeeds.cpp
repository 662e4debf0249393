#include "SystemDeeds.hpp"

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
    // As it stands before that process tidies up.
    std::ofstream(project.root.onDisk() / ".projectdata/project.jsonl", std::ios::binary)
        << textOf(many, {one});
}

void leaveWhatADeadWriterLeft(RealProject& project) {
    project.root.addFile(".projectdata/project.jsonl.1-0123456789abcdef.tmp", "half a text");
}

/// A new text gets the owner of the old one, if it may.
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

SystemDeed deed(char const* name, std::optional<std::string> text, TextBackend::Options const& options,
                std::function<void(RealProject&)> prepare, std::function<void(RealProject&)> perform) {
    auto const before = text ? stores::samples::contentOf(stores::samples::readWhole(*text)) : Content();
    return {name, std::move(text), options, std::move(prepare), std::move(perform), before, before};
}

SystemDeed withAfter(SystemDeed deed, Content after) {
    deed.after = std::move(after);
    return deed;
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

std::unique_ptr<RealProject> projectFor(SystemDeed const& deed) {
    auto project = std::make_unique<RealProject>();
    if (deed.text) {
        project->root.addFile(".projectdata/.gitattributes",
                              std::string(stores::StoreFiles::attributesContent));
        project->root.addFile(".projectdata/.gitignore", std::string(stores::StoreFiles::ignoredContent));
        project->root.addFile(".projectdata/project.jsonl", *deed.text);
    }
    project->backend = project->open(deed.options);
    deed.prepare(*project);
    return project;
}

SystemDeed appendingDeed() {
    return withAfter(deed("append", textOf(many), appending, readFirst, commitOne),
                     contentAfter({many, one}));
}

SystemDeed rewritingDeed() {
    return withAfter(deed("rewrite", textOf(many), rewriting, readFirst, commitOne),
                     contentAfter({many, one}));
}

SystemDeed creatingDeed() {
    return withAfter(deed("create", std::nullopt, rewriting, nothing, commitOne), contentAfter({one}));
}

std::vector<SystemDeed> systemDeeds() {
    auto const text = textOf(many);
    auto afterOthers =
        deed("append after others", textOf(many), appending, letAnotherProcessAppend, commitAnother);
    afterOthers.before = contentAfter({many, one});
    auto lookAfterOthers = deed("look after others", text, appending, letAnotherProcessAppend, readFirst);
    lookAfterOthers.before = contentAfter({many, one});
    auto close =
        deed("close", text, appending, commitOne, [](RealProject& project) { project.backend.reset(); });
    close.before = contentAfter({many, one});
    return {
        appendingDeed(),
        rewritingDeed(),
        creatingDeed(),
        withAfter(deed("recover", text, rewriting, leaveWhatADeadWriterLeft, commitOne),
                  contentAfter({many, one})),
        withAfter(deed("rewrite somebody else's text", text, rewriting, giveAway, commitOne),
                  contentAfter({many, one})),
        withAfter(afterOthers, contentAfter({many, one, another})),
        withAfter(lookAfterOthers, contentAfter({many, one})),
        withAfter(close, contentAfter({many, one})),
        deed("discard", text, appending, nothing, discardOne),
        deed("discard creation", std::nullopt, appending, nothing, discardOne),
        deed("tidy", textOf(many, {one}), appending, nothing,
             [](RealProject& project) { project.backend->tidy(); }),
        deed("repair", damagedText(), appending, nothing,
             [](RealProject& project) { project.backend->repair(); }),
        withAfter(deed("settle", conflictedText(), appending, nothing,
                       [](RealProject& project) { project.backend->resolve(textOf(many)); }),
                  contentAfter({many})),
        deed("look", text, appending, nothing, readFirst),
        deed("check", text, appending, nothing, [](RealProject& project) { project.backend->check(); }),
    };
}

} // namespace project::test
