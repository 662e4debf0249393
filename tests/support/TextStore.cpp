#include "support/TextStore.hpp"

#include <algorithm>
#include <ostream>
#include <utility>

namespace project::metadata {

void PrintTo(MetadataPath const& address, std::ostream* out) {
    for (auto const& element : address.getPath()) {
        *out << '(' << testing::PrintToString(element.getType()) << ", "
             << testing::PrintToString(element.getLocation()) << ')';
    }
}

} // namespace project::metadata

namespace project::test {

using stores::ProjectText;

namespace {

void walk(Backend& backend, Address const& parent, Content& content) {
    for (auto const& child : backend.load(parent)) {
        auto const address = parent.child(child.element);
        if (child.node || child.isCreated) {
            content.emplace(address, stores::samples::described(child.node));
        }
        auto const before = content.size();
        walk(backend, address, content);
        EXPECT_EQ(child.hasChildren, content.size() > before);
    }
}

} // namespace

FileChanges commit(Backend& backend, Batch const& batch) {
    Entered const entered(backend, Access::Write);
    try {
        auto files = backend.write(batch);
        backend.keep();
        return files;
    } catch (...) {
        backend.discard();
        throw;
    }
}

Batch addFiles(std::vector<std::u16string> const& paths) {
    Batch batch;
    for (auto const& path : paths) {
        batch.push_back(set(fileAddress(path)));
    }
    return batch;
}

std::vector<std::u16string> manyFiles(std::size_t count, std::u16string const& folder) {
    std::vector<std::u16string> paths;
    for (std::size_t index = 0; index < count; ++index) {
        auto number = std::to_string(index);
        number.insert(0, number.size() < 4 ? 4 - number.size() : 0, '0');
        paths.push_back(folder + u"/" + std::u16string(number.begin(), number.end()));
    }
    return paths;
}

Content loadAll(Backend& backend) {
    Content content;
    walk(backend, Address::root(), content);
    return content;
}

Content contentOf(Backend& backend) {
    Entered const entered(backend);
    return loadAll(backend);
}

Content contentAfter(std::vector<Batch> const& batches) {
    auto text = ProjectText::empty();
    for (auto const& batch : batches) {
        text = text.rewrittenWith(batch);
    }
    return stores::samples::contentOf(text);
}

std::string textOf(Batch const& body, std::vector<Batch> const& tail) {
    auto text = ProjectText::empty().rewrittenWith(body);
    auto bytes = text.body();
    for (auto const& batch : tail) {
        auto const lines = text.tailFor(batch);
        EXPECT_TRUE(text.extend(lines).has_value());
        bytes += lines;
    }
    return bytes;
}

void TextStore::prepare(std::vector<std::u16string> const& files) const {
    volume->removeFolder();
    commit(*open(), addFiles(files));
    volume->advanceBeyondTick();
    volume->calls.clear();
}

void TextStore::prepareText(std::string text) const {
    volume->makeFolder();
    volume->replaceFile("project.jsonl", std::move(text));
    volume->advanceBeyondTick();
}

void TextStore::failOnce(std::string call) const {
    volume->beforeCall = [call = std::move(call), hasFailed = false](std::string const& now) mutable {
        if (now == call && !std::exchange(hasFailed, true)) {
            throw StoreError(StoreError::Kind::DiskFailed, "", 0, "Input/output error", "");
        }
    };
}

std::vector<std::string> TextStore::writes() const {
    std::vector<std::string> result;
    std::copy_if(
        volume->calls.begin(), volume->calls.end(), std::back_inserter(result), [](auto const& call) {
            return call.starts_with("append") || call.starts_with("create") || call.starts_with("sync") ||
                   call.starts_with("exchange") || call.starts_with("rename") || call.starts_with("remove") ||
                   call.starts_with("makeFolder");
        });
    volume->calls.clear();
    return result;
}

} // namespace project::test
