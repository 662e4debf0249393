#include "merge/DisputedBase.hpp"

#include <algorithm>
#include <memory>
#include <utility>
#include <vector>

#include "node/NestedNodes.hpp"
#include "node/Siblings.hpp"
#include "project/metadata/MetadataNodeSpecification.hpp"
#include "text/TextDifference.hpp"
#include "text/TextLines.hpp"
#include "text/TextReader.hpp"

namespace project::stores {

using metadata::MetadataNode;
using metadata::MetadataNodeSpecification;

namespace {

/// True for a key whose change would give a nested node another identity: the identifying key, and also an
/// empty UUID, which leaves the identity to the name.
bool isOfIdentity(MetadataNode const& node, std::u16string const& key) {
    return key == u"UUID" || key == identifyingKey(node);
}

/// True if a nested node has a key or a nested node that a merge can find changed.
bool hasMoreThanIdentity(MetadataNode const& node) {
    auto const keys = node.getKeys();
    auto const& nested = node.getChildren();
    return identifyingKey(node) &&
           (std::any_of(keys.begin(), keys.end(),
                        [&node](auto const& key) { return !isOfIdentity(node, key); }) ||
            std::any_of(nested.begin(), nested.end(),
                        [](auto const& child) { return hasMoreThanIdentity(*child); }));
}

class Dispute {
public:
    explicit Dispute(std::u16string const& disputed) : disputed_(disputed) {}

    /// The node of an address, of which at least one side has a node.
    Node nodeOf(MetadataNode const* ours, MetadataNode const* theirs) const {
        if (ours == nullptr || theirs == nullptr) {
            auto node = std::make_shared<MetadataNodeSpecification>(disputed_);
            copyInto(*node, ours != nullptr ? *ours : *theirs);
            return node;
        }
        auto node = std::make_shared<MetadataNodeSpecification>(agreed(ours->getType(), theirs->getType()));
        fill(*node, *ours, *theirs);
        return node;
    }

private:
    std::u16string const& agreed(std::u16string const& ours, std::u16string const& theirs) const {
        return ours == theirs ? ours : disputed_;
    }

    void fill(MetadataNode& target, MetadataNode const& ours, MetadataNode const& theirs) const {
        for (auto const* const side : {&ours, &theirs}) {
            for (auto const& key : side->getKeys()) {
                target.put(key, agreed(ours.get(key), theirs.get(key)));
            }
        }
        Siblings const siblings({nullptr, &ours, &theirs});
        for (std::size_t const rank :
             siblings.mergedOrder(std::vector<bool>(siblings.byRank().size(), true))) {
            addNested(target, siblings.byRank()[rank]);
        }
    }

    void addNested(MetadataNode& target, Siblings::Versions const& nested) const {
        auto const& present = nested.ours != nullptr ? *nested.ours : *nested.theirs;
        if (nested.ours != nullptr && nested.theirs != nullptr) {
            fill(*target.addChild(present.getType()), *nested.ours, *nested.theirs);
        } else {
            addDisputed(target, present);
        }
    }

    /// Adds a nested node that only one side has.
    void addDisputed(MetadataNode& target, MetadataNode const& present) const {
        if (!hasMoreThanIdentity(present)) {
            return;
        }
        auto& node = *target.addChild(present.getType());
        for (auto const& key : present.getKeys()) {
            node.put(key, isOfIdentity(present, key) ? present.get(key) : disputed_);
        }
        for (auto const& child : present.getChildren()) {
            addDisputed(node, *child);
        }
    }

    std::u16string const& disputed_;
};

/// A text of the lines that both sides have.
std::string linesOfBoth(TextBody const& ours, TextBody const& theirs) {
    std::string text = std::string(firstLine) + '\n';
    auto rest = theirs.all();
    for (std::size_t i = 0; i < ours.size(); ++i) {
        rest.begin = theirs.lowerBound(rest, ours.address(i));
        if (!rest.empty() && theirs.line(rest.begin) == ours.line(i)) {
            text.append(ours.line(i)) += '\n';
        }
    }
    return text.append(endLine) += '\n';
}

} // namespace

TextBody disputedBase(TextBody const& ours, TextBody const& theirs, std::u16string const& disputed) {
    Dispute const dispute(disputed);
    Batch batch;
    for (auto const& [address, our, their] : differences(TextContent(ours), TextContent(theirs))) {
        if (our || their) {
            batch.push_back({Change::Kind::Set, address, dispute.nodeOf(our.get(), their.get())});
        }
    }
    return readText(linesOfBoth(ours, theirs), "base")->content.write(batch);
}

} // namespace project::stores
