#include "stores/merge_matrix/SampleProject.hpp"

#include <memory>

#include "project/core/ProjectManagerBase.hpp"
#include "project/metadata/ProjectException.hpp"
#include "project/stores/TextBackend.hpp"
#include "project/stores/TreeMetadataManager.hpp"
#include "support/CrashingDisk.hpp"

namespace project::test {

using stores::TextBackend;

namespace {

constexpr char const* textFile = "project.jsonl";

TextBackend::Options optionsOf(Writing writing) {
    TextBackend::Options options;
    if (writing == Writing::Appending) {
        options.alwaysRewritten = 0;
        options.bodyToTail = 1;
    }
    return options;
}

} // namespace

SampleProject::SampleProject() {
    for (auto const* const name : {u"main.cpp", u"new.txt", u"src/one.cpp", u"src/two.cpp", u"src/new.cpp",
                                   u"src/sub/deep.cpp", u"doc/guide.md", u"extra/x.txt", u"other.cpp"}) {
        folder_.file(name);
    }
    for (auto const* const name : {u"lib", u"lib2"}) {
        folder_.folder(name);
    }
}

std::string SampleProject::after(std::string const& text, Action const& action, Writing writing) const {
    auto const volume = std::make_shared<CrashingVolume>();
    if (!text.empty()) {
        volume->makeFolder();
        volume->replaceFile(textFile, text);
    }
    auto backend = std::make_unique<TextBackend>(std::make_unique<CrashingDisk>(volume), optionsOf(writing));
    auto const store = std::make_shared<stores::TreeMetadataManager>(std::move(backend),
                                                                     folder_.path(TextBackend::folderName));
    management::ProjectManagerBase project(folder_.root(), store);
    action(project, folder_);
    return volume->content(textFile); // before the store is closed, which tidies it
}

std::optional<std::string> SampleProject::afterIfAllowed(std::string const& text,
                                                         Action const& action) const {
    try {
        return after(text, action);
    } catch (exception::ProjectException const&) {
        return std::nullopt;
    }
}

} // namespace project::test
