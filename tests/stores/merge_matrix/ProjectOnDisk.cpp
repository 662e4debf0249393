#include "stores/merge_matrix/ProjectOnDisk.hpp"

#include <fstream>
#include <iterator>
#include <memory>

#include "project/core/ProjectManagerBase.hpp"
#include "project/metadata/ProjectException.hpp"
#include "project/stores/TextBackend.hpp"
#include "project/stores/TreeMetadataManager.hpp"

namespace project::test {

using stores::TextBackend;

namespace {

TextBackend::Options optionsOf(Writing writing) {
    TextBackend::Options options;
    if (writing == Writing::Appending) {
        options.alwaysRewritten = 0;
        options.bodyToTail = 1;
    }
    return options;
}

std::string contentOf(std::filesystem::path const& file) {
    std::ifstream stream(file, std::ios::binary);
    return {std::istreambuf_iterator<char>(stream), {}};
}

} // namespace

ProjectOnDisk::ProjectOnDisk() {
    for (auto const* const name : {u"main.cpp", u"new.txt", u"src/one.cpp", u"src/two.cpp", u"src/new.cpp",
                                   u"src/sub/deep.cpp", u"doc/guide.md", u"extra/x.txt", u"other.cpp"}) {
        folder_.file(name);
    }
    for (auto const* const name : {u"lib", u"lib2"}) {
        folder_.folder(name);
    }
}

std::string ProjectOnDisk::after(std::string const& text, Action const& action, Writing writing) const {
    folder_.remove(u".projectdata");
    auto const file = folder_.onDisk() / ".projectdata" / "project.jsonl";
    if (!text.empty()) {
        folder_.addFile(".projectdata/project.jsonl", text);
    }
    auto backend = std::make_unique<TextBackend>(stores::makeSystemDisk(folder_.root()), optionsOf(writing));
    auto const store = std::make_shared<stores::TreeMetadataManager>(std::move(backend),
                                                                     folder_.path(TextBackend::folderName));
    management::ProjectManagerBase project(folder_.root(), store);
    action(project, folder_);
    return contentOf(file); // before the store is closed, which takes in the tail
}

std::optional<std::string> ProjectOnDisk::afterIfAllowed(std::string const& text,
                                                         Action const& action) const {
    try {
        return after(text, action);
    } catch (exception::ProjectException const&) {
        return std::nullopt;
    }
}

} // namespace project::test
