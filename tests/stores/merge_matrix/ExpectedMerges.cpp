#include "stores/merge_matrix/ExpectedMerges.hpp"

#include <set>

#include <gtest/gtest.h>

#include "stores/merge/MergeSamples.hpp"

namespace project::test {

using namespace stores::samples;
using stores::Address;
using stores::ProjectText;

namespace {

struct Conflict {
    char const* ours;
    char const* theirs;
    char const* description;
};

constexpr char const* kindAddress = R"("Categories","Root","Category","c-kind")";

/// The pairs that conflict. All others merge without conflicts.
std::vector<Conflict> const& conflicts() {
    static std::string const deleted =
        std::string("Subtree at ") + kindAddress + ", removed by ours, changed ";
    static std::string const renamed = deleted + kindAddress;
    static std::string const made = deleted + R"("Categories","Root","Category","c-kind","Label","l-docs")";
    static std::string const entry =
        R"(Subtree at "EntryPoints","Root","EntryPoint","e-main", removed by ours, )"
        R"(changed "EntryPoints","Root","EntryPoint","e-main")";
    static std::string const group =
        R"(Subtree at "EntryPointGroups","Root","EntryPointGroup","g-tools", removed by ours, )"
        R"(changed "EntryPointGroups","Root","EntryPointGroup","g-tools")";
    static std::string const names = std::string("Key Name at ") + kindAddress;
    static std::vector<Conflict> const all{
        {"remove src", "add src/new.cpp", "Subtree at src, removed by ours, changed src/new.cpp"},
        {"remove src", "label src Source", "Subtree at src, removed by ours, changed src"},
        {"remove src", "label src/one.cpp Test", "Subtree at src, removed by ours, changed src/one.cpp"},
        {"remove src", "label src/two.cpp Final", "Subtree at src, removed by ours, changed src/two.cpp"},
        {"remove src/one.cpp", "label src/one.cpp Test",
         "Subtree at src/one.cpp, removed by ours, changed src/one.cpp"},
        {"delete category Kind", "rename category Kind to Sort", renamed.c_str()},
        {"delete category Kind", "rename category Kind to Art", renamed.c_str()},
        {"delete category Kind", "create label Docs", made.c_str()},
        {"rename category Kind to Sort", "rename category Kind to Art", names.c_str()},
        {"remove entry point main.cpp", "rename entry point main.cpp", entry.c_str()},
        {"remove entry point main.cpp", "extend entry point main.cpp", entry.c_str()},
        {"remove entry point main.cpp", "move entry point main.cpp to tests", entry.c_str()},
        {"delete group tools", "rename group tools", group.c_str()},
        {"name it Station", "name it Works", R"(Key Name at "Info","ProjectData")"},
    };
    return all;
}

/// Changes whose result differs from their merge if they are made in this order in one project: the later
/// one affects the result of the earlier one. All other orders that the managers allow equal the merge.
std::set<std::pair<std::string, std::string>> const reaching{
    {"label src Source", "add src/new.cpp"}, // adding drops the labels of the folders above
    // A label on a file whose category or label was deleted, which `check` reports:
    {"label src/one.cpp Test", "delete category Kind"},
    {"label other.cpp Test", "delete category Kind"},
    {"label src Source", "delete category Kind"},
    {"label src Source", "delete label Source"},
    // An entry point in a deleted group, which is read as one of the default group:
    {"delete group tools", "rename entry point main.cpp"},
    {"delete group tools", "extend entry point main.cpp"},
    // An entry point of a removed file, which `check` reports; the other order is refused:
    {"set entry point src/two.cpp", "remove src"},
};

std::string sortedDescription(metadata::MetadataNode const& node) {
    std::string result = toAscii(node.getType());
    for (std::u16string const& key : node.getKeys()) {
        result += ' ' + toAscii(key) + '=' + toAscii(node.get(key));
    }
    std::multiset<std::string> children;
    for (auto const& child : node.getChildren()) {
        children.insert(sortedDescription(*child));
    }
    for (auto const& child : children) {
        result += '(' + child + ')';
    }
    return result;
}

void collect(ProjectText const& text, Address const& parent, std::string& content) {
    for (auto const& child : text.children(parent)) {
        Address const address = parent.child(child.element);
        if (child.node || child.isCreated) {
            content += stores::AddressText(address).view().text;
            content += ": " + (child.node ? sortedDescription(*child.node) : "made") + '\n';
        }
        collect(text, address, content);
    }
}

std::string exchanged(std::string description) {
    for (auto at = description.find("removed by ours"); at != description.npos;
         at = description.find("removed by ours", at)) {
        description.replace(at, std::string("removed by ours").size(), "removed by theirs");
    }
    return description;
}

} // namespace

std::string contentOf(std::string const& text) {
    std::string content;
    collect(readWhole(text), Address::root(), content);
    return content;
}

ExpectedMerges::ExpectedMerges() : common_(project_.after({}, makeCommonProject)) {
}

std::string ExpectedMerges::conflict(std::string const& ours, std::string const& theirs) {
    for (auto const& conflict : conflicts()) {
        if (conflict.ours == ours && conflict.theirs == theirs) {
            return conflict.description;
        }
        if (conflict.ours == theirs && conflict.theirs == ours) {
            return exchanged(conflict.description);
        }
    }
    return {};
}

std::vector<std::pair<std::string, std::string>> ExpectedMerges::exceptions() {
    std::vector<std::pair<std::string, std::string>> result(reaching.begin(), reaching.end());
    for (auto const& conflict : conflicts()) {
        result.emplace_back(conflict.ours, conflict.theirs);
    }
    return result;
}

void ExpectedMerges::expectBoth(std::string const& merged, NamedChange const& one,
                                NamedChange const& other) const {
    bool const allowed = expectAfter(merged, one, other);
    EXPECT_TRUE(expectAfter(merged, other, one) || allowed);
}

/// @return whether the managers allow this order.
bool ExpectedMerges::expectAfter(std::string const& merged, NamedChange const& first,
                                 NamedChange const& second) const {
    auto const model = project_.afterIfAllowed(project_.after(common_, first.make), second.make);
    if (model && reaching.contains({first.name, second.name})) {
        EXPECT_NE(contentOf(merged), contentOf(*model));
    } else if (model) {
        EXPECT_EQ(contentOf(merged), contentOf(*model)) << "after: " << first.name;
    }
    return model.has_value();
}

} // namespace project::test
