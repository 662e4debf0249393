// Random versions: laws of every merge, and merges of plain maps.
#include "project/stores/TextMerge.hpp"

#include <rapidcheck/gtest.h>

#include "fl/i18n/JsonString.hpp"
#include "line/LineAddress.hpp"
#include "node/NestedNodes.hpp"
#include "project/metadata/MetadataNodeSpecification.hpp"
#include "stores/merge/MergeModel.hpp"
#include "stores/merge/MergeSamples.hpp"
#include "support/TextGenerators.hpp"

namespace project::stores {

namespace {

using namespace samples;

std::string textOf(Tree const& tree) {
    Batch batch;
    for (auto const& [address, keys] : tree) {
        batch.push_back(keys ? set(address, makeNode(u"Info", *keys)) : make(address));
    }
    return textWith(batch);
}

/// A number below another, whatever the size of the case.
int drawNumber(int below) {
    return *rc::gen::resize(rc::kNominalSize, rc::gen::inRange(0, below));
}

/// Nodes by address; a null node is an address that was created without one.
using Nodes = std::map<Address, Node>;

/// An address of a node, above one, below one, or anywhere.
Address drawAddress(Nodes const& nodes) {
    if (nodes.empty() || drawNumber(6) == 0) {
        return *anyAddress();
    }
    Address address = std::next(nodes.begin(), drawNumber(static_cast<int>(nodes.size())))->first;
    if (drawNumber(4) == 0) {
        return address.child({u"File", *rc::gen::element<std::u16string>(u"a", u"b")});
    }
    for (int up = drawNumber(3) - 1; up > 0 && address.depth() > 1; --up) {
        address = address.parent();
    }
    return address;
}

/// Changes a node a little, or one that is nested in it.
void change(metadata::MetadataNode& node) {
    auto const& children = node.getChildren();
    auto const one = *rc::gen::element<std::u16string>(u"1", u"2");
    switch (drawNumber(6)) {
    case 0:
        node.put(*rc::gen::element<std::u16string>(u"Value", u"k"), one);
        break;
    case 1:
        node.addChild(u"Label")->put(u"UUID", one);
        break;
    case 2:
        node.addChild(u"Category")->put(u"UUID", one);
        break;
    case 3:
        if (!children.empty()) {
            node.removeChild(
                children[static_cast<std::size_t>(drawNumber(static_cast<int>(children.size())))].get());
        }
        break;
    default:
        if (!children.empty()) {
            change(*children[static_cast<std::size_t>(drawNumber(static_cast<int>(children.size())))]);
        }
    }
}

Node drawNode(Nodes const& nodes, Address const& address) {
    auto const found = nodes.find(address);
    if (found == nodes.end() || found->second == nullptr || drawNumber(8) == 0) {
        return *anyNode();
    }
    auto node = std::make_shared<metadata::MetadataNodeSpecification>(*found->second);
    for (int count = drawNumber(4); count >= 0; --count) {
        change(*node);
    }
    return node;
}

Batch drawBatch(Nodes& nodes, int most) {
    Batch batch;
    for (int count = drawNumber(most); count > 0; --count) {
        Address const address = drawAddress(nodes);
        if (drawNumber(4) == 0) {
            batch.push_back(remove(address));
            std::erase_if(nodes, [&](auto const& entry) { return entry.first.isWithin(address); });
        } else {
            Node const node = drawNumber(8) == 0 ? nullptr : drawNode(nodes, address);
            batch.push_back({node ? Change::Kind::Set : Change::Kind::Create, address, node});
            nodes.insert_or_assign(address, node);
        }
    }
    return batch;
}

/// Three versions with arbitrary nodes; the two later ones may have tails.
struct Versions {
    Versions() {
        Nodes nodes;
        ProjectText const common = ProjectText::empty().rewrittenWith(drawBatch(nodes, 10));
        base = common.body();
        ours = changed(common, nodes);
        theirs = changed(common, nodes);
    }

    static std::string changed(ProjectText const& text, Nodes nodes) {
        Batch const batch = drawBatch(nodes, 6);
        bool const appends = *rc::gen::arbitrary<bool>();
        return appends ? text.body() + text.tailFor(batch) : text.rewrittenWith(batch).body();
    }

    TextMerge merge() const { return mergeTexts(base, ours, theirs); }

