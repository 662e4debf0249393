#include "merge/RenamesOfMerge.hpp"

#include <algorithm>
#include <charconv>
#include <cstddef>
#include <optional>
#include <string_view>
#include <system_error>

#include "git/GitCommand.hpp"
#include "git/RawChanges.hpp"
#include "git/TextInRepository.hpp"
#include "merge/MergedStates.hpp"
#include "output/Failure.hpp"
#include "output/NameForms.hpp"

namespace projectctl {

namespace {

using fl::filesystem::Path;
using project::stores::SideRenames;
using project::stores::ThreeWay;

/// Tells a merge driver that is called by our own question to git not to ask again.
constexpr char const* isAskedKey = "merge.project-definition.isasked";

std::vector<std::string_view> zeroFieldsOf(std::string_view text) {
    std::vector<std::string_view> result;
    while (!text.empty()) {
        auto const end = std::min(text.find('\0'), text.size());
        result.push_back(text.substr(0, end));
        text.remove_prefix(std::min(end + 1, text.size()));
    }
    return result;
}

/// Git's settings for renames in merges.
struct RenameSettings {
    bool areFollowed = true;
    std::string limit = "7000"; // git's own value

    explicit RenameSettings(Path const& folder) {
        std::optional<bool> ofMerge;
        std::optional<bool> ofDiff;
        std::optional<std::string> limitOfMerge;
        std::optional<std::string> limitOfDiff;
        auto const found =
            runGit(folder, {"config", "-z", "--get-regexp",
                            R"(^(diff|merge)\.(renames|renamelimit)$|^merge\.project-definition\.isasked$)"});
        for (auto const field : zeroFieldsOf(found.output)) {
            auto const end = field.find('\n');
            auto const key = field.substr(0, end);
            auto const value = end == field.npos ? "true" : field.substr(end + 1);
            if (key == "merge.renames") {
                ofMerge = isOn(value);
            } else if (key == "diff.renames") {
                ofDiff = isOn(value);
            } else if (key == "merge.renamelimit") {
                limitOfMerge = value;
            } else if (key == "diff.renamelimit") {
                limitOfDiff = value;
            } else {
                areFollowed = false;
            }
        }
        areFollowed = areFollowed && ofMerge.value_or(ofDiff.value_or(true));
        limit = limitOfMerge.value_or(limitOfDiff.value_or(limit));
    }

    static bool isOn(std::string_view value) {
        return value != "false" && value != "no" && value != "off" && value != "0" && !value.empty();
    }
};

/// The questions to git about one merge.
class RenameQuestions {
public:
    RenameQuestions(Path const& folder, std::string_view prefix, MergedStates const& states,
                    RenameSettings const& settings)
        : folder_(folder), prefix_(prefix), states_(states), settings_(settings) {}

    RenamesOfMerge ask() const {
        RenamesOfMerge result;
        result.ours.renamed = renamedIn(states_.trees.ours);
        result.theirs.renamed = renamedIn(states_.trees.theirs);
        if (!result.ours.renamed.empty() || !result.theirs.renamed.empty()) {
            askForPlaces(result);
        }
        return result;
    }

private:
    /// A path from the root of the project; nothing for a file outside it.
    std::optional<std::u16string> inProject(std::string_view path) const {
        return path.starts_with(prefix_) ? std::optional(textOf(std::string(path.substr(prefix_.size()))))
                                         : std::nullopt;
    }

    SideRenames::Paths renamedIn(std::string const& side) const {
        auto const raw = runGit(folder_, {"diff-tree", "-r", "-z", "--raw", "--no-abbrev", "-M",
                                          "-l" + settings_.limit, states_.trees.base, side});
        SideRenames::Paths result;
        for (auto const& change : readRawChanges(raw.output)) {
            auto from = inProject(change.from);
            auto to = inProject(change.to);
            if (change.status == 'R' && from && to) {
                result.emplace(*std::move(from), *std::move(to));
            }
        }
        return result;
    }

