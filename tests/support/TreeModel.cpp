#include "support/TreeModel.hpp"

#include <algorithm>
#include <iterator>
#include <optional>
#include <stdexcept>
#include <tuple>
#include <utility>

#include "project/metadata/MetadataNodeSpecification.hpp"
#include "support/TextGenerators.hpp"

namespace project::test {

using metadata::MetadataNode;
using metadata::MetadataNodeSpecification;
using stores::Node;
using stores::TreeMetadataManager;
using stores::samples::described;

namespace {

std::string firstDifference(Content const& wanted, Content const& found) {
    for (auto const& [from, other, meaning] :
         {std::tuple(&wanted, &found, "it lacks "), std::tuple(&found, &wanted, "it has ")}) {
        for (auto const& entry : *from) {
            if (auto const same = other->find(entry.first); same == other->end() || *same != entry) {
                return meaning + testing::PrintToString(entry);
            }
        }
    }
    return "nothing differs";
}

void ask(TreeMetadataManager& tree, Address const& address, Content& content) {
    for (auto const& child : tree.getChildNodes(address)) {
        require(tree.pathExists(child), "a child does not exist");
        auto const node = tree.getNode(child);
        require((node != nullptr) == tree.hasNode(child), "hasNode and getNode differ");
        auto const before = content.size();
        ask(tree, child, content);
        if (node) {
            content.emplace(child, described(*node));
        } else if (content.size() == before) {
            content.emplace(child, "created"); // it has no node and nothing below it
        }
    }
}

} // namespace

void require(bool holds, std::string const& law) {
    if (!holds) {
        throw std::logic_error(law);
    }
}

void TreeModel::set(std::map<Address, Node> const& nodes) {
    for (auto const& [address, node] : nodes) {
        content_[address] = described(node);
    }
}

void TreeModel::remove(std::vector<Address> const& addresses) {
    std::erase_if(content_, [&](auto const& entry) {
        return std::any_of(addresses.begin(), addresses.end(),
                           [&](Address const& address) { return entry.first.isWithin(address); });
    });
}

void TreeModel::create(std::vector<Address> const& addresses) {
    auto after = content_;
    for (auto const& address : addresses) {
        if (!exists(address)) {
            after.emplace(address, "created");
        }
    }
    content_ = std::move(after);
}

bool TreeModel::exists(Address const& address) const {
    return std::any_of(content_.begin(), content_.end(),
                       [&](auto const& entry) { return entry.first.isWithin(address); });
}

Content TreeModel::visible() const {
    Content result;
    for (auto entry = content_.begin(); entry != content_.end(); ++entry) {
        auto const next = std::next(entry);
        bool const isAbove = next != content_.end() && next->first.isWithin(entry->first);
        if (entry->second != "created" || !isAbove) {
            result.insert(*entry);
        }
    }
    return result;
}

Content contentOf(TreeMetadataManager& tree) {
    auto const guard = tree.acquireReadLock(); // one check for changes for all questions
    Content content;
    ask(tree, Address::root(), content);
    return content;
}

void requireEqual(TreeMetadataManager& tree, TreeModel const& model) {
    auto const content = contentOf(tree);
    auto const wanted = model.visible();
    if (content != wanted) {
        throw std::logic_error("the project differs from the model: " + firstDifference(wanted, content));
    }
}

void showWrite(std::map<Address, Node> const& nodes, std::vector<Address> const& addresses,
               std::ostream& out) {
    for (auto const& [address, node] : nodes) {
        out << "\n    " << testing::PrintToString(address) << " = " << described(node);
    }
    for (auto const& address : addresses) {
        out << "\n    " << testing::PrintToString(address);
    }
}

void showValue(PartialWrite const& write, std::ostream& out) {
    constexpr char const* kinds[] = {"Set", "Remove", "Create"};
    out << "\n  " << kinds[static_cast<int>(write.kind)] << (write.isNested ? ", nested" : "")
        << (write.isNested && !write.isKept ? ", rolled back" : "");
    showWrite(write.nodes, write.addresses, out);
}

rc::Gen<std::map<Address, Node>> anyNodes() {
    return rc::gen::map(
        stores::samples::fewOf(6, rc::gen::pair(stores::samples::anyAddress(), stores::samples::anyNode())),
        [](auto const& pairs) { return std::map<Address, Node>(pairs.begin(), pairs.end()); });
}

rc::Gen<PartialWrite> anyPartialWrite() {
    using Kind = PartialWrite::Kind;
    return rc::gen::build<PartialWrite>(
        rc::gen::set(&PartialWrite::kind,
                     rc::gen::weightedElement<Kind>({{4, Kind::Set}, {3, Kind::Remove}, {1, Kind::Create}})),
        rc::gen::set(&PartialWrite::nodes, anyNodes()),
        rc::gen::set(&PartialWrite::addresses, stores::samples::fewOf(3, stores::samples::anyAddress())),
        rc::gen::set(&PartialWrite::isNested, rc::gen::arbitrary<bool>()),
        rc::gen::set(&PartialWrite::isKept, rc::gen::arbitrary<bool>()));
}

void write(TreeMetadataManager& tree, PartialWrite const& step, TreeModel& after) {
    auto addresses = step.addresses;
    switch (step.kind) {
    case PartialWrite::Kind::Set: {
        std::map<Address, std::shared_ptr<MetadataNode>> nodes;
        for (auto const& [address, node] : step.nodes) {
            nodes.emplace(address, std::make_shared<MetadataNodeSpecification>(*node));
        }
        after.set(step.nodes);
        tree.setNodes(nodes);
        break;
    }
    case PartialWrite::Kind::Remove:
        after.remove(step.addresses);
        tree.removeNodes(addresses);
        break;
    case PartialWrite::Kind::Create:
        after.create(step.addresses);
        tree.createPaths(addresses);
        break;
    }
}

void runTransaction(TreeMetadataManager& tree, std::vector<PartialWrite> const& writes, bool isCommitted,
                    TreeModel& after) {
    auto const before = after;
    auto transaction = tree.transaction();
    for (auto const& part : writes) {
        auto const beforePart = after;
        auto nested = part.isNested ? std::optional(tree.transaction()) : std::nullopt;
        write(tree, part, after);
        if (nested && part.isKept) {
            nested->commit();
        } else if (nested) {
            after = beforePart;
        }
        nested.reset();
        require(contentOf(tree) == after.visible(),
                "an operation in a transaction does not see the effects of the earlier ones");
    }
    if (isCommitted) {
        transaction.commit();
    } else {
        after = before;
    }
}

} // namespace project::test
