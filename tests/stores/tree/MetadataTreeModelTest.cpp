// Random histories of a tree against a sorted map: batches that are applied and undone, levels that are
// loaded at any time, and changes of others.
#include "tree/MetadataTree.hpp"

#include <algorithm>
#include <iterator>
#include <map>
#include <numeric>
#include <random>

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include "project/metadata/MetadataNodeSpecification.hpp"

namespace project::stores {
namespace {

using metadata::MetadataNodeSpecification;
using metadata::PathElement;

/// The state of each address that has one.
class States {
public:
    using Map = std::map<Address, std::pair<Node, bool>>;

    bool exists(Address const& address) const {
        auto const found = states_.lower_bound(address);
        return found != states_.end() && found->first.isWithin(address);
    }

    Node node(Address const& address) const {
        auto const found = states_.find(address);
        return found == states_.end() ? nullptr : found->second.first;
    }

    Children children(Address const& parent) const {
        Children children;
        for (auto at = states_.lower_bound(parent); at != states_.end() && at->first.isWithin(parent); ++at) {
            auto const& [address, state] = *at;
            if (address.depth() == parent.depth()) {
                continue;
            }
            auto const& element = address[parent.depth()];
            bool const isChild = address.depth() == parent.depth() + 1;
            if (children.empty() || children.back().element != element) {
                children.push_back(
                    {element, isChild ? state.first : nullptr, isChild && state.second, !isChild});
            } else {
                children.back().hasChildren = true;
            }
        }
        return children;
    }

    void apply(Change const& change) {
        if (change.kind == Change::Kind::Remove) {
            std::erase_if(states_, [&](auto const& entry) { return entry.first.isWithin(change.address); });
        } else {
            states_[change.address] = {change.node, change.kind == Change::Kind::Create};
        }
    }

    Map const& map() const { return states_; }

private:
    Map states_;
};

class History {
public:
    explicit History(unsigned seed) : random_(seed) {}

    /// Runs one random step, and compares the results with the model's.
    void step() {
        switch (draw(12)) {
        case 0:
        case 1:
        case 2:
            applyBatch();
            break;
        case 3:
            undoLast();
            break;
        case 4:
            commit();
            break;
        case 5:
            changeByOthers();
            break;
        case 6:
            undoAll();
            forgetAll();
            break;
        case 7:
            search();
            break;
        default:
            query(drawAddress());
        }
    }

    void queryAll() {
        query(Address::root());
        for (auto const& [address, state] : current_.map()) {
            for (auto above = address; above.depth() > 0; above = above.parent()) {
                query(above);
            }
        }
    }

private:
    std::size_t draw(std::size_t below) { return random_() % below; }

    PathElement drawElement() {
        static std::vector<std::u16string> const types{u"File", u"", u"\u0416", u"Z"};
        static std::vector<std::u16string> const names{u"a",      u"b",     u"",           u"\u00E9",
                                                       u"\u4E00", {0xD800}, {0xDC00, u'x'}};
        return {types[draw(3) == 0 ? draw(types.size()) : 0], names[draw(names.size())]};
    }

    /// Half of the addresses share steps with the one before.
    Address drawAddress() {
        auto address = draw(2) == 0 ? Address::root() : drawn_;
        for (auto shared = draw(3); address.depth() > shared;) {
            address = address.parent();
        }
        for (auto depth = draw(4) + 1; depth > 0; --depth) {
            address = address.child(drawElement());
        }
        drawn_ = address;
        return address;
    }

    Node drawNode() {
        if (draw(2) == 0) {
            return plainNode();
        }
        auto node = std::make_shared<MetadataNodeSpecification>(draw(2) == 0 ? u"Info" : u"Other");
        if (draw(4) != 0) {
            node->put(u"key", std::u16string(1, static_cast<char16_t>(draw(100))));
        }
        return node;
    }

    Change drawChange(States const& states) {
        auto const address = drawAddress();
        switch (draw(4)) {
        case 0:
            return {Change::Kind::Remove, address, nullptr};
        case 1:
            if (!states.exists(address)) {
                return {Change::Kind::Create, address, nullptr};
            }
            [[fallthrough]];
        default:
            return {Change::Kind::Set, address, drawNode()};
        }
    }

    void applyBatch() {
        States next = current_;
        Batch batch;
        for (auto count = draw(6) + 1; count > 0; --count) {
            batch.push_back(drawChange(next));
            next.apply(batch.back());
        }
        undone_.push_back({tree_.apply(batch), current_});
        current_ = std::move(next);
    }

    void undoLast() {
        if (!undone_.empty()) {
            tree_.undo(std::move(undone_.back().undo));
            current_ = std::move(undone_.back().before);
            undone_.pop_back();
        }
    }

