#include "report/History.hpp"

#include <algorithm>
#include <cstdint>
#include <exception>
#include <set>
#include <utility>

#include "git/Blobs.hpp"
#include "history/TextLog.hpp"
#include "report/Definition.hpp"

namespace projectctl {

namespace {

constexpr std::size_t mostVersions = 64;
constexpr std::uint64_t mostBytes = std::uint64_t{128} << 20; ///< of all texts that are read

/// A version of the text: where its content is.
struct StoredText {
    LoggedCommit commit;
    std::string content; ///< the id
    std::uint64_t size;
};

/// The versions of the text in the main line of history, the oldest first.
std::vector<StoredText> storedTexts(GitProject const& project) {
    std::vector<StoredText> result;
    std::set<std::string> contents;
    visitTextLog(project, {"--first-parent"}, [&](TextLog const& part) {
        for (auto const& commit : part.commits) {
            if (auto const* const change = changeOfText(commit, part.text)) {
                result.push_back({commit, change->after, 0});
                result.back().commit.changes.clear();
                contents.insert(change->after);
            }
        }
        return true;
    });
    auto const sizes = readBlobSizes(project.root(), contents);
    std::erase_if(result, [&sizes](StoredText const& text) { return !sizes.contains(text.content); });
    for (auto& text : result) {
        text.size = sizes.at(text.content);
    }
    std::ranges::reverse(result);
    return result;
}

std::uint64_t totalSize(std::vector<StoredText> const& texts) {
    std::uint64_t result = 0;
    for (auto const& text : texts) {
        result += text.size;
    }
    return result;
}

/// The first, the last, and others evenly between them.
std::vector<StoredText> sample(std::vector<StoredText> const& texts, std::size_t count) {
    if (texts.size() <= count) {
        return texts;
    }
    std::vector<StoredText> result;
    for (std::size_t i = 0; i < count; ++i) {
        result.push_back(texts[i * (texts.size() - 1) / (count - 1)]);
    }
    return result;
}

std::vector<StoredText> withinLimits(std::vector<StoredText> const& texts) {
    std::size_t count = mostVersions;
    auto result = sample(texts, count);
    while (count > 2 && totalSize(result) > mostBytes) {
        count /= 2;
        result = sample(texts, count);
    }
    return result;
}

void count(Definition const& definition, Version& version, History& history) {
    for (auto const& entry : definition.entries) {
        ++(entry.kind == Kind::File ? version.files : version.folders);
        for (auto const& label : entry.labels) {
            ++version.labels[label];
        }
    }
    for (auto const& [categoryUUID, category] : definition.categories) {
        for (auto const& [labelUUID, name] : category.labels) {
            history.labels[{categoryUUID, labelUUID}] = {category.name, name};
        }
    }
}

} // namespace

History readHistory(GitProject const& project, Progress& progress) {
    History result;
    if (!project.findCommit("HEAD")) {
        return result;
    }
    auto const all = storedTexts(project);
    auto const chosen = withinLimits(all);
    result.omitted = all.size() - chosen.size();
    std::set<std::string> contents;
    for (auto const& text : chosen) {
        contents.insert(text.content);
    }
    auto const texts = readBlobs(project.root(), contents);
    for (std::size_t i = 0; i < chosen.size(); ++i) {
        progress.reach(i + 1);
        try {
            Version version{chosen[i].commit, 0, 0, {}};
            count(readDefinition(texts.at(chosen[i].content), version.commit.id), version, result);
            result.versions.push_back(std::move(version));
        } catch (std::exception const&) { // a text that was damaged then says nothing about the others
            ++result.omitted;
        }
    }
    return result;
}

std::optional<LoggedCommit> lastChangeOf(GitProject const& project) {
    if (!project.findCommit("HEAD")) {
        return std::nullopt;
    }
    auto commits = readCommitLog(project.root(), {"-1", "--", ":(top,literal)" + project.textInRepository()});
    return commits.empty() ? std::nullopt : std::optional(std::move(commits.front()));
}

} // namespace projectctl
