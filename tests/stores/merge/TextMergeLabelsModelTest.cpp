// Labels on a file, merged like a plain map of counts.
#include "project/stores/TextMerge.hpp"

#include <rapidcheck/gtest.h>

#include "stores/merge/MergeSamples.hpp"

namespace project::stores {

namespace {

using namespace samples;

/// How often each label of each category is on a file.
using Labels = std::map<std::pair<std::u16string, std::u16string>, int>;

Labels noLabels() {
    Labels labels;
    for (std::u16string const category : {u"c", u"d"}) {
        for (std::u16string const label : {u"1", u"2", u"3"}) {
            labels[{category, label}] = 0;
        }
    }
    return labels;
}

Labels drawLabels() {
    Labels labels = noLabels();
    for (auto& [label, count] : labels) {
        count = *rc::gen::weightedElement<int>({{3, 0}, {3, 1}, {1, 2}});
    }
    return labels;
}

std::string fileWith(Labels const& labels) {
    std::map<std::u16string, std::vector<Nested>> byCategory;
    for (auto const& [label, count] : labels) {
        Nested const nested{u"Label", {{u"UUID", label.second}}, {}};
        auto& children = byCategory[label.first];
        children.insert(children.end(), static_cast<std::size_t>(count), nested);
    }
    std::vector<Nested> nested;
    for (auto const& [category, children] : byCategory) {
        if (children.empty()) {
            continue;
        }
        nested.push_back({u"Category", {{u"UUID", category}}, children});
    }
    return textWith({set(fileAddress(u"a"), makeNode(u"Info", {}, nested))});
}

/// The labels on that file.
Labels labelsOf(std::string const& text) {
    Labels labels = noLabels();
    Address const folder = addressOf({u"Files", u"Root"});
    Node const file = readWhole(text).children(folder).at(0).node;
    for (auto const& category : file->getChildren()) {
        for (auto const& label : category->getChildren()) {
            ++labels[{category->get(u"UUID"), label->get(u"UUID")}];
        }
    }
    return labels;
}

RC_GTEST_PROP(TextMergeModel, labelsAreMergedLikeCounts, ()) {
    Labels const base = drawLabels();
    Labels const ours = drawLabels();
    Labels const theirs = drawLabels();
    Labels expected;
    for (auto const& [label, before] : base) {
        int const mine = ours.at(label);
        int const other = theirs.at(label);
        for (int which = 0; which < 2; ++which) {
            bool const has = (which < mine) == (which < other) ? which < mine : which >= before;
            expected[label] += has ? 1 : 0;
        }
    }
    TextMerge const merge = mergeTexts(fileWith(base), fileWith(ours), fileWith(theirs));
    RC_ASSERT(merge.conflicts().empty());
    RC_ASSERT(labelsOf(merge.text()) == expected);
    RC_ASSERT(merge.text().size() == fileWith(expected).size());
}

} // namespace

} // namespace project::stores