    void undoAll() {
        while (!undone_.empty()) {
            undoLast();
        }
    }

    void commit() {
        undone_.clear();
        stored_ = current_;
    }

    void changeByOthers() {
        undoAll();
        commit();
        Changes changes;
        auto const before = stored_;
        for (auto count = draw(4); count > 0; --count) {
            stored_.apply(drawChange(stored_));
        }
        for (auto const* states : {&before, &std::as_const(stored_)}) {
            for (auto const& [address, state] : states->map()) {
                auto const known = before.map().find(address);
                auto const now = stored_.map().find(address);
                if (known == before.map().end() || now == stored_.map().end() ||
                    known->second != now->second) {
                    changes.differences.push_back({address, before.node(address), stored_.node(address)});
                }
            }
        }
        current_ = stored_;
        tree_.applyChanges(changes);
    }

    void forgetAll() {
        stored_ = current_;
        tree_.applyChanges({true, {}});
    }

    void query(Address const& address) {
        auto const expected = current_.node(address);
        auto const node = tree_.node(address);
        EXPECT_EQ(tree_.hasNode(address), expected != nullptr);
        EXPECT_EQ(node == nullptr, expected == nullptr);
        EXPECT_TRUE(!node || !expected || isEqual(*node, *expected));
        EXPECT_EQ(tree_.exists(address), current_.exists(address));
        std::vector<Address> children;
        for (auto const& child : current_.children(address)) {
            children.push_back(address.child(child.element));
        }
        EXPECT_EQ(tree_.children(address), children);
    }

    /// Queries for several addresses in one search.
    void search() {
        std::vector<Address> addresses;
        std::generate_n(std::back_inserter(addresses), 8, [this] { return drawAddress(); });
        addresses.push_back(Address::root());
        MetadataTree::Search search(tree_);
        for (auto const& address : addresses) {
            auto const expected = current_.node(address);
            auto const& node = search.node(address);
            EXPECT_EQ(node == nullptr, expected == nullptr);
            EXPECT_TRUE(!node || !expected || isEqual(*node, *expected));
        }
    }

    struct Undone {
        MetadataTree::Undo undo;
        States before;
    };

    std::mt19937 random_;
    Address drawn_ = Address::root();
    States stored_;  ///< of the backend: without the batches that can be undone
    States current_; ///< of the tree
    MetadataTree tree_{[this](Address const& address, ChildSink& sink) {
        for (auto const& child : stored_.children(address)) {
            sink.add({child.element.getType(), child.element.getLocation(), child.node, child.isCreated,
                      child.hasChildren});
        }
    }};
    std::vector<Undone> undone_;
};

RC_GTEST_PROP(MetadataTreeModel, anyHistoryGivesTheStatesOfASortedMap, ()) {
    History history(*rc::gen::arbitrary<unsigned>());
    for (auto steps = *rc::gen::inRange(1, 60); steps > 0; --steps) {
        history.step();
    }
    history.queryAll();
    RC_ASSERT(!testing::Test::HasFailure());
}

TEST(MetadataTreeModel, aLevelOf100000EntriesTakesSingleInsertsAndRemovalsAtRandomPlaces) {
    constexpr std::size_t most = 100'000;
    auto const folder = Address::root().child({u"Files", u"Root"});
    auto const fileNumber = [&](std::size_t number) {
        auto const digits = std::to_string(number);
        return folder.child({u"File", std::u16string(digits.begin(), digits.end())});
    };
    MetadataTree tree([](Address const&, ChildSink&) {});
    std::vector<std::size_t> numbers(most);
    std::iota(numbers.begin(), numbers.end(), std::size_t{0});
    std::mt19937 random(7);
    std::shuffle(numbers.begin(), numbers.end(), random);
    for (auto const number : numbers) {
        tree.apply({{Change::Kind::Set, fileNumber(number), plainNode()}});
    }
    auto const all = tree.children(folder);
    EXPECT_EQ(all.size(), most);
    EXPECT_TRUE(std::is_sorted(all.begin(), all.end()));
    std::vector<MetadataTree::Undo> undone;
    for (std::size_t i = 0; i < most; i += 2) {
        undone.push_back(tree.apply({{Change::Kind::Remove, fileNumber(numbers[i]), nullptr}}));
    }
    EXPECT_EQ(tree.children(folder).size(), most / 2);
    EXPECT_FALSE(tree.exists(fileNumber(numbers[0])));
    EXPECT_TRUE(tree.hasNode(fileNumber(numbers[1])));
    for (auto undo = undone.rbegin(); undo != undone.rend(); ++undo) {
        tree.undo(std::move(*undo));
    }
    EXPECT_EQ(tree.children(folder), all);
}

} // namespace
} // namespace project::stores