    std::string base;
    std::string ours;
    std::string theirs;
};

std::string tidied(std::string const& text) {
    return readWhole(text).rewrittenWith({}).body();
}

std::vector<MergeSide> all(TextMerge const& merge, MergeSide side) {
    return std::vector<MergeSide>(merge.conflicts().size(), side);
}

std::vector<MergeSide> drawChoices(TextMerge const& merge) {
    std::vector<MergeSide> choices;
    for (std::size_t i = 0; i < merge.conflicts().size(); ++i) {
        choices.push_back(*rc::gen::element(MergeSide::Ours, MergeSide::Theirs));
    }
    return choices;
}

RC_GTEST_PROP(TextMergeModel, aChangeOfOnlyOneSideIsApplied, ()) {
    Versions const versions;
    RC_ASSERT(merged(versions.base, versions.base, versions.ours) == tidied(versions.ours));
    RC_ASSERT(merged(versions.base, versions.ours, versions.base) == tidied(versions.ours));
}

RC_GTEST_PROP(TextMergeModel, equalChangesOfBothSidesAreAppliedOnce, ()) {
    Versions const versions;
    RC_ASSERT(merged(versions.base, versions.ours, versions.ours) == tidied(versions.ours));
    RC_ASSERT(merged("", versions.ours, versions.ours) == tidied(versions.ours));
}

RC_GTEST_PROP(TextMergeModel, exchangingTheSidesGivesTheSameText, ()) {
    Versions const versions;
    std::string const base = *rc::gen::arbitrary<bool>() ? versions.base : "";
    TextMerge const merge = mergeTexts(base, versions.ours, versions.theirs);
    TextMerge const exchanged = mergeTexts(base, versions.theirs, versions.ours);
    RC_CLASSIFY(!merge.conflicts().empty(), "conflicts");
    RC_ASSERT(merge.conflicts().size() == exchanged.conflicts().size());
    RC_ASSERT(merge.text(all(merge, MergeSide::Ours)) == exchanged.text(all(merge, MergeSide::Theirs)));
}

RC_GTEST_PROP(TextMergeModel, theMergedTextIsTidyWhateverIsChosen, ()) {
    Versions const versions;
    TextMerge const merge = versions.merge();
    std::string const text = merge.text(drawChoices(merge));
    ProjectText const read = readWhole(text);
    RC_ASSERT(read.isTidy());
    RC_ASSERT(read.faults().empty());
    RC_ASSERT(read.rewrittenWith({}).body() == text);
}

RC_GTEST_PROP(TextMergeModel, aRemovalIsAppliedUnlessItIsInConflict, ()) {
    Versions const versions;
    TextMerge const merge = versions.merge();
    Content const base = contentOf(readWhole(versions.base));
    Content const ours = contentOf(readWhole(versions.ours));
    Content const theirs = contentOf(readWhole(versions.theirs));
    Content const result = contentOf(readWhole(merge.text(all(merge, MergeSide::Theirs))));
    for (auto const& [address, node] : base) {
        bool const removed = !ours.contains(address) || !theirs.contains(address);
        bool const decided =
            std::none_of(merge.conflicts().begin(), merge.conflicts().end(),
                         [at = address](auto const& conflict) { return at.isWithin(conflict.address); });
        RC_ASSERT(!removed || !decided || !result.contains(address));
    }
}

/// The text of one side of a text with markers, as git writes them.
std::string sideOf(std::string const& marked, std::string const& opening) {
    std::string text;
    std::string within;
    for (std::size_t at = 0; at < marked.size();) {
        std::size_t const end = marked.find('\n', at) + 1;
        std::string const line = marked.substr(at, end - at);
        at = end;
        if (line.find_first_of("<|=>") == 0) {
            within = line.front() == '>' ? "" : line.substr(0, 1);
        } else if (within.empty() || within == opening) {
            text += line;
        }
    }
    return text;
}

RC_GTEST_PROP(TextMergeModel, theMarkersEncloseTheSidesToChooseFrom, ()) {
    Versions const versions;
    TextMerge const merge = versions.merge();
    std::string const marked = merge.textWithMarkers();
    RC_ASSERT(sideOf(marked, "<") == merge.text(all(merge, MergeSide::Ours)));
    RC_ASSERT(sideOf(marked, "=") == merge.text(all(merge, MergeSide::Theirs)));
    bool const nested =
        std::any_of(merge.conflicts().begin(), merge.conflicts().end(),
                    [](MergeConflict const& it) { return it.kind == MergeConflict::Kind::Nested; });
    if (!nested) { // if one of several nodes of one name is removed, the next ones are matched with others
        TextMerge const again = mergeTexts(sideOf(marked, "|"), sideOf(marked, "<"), sideOf(marked, "="));
        RC_ASSERT(described(again.conflicts()) == described(merge.conflicts()));
        RC_ASSERT(again.textWithMarkers() == marked);
    }
}

RC_GTEST_PROP(TextMergeModel, aTextWithMarkersIsReadAsBothSidesJoined, ()) {
    Versions const versions;
    TextMerge const merge = versions.merge();
    ProjectText const read = readWhole(merge.textWithMarkers());
    Content const content = contentOf(read);
    std::set<Address> sites;
    for (MergeConflict const& conflict : merge.conflicts()) {
        sites.insert(conflict.address);
    }
    RC_ASSERT(read.faults().size() == sites.size());
    for (MergeSide const side : {MergeSide::Ours, MergeSide::Theirs}) {
        for (auto const& [address, node] : contentOf(readWhole(merge.text(all(merge, side))))) {
            RC_ASSERT(content.contains(address));
        }
    }
}

/// Whether two nested nodes of a node have the same identity.
bool hasTwins(metadata::MetadataNode const& node) {
    std::set<std::string> identities;
    auto const& nested = node.getChildren();
    return std::any_of(nested.begin(), nested.end(), [&identities](auto const& child) {
        return !identities.insert(identityOf(*child)).second || hasTwins(*child);
    });
}

bool hasTwins(std::string const& text) {
    auto const content = ProjectText::empty().differencesTo(readWhole(text));
    return std::any_of(content.begin(), content.end(),
                       [](auto const& found) { return found.after && hasTwins(*found.after); });
}

bool hasAddressWithoutNode(std::string const& text) {
    return text.find("\"node\":false") != std::string::npos;
}

/// Whether the sides of an unfinished merge can differ in something that a later merge keeps, whatever was
/// decided: an address without a node, or one of two nested nodes of the same identity.
bool canKeepWhatWasDecided(TextMerge const& merge) {
    return hasAddressWithoutNode(merge.textWithMarkers()) ||
           hasTwins(merge.text(all(merge, MergeSide::Ours))) ||
           hasTwins(merge.text(all(merge, MergeSide::Theirs)));
}

/// A node without the order of its nested nodes.
std::string unorderedForm(metadata::MetadataNode const& node) {
    std::multiset<std::string> nested;
    for (auto const& child : node.getChildren()) {
        nested.insert(unorderedForm(*child));
    }
    metadata::MetadataNodeSpecification own(node.getType());
    copyKeys(own, node);
    std::string form = identityOf(own);
    for (auto const& key : own.getKeys()) {
        if (!own.get(key).empty()) { // a query cannot distinguish an empty value from none
            fl::i18n::appendJsonString(form, key);
            fl::i18n::appendJsonString(form, own.get(key));
        }
    }
    for (auto const& child : nested) {
        form += '(' + child + ')';
    }
    return form;
}

/// A text without the order of nested nodes. Where two resolutions order them differently, a merge chooses.
std::map<Address, std::string> unordered(std::string const& text) {
    std::map<Address, std::string> result;
    for (auto const& [address, before, after] : ProjectText::empty().differencesTo(readWhole(text))) {
        result.emplace(address, after ? unorderedForm(*after) : "created");
    }
    return result;
}

RC_GTEST_PROP(TextMergeModel, twoResolutionsOfOneMergeAreAConflictUnlessTheyAreEqual, ()) {
    TextMerge const merge = Versions().merge();
    RC_PRE(!canKeepWhatWasDecided(merge));
    std::string const one = merge.text(drawChoices(merge));
    std::string const two = merge.text(drawChoices(merge));
    TextMerge const again = mergeTexts(merge.textWithMarkers(), one, two);
    RC_CLASSIFY(one != two, "conflicts");
    RC_ASSERT(again.conflicts().empty() == (unordered(one) == unordered(two)));
    RC_ASSERT(unordered(again.text(all(again, MergeSide::Ours))) == unordered(one));
    RC_ASSERT(unordered(again.text(all(again, MergeSide::Theirs))) == unordered(two));
}

void addNestedIdentities(metadata::MetadataNode const& node, std::string const& path,
                         std::set<std::string>& identities) {
    for (auto const& child : node.getChildren()) {
        std::string const own = path + '/' + identityOf(*child);
        identities.insert(own);
        addNestedIdentities(*child, own, identities);
    }
}

std::set<std::string> nestedIdentities(std::string const& text) {
    std::set<std::string> identities;
    for (auto const& [address, before, after] : ProjectText::empty().differencesTo(readWhole(text))) {
        if (after) {
            addNestedIdentities(*after, std::string(AddressText(address).view().text), identities);
        }
    }
    return identities;
}

/// Whether a text has a nested node that a resolution decided against. It may be merged as that resolution
/// decided.
bool hasWhatWasDecidedAgainst(std::string const& text, std::string const& resolved, TextMerge const& merge) {
    std::set<std::string> decided;
    decided.merge(nestedIdentities(merge.text(all(merge, MergeSide::Ours))));
    decided.merge(nestedIdentities(merge.text(all(merge, MergeSide::Theirs))));
    for (auto const& kept : nestedIdentities(resolved)) {
        decided.erase(kept);
    }
    auto const found = nestedIdentities(text);
    return std::any_of(decided.begin(), decided.end(),
                       [&](auto const& node) { return found.contains(node); });
}

RC_GTEST_PROP(TextMergeModel, aChangeAfterAResolutionIsAppliedOrInConflict, ()) {
    TextMerge const merge = Versions().merge();
    RC_PRE(!canKeepWhatWasDecided(merge));
    std::string const resolved = merge.text(drawChoices(merge));
    Nodes nodes;
    for (auto const& [address, before, after] : ProjectText::empty().differencesTo(readWhole(resolved))) {
        nodes.emplace(address, after);
    }
    std::string const changed = readWhole(resolved).rewrittenWith(drawBatch(nodes, 4)).body();
    RC_PRE(!hasAddressWithoutNode(changed) && !hasWhatWasDecidedAgainst(changed, resolved, merge));
    TextMerge const again = mergeTexts(merge.textWithMarkers(), resolved, changed);
    RC_CLASSIFY(!merge.conflicts().empty() && again.conflicts().empty() && changed != resolved, "applied");
    RC_ASSERT(unordered(again.text(all(again, MergeSide::Theirs))) == unordered(changed));
}

Keys drawKeys() {
    Keys keys;
    for (std::u16string const key : {u"k", u"l", u"m"}) {
        auto const value = *rc::gen::element<std::u16string>(u"", u"1", u"2");
        if (!value.empty()) {
            keys.emplace(key, value);
        }
    }
    return keys;
}

/// Addresses of a few names and levels, so that they coincide and lie within each other.
Address drawNearAddress() {
    Address address = addressOf({u"Files", u"Root"});
    for (int depth = 1 + drawNumber(3); depth > 0; --depth) {
        address = address.child({u"File", *rc::gen::element<std::u16string>(u"a", u"b")});
    }
    return address;
}

Tree drawChanges(Tree tree, int most) {
    for (int count = drawNumber(most); count > 0; --count) {
        Address const address = drawNearAddress();
        switch (drawNumber(4)) {
        case 0:
            std::erase_if(tree, [&](auto const& entry) { return entry.first.isWithin(address); });
            break;
        case 1:
            tree.insert_or_assign(address, std::nullopt);
            break;
        default:
            tree.insert_or_assign(address, drawKeys());
        }
    }
    return tree;
}

RC_GTEST_PROP(TextMergeModel, addressesAndKeysAreMergedLikePlainMaps, ()) {
    Tree const base = drawChanges({}, 16);
    Tree const ours = drawChanges(base, 10);
    Tree const theirs = drawChanges(base, 10);
    MergeModel const model(base, ours, theirs);
    TextMerge const merge = mergeTexts(textOf(base), textOf(ours), textOf(theirs));
    std::set<Address> conflicts;
    for (MergeConflict const& conflict : merge.conflicts()) {
        conflicts.insert(conflict.address);
    }
    RC_CLASSIFY(!conflicts.empty(), "conflicts");
    RC_ASSERT(conflicts == model.conflicts());
    if (conflicts.empty()) {
        RC_ASSERT(merge.text() == textOf(model.merged()));
    }
}

RC_GTEST_PROP(TextMergeModel, changesOfDifferentAddressesAreBothApplied, ()) {
    Tree const base = drawChanges({}, 8);
    auto const below = [](Tree const& tree, std::u16string const& name) {
        Tree part;
        for (auto const& [address, node] : tree) {
            if (address.isWithin(fileAddress(name))) {
                part.emplace(address, node);
            }
        }
        return part;
    };
    Tree const ours = drawChanges(base, 6);
    Tree const theirs = drawChanges(base, 6);
    auto const join = [&](Tree const& inA, Tree const& inB) {
        Tree joined = below(inA, u"a");
        joined.merge(below(inB, u"b"));
        return joined;
    };
    RC_ASSERT(merged(textOf(base), textOf(join(ours, base)), textOf(join(base, theirs))) ==
              textOf(join(ours, theirs)));
}

} // namespace

} // namespace project::stores