    /// Lets git merge the states once more, without touching anything, and reads the places from its
    /// messages.
    void askForPlaces(RenamesOfMerge& result) const {
        auto const commits = mergeableCommits();
        if (!commits) {
            return;
        }
        auto const merged = runGit(
            folder_, {"-c", std::string(isAskedKey) + "=true", "-c", "merge.project-definition.driver=true",
                      "merge-tree", "--write-tree", "-z", "--messages", commits->first, commits->second});
        if (merged.exitCode == 0 || merged.exitCode == 1) { // anything else: git is too old to answer
            readMessages(zeroFieldsOf(merged.output), result);
        }
    }

    /// The commits whose merge is the one in question. Where git merges a change into a third commit, these
    /// are two new commits with the common version as their parent, to which nothing refers.
    std::optional<std::pair<std::string, std::string>> mergeableCommits() const {
        if (states_.isOfBranches) {
            return std::pair(states_.trees.ours, states_.trees.theirs);
        }
        auto const base = commitOf(states_.trees.base, {});
        auto const ours = base ? commitOf(states_.trees.ours, *base) : std::nullopt;
        auto const theirs = base ? commitOf(states_.trees.theirs, *base) : std::nullopt;
        return ours && theirs ? std::optional(std::pair(*ours, *theirs)) : std::nullopt;
    }

    std::optional<std::string> commitOf(std::string const& state, std::string const& parent) const {
        auto const tree = answer(runGit(folder_, {"rev-parse", "--verify", state + "^{tree}"}));
        if (!tree) {
            return std::nullopt;
        }
        std::string commit = "tree " + *tree + '\n';
        commit += parent.empty() ? "" : "parent " + parent + '\n';
        commit += "author projectctl <> 0 +0000\ncommitter projectctl <> 0 +0000\n\nrenames\n";
        return answer(runGit(folder_, {"hash-object", "-t", "commit", "-w", "--stdin"}, commit));
    }

    static std::optional<std::string> answer(ProcessResult const& result) {
        return result.exitCode == 0 ? std::optional(result.output.substr(0, result.output.find('\n')))
                                    : std::nullopt;
    }

    /// Each message consists of a number of paths, the paths, its kind, and a text. Before the messages there
    /// are the conflicting files, and an empty field.
    void readMessages(std::vector<std::string_view> const& fields, RenamesOfMerge& result) const {
        auto field = std::ranges::find(fields, std::string_view());
        for (field += field == fields.end() ? 0 : 1; field != fields.end();) {
            std::size_t count = 0;
            std::from_chars(field->data(), field->data() + field->size(), count);
            if (static_cast<std::size_t>(fields.end() - field) < count + 3) {
                return;
            }
            auto const paths = field + 1;
            auto const kind = paths[static_cast<std::ptrdiff_t>(count)];
            bool const isSuggested = kind == "CONFLICT (directory rename suggested)";
            if (count == 2 && (isSuggested || kind == "Path updated due to directory rename")) {
                addPlace(paths[1], paths[0], isSuggested, result);
            }
            field += static_cast<std::ptrdiff_t>(count) + 3;
        }
    }

    void addPlace(std::string_view path, std::string_view place, bool isSuggested,
                  RenamesOfMerge& result) const {
        auto const from = inProject(path);
        auto const to = inProject(place);
        if (from && to) {
            result.ours.relocated.emplace(*from, *to);
            result.theirs.relocated.emplace(*from, *to);
            if (isSuggested) {
                result.suggested.emplace_back(*from, *to);
            }
        }
    }

    Path const& folder_;
    std::string_view prefix_;
    MergedStates const& states_;
    RenameSettings const& settings_;
};

} // namespace

RenamesOfMerge renamesOfMerge(Path const& folder, std::string const& text,
                              ThreeWay<std::string> const& versions) try {
    if (!text.ends_with(textBelowRoot)) {
        return {};
    }
    RenameSettings const settings(folder);
    auto const states = settings.areFollowed ? findMergedStates(folder, text, versions) : std::nullopt;
    if (!states) {
        return {};
    }
    auto const prefix =
        std::string_view(text).substr(0, text.size() - std::string_view(textBelowRoot).size());
    return RenameQuestions(folder, prefix, *states, settings).ask();

} catch (Failure const&) {

    return {}; // git answers no questions here: the merge goes on without its help

} catch (std::system_error const&) {

    return {};
}

} // namespace projectctl
