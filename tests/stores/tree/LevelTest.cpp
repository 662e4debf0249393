// One level against a sorted map: entries are inserted and extracted at random places, so that chunks are
// split and merged.
#include "tree/Level.hpp"

#include <algorithm>
#include <map>
#include <numeric>
#include <random>

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include "project/metadata/MetadataNodeSpecification.hpp"
#include "tree/LevelBuilder.hpp"

namespace project::stores {
namespace {

using metadata::MetadataNodeSpecification;
using metadata::PathElement;

/// The plain node and nodes of their own.
Node nodeNumber(int number) {
    if (number == 0) {
        return nullptr;
    }
    if (number == 1) {
        return plainNode();
    }
    auto node = std::make_shared<MetadataNodeSpecification>(u"Info");
    node->put(u"number", std::u16string(1, static_cast<char16_t>(number)));
    return node;
}

class LevelTest : public testing::Test {
protected:
    struct State {
        Node node;
        bool isCreated;
        Level* below;
    };

    Level::Found find(PathElement const& element) {
        auto found = level->findNear(ElementKey(types, element.getType(), element.getLocation()), hint);
        hint = found.position;
        return found;
    }

    void insert(PathElement const& element, Node const& node, bool isCreated, bool hasBelow) {
        auto const found = find(element);
        if (found.isFound) {
            level->setState(found.position, node, isCreated);
            auto& known = model.at(element);
            known = {node, isCreated, known.below};
            return;
        }
        Place place{node, isCreated, {}};
        auto& added = model[element];
        added = {node, isCreated, nullptr};
        if (hasBelow) {
            auto below = Level::create(std::pmr::get_default_resource());
            added.below = below.get();
            place.below.set(std::move(below));
        }
        hint = level->insert(found.position, {types.index(element.getType()), NewName(element.getLocation())},
                             std::move(place));
        EXPECT_EQ(level->element(types, hint), element);
    }

    void extract(PathElement const& element) {
        auto const found = find(element);
        auto const known = model.find(element);
        ASSERT_EQ(found.isFound, known != model.end());
        if (found.isFound) {
            auto const place = level->extract(found.position);
            EXPECT_EQ(place.node, known->second.node);
            EXPECT_EQ(place.isCreated, known->second.isCreated);
            EXPECT_EQ(place.below.loaded(), known->second.below);
            model.erase(known);
        }
    }

    /// Compares all entries, and searches each with several hints.
    void expectModel() {
        EXPECT_EQ(level->size(), model.size());
        EXPECT_EQ(level->empty(), model.empty());
        EXPECT_EQ(level->hasOneEntry(), model.size() == 1);
        auto known = model.begin();
        level->forEach([&](Level::Position at) {
            ASSERT_NE(known, model.end());
            EXPECT_EQ(level->element(types, at), known->first);
            EXPECT_EQ(level->node(at), known->second.node);
            EXPECT_EQ(level->isCreated(at), known->second.isCreated);
            auto const* const below = level->below(at);
            EXPECT_EQ(below == nullptr ? nullptr : below->loaded(), known->second.below);
            ElementKey const key(types, known->first.getType(), known->first.getLocation());
            EXPECT_TRUE(level->find(key).isFound);
            EXPECT_EQ(level->find(key).position, at);
            for (auto const& from : {hint, at, Level::Position{}, Level::Position{at.chunk, at.entry + 1}}) {
                auto const found = level->findNear(key, from);
                EXPECT_TRUE(found.isFound);
                EXPECT_EQ(level->element(types, found.position), known->first);
            }
            ++known;
        });
    }

    TypeTable types;
    LevelPointer level = Level::create(std::pmr::get_default_resource());
    Level::Position hint;
    std::map<PathElement, State> model;
};

PathElement numbered(int number) {
    std::u16string digits;
    for (int rest = number; rest > 0; rest /= 10) {
        digits.insert(digits.begin(), static_cast<char16_t>(u'0' + rest % 10));
    }
    return {u"t", u"file" + digits};
}

TEST_F(LevelTest, entriesInAnyOrderAreSortedAndFound) {
    std::vector<int> numbers(5000);
    std::iota(numbers.begin(), numbers.end(), 1);
    std::mt19937 random(1);
    for (int round = 0; round < 3; ++round) {
        std::shuffle(numbers.begin(), numbers.end(), random);
        for (int const number : numbers) {
            insert(numbered(number), nodeNumber(number % 3), number % 5 == 0, number % 7 == 0);
        }
        expectModel();
        std::shuffle(numbers.begin(), numbers.end(), random);
        for (std::size_t i = 0; i < numbers.size() - static_cast<std::size_t>(round) * 2400; ++i) {
            extract(numbered(numbers[i]));
        }
        expectModel();
    }
}

TEST_F(LevelTest, entriesThatGrowAtEitherEndAreSortedAndFound) {
    for (int number = 5000; number < 6000; ++number) {
        insert(numbered(number), plainNode(), false, false);
        insert(numbered(9999 - number), plainNode(), false, false);
    }
    expectModel();
    for (int number = 5000; number < 6000; ++number) {
        extract(numbered(number));
    }
    expectModel();
}

TEST_F(LevelTest, aBuilderGivesTheSameLevelAndCanBeUsedAgain) {
    for (int number = 0; number < 1000; ++number) {
        insert(numbered(number), nodeNumber(number % 3), number % 5 == 0, false);
    }
    LevelBuilder builder(types, std::pmr::get_default_resource());
    builder.begin();
    builder.add({u"t", u"discarded", plainNode(), false, true});
    for (int round = 0; round < 2; ++round) {
        builder.begin();
        for (auto const& [element, state] : model) {
            builder.add({element.getType(), element.getLocation(), state.node, state.isCreated, false});
        }
        level = builder.finish();
        expectModel();
    }
}

RC_GTEST_FIXTURE_PROP(LevelTest, anyHistoryGivesTheEntriesOfASortedMap, ()) {
    auto const steps = *rc::gen::inRange(1, 600);
    std::vector<std::u16string> const parts{
        u"", u"a", u"b", u"\u00E9", u"\u0101", {0xD800}, {0xDFFF}, u"/", std::u16string(130, u'x')};
    std::mt19937 random(*rc::gen::arbitrary<unsigned>());
    auto const drawn = [&](std::size_t below) { return random() % below; };
    for (int step = 0; step < steps; ++step) {
        PathElement const element(parts[drawn(4)], parts[drawn(parts.size())] + parts[drawn(parts.size())] +
                                                       parts[drawn(3)] + parts[drawn(3)]);
        if (drawn(3) == 0) {
            extract(element);
        } else {
            insert(element, nodeNumber(static_cast<int>(drawn(4))), drawn(2) == 0, drawn(4) == 0);
        }
    }
    expectModel();
    RC_ASSERT(!HasFailure());
}

} // namespace
} // namespace project::stores
